// The field set of a message: order, items, errors, copies. Types are in MessageValuesTest.cpp.
#include <AppDefs.h>
#include <Message.h>

#include <gtest/gtest.h>
#include <string>
#include <vector>

namespace {

std::vector<std::string> NamesOf(const BMessage& message, type_code type = B_ANY_TYPE) {
    std::vector<std::string> names;
    char* name = nullptr;
    type_code found = 0;
    for (int32 index = 0; message.GetInfo(type, index, &name, &found) == B_OK; index++)
        names.emplace_back(name);
    return names;
}

} // namespace

TEST(MessageTest, ANewMessageIsEmptyAndNotDelivered) {
    const BMessage plain;
    EXPECT_EQ(plain.what, 0U);
    EXPECT_TRUE(plain.IsEmpty());
    EXPECT_FALSE(plain.WasDelivered());
    EXPECT_FALSE(plain.IsSourceWaiting());
    EXPECT_FALSE(plain.IsSourceRemote());
    EXPECT_FALSE(plain.IsReply());
    EXPECT_FALSE(plain.WasDropped());
    EXPECT_FALSE(plain.HasSpecifiers());
    EXPECT_EQ(plain.Previous(), nullptr);
    EXPECT_EQ(BMessage(103).what, 103U);
}

TEST(MessageTest, CodesOfAnUnderscoreAndCapitalsAreTheSystems) {
    EXPECT_TRUE(BMessage(B_QUIT_REQUESTED).IsSystem());
    EXPECT_FALSE(BMessage(B_SIMPLE_DATA).IsSystem());
    EXPECT_FALSE(BMessage('_abc').IsSystem());
    EXPECT_FALSE(BMessage(103).IsSystem());
    EXPECT_FALSE(BMessage().IsSystem());
}

TEST(MessageTest, SystemCodesHaveThePlatformsValues) {
    EXPECT_EQ(uint32{B_QUIT_REQUESTED}, 0x5f515251U); // _QRQ
    EXPECT_EQ(uint32{B_REFS_RECEIVED}, 0x5252435fU);  // RRC_
    EXPECT_EQ(uint32{B_CLOSE_REQUESTED}, 0x5f515251U);
    EXPECT_EQ(uint32{B_HANDLERS_REQUESTED}, 0x5f485251U); // _HRQ
    EXPECT_EQ(uint32{B_PULSE}, 0x5f50554cU);              // _PUL
    EXPECT_EQ(uint32{B_QUERY_UPDATE}, 0x51555044U);       // QUPD
    EXPECT_EQ(uint32{B_NODE_MONITOR}, 0x4e444d4eU);       // NDMN
    EXPECT_EQ(uint32{B_SIMPLE_DATA}, 0x44415441U);        // DATA
    EXPECT_EQ(uint32{B_REPLY}, 0x52504c59U);              // RPLY
    EXPECT_EQ(uint32{B_NO_REPLY}, 0x4e4f4e45U);           // NONE
    EXPECT_EQ(uint32{B_MESSAGE_NOT_UNDERSTOOD}, 0x4d4e4f54U);
}

TEST(MessageTest, AMoveTakesEverythingAndLeavesTheOtherEmpty) {
    BMessage source('from');
    source.AddString("s", "text");
    source.AddSpecifier("Property");
    BMessage moved(std::move(source));
    EXPECT_EQ(moved.what, uint32{'from'});
    EXPECT_STREQ(moved.GetString("s"), "text");
    EXPECT_TRUE(moved.HasSpecifiers());
    EXPECT_EQ(source.what, 0U);
    EXPECT_TRUE(source.IsEmpty());
    EXPECT_FALSE(source.HasSpecifiers());

    BMessage assigned('old_');
    assigned.AddInt32("n", 1);
    assigned = std::move(moved);
    EXPECT_EQ(assigned.what, uint32{'from'});
    EXPECT_FALSE(assigned.HasInt32("n"));
    EXPECT_STREQ(assigned.GetString("s"), "text");
    EXPECT_TRUE(moved.IsEmpty());

    // What has been moved from can be used again.
    moved.AddInt32("n", 7);
    EXPECT_EQ(moved.GetInt32("n", 0), 7);
}

