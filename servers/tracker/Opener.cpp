#include "Opener.h"

#include "ErrorLine.h"
#include "host/api/desktop_programs.h"
#include "host/api/file_manager.h"
#include "host/api/file_system.h"
#include "host/api/processes.h"
#include <Errors.h>
#include <Roster.h>

#include <algorithm>

namespace {

struct Entry {
    entry_ref ref;
    // Empty when it is not there.
    std::string path;
    bool isFolder = false;
};

void Say(const std::string& text) {
    SayError("tracker", text);
}

Entry Look(const entry_ref& ref) {
    Entry entry;
    entry.ref = ref;
    const auto path =
        host::file_system().path_of({ref.device, ref.directory, ref.name != nullptr ? ref.name : ""});
    const auto target = path ? host::file_system().entry_of(*path, host::Follow::yes)
                             : host::Result<host::EntryRef>(path.status());
    const auto stat =
        target ? host::file_system().stat(*target) : host::Result<host::NodeStat>(target.status());
    if (!stat) {
        Say(PrintableName(ref.name != nullptr ? ref.name : "") + ": is not there");
        return entry;
    }
    entry.path = *path;
    entry.isFolder = stat->kind == host::NodeKind::directory;
    return entry;
}

// By the desktop's own helpers. False when there is none that starts.
bool OpenWithHelper(const std::string& path) {
    struct Helper {
        const char* name;
        std::vector<std::string> arguments;
    };
    for (const Helper& helper : {Helper{"xdg-open", {path}}, Helper{"gio", {"open", path}}}) {
        const std::string program = host::program_in_path(helper.name);
        if (program.empty())
            continue;
        host::ProcessStart start;
        start.executable = program;
        start.arguments = helper.arguments;
        const auto process = host::start_process(start, [path, name = helper.name](int status) {
            if (status != 0)
                Say(PrintableName(path) + ": " + name + " could not open it");
        });
        if (process)
            return true;
    }
    return false;
}

void OpenFolders(const std::vector<std::string>& paths) {
    if (paths.empty() || host::open_folders(paths).ok())
        return;
    for (const std::string& path : paths) {
        if (!OpenWithHelper(path))
            Say(PrintableName(path) + ": there is no file manager to open it");
    }
}

void OpenFile(const Entry& file) {
    entry_ref program;
    status_t status = be_roster->FindApp(&file.ref, &program);
    if (status == B_OK && program == file.ref) {
        if (!host::show_entries({file.path}).ok())
            Say(PrintableName(file.path) + ": is a program, which is not run from here");
        return;
    }
    if (status == B_OK)
        status = be_roster->Launch(&file.ref);
    if (status == B_OK || status == B_ALREADY_RUNNING || OpenWithHelper(file.path))
        return;
    Say(PrintableName(file.path) + ": " + strerror(status));
}

} // namespace

void Opener::Open(const std::vector<entry_ref>& refs) {
    std::vector<std::string> folders;
    for (const entry_ref& ref : refs) {
        const Entry entry = Look(ref);
        if (entry.path.empty())
            continue;
        if (entry.isFolder)
            folders.push_back(entry.path);
        else
            OpenFile(entry);
    }
    OpenFolders(folders);
}

void Opener::Show(const std::vector<entry_ref>& refs) {
    std::vector<std::string> paths;
    std::vector<std::string> folders;
    for (const entry_ref& ref : refs) {
        const Entry entry = Look(ref);
        if (entry.path.empty())
            continue;
        paths.push_back(entry.path);
        folders.push_back(entry.path.substr(0, std::max<size_t>(entry.path.rfind('/'), 1)));
    }
    if (!paths.empty() && !host::show_entries(paths).ok())
        OpenFolders(folders);
}
