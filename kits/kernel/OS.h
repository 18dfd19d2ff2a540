// Threads, ports, semaphores and clocks.
//
// Everything here may be called from any thread. All ids are numbers of this process: they mean nothing to
// another one and are not given out twice. Only a team_id is the system's, being the process id.
#pragma once

#include <StorageDefs.h>
#include <SupportDefs.h>
#include <ThreadIdentity.h>

typedef int32 sem_id;
typedef int32 port_id;
typedef int32 team_id;

inline constexpr size_t B_OS_NAME_LENGTH = 32;
inline constexpr size_t B_PAGE_SIZE = 4096;
inline constexpr bigtime_t B_INFINITE_TIMEOUT = INT64_MAX;

// Flags of the ..._etc() calls. A relative time-out counts from the call, an absolute one is a system_time();
// without either flag the call waits for ever. B_CAN_INTERRUPT is accepted, but nothing interrupts a wait
// here.
enum : uint32 {
    B_CAN_INTERRUPT = 0x01,
    B_DO_NOT_RESCHEDULE = 0x02,
    B_CHECK_PERMISSION = 0x04,
    B_TIMEOUT = 0x08,
    B_RELATIVE_TIMEOUT = 0x08,
    B_ABSOLUTE_TIMEOUT = 0x10,
};

typedef int32 (*thread_func)(void* data);
typedef thread_func thread_entry;

// A higher number is more urgent. On this host: below B_NORMAL_PRIORITY a thread is ten steps nicer than the
// process (at B_IDLE_PRIORITY as nice as can be) and in the idle I/O class; everything from B_NORMAL_PRIORITY
// on means the process's own schedule, because a plain user cannot raise a thread. Nor can a plain user undo
// a lowering: the thread then stays as nice as it was, and so do the threads that it spawns.
enum : int32 {
    B_IDLE_PRIORITY = 0,
    B_LOWEST_ACTIVE_PRIORITY = 1,
    B_LOW_PRIORITY = 5,
    B_NORMAL_PRIORITY = 10,
    B_DISPLAY_PRIORITY = 15,
    B_URGENT_DISPLAY_PRIORITY = 20,
    B_REAL_TIME_DISPLAY_PRIORITY = 100,
    B_URGENT_PRIORITY = 110,
    B_REAL_TIME_PRIORITY = 120,
};

typedef enum {
    B_THREAD_RUNNING = 1,
    B_THREAD_READY,
    B_THREAD_RECEIVING,
    B_THREAD_ASLEEP,
    B_THREAD_SUSPENDED,
    B_THREAD_WAITING
} thread_state;

typedef struct {
    thread_id thread;
    team_id team;
    char name[B_OS_NAME_LENGTH];
    // B_THREAD_SUSPENDED before the first resume_thread(), B_THREAD_RECEIVING inside receive_data(),
    // otherwise B_THREAD_RUNNING: what the system's scheduler does with it is not told apart.
    thread_state state;
    int32 priority;
    // Always -1: not tracked.
    sem_id sem;
    // Processor time used so far, in microseconds.
    bigtime_t user_time;
    bigtime_t kernel_time;
    // Null: not known.
    void* stack_base;
    void* stack_end;
} thread_info;

// Makes a thread that will call function(data) once resume_thread() starts it; what the function returns is
// the thread's exit status. The name is cut to B_OS_NAME_LENGTH - 1 bytes (the system's own tools show 15 of
// them). `data` stays the caller's. The id, or B_BAD_VALUE for a null function. Takes nothing of the system's
// before it is started.
[[nodiscard]] thread_id spawn_thread(thread_func function, const char* name, int32 priority, void* data);

// Starts a thread that has been spawned. B_BAD_THREAD_STATE when it has been started already,
// B_BAD_THREAD_ID, or B_NO_MORE_THREADS when the system has no room for it (it can be tried again).
status_t resume_thread(thread_id thread);

// Stopping a running thread from outside is not possible on this host without stopping it inside a lock:
// B_UNSUPPORTED. B_BAD_THREAD_STATE when it has not been started yet, B_BAD_THREAD_ID.
status_t suspend_thread(thread_id thread);

