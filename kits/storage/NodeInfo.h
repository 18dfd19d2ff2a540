// BNodeInfo: a file's type, icon and preferred application.
#pragma once

#include <EntryRef.h>
#include <MimeType.h>

class BBitmap;
class BNode;

// Works on a node that the caller keeps alive. What is set is stored in attributes of the file. Getters
// answer B_ENTRY_NOT_FOUND for what the file does not carry; setters given null remove it. Methods without a
// node answer B_NO_INIT. One thread at a time for a node; objects on different nodes in any number of
// threads.
class BNodeInfo {
  public:
    BNodeInfo();
    explicit BNodeInfo(BNode* node);
    BNodeInfo(const BNodeInfo&) = delete;
    BNodeInfo& operator=(const BNodeInfo&) = delete;
    virtual ~BNodeInfo();

    status_t SetTo(BNode* node);
    status_t InitCheck() const;

    // Into a buffer of B_MIME_TYPE_LENGTH bytes.
    virtual status_t GetType(char* buffer) const;
    virtual status_t SetType(const char* type);

    // Into a bitmap of exactly the icon's size, else B_BAD_VALUE. A bitmap of another size that is set is
    // scaled.
    virtual status_t GetIcon(BBitmap* icon, icon_size size = B_LARGE_ICON) const;
    virtual status_t SetIcon(const BBitmap* icon, icon_size size = B_LARGE_ICON);

    status_t GetPreferredApp(char* signature, app_verb verb = B_OPEN) const;
    status_t SetPreferredApp(const char* signature, app_verb verb = B_OPEN);
    status_t GetAppHint(entry_ref* ref) const;
    status_t SetAppHint(const entry_ref* ref);

    // The icon that a file manager would show: the file's own, else that of its type (the one it carries, or
    // the one its name and contents suggest), else that of its kind. Cheap: icons of types are kept in
    // memory, converted.
    status_t GetTrackerIcon(BBitmap* icon, icon_size size = B_LARGE_ICON) const;
    static status_t GetTrackerIcon(const entry_ref* ref, BBitmap* icon, icon_size size = B_LARGE_ICON);

  private:
    BNode* mNode = nullptr;
    status_t mStatus = B_NO_INIT;
};
