#include <IndexMaintenance.h>

#include "host/api/index.h"

#include <Errors.h>

status_t rebuild_index(dev_t device, const std::function<bool(uint64)>& progress) {
    const auto report = [&](std::uint64_t files) { return !progress || progress(files); };
    return status_from_errno(host::indexes().rebuild(device, report).error());
}

status_t refresh_index(dev_t device, index_refresh depth) {
    const auto how =
        depth == B_REFRESH_FILES ? host::Indexes::Depth::thorough : host::Indexes::Depth::directories;
    return status_from_errno(host::indexes().reconcile(device, how, nullptr).error());
}

status_t sync_index(dev_t device) {
    return status_from_errno(host::indexes().flush(device).error());
}

void close_indices() {
    host::indexes().shut_down();
}
