// BClipboard: data that is passed on by copying and pasting.
#pragma once

#include <Locker.h>
#include <Message.h>
#include <Messenger.h>

#include <map>
#include <string>
#include <vector>

inline constexpr uint32 B_CLIPBOARD_CHANGED = 'CLCH';

// Lock() takes over what is on the desktop's clipboard, Clear() empties it, Data() is filled, Commit() hands
// it to the desktop, Unlock(). All between them wants the lock. Any thread but the one that runs the display.
//
// The clipboard "system" is the desktop's own: fields of type B_MIME_TYPE (the field's name is the MIME type)
// are exchanged with all programs, "text/plain" as UTF-8; programs on these kits get every field. Other names
// are clipboards of this program alone.
class BClipboard {
  public:
    explicit BClipboard(const char* name, bool transient = false);
    virtual ~BClipboard();
    BClipboard(const BClipboard&) = delete;
    BClipboard& operator=(const BClipboard&) = delete;

    const char* Name() const { return mName.c_str(); }
    // How often it has been committed as far as this object, or the desktop, knows.
    uint32 LocalCount() const { return mCount; }
    uint32 SystemCount() const;

    // The target gets B_CLIPBOARD_CHANGED after every commit by any program.
    status_t StartWatching(BMessenger target);
    status_t StopWatching(BMessenger target);

    bool Lock();
    void Unlock();
    bool IsLocked() const;

    // Each answers B_NOT_ALLOWED without the lock. Commit() with `failIfChanged` answers B_ERROR when the
    // clipboard has changed since Lock().
    status_t Clear();
    status_t Commit();
    status_t Commit(bool failIfChanged);
    status_t Revert();

    // Who committed what is there; not valid when that was another program.
    BMessenger DataSource() const;
    // The contents, this object's own; null without the lock.
    BMessage* Data() const;

  private:
    bool IsSystem() const;
    void Download();

    const std::string mName;
    mutable BLocker mLock{"clipboard"};
    // All guarded by mLock.
    BMessage mData;
    BMessenger mSource;
    uint32 mCount = 0;
};

// The desktop's clipboard.
extern BClipboard* const be_clipboard;
