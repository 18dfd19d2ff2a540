// A song that goes away while it is being found.
#include "host/linux/system_calls.h"
#include "metadata/BrindleMetaData.h"
#include "search/FindWindowStage.h"

#include <OS.h>

#include <cstring>
#include <filesystem>

namespace {

constexpr char kLeaf[] = "gone.mp3";

// Removes the song before or after a call for it.
class Thief : public host::SystemCalls {
  public:
    enum class Moment { beforeTheLook, beforeTheOpening, afterTheOpening };
    Thief(Moment moment, std::string path) : mMoment(moment), mPath(std::move(path)) {}

    int fstatat(int directory, const char* path, struct stat* result, int flags) override {
        if (mMoment == Moment::beforeTheLook && strcmp(path, kLeaf) == 0)
            Steal();
        return SystemCalls::fstatat(directory, path, result, flags);
    }
    int openat(int directory, const char* path, int flags, mode_t mode) override {
        const bool wanted = strcmp(path, kLeaf) == 0;
        if (wanted && mMoment == Moment::beforeTheOpening)
            Steal();
        const int descriptor = SystemCalls::openat(directory, path, flags, mode);
        if (wanted && mMoment == Moment::afterTheOpening)
            Steal();
        return descriptor;
    }
    bool Struck() const { return mStruck; }

  private:
    void Steal() {
        mStruck = true;
        std::filesystem::remove(mPath);
    }
    const Moment mMoment;
    const std::string mPath;
    bool mStruck = false;
};

class VanishingHit : public FindWindowStage {
  protected:
    std::vector<std::string> Songs() {
        std::vector<std::string> songs;
        WithWindow([&] {
            for (int32 i = 0; i < mWindow->List()->CountItems(); ++i)
                songs.emplace_back(
                    static_cast<PlayListItem*>(mWindow->List()->ItemAt(i))->MetaData().mSongname);
        });
        return songs;
    }
};

TEST_F(VanishingHit, LeavesTheOthersListed) {
    const struct {
        const char* what;
        Thief::Moment moment;
        Names rows;
        std::vector<std::string> songs;
    } cases[] = {
        {"before it is looked at", Thief::Moment::beforeTheLook, {"a.mp3", "z.mp3"}, {"Race a", "Race z"}},
        {"before its row opens it",
         Thief::Moment::beforeTheOpening,
         {"a.mp3", "gone.mp3", "z.mp3"},
         {"Race a", "", "Race z"}},
        {"once its row has opened it",
         Thief::Moment::afterTheOpening,
         {"a.mp3", "gone.mp3", "z.mp3"},
         {"Race a", "Race gone", "Race z"}},
    };
    Open();
    for (const auto& expected : cases) {
        SCOPED_TRACE(expected.what);
        MakeSong("a.mp3", "Race a");
        const std::string path = MakeSong(kLeaf, "Race gone");
        MakeSong("z.mp3", "Race z");
        ASSERT_EQ(Find("Race"), (Names{"a.mp3", "gone.mp3", "z.mp3"}));
        // Rows that were read within the clock's tick of a change are not relied upon: the index then opens
        // the file, too.
        snooze(30'000);
        ASSERT_EQ(Find("Race"), (Names{"a.mp3", "gone.mp3", "z.mp3"}));
        {
            Thief thief(expected.moment, path);
            const host::ScopedSystemCalls scope(thief);
            EXPECT_EQ(Find("Race"), expected.rows);
            EXPECT_TRUE(thief.Struck());
        }
        EXPECT_EQ(Songs(), expected.songs);
        EXPECT_EQ(Find("Race"), (Names{"a.mp3", "z.mp3"}));
        for (const char* leaf : {"a.mp3", "z.mp3"})
            std::filesystem::remove(path.substr(0, path.rfind('/') + 1) + leaf);
    }
}

} // namespace
