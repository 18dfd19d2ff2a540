#include <IndexMaintenance.h>

#include "host/api/index.h"

#include <HostConversions.h>

namespace {

// A number that is no volume's is a wrong argument.
status_t AnswerOf(host::Status status) {
    return status.error() == ENODEV ? B_BAD_VALUE : StatusOf(status);
}

} // namespace

status_t rebuild_index(dev_t device, const std::function<bool(uint64)>& progress) {
    const auto report = [&](std::uint64_t files) { return !progress || progress(files); };
    return AnswerOf(host::indexes().rebuild(device, report));
}

status_t refresh_index(dev_t device, index_refresh depth) {
    const auto how =
        depth == B_REFRESH_FILES ? host::Indexes::Depth::thorough : host::Indexes::Depth::directories;
    return AnswerOf(host::indexes().reconcile(device, how, nullptr));
}

status_t sync_index(dev_t device) {
    return AnswerOf(host::indexes().flush(device));
}

void close_indices() {
    host::indexes().shut_down();
}

void follow_index_changes() {
    host::indexes().follow_changes();
}
