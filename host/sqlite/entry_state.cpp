#include "host/sqlite/entry_state.h"
#include "host/linux/opening.h"
#include "host/linux/system_calls.h"
#include "host/sqlite/attribute_value.h"
#include <algorithm>
#include <cerrno>
#include <ctime>
#include <fcntl.h>

namespace host {
namespace {

constexpr std::int64_t kSecond = 1'000'000'000;
// Kernels without fine-grained times give all changes within one timer tick (at most 10 ms) the same time.
constexpr std::int64_t kTick = 10'000'000;
constexpr int kAttempts = 20;
// Texts that only a file holds are still compared, up to this length.
constexpr std::size_t kLongestComparedText = 65536;

} // namespace

bool says_nothing_of_the_entry(int error) {
    switch (error) {
    case EIO:
    case ESTALE:
    case ETIMEDOUT:
    case EMFILE:
    case ENFILE:
    case ENOMEM:
        return true;
    default:
        return false;
    }
}

std::int64_t change_time_of(const struct stat& status) {
    return status.st_ctim.tv_sec * kSecond + status.st_ctim.tv_nsec;
}

RecordedAttribute recorded_form(const FileAttribute& attribute) {
    RecordedAttribute recorded;
    const AttributeValue::Kind kind = kind_of_type(attribute.type);
    std::string_view bytes = attribute.bytes;
    if (kind == AttributeValue::Kind::text)
        bytes = bytes.substr(0, bytes.find('\0'));
    recorded.cut =
        !attribute.complete || kind == AttributeValue::Kind::none || bytes.size() > kLongestRecordedValue;
    if (!recorded.cut)
        recorded.bytes = std::as_bytes(std::span(bytes));
    return recorded;
}

bool is_recorded_exactly(const EntryState& state) {
    // Where times are whole seconds, two changes within one have the same.
    if (state.status.st_ctim.tv_nsec == 0 || !state.whole)
        return false;
    return std::ranges::all_of(state.attributes, [](const FileAttribute& attribute) {
        const RecordedAttribute recorded = recorded_form(attribute);
        if (recorded.cut)
            return true;
        // A blob may get lost without a change of the file.
        if (attribute.spilled)
            return false;
        const bool is_text = kind_of_type(attribute.type) == AttributeValue::Kind::text;
        return attribute.bytes.size() == recorded.bytes.size() + (is_text ? 1 : 0);
    });
}

bool row_agrees(const IndexRow& row, const EntryState& state, const AttributeNames& names) {
    if (row.inode != state.status.st_ino || row.change_time != change_time_of(state.status) ||
        (row.exact && !is_recorded_exactly(state)))
        return false;
    RecordReader reader(row.attributes);
    RecordedAttribute recorded;
    for (const FileAttribute& attribute : state.attributes) {
        if (!reader.next(recorded))
            return false;
        const auto name = names.find(recorded.id);
        const RecordedAttribute wanted = recorded_form(attribute);
        if (name == names.end() || name->second.name != attribute.name ||
            name->second.type != attribute.type || recorded.cut != wanted.cut ||
            !std::ranges::equal(recorded.bytes, wanted.bytes))
            return false;
    }
    return !reader.next(recorded);
}

Status StateReader::read(int directory, DeviceId device, const char* leaf, EntryState& state) {
    state.attributes.clear();
    state.whole = false;
    Result<Descriptor> file = open_for_reading(directory, leaf, &state.status);
    // What this user may not read has no attributes for him.
    if (!file)
        return state.status.st_mode == 0 || file.error() == ENOENT || says_nothing_of_the_entry(file.error())
                   ? file.status()
                   : Status();
    if (!S_ISREG(state.status.st_mode) && !S_ISDIR(state.status.st_mode))
        return {};
    for (int attempt = 0; attempt < kAttempts; ++attempt) {
        // The first time that of the name, which another file may have taken over before it was opened.
        const ino_t inode = state.status.st_ino;
        const std::int64_t before = change_time_of(state.status);
        state.attributes.clear();
        timespec now = {};
        clock_gettime(CLOCK_REALTIME, &now);
        state.settled = now.tv_sec * kSecond + now.tv_nsec - before > kTick;
        const Status scanned = scanner_.scan({file->get(), device}, [&](const ScannedAttribute& attribute) {
            state.attributes.push_back(
                {std::string(attribute.name), attribute.type,
                 std::string(reinterpret_cast<const char*>(attribute.bytes.data()), attribute.bytes.size()),
                 attribute.complete, attribute.spilled});
        });
        if (says_nothing_of_the_entry(scanned.error()))
            return scanned;
        if (!scanned.ok())
            state.attributes.clear();
        state.whole = scanned.ok() && !scanner_.passed_over();
        if (system_calls().fstat(file->get(), &state.status) != 0)
            return errno;
        if (change_time_of(state.status) == before && state.status.st_ino == inode)
            return {};
    }
    state.settled = false;
    return {};
}

void EntrySubject::set_status(const struct stat& status) {
    status_ = status;
    status_known_ = Known::yes;
}

void EntrySubject::set_record(const std::vector<std::byte>& record, const AttributeNames& names) {
    record_ = &record;
    names_ = &names;
}

void EntrySubject::set_state(const EntryState& state) {
    state_ = &state;
    set_status(state.status);
}

bool EntrySubject::look() {
    if (status_known_ == Known::no)
        status_known_ =
            system_calls().fstatat(directory_, std::string(leaf_).c_str(), &status_, AT_SYMLINK_NOFOLLOW) == 0
                ? Known::yes
                : Known::failed;
    return status_known_ == Known::yes;
}

AttributeValue EntrySubject::size() {
    return look() ? AttributeValue::of_integer(status_.st_size) : AttributeValue();
}

AttributeValue EntrySubject::last_modified() {
    return look() ? AttributeValue::of_integer(status_.st_mtim.tv_sec) : AttributeValue();
}

bool EntrySubject::open() {
    if (file_known_ == Known::no) {
        Result<Descriptor> file = open_for_reading(directory_, std::string(leaf_).c_str());
        file_known_ = file ? Known::yes : Known::failed;
        if (file)
            file_ = std::move(*file);
    }
    return file_known_ == Known::yes;
}

AttributeValue EntrySubject::from_file(const std::string& name) {
    if (!open())
        return {};
    const AttributeFile file = {file_.get(), device_};
    const Result<AttributeInfo> info = attribute_info(file, name.c_str());
    if (!info || kind_of_type(info->type) == AttributeValue::Kind::none)
        return {};
    auto value = std::make_unique<std::string>(
        std::min(static_cast<std::size_t>(info->size), kLongestComparedText), '\0');
    const Result<std::size_t> read = read_attribute(file, name.c_str(), 0, value->data(), value->size());
    if (!read)
        return {};
    value->resize(*read);
    values_.push_back(std::move(value));
    return attribute_value(info->type, std::as_bytes(std::span(*values_.back())));
}

AttributeValue EntrySubject::attribute(const std::string& name) {
    if (state_ != nullptr) {
        for (const FileAttribute& attribute : state_->attributes) {
            if (attribute.name == name)
                return attribute.complete
                           ? attribute_value(attribute.type, std::as_bytes(std::span(attribute.bytes)))
                           : from_file(name);
        }
        return {};
    }
    if (record_ == nullptr)
        return from_file(name);
    RecordReader reader(*record_);
    RecordedAttribute recorded;
    while (reader.next(recorded)) {
        const auto found = names_->find(recorded.id);
        if (found == names_->end() || found->second.name != name)
            continue;
        return recorded.cut ? from_file(name) : attribute_value(found->second.type, recorded.bytes);
    }
    return {};
}

} // namespace host
