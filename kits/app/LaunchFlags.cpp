#include "LaunchFlags.h"

#include "host/api/application_records.h"
#include <Roster.h>

uint32 launch_flags(const host::ApplicationRecord& record) {
    uint32 flags = B_MULTIPLE_LAUNCH;
    if (record.instances == host::Instances::one_per_executable)
        flags = B_SINGLE_LAUNCH;
    else if (record.instances == host::Instances::one_per_signature)
        flags = B_EXCLUSIVE_LAUNCH;
    return flags | (record.background ? B_BACKGROUND_APP : uint32{0}) |
           (record.arguments_only ? B_ARGV_ONLY : uint32{0});
}

uint32 launch_flags(const std::string& signature) {
    const auto record = host::find_application_record(signature);
    return record ? launch_flags(*record) : B_MULTIPLE_LAUNCH;
}