// A thread that was never started ends here, and B_OK. exit_thread(B_ERROR) for the calling thread itself. A
// running thread of others cannot be killed without leaving its locks locked: B_UNSUPPORTED. B_BAD_THREAD_ID.
status_t kill_thread(thread_id thread);

// Ends the calling thread with that exit status. Objects on its stack are destroyed (by unwinding: a function
// on the way that is noexcept, or that swallows every exception, must not be left so). In the main thread it
// ends the process.
[[noreturn]] void exit_thread(status_t status);

// Waits until the thread has ended; one that was not yet resumed is resumed first. `exitStatus`, which may be
// null, receives the thread's exit status. B_OK, also for several waiting threads at once. Once a thread has
// ended this returns at once: B_OK the first time, if nobody waited before (the statuses of the last 256
// threads that ended unobserved are kept), and B_BAD_THREAD_ID from then on. B_BAD_THREAD_ID also for 0,
// unknown ids and the calling thread itself, which would wait for ever.
status_t wait_for_thread(thread_id thread, status_t* exitStatus);

// Calls function(data) in the calling thread as it ends; the last one registered is called first. It may use
// the kernel kit as that thread, but not exit_thread(). B_BAD_VALUE for null.
status_t on_exit_thread(void (*function)(void* data), void* data);

// The id of the thread with that name (any one, when several have it), or B_NAME_NOT_FOUND.
// With null the calling thread's: that works in every thread, also in one that spawn_thread() did not make.
[[nodiscard]] thread_id find_thread(const char* name);

status_t rename_thread(thread_id thread, const char* newName);

// The priority that it had, or B_BAD_THREAD_ID. Takes effect as far as the system lets it, see the
// priorities.
status_t set_thread_priority(thread_id thread, int32 newPriority);

// B_BAD_VALUE for null, B_BAD_THREAD_ID.
status_t get_thread_info(thread_id thread, thread_info* info);
// The threads of this process one after the other in the order of their ids; `team` is 0 or this process, and
// `cookie` begins as 0. B_BAD_VALUE after the last one, B_BAD_TEAM_ID for another process. Threads that the
// kits did not make appear once they have called the kernel kit.
status_t get_next_thread_info(team_id team, int32* cookie, thread_info* info);

// Every thread has one slot for a message: a code and a copy of `size` bytes.
// send_data() fills it and waits while it is still full. B_BAD_THREAD_ID for a thread that is unknown, has
// ended, or ends while this waits; B_WOULD_BLOCK for a thread that sends to itself though its own slot is
// full, since nobody else could empty it; B_BAD_VALUE for null with a size, B_NO_MEMORY.
status_t send_data(thread_id thread, int32 code, const void* buffer, size_t size);
// Waits for a message to the calling thread, takes it and answers its code. At most `size` bytes are copied,
// the rest is dropped. `sender` may be null.
int32 receive_data(thread_id* sender, void* buffer, size_t size);
// 1 when a message waits in the thread's slot, 0 when not, B_BAD_THREAD_ID (which counts as true) for a
// thread that is unknown or has ended. A thread that asks about itself reads one atomic, so it may ask as
// often as it likes.
int32 has_data(thread_id thread);

// Waits that many microseconds, not at all for 0 and less. Always B_OK.
status_t snooze(bigtime_t microseconds);
inline constexpr int B_SYSTEM_TIMEBASE = 0;
// Waits until that system_time(). B_BAD_VALUE for another time base.
status_t snooze_until(bigtime_t time, int timeBase);

// Microseconds since the machine was started, without the time it slept; never goes back.
bigtime_t system_time();
// Nanoseconds of the same clock.
int64 system_time_nsecs();
// Seconds and microseconds since 1970-01-01 00:00 UTC.
uint32 real_time_clock();
bigtime_t real_time_clock_usecs();

typedef struct sem_info {
    sem_id sem;
    team_id team;
    char name[B_OS_NAME_LENGTH];
    // Negative: that many are being waited for.
    int32 count;
    // The thread that acquired last, or 0.
    thread_id latest_holder;
} sem_info;

// Flags of release_sem_etc(), besides B_DO_NOT_RESCHEDULE.
enum : uint32 {
    B_RELEASE_ALL = 0x08,
    B_RELEASE_IF_WAITING_ONLY = 0x10,
};

