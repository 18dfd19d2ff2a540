#include <PropertyInfo.h>

#include <algorithm>
#include <cstring>
#include <iterator>

namespace {

// An empty list takes everything.
bool ListTakes(const uint32 (&list)[10], uint32 value) {
    const auto end = std::find(std::begin(list), std::end(list), 0u);
    return end == std::begin(list) || std::find(std::begin(list), end, value) != end;
}

} // namespace

BPropertyInfo::BPropertyInfo(property_info* properties) : mProperties(properties) {}

BPropertyInfo::~BPropertyInfo() = default;

int32 BPropertyInfo::FindMatch(BMessage* message, int32 index, BMessage*, int32 form, const char* property,
                               void* data) const {
    if (message == nullptr || property == nullptr)
        return B_ERROR;
    for (int32 entry = 0; entry < CountProperties(); entry++) {
        const property_info& info = mProperties[entry];
        if (std::strcmp(info.name, property) != 0 || !ListTakes(info.specifiers, static_cast<uint32>(form)))
            continue;
        if (index == 0 && !ListTakes(info.commands, message->what))
            continue;
        if (data != nullptr)
            *static_cast<uint32*>(data) = info.extra_data;
        return entry;
    }
    return B_ERROR;
}

int32 BPropertyInfo::CountProperties() const {
    int32 count = 0;
    while (mProperties != nullptr && mProperties[count].name != nullptr)
        count++;
    return count;
}

bool BPropertyInfo::IsFixedSize() const {
    return false;
}

type_code BPropertyInfo::TypeCode() const {
    return B_PROPERTY_INFO_TYPE;
}

// The table as a message: per property a nested message under its name.
BMessage BPropertyInfo::Describe() const {
    BMessage description(B_PROPERTY_INFO_TYPE);
    for (int32 entry = 0; entry < CountProperties(); entry++) {
        const property_info& info = mProperties[entry];
        BMessage property;
        for (const uint32 command : info.commands) {
            if (command != 0)
                property.AddUInt32("commands", command);
        }
        for (const uint32 form : info.specifiers) {
            if (form != 0)
                property.AddUInt32("specifiers", form);
        }
        for (const uint32 type : info.types) {
            if (type != 0)
                property.AddUInt32("types", type);
        }
        property.AddString("usage", info.usage != nullptr ? info.usage : "");
        property.AddUInt32("extra_data", info.extra_data);
        description.AddMessage(info.name, &property);
    }
    return description;
}

ssize_t BPropertyInfo::FlattenedSize() const {
    return Describe().FlattenedSize();
}

status_t BPropertyInfo::Flatten(void* buffer, ssize_t size) const {
    return Describe().Flatten(static_cast<char*>(buffer), size);
}

status_t BPropertyInfo::Unflatten(type_code, const void*, ssize_t) {
    return B_NOT_ALLOWED;
}
