#include "indexing/FileIndexListItem.h"

#include "indexing/VolumeRowLayout.h"
#include "metadata/BrindleMetaData.h"
#include "metadata/MusicAttributes.h"

#include <Bitmap.h>
#include <Directory.h>
#include <Entry.h>
#include <Node.h>
#include <NodeInfo.h>
#include <String.h>
#include <View.h>

#include <algorithm>
#include <cstdio>

namespace {

constexpr int kStatusPasses = 300;
constexpr bigtime_t kStatusPassTime = 10000;
constexpr rgb_color kSelectedBackground = {192, 192, 192, 255};
constexpr rgb_color kWhite = {255, 255, 255, 255};
constexpr rgb_color kDarkBlue = {64, 64, 128, 255};
constexpr rgb_color kBlack = {0, 0, 0, 255};
// The text of a volume that cannot be indexed: black, lightened by 128.
constexpr rgb_color kMidGrey = {128, 128, 128, 255};

// The buffer that the predicate is read back into; nothing comes of it.
constexpr size_t kPredicateBufferSize = 255;

// The last two are removed a second time, which is harmless and intended.
constexpr const char* kRemovedAttributes[] = {
    kAttributeSongname, kAttributeArtist,   kAttributeAlbum,      kAttributeTrackNo,    kAttributeDisc,
    kAttributeVersion,  kAttributeLength,   kAttributeLengthUsec, kAttributeSamplerate, kAttributeFramerate,
    kAttributeBitrate,  kAttributeChannels, kAttributeEncoder,    kAttributeCoverImage, kAttributeCoverColor,
    kAttributeLength,   kAttributeBitrate,
};

std::unique_ptr<BBitmap> IconOfRootDirectory(const BVolume& volume) {
    auto icon = std::make_unique<BBitmap>(BRect(0, 0, 15, 15), B_CMAP8);
    BDirectory root;
    BEntry entry;
    volume.GetRootDirectory(&root);
    root.GetEntry(&entry);
    BNode node(&entry);
    BNodeInfo nodeInfo(&node);
    if (nodeInfo.GetTrackerIcon(icon.get(), B_MINI_ICON) != B_OK) {
        printf("can't get icon for volume\n");
        icon.reset();
    }
    return icon;
}

} // namespace

FileIndexListItem::FileIndexListItem(VolumeListEntry* entry)
    : BListItem(0, true), mSupported(entry->volume->KnowsAttr() && entry->volume->KnowsQuery()),
      mEntry(entry), mIcon(IconOfRootDirectory(*entry->volume)) {}

FileIndexListItem::~FileIndexListItem() {
    StopThread();
}

void FileIndexListItem::StatAttributes() {
    StartJob(thread_func_stat, "attr_stat", kJobStatus);
}

void FileIndexListItem::EraseAttributes() {
    StartJob(thread_func_erase, "attr_erase", kJobErase);
}

void FileIndexListItem::IndexAttributes() {
    StartJob(thread_func_index, "attr_index", kJobIndex);
}

void FileIndexListItem::StartJob(thread_func function, const char* threadName, JobState state) {
    const thread_id thread = spawn_thread(function, threadName, B_LOW_PRIORITY, this);
    if (thread < B_OK)
        return;
    // The job asks for messages under this id, and it may be over before resume_thread() returns: both its id
    // and its flags are set before it runs.
    mThread.store(thread, std::memory_order_relaxed);
    mRunning.store(true, std::memory_order_relaxed);
    mDone.store(false, std::memory_order_relaxed);
    mJobState.store(state, std::memory_order_relaxed);
    resume_thread(thread);
}

int32 FileIndexListItem::thread_func_stat(void* item) {
    static_cast<FileIndexListItem*>(item)->StatAttributesThread();
    return B_OK;
}

int32 FileIndexListItem::thread_func_erase(void* item) {
    static_cast<FileIndexListItem*>(item)->EraseAttributesThread();
    return B_OK;
}

int32 FileIndexListItem::thread_func_index(void* item) {
    static_cast<FileIndexListItem*>(item)->IndexAttributesThread();
    return B_OK;
}

void FileIndexListItem::StatAttributesThread() {
    for (int pass = 1; pass <= kStatusPasses && !IsCancelled(); ++pass) {
        snooze(kStatusPassTime);
        mProgress.store(static_cast<float>(pass / double{kStatusPasses}), std::memory_order_relaxed);
    }
    EndJob();
}

void FileIndexListItem::EraseAttributesThread() {
    BQuery query;
    if (FetchMP3Files(query)) {
        BEntry entry;
        BNode node;
        while (!IsCancelled()) {
            if (query.GetNextEntry(&entry, false) != B_OK) {
                mProgress.store(kProgressFinished, std::memory_order_relaxed);
                break;
            }
            CountFile();
            node.SetTo(&entry);
            RemoveAttributes(&node);
            mProgress.store(kProgressUnknown, std::memory_order_relaxed);
        }
    }
    EndJob();
}

