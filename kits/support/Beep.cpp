#include <Beep.h>

#include "host/api/threads.h"

#include <cstdio>

status_t beep() {
    if (!host::standard_error_is_terminal())
        return B_ERROR;
    return std::fputc('\a', stderr) == '\a' ? B_OK : B_ERROR;
}
