// Dragging files into the list: when the walking ants show, what is taken in, and what is left on the screen.
#include "PlayListStage.h"

#include <Node.h>
#include <NodeInfo.h>

namespace {

constexpr BPoint kIn(200, 120);
constexpr BPoint kElsewhereIn(220, 140);

class PlayListDrop : public PlayListStage {
  protected:
    using Kind = host::DragInput::Kind;

    static std::string MakeTyped(const std::string& path, const char* type) {
        const std::string full = MakeFile(path);
        const entry_ref ref = RefOf(full);
        BNode node(&ref);
        EXPECT_EQ(BNodeInfo(&node).SetType(type), B_OK);
        return full;
    }
    static std::shared_ptr<const host::DataFormats> FilesOf(const Names& paths) {
        host::DataFormats data;
        std::string list;
        for (const std::string& path : paths)
            list += UriOfPath(path) + "\r\n";
        data.set("text/uri-list", list);
        return std::make_shared<const host::DataFormats>(data);
    }
    static std::shared_ptr<const host::DataFormats> TextOnly() {
        host::DataFormats data;
        data.set("text/plain", "no files");
        return std::make_shared<const host::DataFormats>(data);
    }
    void Drag(Kind kind, const std::shared_ptr<const host::DataFormats>& data, BPoint where) {
        const BPoint inWindow = InList(where);
        host::DragInput input;
        input.kind = kind;
        input.where = {static_cast<double>(inWindow.x), static_cast<double>(inWindow.y)};
        input.on_screen = OnScreen(inWindow);
        input.buttons = kind == Kind::dropped ? 0 : 1;
        input.data = kind == Kind::left ? nullptr : data;
        mEvents->drag(input);
        Settle();
    }
    void Enter(const std::shared_ptr<const host::DataFormats>& data, BPoint where = kIn) {
        Drag(Kind::entered, data, where);
    }
    void Move(const std::shared_ptr<const host::DataFormats>& data, BPoint where) {
        Drag(Kind::moved, data, where);
    }
    void Leave() { Drag(Kind::left, nullptr, BPoint(-50, -50)); }
    void Drop(const std::shared_ptr<const host::DataFormats>& data, BPoint where = kIn) {
        Drag(Kind::dropped, data, where);
    }
    void MoveWithoutDrag(BPoint where) {
        TellPointer(host::PointerInput::Kind::moved, InList(where), 0);
        Settle();
    }
    bool AntsShow() {
        return Locked([&] { return mList->AntsAreVisible(); });
    }
    void Pulse() {
        mWindow->PostMessage(B_PULSE);
        Settle();
    }
    // What the list shows, as its pixels.
    std::vector<uint32> Pixels() {
        return Locked([&] {
            mWindow->UpdateIfNeeded();
            const PixelSurface surface = mWindow->Host()->Surface();
            const BRect bounds = mList->Bounds();
            const BPoint corner = mList->ConvertToScreen(bounds.LeftTop()) - mWindow->Frame().LeftTop();
            std::vector<uint32> pixels;
            for (auto y = static_cast<int32>(corner.y); y <= static_cast<int32>(corner.y + bounds.Height());
                 ++y) {
                const auto* const row = reinterpret_cast<const uint32*>(surface.Row(y));
                pixels.insert(pixels.end(), row + static_cast<int32>(corner.x),
                              row + static_cast<int32>(corner.x + bounds.Width()) + 1);
            }
            return pixels;
        });
    }

