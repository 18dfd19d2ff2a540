// BMimeType: a MIME type and what the user's MIME database knows of it.
#pragma once

#include <Mime.h>
#include <StorageDefs.h>

#include <string>

class BBitmap;
class BMessage;
class BString;
struct entry_ref;

enum app_verb { B_OPEN };

// A type is a "super/sub" text, or "super" alone, compared without regard to case. What is set goes to the
// type's record at once (docs/mime.md) and is seen by every process at its next question; a record that is
// damaged reads as one that is not there. Two processes that change the same record at once both find their
// change in it. One thread at a time for an object, any number of objects at once.
//
// Getters answer B_ENTRY_NOT_FOUND when the type is not installed or lacks what is asked for, B_NO_INIT
// without a type, B_BAD_VALUE for null. Setters install the type when it is not; null removes.
class BMimeType {
  public:
    BMimeType();
    explicit BMimeType(const char* type);
    BMimeType(const BMimeType&) = delete;
    BMimeType& operator=(const BMimeType&) = delete;
    virtual ~BMimeType();

    // B_BAD_VALUE for a text that is no type.
    status_t SetTo(const char* type);
    void Unset();
    status_t InitCheck() const;

    // As it was set, null when it was not.
    const char* Type() const;
    bool IsValid() const;
    bool IsSupertypeOnly() const;
    status_t GetSupertype(BMimeType* superType) const;
    bool Contains(const BMimeType* type) const;
    bool operator==(const BMimeType& other) const;
    bool operator==(const char* type) const;

    bool IsInstalled() const;
    // Both answer B_OK when there is nothing to do.
    status_t Install();
    status_t Delete();

    // Into a bitmap of exactly the icon's size.
    status_t GetIcon(BBitmap* icon, icon_size size) const;
    status_t SetIcon(const BBitmap* icon, icon_size size);
    status_t GetIconForType(const char* type, BBitmap* icon, icon_size size) const;
    status_t SetIconForType(const char* type, const BBitmap* icon, icon_size size);

    // A signature, into a buffer of B_MIME_TYPE_LENGTH bytes.
    status_t GetPreferredApp(char* signature, app_verb verb = B_OPEN) const;
    status_t SetPreferredApp(const char* signature, app_verb verb = B_OPEN);
    // Where an application's program was last seen.
    status_t GetAppHint(entry_ref* ref) const;
    status_t SetAppHint(const entry_ref* ref);

    // What a file manager shows of the attributes of such files: per attribute the fields "attr:name",
    // "attr:public_name" (strings), "attr:type" (int32), "attr:viewable", "attr:editable" (bools),
    // "attr:width", "attr:alignment" (int32). The answer also holds "type"; setting keeps the message as it
    // is.
    status_t GetAttrInfo(BMessage* info) const;
    status_t SetAttrInfo(const BMessage* info);
    // Strings "extensions", without dots.
    status_t GetFileExtensions(BMessage* extensions) const;
    status_t SetFileExtensions(const BMessage* extensions);

    // Into a buffer of B_MIME_TYPE_LENGTH bytes.
    status_t GetShortDescription(char* description) const;
    status_t SetShortDescription(const char* description);
    status_t GetLongDescription(char* description) const;
    status_t SetLongDescription(const char* description);

    // Kept for other programs; types are guessed by the desktop's rules.
    status_t GetSnifferRule(BString* rule) const;
    status_t SetSnifferRule(const char* rule);

    // Strings "applications": the signatures of the programs that open this type, then those of its
    // supertype; int32 "be:sub" and "be:super" hold how many there are of each. An application's own types
    // are set with SetSupportedTypes() on the type of its signature.
    status_t GetSupportingApps(BMessage* signatures) const;
    status_t GetSupportedTypes(BMessage* types) const;
    status_t SetSupportedTypes(const BMessage* types);

    static bool IsValid(const char* type);
    // Strings "super_types", and "types".
    static status_t GetInstalledSupertypes(BMessage* superTypes);
    static status_t GetInstalledTypes(BMessage* types);
    static status_t GetInstalledTypes(const char* superType, BMessage* types);
    static status_t GetWildcardApps(BMessage* wildcardApps);

    // By an installed type's extensions, then by the desktop's knowledge of names and contents.
    static status_t GuessMimeType(const entry_ref* ref, BMimeType* type);
    static status_t GuessMimeType(const void* buffer, int32 length, BMimeType* type);
    static status_t GuessMimeType(const char* fileName, BMimeType* type);

  private:
    std::string mType;
    status_t mStatus = B_NO_INIT;
};
