// A directory with very many entries, as a full tier: making the files takes its time.
#include "VolumeJobs.h"

#include <fcntl.h>
#include <unistd.h>

namespace {

class LargeDirectory : public TrackTest {};

TEST_F(LargeDirectory, IsTaggedAndStrippedToItsLastFile) {
    constexpr int kFiles = 200000;
    for (int i = 0; i < kFiles; ++i) {
        const std::string path = Volume() + "/Artist - " + std::to_string(i) + ".mp3";
        const int file = open(path.c_str(), O_CREAT | O_WRONLY | O_CLOEXEC, 0644);
        ASSERT_GE(file, 0);
        close(file);
    }
    const auto item = MakeItem(Volume());

    item->IndexAttributes();
    EXPECT_TRUE(WaitUntil([&] { return item->IsDone(); }, 600000000));

    EXPECT_EQ(StatusTextOf(*item), "Indexed 200000 files");
    int tagged = 0;
    for (int i = 0; i < kFiles; ++i)
        tagged +=
            Text(Volume() + "/Artist - " + std::to_string(i) + ".mp3", "Audio:Songname") == std::to_string(i);
    EXPECT_EQ(tagged, kFiles);

    item->EraseAttributes();
    EXPECT_TRUE(WaitUntil([&] { return item->IsDone(); }, 600000000));

    EXPECT_EQ(StatusTextOf(*item), "Striped 200000 files");
    EXPECT_TRUE(AttributeNames(Volume() + "/Artist - 0.mp3").empty());
    EXPECT_TRUE(AttributeNames(Volume() + "/Artist - 199999.mp3").empty());
}

} // namespace