TEST(MessageTest, NamesKeepTheOrderOfTheirFirstAddition) {
    BMessage message;
    message.AddInt32("winX", 1);
    message.AddString("a", "text");
    message.AddInt32("winY", 2);
    message.AddInt32("winX", 3);
    EXPECT_EQ(NamesOf(message), (std::vector<std::string>{"winX", "a", "winY"}));
    EXPECT_EQ(NamesOf(message, B_INT32_TYPE), (std::vector<std::string>{"winX", "winY"}));
    EXPECT_EQ(message.CountNames(B_ANY_TYPE), 3);
    EXPECT_EQ(message.CountNames(B_INT32_TYPE), 2);
    EXPECT_EQ(message.CountNames(B_RECT_TYPE), 0);

    ASSERT_EQ(message.RemoveName("winX"), B_OK);
    message.AddInt32("winX", 4);
    EXPECT_EQ(NamesOf(message), (std::vector<std::string>{"a", "winY", "winX"}));
}

TEST(MessageTest, AFieldHoldsManyItemsInOrder) {
    BMessage message;
    for (int32 value = 0; value < 1000; value++)
        ASSERT_EQ(message.AddInt32("n", value * 3), B_OK);
    int32 found = 0;
    ASSERT_EQ(message.FindInt32("n", &found), B_OK);
    EXPECT_EQ(found, 0);
    ASSERT_EQ(message.FindInt32("n", 999, &found), B_OK);
    EXPECT_EQ(found, 2997);
    EXPECT_EQ(message.FindInt32("n", 1000, &found), B_BAD_INDEX);
    EXPECT_EQ(message.FindInt32("n", -1, &found), B_BAD_INDEX);
    EXPECT_EQ(found, 2997);
}

TEST(MessageTest, InfoTellsTypeCountAndWhetherItemsHaveOneSize) {
    BMessage message;
    message.AddString("s", "one");
    message.AddString("s", "two");
    message.AddFloat("f", 1.5F);
    type_code type = 0;
    int32 count = 0;
    bool fixedSize = true;
    EXPECT_EQ(message.GetInfo("s", &type, &count), B_OK);
    EXPECT_EQ(type, type_code{B_STRING_TYPE});
    EXPECT_EQ(count, 2);
    EXPECT_EQ(message.GetInfo("s", &type, &fixedSize), B_OK);
    EXPECT_FALSE(fixedSize);
    EXPECT_EQ(message.GetInfo("f", &type, &fixedSize), B_OK);
    EXPECT_EQ(type, type_code{B_FLOAT_TYPE});
    EXPECT_TRUE(fixedSize);
    EXPECT_EQ(message.GetInfo("s", nullptr), B_OK);

    EXPECT_EQ(message.GetInfo("missing", &type, &count), B_NAME_NOT_FOUND);
    char* name = nullptr;
    EXPECT_EQ(message.GetInfo(B_ANY_TYPE, 1, &name, &type, &count), B_OK);
    EXPECT_STREQ(name, "f");
    EXPECT_EQ(count, 1);
    EXPECT_EQ(message.GetInfo(B_ANY_TYPE, 2, &name, &type, &count), B_BAD_INDEX);
    EXPECT_NE(message.GetInfo(B_RECT_TYPE, 0, &name, &type, &count), B_OK);
}

TEST(MessageTest, AMissingFieldAWrongTypeAndAWrongIndexAreToldApart) {
    BMessage message;
    message.AddString("name", "x");
    int32 number = 77;
    EXPECT_EQ(message.FindInt32("other", &number), B_NAME_NOT_FOUND);
    EXPECT_EQ(message.FindInt32("name", &number), B_BAD_TYPE);
    const char* text = nullptr;
    EXPECT_EQ(message.FindString("name", 1, &text), B_BAD_INDEX);
    EXPECT_EQ(message.AddInt32("name", 1), B_BAD_TYPE);
    EXPECT_EQ(message.ReplaceInt32("other", 1), B_NAME_NOT_FOUND);
    EXPECT_EQ(message.ReplaceInt32("name", 1), B_BAD_TYPE);
    EXPECT_EQ(message.ReplaceString("name", 1, "y"), B_BAD_INDEX);
    EXPECT_EQ(message.RemoveData("other"), B_NAME_NOT_FOUND);
    EXPECT_EQ(message.RemoveData("name", 1), B_BAD_INDEX);
    EXPECT_EQ(message.RemoveData("name", -1), B_BAD_INDEX);
    EXPECT_EQ(message.RemoveName("other"), B_NAME_NOT_FOUND);
    EXPECT_EQ(number, 77);
    EXPECT_EQ(message.CountNames(B_ANY_TYPE), 1);
}

