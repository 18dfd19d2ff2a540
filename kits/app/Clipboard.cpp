#include <Clipboard.h>

#include <ThreadSafety.h>

#include "host/api/clipboard.h"

#include <algorithm>
#include <string_view>

namespace {

constexpr char kSystemName[] = "system";
// Travels with the contents and is taken out when they are read.
constexpr char kSourceField[] = "be:clipboard_source";
constexpr char kTextField[] = "text/plain";

// The clipboards of other names, and who watches which.
class ClipboardBoard {
  public:
    static ClipboardBoard& Instance() {
        static ClipboardBoard* const board = new ClipboardBoard;
        return *board;
    }

    BMessage Contents(const std::string& name) {
        GuardLock guard(mMutex);
        return mContents[name].data;
    }
    uint32 Count(const std::string& name) {
        GuardLock guard(mMutex);
        return mContents[name].count;
    }
    void Put(const std::string& name, const BMessage& data) {
        {
            GuardLock guard(mMutex);
            Shelf& shelf = mContents[name];
            shelf.data = data;
            ++shelf.count;
        }
        Tell(name);
    }
    void Watch(const std::string& name, const BMessenger& target) {
        GuardLock guard(mMutex);
        mContents[name].watchers.push_back(target);
        if (name == kSystemName && !mFollowsSystem) {
            mFollowsSystem = true;
            host::set_clipboard_listener([this](host::ClipboardName which) {
                if (which == host::ClipboardName::clipboard) {
                    Tell(kSystemName);
                }
            });
        }
    }
    status_t StopWatch(const std::string& name, const BMessenger& target) {
        GuardLock guard(mMutex);
        std::vector<BMessenger>& watchers = mContents[name].watchers;
        const auto found = std::find(watchers.begin(), watchers.end(), target);
        if (found == watchers.end()) {
            return B_BAD_VALUE;
        }
        watchers.erase(found);
        return B_OK;
    }

  private:
    struct Shelf {
        BMessage data;
        uint32 count = 0;
        std::vector<BMessenger> watchers;
    };

    // May come on the display's thread: does not wait for anybody.
    void Tell(const std::string& name) {
        std::vector<BMessenger> watchers;
        {
            GuardLock guard(mMutex);
            watchers = mContents[name].watchers;
        }
        for (const BMessenger& watcher : watchers) {
            BMessage changed(B_CLIPBOARD_CHANGED);
            changed.AddString("be:clipboard", name.c_str());
            (void)watcher.SendMessage(&changed, static_cast<BHandler*>(nullptr), 0);
        }
    }

    GuardMutex mMutex;
    std::map<std::string, Shelf> mContents GUARDED_BY(mMutex);
    bool mFollowsSystem GUARDED_BY(mMutex) = false;
};

BClipboard sSystemClipboard(kSystemName);

} // namespace

BClipboard* const be_clipboard = &sSystemClipboard;

BClipboard::BClipboard(const char* name, bool /*transient*/) : mName(name != nullptr ? name : kSystemName) {}

BClipboard::~BClipboard() = default;

bool BClipboard::IsSystem() const {
    return mName == kSystemName;
}

uint32 BClipboard::SystemCount() const {
    return IsSystem() ? host::clipboard_changes(host::ClipboardName::clipboard)
                      : ClipboardBoard::Instance().Count(mName);
}

status_t BClipboard::StartWatching(BMessenger target) {
    if (!target.IsValid()) {
        return B_BAD_VALUE;
    }
    ClipboardBoard::Instance().Watch(mName, target);
    return B_OK;
}

status_t BClipboard::StopWatching(BMessenger target) {
    return ClipboardBoard::Instance().StopWatch(mName, target);
}

bool BClipboard::Lock() {
    if (!mLock.Lock()) {
        return false;
    }
    if (mLock.CountLocks() == 1) {
        Download();
    }
    return true;
}

void BClipboard::Unlock() {
    mLock.Unlock();
}

bool BClipboard::IsLocked() const {
    return mLock.IsLocked();
}

void BClipboard::Download() {
    mCount = SystemCount();
    mData = BMessage();
    mSource = BMessenger();
    if (!IsSystem()) {
        mData = ClipboardBoard::Instance().Contents(mName);
    } else {
        const host::DataFormats found = host::read_clipboard(
            host::ClipboardName::clipboard, {std::string(host::message_type), std::string(host::text_type)});
        const std::string* const flat = found.find(host::message_type);
        const std::string* const text = found.find(host::text_type);
        // Bytes that are no message came from somebody who only calls them so.
        const bool isMessage = flat != nullptr && mData.Unflatten(flat->data(), flat->size()) == B_OK;
        if (!isMessage && text != nullptr && !text->empty()) {
            mData.AddData(kTextField, B_MIME_TYPE, text->data(), static_cast<ssize_t>(text->size()));
        }
    }
    if (mData.FindMessenger(kSourceField, &mSource) == B_OK) {
        mData.RemoveName(kSourceField);
    }
}

status_t BClipboard::Clear() {
    if (!IsLocked()) {
        return B_NOT_ALLOWED;
    }
    mData = BMessage();
    return B_OK;
}

status_t BClipboard::Commit() {
    return Commit(false);
}

status_t BClipboard::Commit(bool failIfChanged) {
    if (!IsLocked()) {
        return B_NOT_ALLOWED;
    }
    if (failIfChanged && SystemCount() != mCount) {
        return B_ERROR;
    }
    BMessage data = mData;
    mSource = be_app_messenger;
    if (mSource.IsValid()) {
        data.AddMessenger(kSourceField, mSource);
    }
    if (!IsSystem()) {
        ClipboardBoard::Instance().Put(mName, data);
        mCount = SystemCount();
        return B_OK;
    }
    host::DataFormats formats;
    std::string flat(static_cast<size_t>(data.FlattenedSize()), '\0');
    if (const status_t status = data.Flatten(flat.data(), static_cast<ssize_t>(flat.size()));
        status != B_OK) {
        return status;
    }
    formats.set(host::message_type, std::move(flat));
    char* name = nullptr;
    type_code type = 0;
    for (int32 i = 0; mData.GetInfo(B_MIME_TYPE, i, &name, &type) == B_OK; ++i) {
        const void* bytes = nullptr;
        ssize_t size = 0;
        if (mData.FindData(name, B_MIME_TYPE, &bytes, &size) == B_OK) {
            formats.set(name, std::string(static_cast<const char*>(bytes), static_cast<size_t>(size)));
        }
    }
    host::write_clipboard(host::ClipboardName::clipboard, std::move(formats));
    return B_OK;
}

status_t BClipboard::Revert() {
    if (!IsLocked()) {
        return B_NOT_ALLOWED;
    }
    Download();
    return B_OK;
}

BMessenger BClipboard::DataSource() const {
    return mSource;
}

BMessage* BClipboard::Data() const {
    return IsLocked() ? const_cast<BMessage*>(&mData) : nullptr;
}
