// Which files a list holds rows of.
#include "playlist/ListedRefs.h"

#include <gtest/gtest.h>

namespace {

TEST(ListedRefs, KnowsAFileByDeviceFolderAndName) {
    ListedRefs refs;
    refs.Add(entry_ref(1, 2, "song.mp3"));

    EXPECT_TRUE(refs.Has(entry_ref(1, 2, "song.mp3")));
    EXPECT_FALSE(refs.Has(entry_ref(2, 2, "song.mp3")));
    EXPECT_FALSE(refs.Has(entry_ref(1, 3, "song.mp3")));
    EXPECT_FALSE(refs.Has(entry_ref(1, 2, "Song.mp3")));
    EXPECT_FALSE(refs.Has(entry_ref(1, 2, nullptr)));
}

TEST(ListedRefs, NamesAreBytes) {
    ListedRefs refs;
    refs.Add(entry_ref(1, 2, "\xFF\xFE.mp3"));

    EXPECT_TRUE(refs.Has(entry_ref(1, 2, "\xFF\xFE.mp3")));
    EXPECT_FALSE(refs.Has(entry_ref(1, 2, "\xFF\xFD.mp3")));
}

TEST(ListedRefs, AFileWithTwoRowsIsListedUntilBothHaveGone) {
    ListedRefs refs;
    const entry_ref ref(1, 2, "song.mp3");
    refs.Add(ref);
    refs.Add(ref);

    refs.Remove(ref);
    EXPECT_TRUE(refs.Has(ref));
    refs.Remove(ref);
    EXPECT_FALSE(refs.Has(ref));
    refs.Remove(ref);
    EXPECT_FALSE(refs.Has(ref)) << "removing what is not there does nothing";
}

TEST(ListedRefs, ARefWithoutANameIsAFileLikeAnyOther) {
    ListedRefs refs;
    refs.Add(entry_ref(1, 2, nullptr));

    EXPECT_TRUE(refs.Has(entry_ref(1, 2, nullptr)));
    refs.Remove(entry_ref(1, 2, nullptr));
    EXPECT_FALSE(refs.Has(entry_ref(1, 2, nullptr)));
}

TEST(ListedRefs, ClearForgetsAll) {
    ListedRefs refs;
    refs.Add(entry_ref(1, 2, "a"));
    refs.Add(entry_ref(1, 2, "b"));
    refs.Clear();

    EXPECT_FALSE(refs.Has(entry_ref(1, 2, "a")));
    EXPECT_FALSE(refs.Has(entry_ref(1, 2, "b")));
}

} // namespace