// The id, or B_BAD_VALUE for a negative count.
[[nodiscard]] sem_id create_sem(int32 count, const char* name);
// Threads that wait for it wake with B_BAD_SEM_ID.
status_t delete_sem(sem_id sem);
status_t acquire_sem(sem_id sem);
// Takes `count` at once. B_WOULD_BLOCK for a relative time-out of 0 or less that cannot be met, B_TIMED_OUT,
// B_BAD_VALUE for a count below 1, B_BAD_SEM_ID. Threads are served in the order in which they came.
status_t acquire_sem_etc(sem_id sem, int32 count, uint32 flags, bigtime_t timeout);
status_t release_sem(sem_id sem);
// Gives `count` back. B_RELEASE_ALL (count must be 0 then) wakes everyone who waits,
// B_RELEASE_IF_WAITING_ONLY never lets the count rise above 0.
status_t release_sem_etc(sem_id sem, int32 count, uint32 flags);
status_t get_sem_count(sem_id sem, int32* count);
status_t get_sem_info(sem_id sem, sem_info* info);

typedef struct port_info {
    port_id port;
    team_id team;
    char name[B_OS_NAME_LENGTH];
    // How many messages it holds at most, holds now, and has held in all.
    int32 capacity;
    int32 queue_count;
    int32 total_count;
} port_info;

inline constexpr int32 B_PORT_MAX_CAPACITY = 4096;
inline constexpr size_t B_PORT_MAX_MESSAGE_SIZE = size_t{256} * 1024;

// A queue of at most `capacity` messages (a code and bytes each), within this process. The id, or B_BAD_VALUE
// for a capacity outside 1..B_PORT_MAX_CAPACITY.
[[nodiscard]] port_id create_port(int32 capacity, const char* name);
[[nodiscard]] port_id find_port(const char* name);
// B_BAD_PORT_ID for a port that is unknown, deleted or closed, also when that happens during the wait;
// B_BAD_VALUE for more than B_PORT_MAX_MESSAGE_SIZE bytes; B_WOULD_BLOCK and B_TIMED_OUT with a relative or
// absolute time-out.
status_t write_port(port_id port, int32 code, const void* buffer, size_t size);
status_t write_port_etc(port_id port, int32 code, const void* buffer, size_t size, uint32 flags,
                        bigtime_t timeout);
// Takes the oldest message and answers the number of bytes copied, at most `size`; the rest is dropped.
// Errors as above, but a closed port may be read until it is empty.
ssize_t read_port(port_id port, int32* code, void* buffer, size_t size);
ssize_t read_port_etc(port_id port, int32* code, void* buffer, size_t size, uint32 flags, bigtime_t timeout);
// The size of the oldest message; waits for one as read_port() does, and leaves it there.
ssize_t port_buffer_size(port_id port);
ssize_t port_buffer_size_etc(port_id port, uint32 flags, bigtime_t timeout);
// How many messages wait.
ssize_t port_count(port_id port);
// No more writing; what is in the port can still be read.
status_t close_port(port_id port);
// Threads that wait at it wake with B_BAD_PORT_ID.
status_t delete_port(port_id port);
// Ports belong to this process: B_BAD_TEAM_ID for any other team.
status_t set_port_owner(port_id port, team_id team);
status_t get_port_info(port_id port, port_info* info);

inline constexpr team_id B_CURRENT_TEAM = 0;

typedef struct {
    team_id team;
    // Threads that the kits know of.
    int32 thread_count;
    // Always 0: not tracked.
    int32 image_count;
    int32 area_count;
    // The command line, cut where the field ends.
    int32 argc;
    char args[64];
    uid_t uid;
    gid_t gid;
} team_info;

// This process alone: B_BAD_TEAM_ID for another.
status_t get_team_info(team_id team, team_info* info);

typedef struct {
    bigtime_t boot_time;
    uint32 cpu_count;
    // Memory in pages of B_PAGE_SIZE.
    uint64 max_pages;
    uint64 used_pages;
    uint32 used_threads;
    uint32 used_ports;
    uint32 used_sems;
    char kernel_name[B_FILE_NAME_LENGTH];
} system_info;

status_t get_system_info(system_info* info);

// Prints the message on standard error and stops the process there: in the debugger when one is attached,
// otherwise it ends with SIGABRT.
[[noreturn]] void debugger(const char* message);