void FileIndexListItem::IndexAttributesThread() {
    BQuery query;
    if (FetchMP3Files(query)) {
        entry_ref ref;
        BrindleMetaData metaData;
        while (!IsCancelled()) {
            if (query.GetNextRef(&ref) != B_OK) {
                mProgress.store(kProgressFinished, std::memory_order_relaxed);
                break;
            }
            CountFile();
            metaData.ReadMetaDataFromRef(&ref);
            mProgress.store(kProgressUnknown, std::memory_order_relaxed);
        }
    }
    EndJob();
}

bool FileIndexListItem::FetchMP3Files(BQuery& query) {
    query.PushAttr("name");
    query.PushString(".mp3");
    query.PushOp(B_ENDS_WITH);
    query.PushAttr("name");
    query.PushString(".MP3");
    query.PushOp(B_ENDS_WITH);
    query.PushOp(B_OR);
    query.SetVolume(mEntry->volume.get());
    char predicate[kPredicateBufferSize];
    query.GetPredicate(predicate, sizeof(predicate));

    mProgress.store(kProgressStarted, std::memory_order_relaxed);
    const status_t status = query.Fetch();
    if (status != B_OK) {
        printf("Error %s while on Fetch()\n", strerror(status));
        return false;
    }
    mFileCount.store(0, std::memory_order_relaxed);
    return true;
}

void FileIndexListItem::CountFile() {
    mFileCount.store(FileCount() + 1, std::memory_order_relaxed);
}

// The job's last step that touches the row.
void FileIndexListItem::EndJob() {
    mRunning.store(false, std::memory_order_release);
    mDone.store(true, std::memory_order_release);
}

void FileIndexListItem::CancelScan() {
    StopThread();
    mRunning.store(false, std::memory_order_relaxed);
    mJobState.store(kJobCancelled, std::memory_order_relaxed);
}

void FileIndexListItem::StopThread() {
    const thread_id thread = Thread();
    if (thread == 0)
        return;
    // A message in the thread's queue, whatever it says, stops the job. For a thread that has ended, both
    // calls return at once.
    send_data(thread, MSG_INDEX_STOP, nullptr, 0);
    status_t exitStatus = B_OK;
    wait_for_thread(thread, &exitStatus);
    mThread.store(0, std::memory_order_relaxed);
}

void FileIndexListItem::RemoveAttributes(BNode* node) {
    for (const char* name : kRemovedAttributes)
        node->RemoveAttr(name);
}

void FileIndexListItem::GetStatusText(char (&text)[kJobStatusTextSize]) const {
    FormatJobStatus(State(), Progress(), FileCount(), text);
}

void FileIndexListItem::Update(BView* owner, const BFont* font) {
    BListItem::Update(owner, font);
    SetHeight(std::max(Height(), kVolumeRowHeight));
}

void FileIndexListItem::DrawItem(BView* owner, BRect frame, bool complete) {
    const VolumeRowLayout layout(frame);
    const rgb_color background = IsSelected() ? kSelectedBackground : kWhite;
    const rgb_color textColor = mSupported || IsSelected() ? kBlack : kMidGrey;

    owner->PushState();
    owner->SetLowColor(background);
    if (IsSelected() || complete)
        owner->FillRect(frame, B_SOLID_LOW);
    owner->SetDrawingMode(B_OP_OVER);
    if (mIcon)
        owner->DrawBitmap(mIcon.get(), layout.icon);
    DrawName(owner, layout, textColor);

    // One look at the job for bar and text, so that they agree.
    const float progress = Progress();
    if (mSupported) {
        DrawBar(owner, layout.bar, progress);
    } else {
        owner->SetHighColor(textColor);
        owner->DrawString("Unsupported", layout.unsupported);
    }
    char status[kJobStatusTextSize];
    FormatJobStatus(State(), progress, FileCount(), status);
    owner->SetHighColor(textColor);
    owner->DrawString(status, layout.status);
    owner->PopState();
}

void FileIndexListItem::DrawName(BView* owner, const VolumeRowLayout& layout, rgb_color color) const {
    char name[B_FILE_NAME_LENGTH] = "";
    mEntry->volume->GetName(name);
    owner->SetFontSize(kVolumeRowFontSize);
    // A longer name would run into the bar.
    BString shown(name);
    owner->TruncateString(&shown, B_TRUNCATE_END, kVolumeNameWidth);
    owner->SetHighColor(color);
    owner->DrawString(shown.String(), layout.name);
}

void FileIndexListItem::DrawBar(BView* owner, BRect bar, float progress) const {
    const BarFill fill(bar, progress);
    owner->SetDrawingMode(B_OP_COPY);
    owner->SetHighColor(kDarkBlue);
    owner->SetLowColor(kWhite);
    owner->FillRect(fill.empty, B_SOLID_LOW);
    owner->FillRect(fill.filled, progress == kProgressUnknown ? mStripePattern : B_SOLID_HIGH);
    owner->StrokeRect(bar);
    owner->SetDrawingMode(B_OP_OVER);
}
