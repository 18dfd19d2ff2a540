#include "AppFinder.h"

#include "AppFiles.h"
#include "LaunchFlags.h"
#include "RunningApps.h"
#include "host/api/application_records.h"
#include "host/api/mime_sniffer.h"
#include <Roster.h>

namespace {

void SetApplication(const host::ApplicationRecord& record, FoundApp* app) {
    app->executable = record.executable;
    app->signature = record.signature;
    app->flags = launch_flags(record);
}

// The application of a signature, by the record, by a process that runs, or by the path that the MIME
// database remembers. False when it is in none of them.
bool FindBySignature(const std::string& signature, FoundApp* app) {
    if (const auto record = host::find_application_record(signature)) {
        SetApplication(*record, app);
        return true;
    }
    const std::optional<RunningApp> running = running_app(signature.c_str());
    const std::string path = running ? running->executable : application_path_of_type(signature);
    if (path.empty())
        return false;
    app->executable = path;
    app->signature = running ? running->signature : signature;
    app->flags = B_MULTIPLE_LAUNCH;
    return true;
}

status_t Checked(const FoundApp& app) {
    entry_ref ref;
    return ref_of_path(app.executable, &ref) ? B_OK : B_LAUNCH_FAILED_APP_NOT_FOUND;
}

} // namespace

status_t find_app_by_type(const std::string& mimeType, FoundApp* app) {
    // A type is "super/sub".
    const size_t slash = mimeType.find('/');
    if (slash == 0 || slash == std::string::npos || slash + 1 == mimeType.size())
        return B_BAD_VALUE;
    if (FindBySignature(mimeType, app))
        return Checked(*app);
    const std::string preferred = preferred_app_of_type(mimeType);
    if (!preferred.empty() && FindBySignature(preferred, app) && Checked(*app) == B_OK)
        return B_OK;
    const auto program = host::preferred_program(mimeType);
    if (!program)
        return mimeType.starts_with("application/x-vnd.") ? B_LAUNCH_FAILED_APP_NOT_FOUND
                                                          : B_LAUNCH_FAILED_NO_PREFERRED_APP;
    *app = FoundApp();
    app->executable = program->executable;
    app->desktop = *program;
    return B_OK;
}

status_t find_app_for_file(const entry_ref& file, FoundApp* app) {
    const std::string path = path_of_ref(file);
    if (path.empty())
        return B_ENTRY_NOT_FOUND;
    if (find_app_that_is(path, app))
        return B_OK;
    const std::string preferred = preferred_app_of_file(file);
    if (!preferred.empty() && FindBySignature(preferred, app) && Checked(*app) == B_OK)
        return B_OK;
    std::string type = own_type_of_file(file);
    if (type.empty())
        type = host::type_of_path(path);
    const status_t status = find_app_by_type(type, app);
    return status == B_BAD_VALUE ? B_LAUNCH_FAILED_NO_PREFERRED_APP : status;
}

bool find_app_that_is(const std::string& path, FoundApp* app) {
    *app = FoundApp();
    if (const auto record = host::find_application_record_of(path)) {
        SetApplication(*record, app);
        return true;
    }
    if (!is_program(path))
        return false;
    app->executable = path;
    return true;
}
