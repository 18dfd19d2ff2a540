// What an application's record says about launching it. Internal to the app kit.
#pragma once

#include <SupportDefs.h>

#include <string>

namespace host {
struct ApplicationRecord;
}

// The flags of Roster.h; B_MULTIPLE_LAUNCH for a signature without a record. Any thread.
uint32 launch_flags(const host::ApplicationRecord& record);
uint32 launch_flags(const std::string& signature);
