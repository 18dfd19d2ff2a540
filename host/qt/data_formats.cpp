#include "data_formats.h"

#include <QMimeData>
#include <QUrl>

namespace host {

const std::string* DataFormats::find(std::string_view type) const {
    for (const auto& [name, bytes] : formats) {
        if (name == type) {
            return &bytes;
        }
    }
    return nullptr;
}

void DataFormats::set(std::string_view type, std::string bytes) {
    for (auto& [name, old] : formats) {
        if (name == type) {
            old = std::move(bytes);
            return;
        }
    }
    formats.emplace_back(std::string(type), std::move(bytes));
}

QMimeData* to_mime_data(const DataFormats& data) {
    auto* const mime = new QMimeData;
    for (const auto& [type, bytes] : data.formats) {
        if (type == text_type) {
            // So that programs that ask for another encoding get theirs.
            mime->setText(QString::fromStdString(bytes));
        } else {
            mime->setData(QString::fromStdString(type),
                          QByteArray(bytes.data(), static_cast<qsizetype>(bytes.size())));
        }
    }
    return mime;
}

DataFormats from_mime_data(const QMimeData& mime, const std::vector<std::string>& wanted) {
    DataFormats data;
    for (const std::string& type : wanted) {
        const QString name = QString::fromStdString(type);
        if (type == text_type ? !mime.hasText() : !mime.hasFormat(name)) {
            continue;
        }
        if (type == text_type) {
            data.set(type, mime.text().toStdString());
        } else {
            const QByteArray bytes = mime.data(name);
            data.set(type, std::string(bytes.constData(), static_cast<std::size_t>(bytes.size())));
        }
    }
    return data;
}

} // namespace host
