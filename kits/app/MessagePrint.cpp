// BMessage::PrintToStream().
#include "MessageCodec.h"
#include <Message.h>
#include <Messenger.h>

#include <cctype>
#include <cstdio>
#include <string>

namespace {

// 'LONG' for a code of four printable characters, otherwise the number.
std::string CodeText(uint32 code) {
    std::string text = "'";
    for (int shift = 24; shift >= 0; shift -= 8) {
        const int character = static_cast<int>((code >> shift) & 0xff);
        if (character > 0x7f || std::isprint(character) == 0)
            return std::to_string(code);
        text += static_cast<char>(character);
    }
    return text + "'";
}

} // namespace

void BMessage::PrintToStream() const {
    PrintToStream(0, kMaxMessageDepth);
}

void BMessage::PrintToStream(int indent, int levelsLeft) const {
    std::printf("%*sBMessage(%s) {\n", indent, "", CodeText(what).c_str());
    for (const MessageField& field : mFields.All()) {
        const char* name = field.name.c_str();
        for (uint32 item = 0; item < field.CountItems(); item++) {
            const int32 index = static_cast<int32>(item);
            std::printf("%*s%s[%u] (%s): ", indent + 4, "", name, item, CodeText(field.type).c_str());
            const char* text = nullptr;
            BMessage nested;
            entry_ref ref;
            if (FindString(name, index, &text) == B_OK) {
                std::printf("\"%s\"\n", text);
            } else if (HasBool(name, index)) {
                std::printf("%s\n", GetBool(name, index, false) ? "true" : "false");
            } else if (HasInt8(name, index)) {
                std::printf("%d\n", GetInt8(name, index, 0));
            } else if (HasUInt8(name, index)) {
                std::printf("%u\n", GetUInt8(name, index, 0));
            } else if (HasInt16(name, index)) {
                std::printf("%d\n", GetInt16(name, index, 0));
            } else if (HasUInt16(name, index)) {
                std::printf("%u\n", GetUInt16(name, index, 0));
            } else if (HasInt32(name, index)) {
                std::printf("%" B_PRId32 "\n", GetInt32(name, index, 0));
            } else if (HasUInt32(name, index)) {
                std::printf("%" B_PRIu32 "\n", GetUInt32(name, index, 0));
            } else if (HasInt64(name, index)) {
                std::printf("%" B_PRId64 "\n", GetInt64(name, index, 0));
            } else if (HasUInt64(name, index)) {
                std::printf("%" B_PRIu64 "\n", GetUInt64(name, index, 0));
            } else if (HasFloat(name, index)) {
                std::printf("%g\n", static_cast<double>(GetFloat(name, index, 0)));
            } else if (HasDouble(name, index)) {
                std::printf("%g\n", GetDouble(name, index, 0));
            } else if (HasPoint(name, index)) {
                GetPoint(name, index, BPoint()).PrintToStream();
            } else if (HasRect(name, index)) {
                GetRect(name, index, BRect()).PrintToStream();
            } else if (HasPointer(name, index)) {
                std::printf("%p\n", GetPointer(name, index, nullptr));
            } else if (FindRef(name, index, &ref) == B_OK) {
                std::printf(
                    "device %llu, directory %llu, \"%s\"\n", static_cast<unsigned long long>(ref.device),
                    static_cast<unsigned long long>(ref.directory), ref.name != nullptr ? ref.name : "");
            } else if (levelsLeft > 1 && FindMessage(name, index, &nested) == B_OK) {
                std::printf("\n");
                nested.PrintToStream(indent + 8, levelsLeft - 1);
            } else {
                std::printf("%zu bytes\n", field.ItemAt(item).size());
            }
        }
    }
    std::printf("%*s}\n", indent, "");
}
