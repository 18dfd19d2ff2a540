// Which fields of a stat structure a change is about. Internal to the storage kit.
#pragma once

#include <SupportDefs.h>

enum : uint32 {
    kStatPermissions = 0x01,
    kStatOwner = 0x02,
    kStatGroup = 0x04,
    kStatAccessTime = 0x08,
    kStatModificationTime = 0x10,
};
