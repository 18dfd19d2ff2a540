// Between the kit's names for files and the host's. Internal to the storage kit.
#pragma once

#include <EntryRef.h>
#include <Errors.h>

#include "host/api/entry.h"
#include "host/api/result.h"

#include <string>
#include <string_view>

struct stat;

namespace host {
class Node;
}

inline status_t StatusOf(host::Status status) {
    return status_from_errno(status.error());
}

template <typename Value>
status_t StatusOf(const host::Result<Value>& result) {
    return status_from_errno(result.error());
}

inline host::EntryRef HostRef(const entry_ref& ref) {
    return {ref.device, ref.directory, ref.name != nullptr ? ref.name : ""};
}

inline entry_ref KitRef(const host::EntryRef& ref) {
    return entry_ref(ref.device, ref.directory, ref.leaf.c_str());
}

// The current directory stands before a path that does not begin with a slash.
[[nodiscard]] status_t MakeAbsolute(std::string& path);

// A name that can be a directory's entry: neither empty, nor "." or "..", and without a slash.
[[nodiscard]] bool IsPlainLeaf(std::string_view leaf);

// What is known of a file in POSIX's form, and the way back for the fields that `what` names
// (<StatFields.h>).
void FillStat(const host::NodeStat& from, struct stat* stat);
[[nodiscard]] status_t ChangeStat(host::Node& node, const struct stat& stat, uint32 what);
