// The numbers that threads are known by, below everything that needs to know "is it me?".
#pragma once

#include <SupportDefs.h>

typedef int32 thread_id;

// The calling thread's number: given at its first call, positive, the same for the thread's life and
// never given to another thread of this process. Any thread, made by the kits or not.
[[nodiscard]] thread_id current_thread_identity();

// A fresh number for a thread that is still to be made. Any thread.
[[nodiscard]] thread_id reserve_thread_identity();

// Gives the calling thread a reserved number. Only as the thread's first act.
void adopt_thread_identity(thread_id reserved);