    const std::string mSong = MakeTyped("song.mp3", "audio/x-mpeg");
    const std::string mLetter = MakeTyped("letter.txt", "text/plain");
};

TEST_F(PlayListDrop, AudioFilesAreTakenInWhereTheAntsShow) {
    const auto files = FilesOf({mSong, mLetter, MakeTyped("second.mp3", "audio/x-mpeg")});
    Enter(files);
    EXPECT_TRUE(AntsShow());
    EXPECT_EQ(Locked([&] { return mList->AntsRect(); }),
              Locked([&] { return mList->Bounds().InsetByCopy(1, 1); }));
    Drop(files);
    EXPECT_FALSE(AntsShow());
    EXPECT_EQ(Rows(), (Names{"song.mp3", "letter.txt", "second.mp3"})) << "only the first is looked at";
}

TEST_F(PlayListDrop, WhatIsListedIsSkipped) {
    AddFile(mSong);
    const auto files = FilesOf({mSong, MakeTyped("second.mp3", "audio/x-mpeg"), mSong});
    Enter(files);
    Drop(files);
    EXPECT_EQ(Rows(), (Names{"song.mp3", "second.mp3"}));
}

TEST_F(PlayListDrop, WhetherAudioIsBeforeTheSlashOfTheType) {
    const struct {
        const char* type;
        bool taken;
    } cases[] = {{"audio/x-mpeg", true},   {"audio/x-anything", true}, {"audio", true},
                 {"audiobook/mp3", false}, {"text/audio", false},      {"video/mpeg", false}};
    for (const auto& expected : cases) {
        const std::string path = MakeTyped("typed", expected.type);
        // A list of its own, as a list never forgets that it has had audio over it.
        const BAutolock lock(mWindow);
        CLVContainerView* container = nullptr;
        auto* const list = new PlayListView(BRect(0, 0, 100, 100), &container);
        mWindow->AddChild(container);
        BMessage drag(B_SIMPLE_DATA);
        const entry_ref ref = RefOf(path);
        drag.AddRef("refs", &ref);
        list->MouseMoved(BPoint(50, 50), B_ENTERED_VIEW, &drag);
        EXPECT_EQ(list->AntsAreVisible(), expected.taken) << expected.type;
        mWindow->RemoveChild(container);
        delete container;
    }
}

TEST_F(PlayListDrop, AFileWithoutATypeIsWhatItSeemsToBe) {
    const auto untyped = FilesOf({MakeFile("untyped.mp3")});
    Enter(FilesOf({MakeFile("untyped.txt")}));
    EXPECT_FALSE(AntsShow());
    Leave();
    Enter(untyped);
    EXPECT_TRUE(AntsShow());
}

TEST_F(PlayListDrop, AFirstFileThatIsNoAudioIsNotTakenIn) {
    const auto files = FilesOf({mLetter, mSong});
    Enter(files);
    EXPECT_FALSE(AntsShow());
    Move(files, kElsewhereIn);
    EXPECT_FALSE(AntsShow());
    Drop(files);
    EXPECT_EQ(Rows(), Names{});
}

TEST_F(PlayListDrop, AfterAudioHasBeenThereOtherFilesAreTakenInToo) {
    const auto audio = FilesOf({mSong});
    Enter(audio);
    Leave();
    EXPECT_FALSE(AntsShow());
    const auto letter = FilesOf({mLetter});
    Enter(letter);
    EXPECT_TRUE(AntsShow()) << "the frame of the last audio files is still known";
    Drop(letter);
    EXPECT_EQ(Rows(), Names{"letter.txt"});
}

TEST_F(PlayListDrop, WhatLeavesAndComesBackIsTakenIn) {
    const auto files = FilesOf({mSong});
    Enter(files);
    Leave();
    EXPECT_FALSE(AntsShow());
    Enter(files);
    EXPECT_TRUE(AntsShow());
    Drop(files);
    EXPECT_EQ(Rows(), Names{"song.mp3"});
}

TEST_F(PlayListDrop, WhatLeavesForGoodIsNot) {
    Enter(FilesOf({mSong}));
    Leave();
    MoveWithoutDrag(kIn);
    Click(InList(kIn));
    EXPECT_EQ(Rows(), Names{});
}

TEST_F(PlayListDrop, WhatLeavesByTheMarginIsStillTakenInWhereThePointerReturns) {
    const auto files = FilesOf({mSong});
    Enter(files);
    Move(files, BPoint(0, 120));
    Leave();
    EXPECT_FALSE(AntsShow());
    MoveWithoutDrag(kIn);
    EXPECT_TRUE(AntsShow());
    Release(InList(kIn));
    EXPECT_FALSE(AntsShow());
    EXPECT_EQ(Rows(), Names{"song.mp3"});
}

TEST_F(PlayListDrop, WithoutFilesNothingHappens) {
    Enter(TextOnly());
    EXPECT_FALSE(AntsShow());
    Drop(TextOnly());
    EXPECT_EQ(Rows(), Names{});
    // Also where audio files have been.
    Enter(FilesOf({mSong}));
    Leave();
    Enter(TextOnly());
    EXPECT_FALSE(AntsShow());
    Drop(TextOnly());
    EXPECT_EQ(Rows(), Names{});
}

TEST_F(PlayListDrop, AFileThatHasGoneIsNoAudio) {
    BMessage drag(B_SIMPLE_DATA);
    const entry_ref ref = RefOf(mSong);
    drag.AddRef("refs", &ref);
    std::filesystem::remove(mSong);
    Locked([&] { mList->MouseMoved(kIn, B_ENTERED_VIEW, &drag); });
    EXPECT_FALSE(AntsShow());
}

TEST_F(PlayListDrop, TheAntsHideAtTheMarginAndReturn) {
    const auto files = FilesOf({mSong});
    Enter(files);
    Move(files, BPoint(0, 120));
    EXPECT_FALSE(AntsShow());
    Move(files, BPoint(1, 120));
    EXPECT_TRUE(AntsShow());
    Move(files, BPoint(0, 120));
    Drop(files, BPoint(0, 120));
    EXPECT_EQ(Rows(), Names{}) << "let go beside the frame";
}

TEST_F(PlayListDrop, TheFrameIsThatOfTheListAsItIsScrolled) {
    Fill(40);
    Locked([&] { mList->ScrollTo(BPoint(0, 210)); });
    Enter(FilesOf({mSong}), BPoint(200, 90));
    EXPECT_EQ(Locked([&] { return mList->AntsRect().top; }), 211);
}

TEST_F(PlayListDrop, TheAntsWalkWithEveryPulse) {
    Fill(3);
    const std::vector<uint32> before = Pixels();
    Pulse();
    EXPECT_EQ(Pixels(), before) << "nothing is dragged";
    Enter(FilesOf({mSong}));
    std::vector<std::vector<uint32>> steps;
    for (int i = 0; i < 9; ++i) {
        Pulse();
        steps.push_back(Pixels());
        EXPECT_NE(steps.back(), before);
    }
    EXPECT_NE(steps[1], steps[0]);
    EXPECT_EQ(steps[8], steps[0]);
}

TEST_F(PlayListDrop, NoTraceOfTheAntsStaysWhenTheDragGoes) {
    Fill(3);
    const std::vector<uint32> before = Pixels();
    Enter(FilesOf({mSong}));
    Pulse();
    Pulse();
    ASSERT_NE(Pixels(), before);
    Leave();
    EXPECT_EQ(Pixels(), before);
    Pulse();
    EXPECT_EQ(Pixels(), before);
}

TEST_F(PlayListDrop, NoTraceOfTheAntsStaysWhenTheDragGoesSlowly) {
    Fill(3);
    const std::vector<uint32> before = Pixels();
    const auto files = FilesOf({mSong});
    Enter(files);
    Pulse();
    Move(files, BPoint(0, 120));
    EXPECT_EQ(Pixels(), before);
    Leave();
    EXPECT_EQ(Pixels(), before);
}

TEST_F(PlayListDrop, NoTraceOfTheAntsStaysAfterADrop) {
    AddFile(mSong);
    const std::vector<uint32> before = Pixels();
    const auto files = FilesOf({mSong});
    Enter(files);
    Pulse();
    ASSERT_NE(Pixels(), before);
    Drop(files);
    EXPECT_EQ(Pixels(), before) << "the file is listed already";
    Pulse();
    EXPECT_EQ(Pixels(), before);
}

TEST_F(PlayListDrop, APulseLeavesTheWindowForOthersToLock) {
    Enter(FilesOf({mSong}));
    Pulse();
    EXPECT_EQ(mWindow->LockWithTimeout(5000000), B_OK);
    mWindow->Unlock();
}

} // namespace
