// What is known about one attribute of a file.
#pragma once

#include <SupportDefs.h>

struct attr_info {
    // The type code that it was written with.
    uint32 type = 0;
    // The data's length in bytes.
    off_t size = 0;
};
typedef struct attr_info attr_info;
