// The states of a volume's job and the text that its row shows for each.
#pragma once

#include "app/AppMessages.h"

#include <SupportDefs.h>

#include <cstddef>

// Which job ran last. The values are those of the indexer window's buttons; the one for "cancelled" has no
// button.
enum JobState : int32 {
    kJobStatus = MSG_INDEX_STATUS,
    kJobErase = MSG_INDEX_STRIP,
    kJobNeverStarted = MSG_INDEX_STOP,
    kJobIndex = MSG_INDEX_START,
    kJobCancelled = 714,
};

inline constexpr float kProgressStarted = 0.05f;
// A job walks files whose number is not known.
inline constexpr float kProgressUnknown = -1.0f;
inline constexpr float kProgressFinished = 1.0f;

inline constexpr size_t kJobStatusTextSize = 64;

// Whether a job has finished is read from its progress alone, so one that failed before its first file keeps
// the words of a running one. An empty text for a job that never started. Any thread.
void FormatJobStatus(JobState state, float progress, int32 fileCount, char (&text)[kJobStatusTextSize]);
