#include "host/api/file_manager.h"

#include "host/api/desktop_programs.h"

#include <QCoreApplication>
#include <QDBusConnection>
#include <QDBusMessage>
#include <QStringList>

#include <mutex>

namespace host {

namespace {

constexpr int longest_wait = 10'000; // milliseconds
constexpr const char* service = "org.freedesktop.FileManager1";
constexpr const char* object = "/org/freedesktop/FileManager1";

// The bus wants an application object. One that is made here is kept until the process ends.
void make_application_object() {
    static std::once_flag made;
    std::call_once(made, [] {
        if (QCoreApplication::instance() != nullptr)
            return;
        static int count = 1;
        static char name[] = "file-manager";
        static char* arguments[] = {name, nullptr};
        static QCoreApplication* const application = new QCoreApplication(count, arguments);
        Q_UNUSED(application);
    });
}

Status error_of(const QDBusMessage& reply) {
    if (reply.type() != QDBusMessage::ErrorMessage)
        return {};
    const QString error = reply.errorName();
    if (error.endsWith(QLatin1String(".ServiceUnknown")) ||
        error.endsWith(QLatin1String(".NameHasNoOwner")) || error.endsWith(QLatin1String(".UnknownMethod")) ||
        error.contains(QLatin1String(".Spawn.")))
        return ENOENT;
    if (error.endsWith(QLatin1String(".NoReply")) || error.endsWith(QLatin1String(".Timeout")) ||
        error.endsWith(QLatin1String(".TimedOut")))
        return ETIMEDOUT;
    return EIO;
}

Status call(const char* method, const std::vector<std::string>& paths) {
    make_application_object();
    const QDBusConnection bus = QDBusConnection::sessionBus();
    if (!bus.isConnected())
        return ENOENT;
    QStringList uris;
    for (const std::string& path : paths)
        uris.append(QString::fromStdString(file_uri(path)));
    QDBusMessage message =
        QDBusMessage::createMethodCall(QString::fromLatin1(service), QString::fromLatin1(object),
                                       QString::fromLatin1(service), QString::fromLatin1(method));
    // The second argument would be the desktop's startup id, of which there is none here.
    message << uris << QString();
    return error_of(bus.call(message, QDBus::Block, longest_wait));
}

} // namespace

Status open_folders(const std::vector<std::string>& paths) {
    return call("ShowFolders", paths);
}

Status show_entries(const std::vector<std::string>& paths) {
    return call("ShowItems", paths);
}

} // namespace host
