// Jobs whose window was closed while they were at work: they run on to their end.
#pragma once

#include <ThreadSafety.h>

#include <memory>
#include <vector>

class FileIndexListItem;

// One for the application. Any thread.
class UnattendedJobs {
  public:
    UnattendedJobs();
    // Cancels the jobs that are still at work and waits for them.
    ~UnattendedJobs();
    UnattendedJobs(const UnattendedJobs&) = delete;
    UnattendedJobs& operator=(const UnattendedJobs&) = delete;

    // Keeps the row at least until its job has ended.
    void Take(std::unique_ptr<FileIndexListItem> item);
    // Jobs that are at work.
    int Count();

  private:
    void ForgetFinished() REQUIRES(mMutex);

    GuardMutex mMutex;
    std::vector<std::unique_ptr<FileIndexListItem>> mItems GUARDED_BY(mMutex);
};
