#include <CopyText.h>
#include <KernelCounts.h>
#include <OS.h>
#include <ThreadTable.h>

#include "host/api/threads.h"

#include <cstdio>
#include <cstdlib>

status_t get_team_info(team_id team, team_info* info) {
    if (info == nullptr)
        return B_BAD_VALUE;
    if (team != B_CURRENT_TEAM && team != host::current_process())
        return B_BAD_TEAM_ID;
    *info = {};
    info->team = host::current_process();
    info->thread_count = static_cast<int32>(ThreadTable::Get().Count());
    CopyText(info->args, host::command_line(info->argc).c_str());
    info->uid = host::user_id();
    info->gid = host::group_id();
    return B_OK;
}

status_t get_system_info(system_info* info) {
    if (info == nullptr)
        return B_BAD_VALUE;
    const host::system_facts facts = host::describe_system();
    *info = {};
    info->boot_time = facts.boot_time;
    info->cpu_count = facts.processors;
    info->max_pages = facts.memory_bytes / B_PAGE_SIZE;
    info->used_pages = (facts.memory_bytes - facts.free_memory_bytes) / B_PAGE_SIZE;
    info->used_threads = ThreadTable::Get().Count();
    info->used_ports = count_ports();
    info->used_sems = count_semaphores();
    CopyText(info->kernel_name, facts.kernel_name.c_str());
    return B_OK;
}

void debugger(const char* message) {
    std::fprintf(stderr, "%s\n", message != nullptr ? message : "");
    std::abort();
}
