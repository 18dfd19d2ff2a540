// BMimeType's guesses at the type of files and data.

#include <Entry.h>
#include <File.h>
#include <MimeType.h>
#include <TypeIcons.h>
#include <Volume.h>

#include "host/api/mime_sniffer.h"

#include <span>
#include <vector>

namespace {

status_t SetOrUnknown(BMimeType* type, const std::string& guess) {
    return type->SetTo(BMimeType::IsValid(guess.c_str()) ? guess.c_str() : B_FILE_MIME_TYPE);
}

std::string TypeOfContents(const entry_ref& ref) {
    BFile file(&ref, B_READ_ONLY);
    std::vector<std::byte> start(host::sniff_size);
    ssize_t count = file.Read(start.data(), start.size());
    start.resize(count > 0 ? static_cast<size_t>(count) : 0);
    return host::type_of_file(ref.name, start);
}

} // namespace

status_t BMimeType::GuessMimeType(const entry_ref* ref, BMimeType* type) {
    if (ref == nullptr || type == nullptr)
        return B_BAD_VALUE;
    type->Unset();
    BEntry entry;
    if (status_t status = entry.SetTo(ref); status != B_OK)
        return status;
    struct stat stat;
    if (status_t status = entry.GetStat(&stat); status != B_OK)
        return status;
    if (S_ISLNK(stat.st_mode))
        return type->SetTo(std::string(kSymLinkType).c_str());
    if (S_ISDIR(stat.st_mode))
        return type->SetTo(std::string(TypeOfDirectory({stat.st_dev, stat.st_ino})).c_str());
    std::string guess = TypeOfName(ref->name);
    return SetOrUnknown(type, guess.empty() && S_ISREG(stat.st_mode) ? TypeOfContents(*ref) : guess);
}

status_t BMimeType::GuessMimeType(const void* buffer, int32 length, BMimeType* type) {
    if ((buffer == nullptr && length > 0) || length < 0 || type == nullptr)
        return B_BAD_VALUE;
    std::span<const std::byte> data(static_cast<const std::byte*>(buffer), static_cast<size_t>(length));
    return SetOrUnknown(type, host::type_of_data(data));
}

status_t BMimeType::GuessMimeType(const char* fileName, BMimeType* type) {
    if (fileName == nullptr || type == nullptr)
        return B_BAD_VALUE;
    return SetOrUnknown(type, TypeOfName(fileName));
}