TEST(MessageTest, NullNamesAndNullDataAreRefused) {
    BMessage message;
    int32 number = 0;
    const char* const noText = nullptr;
    EXPECT_EQ(message.AddInt32(nullptr, 1), B_BAD_VALUE);
    EXPECT_EQ(message.FindInt32(nullptr, &number), B_BAD_VALUE);
    EXPECT_EQ(message.AddString("s", noText), B_BAD_VALUE);
    EXPECT_EQ(message.AddData("d", B_RAW_TYPE, nullptr, 4), B_BAD_VALUE);
    EXPECT_EQ(message.AddData("d", B_RAW_TYPE, "x", 0), B_BAD_VALUE);
    EXPECT_EQ(message.AddData("d", B_RAW_TYPE, "x", -1), B_BAD_VALUE);
    EXPECT_EQ(message.AddMessage("m", nullptr), B_BAD_VALUE);
    EXPECT_EQ(message.AddRef("r", nullptr), B_BAD_VALUE);
    EXPECT_EQ(message.RemoveName(nullptr), B_BAD_VALUE);
    EXPECT_EQ(message.Rename(nullptr, "x"), B_BAD_VALUE);
    EXPECT_FALSE(message.HasInt32(nullptr));
    EXPECT_TRUE(message.IsEmpty());
}

TEST(MessageTest, ANameHasAtMost255Bytes) {
    BMessage message;
    EXPECT_EQ(message.AddInt32(std::string(255, 'n').c_str(), 1), B_OK);
    EXPECT_EQ(message.AddInt32(std::string(256, 'n').c_str(), 1), B_BAD_VALUE);
    EXPECT_EQ(message.Rename(std::string(255, 'n').c_str(), std::string(256, 'm').c_str()), B_BAD_VALUE);
    EXPECT_EQ(message.CountNames(B_ANY_TYPE), 1);
}

TEST(MessageTest, RemovingTheLastItemRemovesTheField) {
    BMessage message;
    message.AddString("s", "first");
    message.AddString("s", "a second one that is longer");
    message.AddString("s", "third");
    ASSERT_EQ(message.RemoveData("s", 1), B_OK);
    const char* text = nullptr;
    ASSERT_EQ(message.FindString("s", 0, &text), B_OK);
    EXPECT_STREQ(text, "first");
    ASSERT_EQ(message.FindString("s", 1, &text), B_OK);
    EXPECT_STREQ(text, "third");
    EXPECT_EQ(message.FindString("s", 2, &text), B_BAD_INDEX);
    ASSERT_EQ(message.RemoveData("s"), B_OK);
    ASSERT_EQ(message.RemoveData("s"), B_OK);
    EXPECT_TRUE(message.IsEmpty());
    EXPECT_EQ(message.FindString("s", &text), B_NAME_NOT_FOUND);
    EXPECT_EQ(message.AddInt32("s", 1), B_OK);
}

TEST(MessageTest, RemovingAnItemOfFixedSizeMovesTheLaterOnesUp) {
    BMessage message;
    for (int32 value = 10; value < 14; value++)
        message.AddInt32("n", value);
    ASSERT_EQ(message.RemoveData("n", 0), B_OK);
    int32 found = 0;
    ASSERT_EQ(message.FindInt32("n", 0, &found), B_OK);
    EXPECT_EQ(found, 11);
    ASSERT_EQ(message.FindInt32("n", 2, &found), B_OK);
    EXPECT_EQ(found, 13);
    EXPECT_EQ(message.FindInt32("n", 3, &found), B_BAD_INDEX);
}

