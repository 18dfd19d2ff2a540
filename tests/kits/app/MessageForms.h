// Flattened messages, made by the system and made by hand, for the tests of their reader.
#pragma once

#include <Message.h>

#include <cstring>
#include <gtest/gtest.h>
#include <string>

inline std::string Flattened(const BMessage& message) {
    std::string form(static_cast<size_t>(message.FlattenedSize()), '\0');
    EXPECT_EQ(message.Flatten(form.data(), static_cast<ssize_t>(form.size())), B_OK);
    return form;
}

inline status_t Unflatten(BMessage& message, const std::string& form) {
    return message.Unflatten(form.data(), form.size());
}

inline std::string Number(uint32 value) {
    return {static_cast<char>(value), static_cast<char>(value >> 8), static_cast<char>(value >> 16),
            static_cast<char>(value >> 24)};
}

inline std::string ShortNumber(uint16 value) {
    return {static_cast<char>(value), static_cast<char>(value >> 8)};
}

// A form made by hand: the header around the fields.
inline std::string Form(uint32 fieldCount, const std::string& fields) {
    return std::string("BKM\x01") + Number(static_cast<uint32>(16 + fields.size())) + Number('test') +
           Number(fieldCount) + fields;
}

inline constexpr uint16 kFixed = 1;

inline std::string Field(uint32 type, uint16 flags, const std::string& name, uint32 count,
                         const std::string& items) {
    return Number(type) + ShortNumber(flags) + ShortNumber(static_cast<uint16>(name.size())) + Number(count) +
           Number(static_cast<uint32>(items.size())) + name + items;
}

// A form whose messages lie `depth` deep, made from the inside out.
inline std::string NestedForm(int depth) {
    std::string form = Form(0, "");
    for (int level = 1; level < depth; level++)
        form = Form(1, Field('MSGG', 0, "m", 1, Number(static_cast<uint32>(form.size())) + form));
    return form;
}

// Every kind of field, and what a copy of it must hold.
inline BMessage MessageOfAllKinds() {
    BMessage inner('innr');
    inner.AddFloat("winX", 10.5F);
    inner.AddFloat("winY", -3);
    BMessage message('full');
    message.AddString("Audio:Songname", "A song");
    message.AddString("Audio:Songname", "");
    message.AddInt64("Audio:LengthUsec", 185000000);
    message.AddBool("IsValid", true);
    message.AddRect("frame", BRect(1, 2, 3, 4));
    const entry_ref ref(1, 2, "leaf");
    message.AddRef("refs", &ref);
    message.AddRef("refs", &ref);
    message.AddMessage("window", &inner);
    message.AddMessage("window", &inner);
    message.AddData("raw", B_RAW_TYPE, "\0\1\2\3\4", 5, false);
    message.AddInt8("", 1);
    return message;
}

inline void ExpectAllKinds(const BMessage& message) {
    EXPECT_EQ(message.what, uint32{'full'});
    EXPECT_EQ(message.CountNames(B_ANY_TYPE), 8);
    EXPECT_STREQ(message.GetString("Audio:Songname", 0, nullptr), "A song");
    EXPECT_STREQ(message.GetString("Audio:Songname", 1, nullptr), "");
    EXPECT_EQ(message.GetInt64("Audio:LengthUsec", 0), 185000000);
    EXPECT_TRUE(message.GetBool("IsValid", false));
    EXPECT_EQ(message.GetRect("frame", BRect()), BRect(1, 2, 3, 4));
    entry_ref ref;
    EXPECT_EQ(message.FindRef("refs", 1, &ref), B_OK);
    EXPECT_EQ(ref, entry_ref(1, 2, "leaf"));
    BMessage inner;
    EXPECT_EQ(message.FindMessage("window", 1, &inner), B_OK);
    EXPECT_EQ(inner.what, uint32{'innr'});
    EXPECT_EQ(inner.GetFloat("winX", 0), 10.5F);
    EXPECT_EQ(inner.GetFloat("winY", 0), -3.0F);
    const void* data = nullptr;
    ssize_t size = 0;
    EXPECT_EQ(message.FindData("raw", B_RAW_TYPE, &data, &size), B_OK);
    ASSERT_EQ(size, 5);
    EXPECT_EQ(std::memcmp(data, "\0\1\2\3\4", 5), 0);
    EXPECT_EQ(message.GetInt8("", 0), 1);
}

// A form that is refused leaves an empty message.
inline void ExpectRefused(const std::string& form, status_t answer, const char* why) {
    BMessage message('old_');
    message.AddInt32("old", 1);
    EXPECT_EQ(Unflatten(message, form), answer) << why;
    EXPECT_TRUE(message.IsEmpty()) << why;
    EXPECT_EQ(message.what, 0U) << why;
}
