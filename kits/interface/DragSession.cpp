#include "DragSession.h"

#include <ThreadSafety.h>

#include "host/api/file_system.h"

#include <vector>

namespace {

struct Session {
    GuardMutex mutex;
    std::shared_ptr<const OwnDrag> drag GUARDED_BY(mutex);
};

Session& TheSession() {
    static Session* const session = new Session;
    return *session;
}

bool IsUnreserved(char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') ||
           std::string_view("-._~/").find(c) != std::string_view::npos;
}

int HexDigit(char c) {
    if (c >= '0' && c <= '9') {
        return c - '0';
    }
    const char lower = static_cast<char>(c | 0x20);
    return lower >= 'a' && lower <= 'f' ? lower - 'a' + 10 : -1;
}

std::string UriListOf(const BMessage& message) {
    std::string list;
    entry_ref ref;
    for (int32 i = 0; message.FindRef("refs", i, &ref) == B_OK; ++i) {
        const host::Result<std::string> path =
            host::file_system().path_of({ref.device, ref.directory, ref.name != nullptr ? ref.name : ""});
        if (path.ok()) {
            list += UriOfPath(*path) + "\r\n";
        }
    }
    return list;
}

std::vector<std::string_view> LinesOf(std::string_view text) {
    std::vector<std::string_view> lines;
    while (!text.empty()) {
        const size_t end = std::min(text.find('\n'), text.size());
        std::string_view line = text.substr(0, end);
        if (!line.empty() && line.back() == '\r') {
            line.remove_suffix(1);
        }
        lines.push_back(line);
        text.remove_prefix(std::min(end + 1, text.size()));
    }
    return lines;
}

std::unique_ptr<BMessage> RefsOf(const std::string& uriList) {
    auto message = std::make_unique<BMessage>(B_SIMPLE_DATA);
    for (const std::string_view line : LinesOf(uriList)) {
        const std::optional<std::string> path = PathOfUri(line);
        if (!path) {
            continue;
        }
        const host::Result<host::EntryRef> found = host::file_system().entry_of(*path, host::Follow::no);
        if (found.ok() && host::file_system().stat(*found).ok()) {
            const entry_ref ref(found->device, found->directory, found->leaf.c_str());
            message->AddRef("refs", &ref);
        }
    }
    return message->HasRef("refs") ? std::move(message) : nullptr;
}

} // namespace

void DragSession::Begin(std::shared_ptr<const OwnDrag> drag) {
    Session& session = TheSession();
    GuardLock guard(session.mutex);
    session.drag = std::move(drag);
}

std::shared_ptr<const OwnDrag> DragSession::Current() {
    Session& session = TheSession();
    GuardLock guard(session.mutex);
    return session.drag;
}

void DragSession::End() {
    Begin(nullptr);
}

std::optional<std::string> PathOfUri(std::string_view uri) {
    constexpr std::string_view kScheme = "file://";
    if (uri.substr(0, kScheme.size()) != kScheme) {
        return std::nullopt;
    }
    uri.remove_prefix(kScheme.size());
    const size_t slash = uri.find('/');
    const std::string_view host = uri.substr(0, slash);
    if (slash == std::string_view::npos || (!host.empty() && host != "localhost")) {
        return std::nullopt;
    }
    std::string path;
    for (size_t i = slash; i < uri.size(); ++i) {
        if (uri[i] != '%') {
            path += uri[i];
            continue;
        }
        const int high = i + 2 < uri.size() ? HexDigit(uri[i + 1]) : -1;
        const int low = i + 2 < uri.size() ? HexDigit(uri[i + 2]) : -1;
        if (high < 0 || low < 0 || high + low == 0) {
            return std::nullopt;
        }
        path += static_cast<char>(high * 16 + low);
        i += 2;
    }
    return path;
}

std::string UriOfPath(std::string_view path) {
    constexpr char kDigits[] = "0123456789ABCDEF";
    std::string uri = "file://";
    for (const char c : path) {
        if (IsUnreserved(c)) {
            uri += c;
        } else {
            const auto byte = static_cast<uint8>(c);
            uri += '%';
            uri += kDigits[byte >> 4];
            uri += kDigits[byte & 15];
        }
    }
    return uri;
}

host::DataFormats FormatsOf(const BMessage& message) {
    host::DataFormats data;
    const ssize_t size = message.FlattenedSize();
    std::string flat(static_cast<size_t>(std::max<ssize_t>(size, 0)), '\0');
    if (size > 0 && message.Flatten(flat.data(), size) == B_OK) {
        data.set(host::message_type, std::move(flat));
    }
    if (std::string list = UriListOf(message); !list.empty()) {
        data.set(host::uri_list_type, std::move(list));
    }
    const void* text = nullptr;
    ssize_t length = 0;
    if (message.FindData("text/plain", B_MIME_TYPE, &text, &length) == B_OK) {
        data.set(host::text_type, std::string(static_cast<const char*>(text), static_cast<size_t>(length)));
    }
    return data;
}

std::unique_ptr<BMessage> MessageOf(const host::DataFormats& data) {
    if (const std::string* const flat = data.find(host::message_type); flat != nullptr) {
        auto message = std::make_unique<BMessage>();
        return message->Unflatten(flat->data(), flat->size()) == B_OK ? std::move(message) : nullptr;
    }
    if (const std::string* const list = data.find(host::uri_list_type); list != nullptr) {
        if (std::unique_ptr<BMessage> message = RefsOf(*list); message != nullptr) {
            return message;
        }
    }
    if (const std::string* const text = data.find(host::text_type); text != nullptr && !text->empty()) {
        auto message = std::make_unique<BMessage>(B_MIME_DATA);
        message->AddData("text/plain", B_MIME_TYPE, text->data(), static_cast<ssize_t>(text->size()));
        return message;
    }
    return nullptr;
}