TEST(MessageTest, ReplacingChangesOneItemAndLeavesTheOthers) {
    BMessage message;
    message.AddString("s", "a");
    message.AddString("s", "b");
    message.AddString("s", "c");
    const std::string longText(5000, 'L');
    ASSERT_EQ(message.ReplaceString("s", 1, longText.c_str()), B_OK);
    const char* text = nullptr;
    ASSERT_EQ(message.FindString("s", 0, &text), B_OK);
    EXPECT_STREQ(text, "a");
    ASSERT_EQ(message.FindString("s", 1, &text), B_OK);
    EXPECT_EQ(text, longText);
    ASSERT_EQ(message.FindString("s", 2, &text), B_OK);
    EXPECT_STREQ(text, "c");
    ASSERT_EQ(message.ReplaceString("s", 1, ""), B_OK);
    ASSERT_EQ(message.FindString("s", 1, &text), B_OK);
    EXPECT_STREQ(text, "");
    ASSERT_EQ(message.FindString("s", 2, &text), B_OK);
    EXPECT_STREQ(text, "c");
}

TEST(MessageTest, TheMessagesOwnItemsMayBeAddedAndReplacedInIt) {
    BMessage message;
    message.AddString("s", "a text that is too long for any small buffer inside");
    const char* text = nullptr;
    for (int round = 0; round < 100; round++) {
        ASSERT_EQ(message.FindString("s", &text), B_OK);
        ASSERT_EQ(message.AddString("s", text), B_OK);
        ASSERT_EQ(message.FindString("s", &text), B_OK);
        ASSERT_EQ(message.AddString(("t" + std::to_string(round)).c_str(), text), B_OK);
    }
    message.AddString("s", "short");
    ASSERT_EQ(message.FindString("s", 0, &text), B_OK);
    ASSERT_EQ(message.ReplaceString("s", 101, text), B_OK);
    ASSERT_EQ(message.FindString("s", 0, &text), B_OK);
    ASSERT_EQ(message.ReplaceString("s", 0, text + 40), B_OK);
    ASSERT_EQ(message.FindString("s", 0, &text), B_OK);
    EXPECT_STREQ(text, "ffer inside");
    ASSERT_EQ(message.FindString("s", 101, &text), B_OK);
    EXPECT_STREQ(text, "a text that is too long for any small buffer inside");
    ASSERT_EQ(message.FindString("t99", &text), B_OK);
    EXPECT_STREQ(text, "a text that is too long for any small buffer inside");
}

TEST(MessageTest, AFieldOfFixedSizeTakesItemsOfThatSizeOnly) {
    BMessage message;
    ASSERT_EQ(message.AddData("d", B_RAW_TYPE, "abcd", 4), B_OK);
    EXPECT_EQ(message.AddData("d", B_RAW_TYPE, "abc", 3), B_BAD_VALUE);
    EXPECT_EQ(message.ReplaceData("d", B_RAW_TYPE, "abcde", 5), B_BAD_VALUE);
    ASSERT_EQ(message.AddData("d", B_RAW_TYPE, "efgh", 4), B_OK);
    const void* data = nullptr;
    ssize_t size = 0;
    ASSERT_EQ(message.FindData("d", B_RAW_TYPE, 1, &data, &size), B_OK);
    EXPECT_EQ(std::string(static_cast<const char*>(data), static_cast<size_t>(size)), "efgh");

    ASSERT_EQ(message.AddData("v", B_RAW_TYPE, "abcd", 4, false), B_OK);
    ASSERT_EQ(message.AddData("v", B_RAW_TYPE, "x", 1, false), B_OK);
    ASSERT_EQ(message.FindData("v", B_ANY_TYPE, 1, &data, &size), B_OK);
    EXPECT_EQ(std::string(static_cast<const char*>(data), static_cast<size_t>(size)), "x");
}

TEST(MessageTest, BytesFoundAreAlignedForEveryPlainType) {
    BMessage message;
    for (ssize_t size = 1; size < 20; size++)
        ASSERT_EQ(message.AddData("v", B_RAW_TYPE, "0123456789abcdefghij", size, false), B_OK);
    for (int32 index = 0; index < 19; index++) {
        const void* data = nullptr;
        ssize_t size = 0;
        ASSERT_EQ(message.FindData("v", B_RAW_TYPE, index, &data, &size), B_OK);
        EXPECT_EQ(size, index + 1);
        EXPECT_EQ(reinterpret_cast<uintptr_t>(data) % 8, 0U);
    }
}

