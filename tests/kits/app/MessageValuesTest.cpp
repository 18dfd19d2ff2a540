// BMessage's calls for each type.
#include <Message.h>
#include <Messenger.h>

#include "support/captured_output.h"

#include <cstring>
#include <gtest/gtest.h>
#include <limits>

namespace {

// Adds `first` and `second`, reads both, replaces each, and checks every call of the type.
#define EXPECT_CALLS_OF_TYPE(TypeName, Type, code, first, second, third)                                     \
    do {                                                                                                     \
        BMessage message;                                                                                    \
        Type value{};                                                                                        \
        EXPECT_FALSE(message.Has##TypeName("v"));                                                            \
        EXPECT_EQ(message.Find##TypeName("v", &value), B_NAME_NOT_FOUND);                                    \
        ASSERT_EQ(message.Add##TypeName("v", first), B_OK);                                                  \
        ASSERT_EQ(message.Add##TypeName("v", second), B_OK);                                                 \
        EXPECT_TRUE(message.Has##TypeName("v"));                                                             \
        EXPECT_TRUE(message.Has##TypeName("v", 1));                                                          \
        EXPECT_FALSE(message.Has##TypeName("v", 2));                                                         \
        ASSERT_EQ(message.Find##TypeName("v", &value), B_OK);                                                \
        EXPECT_TRUE(value == first);                                                                         \
        ASSERT_EQ(message.Find##TypeName("v", 1, &value), B_OK);                                             \
        EXPECT_TRUE(value == second);                                                                        \
        ASSERT_EQ(message.Replace##TypeName("v", third), B_OK);                                              \
        ASSERT_EQ(message.Replace##TypeName("v", 1, first), B_OK);                                           \
        ASSERT_EQ(message.Find##TypeName("v", 0, &value), B_OK);                                             \
        EXPECT_TRUE(value == third);                                                                         \
        ASSERT_EQ(message.Find##TypeName("v", 1, &value), B_OK);                                             \
        EXPECT_TRUE(value == first);                                                                         \
        EXPECT_EQ(message.Replace##TypeName("v", 2, first), B_BAD_INDEX);                                    \
        type_code type = 0;                                                                                  \
        int32 count = 0;                                                                                     \
        ASSERT_EQ(message.GetInfo("v", &type, &count), B_OK);                                                \
        EXPECT_EQ(type, type_code{code});                                                                    \
        EXPECT_EQ(count, 2);                                                                                 \
        const BMessage copy(message);                                                                        \
        ASSERT_EQ(copy.Find##TypeName("v", &value), B_OK);                                                   \
        EXPECT_TRUE(value == third);                                                                         \
    } while (false)

// Two bytes as an object.
class Pair : public BFlattenable {
  public:
    Pair() = default;
    Pair(char first, char second) : mFirst(first), mSecond(second) {}
    bool IsFixedSize() const override { return true; }
    type_code TypeCode() const override { return 'Pair'; }
    ssize_t FlattenedSize() const override { return 2; }
    status_t Flatten(void* buffer, ssize_t size) const override {
        if (size < 2)
            return B_NO_MEMORY;
        static_cast<char*>(buffer)[0] = mFirst;
        static_cast<char*>(buffer)[1] = mSecond;
        return B_OK;
    }
    status_t Unflatten(type_code code, const void* buffer, ssize_t size) override {
        if (code != 'Pair')
            return B_BAD_TYPE;
        if (size != 2)
            return B_BAD_DATA;
        mFirst = static_cast<const char*>(buffer)[0];
        mSecond = static_cast<const char*>(buffer)[1];
        return B_OK;
    }
    bool operator==(const Pair& other) const { return mFirst == other.mFirst && mSecond == other.mSecond; }

  private:
    char mFirst = 0;
    char mSecond = 0;
};

} // namespace

TEST(MessageValuesTest, EveryPlainTypeIsAddedFoundAndReplaced) {
    EXPECT_CALLS_OF_TYPE(Bool, bool, B_BOOL_TYPE, true, false, false);
    EXPECT_CALLS_OF_TYPE(Int8, int8, B_INT8_TYPE, int8{-128}, int8{127}, int8{0});
    EXPECT_CALLS_OF_TYPE(UInt8, uint8, B_UINT8_TYPE, uint8{255}, uint8{0}, uint8{7});
    EXPECT_CALLS_OF_TYPE(Int16, int16, B_INT16_TYPE, int16{-32768}, int16{32767}, int16{1});
    EXPECT_CALLS_OF_TYPE(UInt16, uint16, B_UINT16_TYPE, uint16{65535}, uint16{0}, uint16{9});
    EXPECT_CALLS_OF_TYPE(Int32, int32, B_INT32_TYPE, std::numeric_limits<int32>::min(), 0, -1);
    EXPECT_CALLS_OF_TYPE(UInt32, uint32, B_UINT32_TYPE, 4294967295U, 0U, 1U);
    EXPECT_CALLS_OF_TYPE(Int64, int64, B_INT64_TYPE, int64{-9000000000}, int64{185000000}, int64{0});
    EXPECT_CALLS_OF_TYPE(UInt64, uint64, B_UINT64_TYPE, uint64{18446744073709551615U}, uint64{0}, uint64{5});
    EXPECT_CALLS_OF_TYPE(Float, float, B_FLOAT_TYPE, 1.25F, -0.5F, 1e30F);
    EXPECT_CALLS_OF_TYPE(Double, double, B_DOUBLE_TYPE, 1.25, -1e300, 0.1);
    EXPECT_CALLS_OF_TYPE(Point, BPoint, B_POINT_TYPE, BPoint(1, 2), BPoint(-3.5F, 4), BPoint());
    EXPECT_CALLS_OF_TYPE(Rect, BRect, B_RECT_TYPE, BRect(0, 0, 64, 64), BRect(), BRect(1, 2, 3, 4));
}

TEST(MessageValuesTest, RefsAreAddedFoundAndReplaced) {
    const entry_ref song(8, 4242, "01 Song \xff.mp3");
    const entry_ref other(static_cast<dev_t>(-1), 1, "b");
    const entry_ref nameless;
    BMessage message;
    ASSERT_EQ(message.AddRef("refs", &song), B_OK);
    ASSERT_EQ(message.AddRef("refs", &nameless), B_OK);
    entry_ref found;
    ASSERT_EQ(message.FindRef("refs", &found), B_OK);
    EXPECT_EQ(found, song);
    ASSERT_EQ(message.FindRef("refs", 1, &found), B_OK);
    EXPECT_EQ(found, nameless);
    EXPECT_EQ(found.name, nullptr);
    ASSERT_EQ(message.ReplaceRef("refs", 1, &other), B_OK);
    ASSERT_EQ(message.FindRef("refs", 1, &found), B_OK);
    EXPECT_EQ(found, other);
    EXPECT_TRUE(message.HasRef("refs", 1));
    EXPECT_FALSE(message.HasRef("refs", 2));
    EXPECT_EQ(message.FindRef("refs", 2, &found), B_BAD_INDEX);
    EXPECT_EQ(found, other);
}

TEST(MessageValuesTest, ARefWhoseBytesAreNoRefIsBadData) {
    BMessage message;
    ASSERT_EQ(message.AddData("short", B_REF_TYPE, "1234567", 7, false), B_OK);
    ASSERT_EQ(message.AddData("open", B_REF_TYPE, "0123456789abcdefname", 20, false), B_OK);
    entry_ref ref;
    EXPECT_EQ(message.FindRef("short", &ref), B_BAD_DATA);
    EXPECT_EQ(message.FindRef("open", &ref), B_BAD_DATA);
}

TEST(MessageValuesTest, NodeRefsAreAddedFoundAndReplaced) {
    const node_ref first(3, 77);
    const node_ref second(static_cast<dev_t>(-1), static_cast<ino_t>(-1));
    BMessage message;
    ASSERT_EQ(message.AddNodeRef("n", &first), B_OK);
    ASSERT_EQ(message.ReplaceNodeRef("n", 0, &second), B_OK);
    node_ref found(1, 1);
    ASSERT_EQ(message.FindNodeRef("n", &found), B_OK);
    EXPECT_EQ(found, second);
    EXPECT_TRUE(message.HasNodeRef("n"));
}

TEST(MessageValuesTest, PointersComeBackAsTheyWere) {
    int object = 0;
    BMessage message;
    ASSERT_EQ(message.AddPointer("p", &object), B_OK);
    ASSERT_EQ(message.AddPointer("p", nullptr), B_OK);
    void* found = nullptr;
    ASSERT_EQ(message.FindPointer("p", &found), B_OK);
    EXPECT_EQ(found, &object);
    ASSERT_EQ(message.FindPointer("p", 1, &found), B_OK);
    EXPECT_EQ(found, nullptr);
    ASSERT_EQ(message.ReplacePointer("p", 1, &object), B_OK);
    ASSERT_EQ(message.FindPointer("p", 1, &found), B_OK);
    EXPECT_EQ(found, &object);
    EXPECT_TRUE(message.HasPointer("p"));
}

TEST(MessageValuesTest, StringsComeAsTextsAndAsBStrings) {
    BMessage message;
    ASSERT_EQ(message.AddString("s", "plain"), B_OK);
    ASSERT_EQ(message.AddString("s", BString("owned \xc3\xa9\xff")), B_OK);
    ASSERT_EQ(message.AddString("s", ""), B_OK);
    const char* text = nullptr;
    BString string("before");
    ASSERT_EQ(message.FindString("s", &text), B_OK);
    EXPECT_STREQ(text, "plain");
    ASSERT_EQ(message.FindString("s", 1, &string), B_OK);
    EXPECT_STREQ(string.String(), "owned \xc3\xa9\xff");
    ASSERT_EQ(message.FindString("s", 2, &text), B_OK);
    EXPECT_STREQ(text, "");
    ASSERT_EQ(message.ReplaceString("s", BString("new")), B_OK);
    ASSERT_EQ(message.FindString("s", &string), B_OK);
    EXPECT_STREQ(string.String(), "new");
    EXPECT_EQ(message.FindString("t", &string), B_NAME_NOT_FOUND);
    EXPECT_STREQ(string.String(), "new");
}

TEST(MessageValuesTest, ATextWithoutItsTerminatorIsNotHandedOut) {
    BMessage message;
    ASSERT_EQ(message.AddData("s", B_STRING_TYPE, "abcd", 4), B_OK);
    const char* text = nullptr;
    EXPECT_EQ(message.FindString("s", &text), B_BAD_DATA);
    EXPECT_EQ(text, nullptr);
    EXPECT_EQ(message.GetString("s", "default"), std::string("default"));
}

TEST(MessageValuesTest, AnItemOfAnotherSizeThanItsTypeIsBadData) {
    BMessage message;
    ASSERT_EQ(message.AddData("n", B_INT32_TYPE, "abc", 3), B_OK);
    int32 number = 7;
    EXPECT_EQ(message.FindInt32("n", &number), B_BAD_DATA);
    EXPECT_EQ(number, 7);
    ASSERT_EQ(message.AddData("r", B_RECT_TYPE, "abcdefgh", 8), B_OK);
    BRect rect;
    EXPECT_EQ(message.FindRect("r", &rect), B_BAD_DATA);
}

TEST(MessageValuesTest, ABoolFromAnyNonZeroByteIsTrue) {
    BMessage message;
    ASSERT_EQ(message.AddData("b", B_BOOL_TYPE, "\x02", 1), B_OK);
    bool value = false;
    ASSERT_EQ(message.FindBool("b", &value), B_OK);
    EXPECT_TRUE(value);
}

TEST(MessageValuesTest, DefaultsStandInForMissingItems) {
    BMessage message;
    message.AddInt32("n", 5);
    EXPECT_EQ(message.GetInt32("n", 9), 5);
    EXPECT_EQ(message.GetInt32("n", 1, 9), 9);
    EXPECT_EQ(message.GetInt32("m", 9), 9);
    EXPECT_EQ(message.GetFloat("n", 2.5F), 2.5F);
    EXPECT_TRUE(message.GetBool("b", true));
    EXPECT_STREQ(message.GetString("s", "none"), "none");
    EXPECT_EQ(message.GetString("s"), nullptr);
}

TEST(MessageValuesTest, NestedMessagesAreCopies) {
    BMessage inner('innr');
    inner.AddFloat("winX", 10);
    BMessage outer;
    ASSERT_EQ(outer.AddMessage("findwindow", &inner), B_OK);
    inner.AddFloat("winY", 20);
    BMessage found('old_');
    found.AddInt32("old", 1);
    ASSERT_EQ(outer.FindMessage("findwindow", &found), B_OK);
    EXPECT_EQ(found.what, uint32{'innr'});
    float x = 0;
    ASSERT_EQ(found.FindFloat("winX", &x), B_OK);
    EXPECT_EQ(x, 10.0F);
    EXPECT_EQ(found.CountNames(B_ANY_TYPE), 1);
    ASSERT_EQ(outer.ReplaceMessage("findwindow", &inner), B_OK);
    ASSERT_EQ(outer.FindMessage("findwindow", &found), B_OK);
    EXPECT_EQ(found.CountNames(B_ANY_TYPE), 2);
    EXPECT_TRUE(outer.HasMessage("findwindow"));
    EXPECT_FALSE(outer.HasMessage("indexwindow"));
    EXPECT_EQ(outer.FindMessage("indexwindow", &found), B_NAME_NOT_FOUND);
    EXPECT_EQ(found.CountNames(B_ANY_TYPE), 2);
}

TEST(MessageValuesTest, AMessageMayBeNestedInItselfAndTakenOutInPlace) {
    BMessage message('self');
    message.AddInt32("n", 1);
    ASSERT_EQ(message.AddMessage("me", &message), B_OK);
    BMessage copy;
    ASSERT_EQ(message.FindMessage("me", &copy), B_OK);
    EXPECT_FALSE(copy.HasMessage("me"));
    ASSERT_EQ(message.FindMessage("me", &message), B_OK);
    EXPECT_TRUE(message.HasInt32("n"));
    EXPECT_FALSE(message.HasMessage("me"));
}

TEST(MessageValuesTest, MessagesNestSixtyFourDeepAndNoDeeper) {
    BMessage message('deep');
    for (int depth = 2; depth <= 64; depth++) {
        BMessage outer('deep');
        ASSERT_EQ(outer.AddMessage("m", &message), B_OK) << depth;
        message = outer;
    }
    BMessage outer;
    EXPECT_EQ(outer.AddMessage("m", &message), B_BAD_VALUE);
    EXPECT_TRUE(outer.IsEmpty());
}

TEST(MessageValuesTest, BytesUnderTheMessageTypeMustBeAMessage) {
    BMessage message;
    EXPECT_EQ(message.AddData("m", B_MESSAGE_TYPE, "not a message at all", 20), B_BAD_DATA);
    EXPECT_TRUE(message.IsEmpty());
}

TEST(MessageValuesTest, FlattenableObjectsComeBackThroughTheirOwnForm) {
    BMessage message;
    const Pair ab('a', 'b');
    Pair cd('c', 'd');
    ASSERT_EQ(message.AddFlat("p", &ab), B_OK);
    ASSERT_EQ(message.AddFlat("p", &cd), B_OK);
    Pair found;
    ASSERT_EQ(message.FindFlat("p", &found), B_OK);
    EXPECT_EQ(found, ab);
    ASSERT_EQ(message.FindFlat("p", 1, &found), B_OK);
    EXPECT_EQ(found, cd);
    Pair ef('e', 'f');
    ASSERT_EQ(message.ReplaceFlat("p", 1, &ef), B_OK);
    ASSERT_EQ(message.FindFlat("p", 1, &found), B_OK);
    EXPECT_EQ(found, ef);
    EXPECT_TRUE(message.HasFlat("p", &found));
    EXPECT_FALSE(message.HasFlat("p", 2, &found));
    message.AddInt32("n", 1);
    EXPECT_FALSE(message.HasFlat("n", &found));
    EXPECT_NE(message.FindFlat("n", &found), B_OK);
    EXPECT_EQ(message.AddFlat("x", static_cast<BFlattenable*>(nullptr)), B_BAD_VALUE);
}

TEST(MessageValuesTest, AMessengerThatPointsNowhereComesBackAsItself) {
    BMessage message;
    ASSERT_EQ(message.AddMessenger("m", BMessenger()), B_OK);
    BMessenger found;
    ASSERT_EQ(message.FindMessenger("m", &found), B_OK);
    EXPECT_EQ(found, BMessenger());
    EXPECT_FALSE(found.IsValid());
    EXPECT_TRUE(message.HasMessenger("m"));
    EXPECT_EQ(message.FindMessenger("n", &found), B_NAME_NOT_FOUND);
}

TEST(MessageValuesTest, PrintingNamesEveryFieldAndStopsAtItsDepth) {
    BMessage inner('innr');
    inner.AddString("title", "Song");
    BMessage message(103);
    message.AddInt32("number", -5);
    message.AddBool("flag", true);
    message.AddMessage("nested", &inner);
    message.AddData("raw", B_RAW_TYPE, "abc", 3);
    CapturedOutput output;
    message.PrintToStream();
    const std::string text = output.text();
    for (const char* part :
         {"103", "number", "-5", "flag", "true", "nested", "'innr'", "title", "\"Song\"", "raw"})
        EXPECT_NE(text.find(part), std::string::npos) << part << " in " << text;
}

TEST(MessageScriptingTest, TheLastSpecifierAddedIsTheCurrentOne) {
    BMessage message;
    EXPECT_FALSE(message.HasSpecifiers());
    ASSERT_EQ(message.AddSpecifier("Volume"), B_OK);
    ASSERT_EQ(message.AddSpecifier("Track", int32{3}), B_OK);
    ASSERT_EQ(message.AddSpecifier("Layer", 2, 5), B_OK);
    ASSERT_EQ(message.AddSpecifier("Window", "Playlist"), B_OK);
    EXPECT_TRUE(message.HasSpecifiers());

    int32 index = -2;
    BMessage specifier;
    int32 form = 0;
    const char* property = nullptr;
    ASSERT_EQ(message.GetCurrentSpecifier(&index, &specifier, &form, &property), B_OK);
    EXPECT_EQ(index, 3);
    EXPECT_EQ(form, int32{B_NAME_SPECIFIER});
    EXPECT_STREQ(property, "Window");
    EXPECT_STREQ(specifier.GetString("name"), "Playlist");

    ASSERT_EQ(message.PopSpecifier(), B_OK);
    ASSERT_EQ(message.GetCurrentSpecifier(&index, &specifier, &form, &property), B_OK);
    EXPECT_EQ(form, int32{B_RANGE_SPECIFIER});
    EXPECT_EQ(specifier.GetInt32("index", -1), 2);
    EXPECT_EQ(specifier.GetInt32("range", -1), 5);

    ASSERT_EQ(message.PopSpecifier(), B_OK);
    ASSERT_EQ(message.GetCurrentSpecifier(&index, &specifier, &form, &property), B_OK);
    EXPECT_EQ(form, int32{B_INDEX_SPECIFIER});
    EXPECT_EQ(specifier.GetInt32("index", -1), 3);

    ASSERT_EQ(message.PopSpecifier(), B_OK);
    ASSERT_EQ(message.GetCurrentSpecifier(&index, &specifier, &form, &property), B_OK);
    EXPECT_EQ(index, 0);
    EXPECT_EQ(form, int32{B_DIRECT_SPECIFIER});
    EXPECT_STREQ(property, "Volume");

    ASSERT_EQ(message.PopSpecifier(), B_OK);
    EXPECT_EQ(message.GetCurrentSpecifier(&index), B_BAD_SCRIPT_SYNTAX);
    EXPECT_EQ(index, -1);
    EXPECT_NE(message.PopSpecifier(), B_OK);

    ASSERT_EQ(message.SetCurrentSpecifier(1), B_OK);
    ASSERT_EQ(message.GetCurrentSpecifier(&index, nullptr, &form), B_OK);
    EXPECT_EQ(index, 1);
    EXPECT_EQ(form, int32{B_INDEX_SPECIFIER});
    EXPECT_EQ(message.SetCurrentSpecifier(4), B_BAD_INDEX);
    EXPECT_EQ(message.SetCurrentSpecifier(-1), B_BAD_INDEX);
}

TEST(MessageScriptingTest, BadSpecifiersAreRefused) {
    BMessage message;
    EXPECT_EQ(message.AddSpecifier(static_cast<const char*>(nullptr)), B_BAD_VALUE);
    EXPECT_EQ(message.AddSpecifier(static_cast<const BMessage*>(nullptr)), B_BAD_VALUE);
    EXPECT_EQ(message.AddSpecifier("Layer", 1, -1), B_BAD_VALUE);
    EXPECT_EQ(message.AddSpecifier("Layer", static_cast<const char*>(nullptr)), B_BAD_VALUE);
    EXPECT_FALSE(message.HasSpecifiers());
    EXPECT_NE(message.SetCurrentSpecifier(0), B_OK);
}
