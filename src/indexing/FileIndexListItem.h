// A volume's row in the file indexer, with the background job that runs on the volume.
#pragma once

#include "indexing/JobStatusText.h"
#include "indexing/VolumeListEntry.h"

#include <GraphicsDefs.h>
#include <ListItem.h>
#include <OS.h>

#include <atomic>
#include <memory>

class BBitmap;
class BNode;
struct VolumeRowLayout;

// At most one job at a time, on a thread of its own at low priority:
//   status  counts nothing, it moves the progress for three seconds;
//   erase   removes the music attributes from every file named *.mp3 or *.MP3 on the volume;
//   index   reads every such file's metadata, which tags those that carry none.
// A file or folder that fails is passed over. A job ends at the end of its walk, when it is cancelled (within
// one file, or 10 ms), or when the query fails, which it says on standard output.
//
// Threads: one thread, the row's, starts and cancels jobs. The job writes its progress, its count and its
// end; any thread may read them at any time, without a lock. Who sees IsDone() sees the job's final progress
// and count.
//
// To run a job to its end without a window: start it, then poll IsDone(), showing Progress(), FileCount() or
// GetStatusText(); CancelScan() from the same thread ends it early and returns when it has ended.
class FileIndexListItem : public BListItem {
  public:
    // Takes the entry over. Says "can't get icon for volume" on standard output when there is none.
    explicit FileIndexListItem(VolumeListEntry* entry);
    // Ends a job that still runs.
    ~FileIndexListItem() override;
    FileIndexListItem(const FileIndexListItem&) = delete;
    FileIndexListItem& operator=(const FileIndexListItem&) = delete;

    // Start a job. Whether one is running is the caller's to know: a second one is not refused. When the
    // system has no room for a thread, nothing changes.
    void StatAttributes();
    void EraseAttributes();
    void IndexAttributes();

    // Stops a running job and waits for it. The row is marked as cancelled in any case, also when no job ever
    // ran.
    void CancelScan();

    // Removes the music attributes of one file, ignoring errors.
    void RemoveAttributes(BNode* node);

    // Icon, name, progress bar and status text; "Unsupported" in the bar's place where there can be no job.
    void DrawItem(BView* owner, BRect frame, bool complete = false) override;
    // As high as a line of text, but no lower than the icon needs.
    void Update(BView* owner, const BFont* font) override;

    // A job is at work.
    bool IsRunning() const { return mRunning.load(std::memory_order_acquire); }
    // The last job has ended, and ClearDone() was not called since.
    bool IsDone() const { return mDone.load(std::memory_order_acquire); }
    void ClearDone() { mDone.store(false, std::memory_order_relaxed); }
    // The volume holds attributes and answers queries.
    bool IsSupported() const { return mSupported; }
    // 0.0 to 1.0; kProgressUnknown while a job walks files.
    float Progress() const { return mProgress.load(std::memory_order_relaxed); }
    JobState State() const { return mJobState.load(std::memory_order_relaxed); }
    // Files that the current or last erase or index job has come to.
    int32 FileCount() const { return mFileCount.load(std::memory_order_relaxed); }
    // 0 when no job was started since the last cancel; a finished job's thread keeps its id here.
    thread_id Thread() const { return mThread.load(std::memory_order_relaxed); }
    void GetStatusText(char (&text)[kJobStatusTextSize]) const;

    const VolumeListEntry& Entry() const { return *mEntry; }
    // Owned by the row; null when the volume's root has none.
    BBitmap* Icon() const { return mIcon.get(); }
    // Fills a bar of unknown progress.
    const pattern& StripePattern() const { return mStripePattern; }

  private:
    static int32 thread_func_stat(void* item);
    static int32 thread_func_erase(void* item);
    static int32 thread_func_index(void* item);

    void StatAttributesThread();
    void EraseAttributesThread();
    void IndexAttributesThread();

    void DrawName(BView* owner, const VolumeRowLayout& layout, rgb_color color) const;
    void DrawBar(BView* owner, BRect bar, float progress) const;

    void StartJob(thread_func function, const char* threadName, JobState state);
    void StopThread();
    // Polled by the jobs, once per file.
    bool IsCancelled() const { return has_data(Thread()) != 0; }
    // Starts the walk over the volume's MP3 files. False when that failed.
    bool FetchMP3Files(BQuery& query);
    void CountFile();
    void EndJob();

    std::atomic<bool> mRunning{false};
    std::atomic<bool> mDone{false};
    bool mSupported;
    std::unique_ptr<VolumeListEntry> mEntry;
    std::unique_ptr<BBitmap> mIcon;
    std::atomic<float> mProgress{0.0f};
    pattern mStripePattern = {{0xC7, 0x8F, 0x1F, 0x3E, 0x7C, 0xF8, 0xF1, 0xE3}};
    std::atomic<thread_id> mThread{0};
    std::atomic<JobState> mJobState{kJobNeverStarted};
    std::atomic<int32> mFileCount{0};
};