TEST(MessageTest, PointersToItemsHoldWhileTheMessageIsUnchanged) {
    BMessage message;
    message.AddString("short", "s");
    message.AddString("long", "a text that is too long for any small buffer inside");
    const char* shortText = nullptr;
    const char* longText = nullptr;
    ASSERT_EQ(message.FindString("short", &shortText), B_OK);
    ASSERT_EQ(message.FindString("long", &longText), B_OK);
    const BMessage copy(message);
    int32 number = 0;
    EXPECT_EQ(message.FindInt32("short", &number), B_BAD_TYPE);
    message.what = 5;
    const char* again = nullptr;
    ASSERT_EQ(message.FindString("short", &again), B_OK);
    EXPECT_EQ(again, shortText);
    EXPECT_STREQ(shortText, "s");
    EXPECT_STREQ(longText, "a text that is too long for any small buffer inside");
}

TEST(MessageTest, RenamingKeepsItemsAndPlace) {
    BMessage message;
    message.AddInt32("a", 1);
    message.AddInt32("a", 2);
    message.AddInt32("b", 3);
    EXPECT_EQ(message.Rename("missing", "c"), B_NAME_NOT_FOUND);
    EXPECT_EQ(message.Rename("a", "b"), B_NAME_IN_USE);
    ASSERT_EQ(message.Rename("a", "c"), B_OK);
    EXPECT_EQ(NamesOf(message), (std::vector<std::string>{"c", "b"}));
    int32 found = 0;
    ASSERT_EQ(message.FindInt32("c", 1, &found), B_OK);
    EXPECT_EQ(found, 2);
    EXPECT_FALSE(message.HasInt32("a"));
}

TEST(MessageTest, CopiesAreIndependent) {
    BMessage original('orig');
    original.AddString("s", "text");
    BMessage copy(original);
    BMessage assigned;
    assigned.AddInt32("old", 1);
    assigned = original;
    original.ReplaceString("s", "changed");
    original.AddInt32("more", 1);
    for (const BMessage* message : {&copy, &assigned}) {
        EXPECT_EQ(message->what, uint32{'orig'});
        const char* text = nullptr;
        ASSERT_EQ(message->FindString("s", &text), B_OK);
        EXPECT_STREQ(text, "text");
        EXPECT_EQ(message->CountNames(B_ANY_TYPE), 1);
    }
    BMessage& alias = copy;
    copy = alias;
    EXPECT_TRUE(copy.HasString("s"));
}

TEST(MessageTest, MakingItEmptyKeepsTheCode) {
    BMessage message('code');
    message.AddInt32("a", 1);
    message.AddSpecifier("Property");
    EXPECT_EQ(message.MakeEmpty(), B_OK);
    EXPECT_TRUE(message.IsEmpty());
    EXPECT_EQ(message.what, uint32{'code'});
    int32 index = 5;
    EXPECT_EQ(message.GetCurrentSpecifier(&index), B_BAD_SCRIPT_SYNTAX);
    EXPECT_EQ(index, -1);
}

TEST(MessageTest, AppendingAddsTheOthersItemsBehindItsOwnOrNothing) {
    BMessage first;
    first.AddInt32("n", 1);
    BMessage second;
    second.AddInt32("n", 2);
    second.AddString("s", "x");
    ASSERT_EQ(first.Append(second), B_OK);
    int32 found = 0;
    ASSERT_EQ(first.FindInt32("n", 1, &found), B_OK);
    EXPECT_EQ(found, 2);
    BMessage wrong;
    wrong.AddInt32("new", 1);
    wrong.AddFloat("n", 1);
    EXPECT_EQ(first.Append(wrong), B_BAD_TYPE);
    EXPECT_EQ(NamesOf(first), (std::vector<std::string>{"n", "s"}));
    ASSERT_EQ(first.Append(first), B_OK);
    ASSERT_EQ(first.FindInt32("n", 3, &found), B_OK);
    EXPECT_EQ(found, 2);
}

TEST(MessageTest, AMessageThatWasNotDeliveredCannotBeReplied) {
    BMessage message;
    EXPECT_EQ(message.SendReply(B_REPLY), B_BAD_REPLY);
    BMessage reply;
    BMessage replyToReply;
    EXPECT_EQ(message.SendReply(&reply, &replyToReply), B_BAD_REPLY);
    EXPECT_EQ(message.SendReply(static_cast<BMessage*>(nullptr), static_cast<BHandler*>(nullptr)),
              B_BAD_VALUE);
}
