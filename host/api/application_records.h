#pragma once

#include "host/api/result.h"
#include "host/api/running_applications.h"
#include <string>

namespace host {

/// What is known of an application before it runs. The files and where they are looked for:
/// docs/applications.md.
struct ApplicationRecord {
    std::string signature;
    std::string executable; ///< absolute path; the file may be missing
    Instances instances = Instances::any;
    bool background = false;     ///< never brought to the front by being started again
    bool arguments_only = false; ///< launched with a command line and nothing else
};

/// Any thread. ENOENT when there is none.
///
/// The record of a signature, letters' case aside; the first one whose executable can be run, else the first.
Result<ApplicationRecord> find_application_record(const std::string& signature);
/// The first record that names this executable, an absolute path.
Result<ApplicationRecord> find_application_record_of(const std::string& executable);

} // namespace host
