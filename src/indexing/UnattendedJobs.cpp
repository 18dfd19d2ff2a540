#include "indexing/UnattendedJobs.h"

#include "indexing/FileIndexListItem.h"

UnattendedJobs::UnattendedJobs() = default;

UnattendedJobs::~UnattendedJobs() = default;

void UnattendedJobs::Take(std::unique_ptr<FileIndexListItem> item) {
    const GuardLock lock(mMutex);
    ForgetFinished();
    mItems.push_back(std::move(item));
}

int UnattendedJobs::Count() {
    const GuardLock lock(mMutex);
    ForgetFinished();
    return static_cast<int>(mItems.size());
}

// IsRunning() ends before the job has let go of its row; the row's destructor waits for that.
void UnattendedJobs::ForgetFinished() {
    std::erase_if(mItems, [](const auto& item) { return !item->IsRunning(); });
}
