// What is stored about one MIME type (docs/mime.md). Internal to the storage kit.
#pragma once

#include <Message.h>
#include <Mime.h>

#include <string>
#include <string_view>
#include <vector>

// A plain value: the fields of one type's file. Getters answer B_ENTRY_NOT_FOUND for what it does not hold,
// or holds in a damaged form.
class MimeRecord {
  public:
    // An empty record for a type.
    explicit MimeRecord(std::string_view type);

    // Reads a file's bytes, which may be anything: B_BAD_DATA for all but a record of exactly this type.
    [[nodiscard]] status_t Parse(const void* bytes, size_t size);
    [[nodiscard]] status_t Serialize(std::vector<char>& bytes) const;

    enum class Text { shortDescription, longDescription, preferredApp, appHint, snifferRule };
    [[nodiscard]] status_t GetText(Text field, std::string& text) const;
    // Null takes the field away.
    status_t SetText(Text field, const char* text);

    enum class List { attributeInfo, extensions, supportedTypes };
    [[nodiscard]] status_t GetList(List field, BMessage& list) const;
    status_t SetList(List field, const BMessage* list);

    // `forType` is empty for the type's own icon, else names a type whose files get this icon from an
    // application.
    [[nodiscard]] status_t GetIcon(std::string_view forType, icon_size size, std::vector<uint8>& bits) const;
    status_t SetIcon(std::string_view forType, icon_size size, const std::vector<uint8>* bits);

  private:
    BMessage mFields;
    std::string mType;
};

// Types are compared in this form: ASCII letters in lower case.
[[nodiscard]] std::string FoldedType(std::string_view type);
