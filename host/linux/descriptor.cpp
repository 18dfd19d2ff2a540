#include "host/linux/descriptor.h"

#include <cerrno>
#include <unistd.h>

namespace host {

void Descriptor::reset() {
    if (descriptor_ < 0)
        return;
    const int kept = errno;
    ::close(std::exchange(descriptor_, -1));
    errno = kept;
}

} // namespace host
