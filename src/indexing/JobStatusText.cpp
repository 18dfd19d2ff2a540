#include "indexing/JobStatusText.h"

#include <cstdio>

void FormatJobStatus(JobState state, float progress, int32 fileCount, char (&text)[kJobStatusTextSize]) {
    const bool finished = progress == kProgressFinished;
    text[0] = '\0';
    switch (state) {
    case kJobNeverStarted:
        break;
    case kJobStatus:
        snprintf(text, sizeof(text), finished ? "Got status" : "Getting status...");
        break;
    case kJobErase:
        // "Striped" is the settled wording.
        snprintf(text, sizeof(text), finished ? "Striped %d files" : "Stripping (%d)", fileCount);
        break;
    case kJobIndex:
        snprintf(text, sizeof(text), finished ? "Indexed %d files" : "Indexing files (%d)", fileCount);
        break;
    case kJobCancelled:
        snprintf(text, sizeof(text), "Cancelled.");
        break;
    }
}
