// The list's columns, rows, keys and menus.
#include "PlayListStage.h"

#include "gui/ColumnListView/CLVColumn.h"
#include "playlist/FolderMenu.h"
#include "support/random_seed.h"

#include <Menu.h>
#include <MenuItem.h>

#include <random>

namespace {

class PlayList : public PlayListStage {
  protected:
    static Names NamesFromTo(int from, int to) {
        Names names;
        for (int i = from; i <= to; ++i)
            names.push_back(std::to_string(i) + ".mp3");
        return names;
    }
};

TEST_F(PlayList, HasSixColumnsThatCanBeSortedBy) {
    const struct {
        const char* label;
        float width, minWidth;
    } columns[] = {{"", 20, 10},          {"No", 30, 10},      {"Time", 35, 35},
                   {"Songname", 150, 10}, {"Artist", 150, 10}, {"Album", 150, 10}};
    Locked([&] {
        ASSERT_EQ(mList->CountColumns(), 6);
        for (int32 i = 0; i < 6; ++i) {
            const CLVColumn* const column = mList->ColumnAt(i);
            EXPECT_STREQ(column->GetLabel(), columns[i].label);
            EXPECT_EQ(column->Width(), columns[i].width) << columns[i].label;
            EXPECT_EQ(column->MinWidth(), columns[i].minWidth) << columns[i].label;
            EXPECT_EQ(column->Flags(), CLV_COLUMN_SORTABLE) << columns[i].label;
        }
        EXPECT_STREQ(mList->Name(), "playlist");
        EXPECT_EQ(mList->ListType(), B_MULTIPLE_SELECTION_LIST);
        EXPECT_TRUE(mList->IsHierarchical());
        EXPECT_EQ(mList->Flags() & (B_WILL_DRAW | B_PULSE_NEEDED | B_FRAME_EVENTS | B_NAVIGABLE),
                  B_WILL_DRAW | B_PULSE_NEEDED | B_FRAME_EVENTS | B_NAVIGABLE);
        EXPECT_FALSE(mList->AntsRect().IsValid());
    });
}

TEST_F(PlayList, AFileIsListedOnce) {
    const std::string song = MakeSong("a.mp3", "A");
    AddFile(song);
    AddFile(MakeSong("b.mp3", "B"));
    AddFile(song);
    EXPECT_EQ(Rows(), (Names{"a.mp3", "b.mp3"}));
}

TEST_F(PlayList, NothingIsAskedOfTheKindOfFile) {
    AddFile(MakeFile("letter.txt"));
    entry_ref missing = RefOf(MakeFile("missing.mp3"));
    std::filesystem::remove(Volume() + "/missing.mp3");
    Locked([&] { mList->AddToList(&missing); });
    EXPECT_EQ(Rows(), (Names{"letter.txt", "missing.mp3"}));
    Locked([&] { mList->AddToList(nullptr); });
    EXPECT_EQ(Rows().size(), 2u);
}

TEST_F(PlayList, ANewRowComesLastHoweverTheListIsSorted) {
    AddFile(MakeSong("b.mp3", "B"));
    AddFile(MakeSong("a.mp3", "A"));
    Locked([&] { mList->SetSortKey(kColumnSongname); });
    EXPECT_EQ(Rows(), (Names{"a.mp3", "b.mp3"}));
    AddFile(MakeSong("0.mp3", "0"));
    EXPECT_EQ(Rows(), (Names{"a.mp3", "b.mp3", "0.mp3"}));
}

TEST_F(PlayList, IsSortedByArtistThenSongname) {
    const struct {
        const char *file, *artist, *name;
    } songs[] = {{"1.mp3", "b", "x"}, {"2.mp3", "B", "z"}, {"3.mp3", "b", "X"}, {"4.mp3", "A", "y"}};
    for (const auto& song : songs) {
        const std::string path = MakeSong(song.file, song.name);
        SetText(path, "Audio:Artist", song.artist);
        AddFile(path);
    }
    Locked([&] {
        mList->SetSortKey(kColumnArtist);
        mList->AddSortKey(kColumnSongname);
    });
    EXPECT_EQ(Rows(), (Names{"4.mp3", "2.mp3", "3.mp3", "1.mp3"}));
}

TEST_F(PlayList, RemovingTheSecondAndFifthOfSixSelectsTheOneBehindTheSecond) {
    Fill(6);
    Select({1, 4});
    Locked([&] { mList->RemoveSelection(); });
    EXPECT_EQ(Rows(), (Names{"0.mp3", "2.mp3", "3.mp3", "5.mp3"}));
    EXPECT_EQ(Selection(), Numbers{1}) << "2.mp3, which was the third";
}

TEST_F(PlayList, RemovingTheLastRowsSelectsNothing) {
    Fill(3);
    Select({1, 2});
    Locked([&] { mList->RemoveSelection(); });
    EXPECT_EQ(Rows(), Names{"0.mp3"});
    EXPECT_EQ(Selection(), Numbers{});
}

TEST_F(PlayList, DeleteRemovesTheSelection) {
    Fill(4);
    Select({0, 2});
    Key("\x7F", host::KeyName::del);
    EXPECT_EQ(Rows(), (Names{"1.mp3", "3.mp3"}));
    EXPECT_EQ(Selection(), Numbers{0});
}

TEST_F(PlayList, DeleteWithNothingSelectedRemovesAndSelectsNothing) {
    Fill(3);
    Select({});
    Key("\x7F", host::KeyName::del);
    EXPECT_EQ(Rows(), NamesFromTo(0, 2));
    EXPECT_EQ(Selection(), Numbers{});
}

TEST_F(PlayList, WhatWasRemovedCanBeAddedAgain) {
    const std::string song = MakeSong("a.mp3", "A");
    AddFile(song);
    Select({0});
    Locked([&] { mList->RemoveSelection(); });
    EXPECT_EQ(Rows(), Names{});
    AddFile(song);
    AddFile(song);
    EXPECT_EQ(Rows(), Names{"a.mp3"});
    Locked([&] { mList->MakeEmpty(); });
    EXPECT_EQ(Rows(), Names{});
    AddFile(song);
    EXPECT_EQ(Rows(), Names{"a.mp3"});
}

// Whichever way rows come and go, a file is refused exactly as long as one of them is its.
TEST_F(PlayList, KnowsItsFilesWhicheverWayRowsComeAndGo) {
    Fill(12);
    std::vector<entry_ref> refs;
    for (int i = 0; i < 12; ++i)
        refs.push_back(RefOf(Volume() + "/" + std::to_string(i) + ".mp3"));
    std::vector<std::unique_ptr<PlayListItem>> own;
    std::mt19937 random(static_cast<std::mt19937::result_type>(RandomSeed()));
    const auto pick = [&](int32 count) { return static_cast<int32>(random() % static_cast<uint32>(count)); };
    for (int step = 0; step < 400; ++step) {
        Locked([&] {
            const int32 count = mList->CountItems();
            const auto make = [&] {
                own.push_back(std::make_unique<PlayListItem>(&refs[static_cast<size_t>(pick(12))]));
                return own.back().get();
            };
            switch (pick(8)) {
            case 0:
                mList->AddToList(&refs[static_cast<size_t>(pick(12))]);
                break;
            case 1:
                mList->AddItem(make());
                break;
            case 2:
                mList->AddItem(make(), pick(count + 1));
                break;
            case 3:
                if (count > 0)
                    mList->AddUnder(make(), mList->ItemAt(pick(count)));
                break;
            case 4: {
                BList items;
                items.AddItem(make());
                items.AddItem(make());
                mList->AddList(&items);
                break;
            }
            case 5:
                mList->RemoveItem(pick(count + 1));
                break;
            case 6:
                if (count > 0)
                    mList->RemoveItem(mList->ItemAt(pick(count)));
                break;
            default:
                mList->RemoveItems(pick(count + 1), pick(4));
            }
            for (entry_ref& ref : refs) {
                bool listed = false;
                for (int32 i = 0; i < mList->FullListCountItems(); ++i) {
                    entry_ref other;
                    static_cast<PlayListItem*>(mList->FullListItemAt(i))->GetRef(&other);
                    listed = listed || other == ref;
                }
                const int32 before = mList->FullListCountItems();
                mList->AddToList(&ref);
                ASSERT_EQ(mList->FullListCountItems(), listed ? before : before + 1) << "step " << step;
                if (!listed)
                    mList->RemoveItem(before);
            }
        });
        if (HasFatalFailure())
            break;
    }
    // The rows must outlive the list, which knows nothing of them.
    Locked([&] { mList->MakeEmpty(); });
}

TEST_F(PlayList, ReturnDoesNothing) {
    Fill(2);
    Select({1});
    Key("\n", host::KeyName::enter);
    EXPECT_EQ(Rows().size(), 2u);
    EXPECT_EQ(Selection(), Numbers{1});
}

TEST_F(PlayList, TheArrowsMoveTheSelection) {
    Fill(4);
    Select({1});
    Key("", host::KeyName::down);
    EXPECT_EQ(Selection(), Numbers{2});
    Key("", host::KeyName::down, host::shift_modifier);
    EXPECT_EQ(Selection(), (Numbers{2, 3}));
    Key("", host::KeyName::home);
    EXPECT_EQ(Selection(), Numbers{0});
}

TEST_F(PlayList, TheSystemsSelectAllSelectsAllRows) {
    Fill(5);
    Select({2});
    BMessenger(mList).SendMessage(B_SELECT_ALL);
    Settle();
    EXPECT_EQ(Selection(), (Numbers{0, 1, 2, 3, 4}));
    Select({2});
    Key("a", host::KeyName::none, host::control_modifier);
    // The window has posted the command behind.
    Settle();
    EXPECT_EQ(Selection(), (Numbers{0, 1, 2, 3, 4}));
}

TEST_F(PlayList, SelectAllInAnEmptyListIsNothing) {
    BMessenger(mList).SendMessage(B_SELECT_ALL);
    Settle();
    EXPECT_EQ(Selection(), Numbers{});
}

TEST_F(PlayList, TheEditMenuKnowsEightThings) {
    BMenu menu("Edit");
    Locked([&] { mList->MakeAndMaintainEditMenu(&menu); });
    const struct {
        const char* label;
        uint32 code;
        char shortcut;
        bool enabled;
    } items[] = {
        {"Cut", B_CUT, 'X', false},     {"Copy", B_COPY, 'C', false},       {"Paste", B_PASTE, 'V', false},
        {"Select All", 708, 'A', true}, {"Remove from list", 707, 0, true}, {nullptr, 0, 0, false},
        {"Edit info", 705, 'I', true},  {"Move to trash", 706, 'T', false},
    };
    ASSERT_EQ(menu.CountItems(), 8);
    for (int32 i = 0; i < 8; ++i) {
        const BMenuItem* const item = menu.ItemAt(i);
        if (items[i].label == nullptr) {
            EXPECT_NE(dynamic_cast<const BSeparatorItem*>(item), nullptr);
            continue;
        }
        EXPECT_STREQ(item->Label(), items[i].label);
        EXPECT_EQ(item->Command(), items[i].code) << items[i].label;
        uint32 modifiers = 0;
        EXPECT_EQ(item->Shortcut(&modifiers), items[i].shortcut) << items[i].label;
        EXPECT_EQ(item->IsEnabled(), items[i].enabled) << items[i].label;
    }
}

TEST_F(PlayList, UpdatingTheEditMenuDisablesFourItemsAndNotEditInfo) {
    BMenu menu("Edit");
    Locked([&] { mList->MakeAndMaintainEditMenu(&menu); });
    for (int32 i = 0; i < menu.CountItems(); ++i)
        menu.ItemAt(i)->SetEnabled(true);
    Locked([&] { mList->UpdateEditMenu(); });
    std::string disabled;
    for (const int32 i : {0, 1, 2, 3, 4, 6, 7})
        disabled += menu.ItemAt(i)->IsEnabled() ? "" : std::string(menu.ItemAt(i)->Label()) + ", ";
    EXPECT_EQ(disabled, "Cut, Copy, Paste, Move to trash, ");
}

TEST_F(PlayList, WithoutAMenuThereIsNothingToUpdate) {
    Locked([&] {
        mList->UpdateEditMenu();
        mList->MakeAndMaintainEditMenu(nullptr);
    });
}

TEST_F(PlayList, TheEditMenusOwnCodesAreHandledByNobody) {
    Fill(3);
    Select({1});
    for (const uint32 code : {705u, 706u, 707u, 708u}) {
        BMessage reply;
        BMessenger(mList).SendMessage(code, &reply);
        EXPECT_EQ(reply.what, uint32{B_MESSAGE_NOT_UNDERSTOOD}) << code;
    }
    EXPECT_EQ(Rows().size(), 3u);
    EXPECT_EQ(Selection(), Numbers{1});
}

TEST_F(PlayList, AFilesMenuHoldsItAndItsFoldersUpToTheRoot) {
    char folder[] = "/tmp/playlist-XXXXXX";
    ASSERT_NE(mkdtemp(folder), nullptr);
    std::filesystem::create_directory(std::string(folder) + "/below");
    const std::string path = std::string(folder) + "/below/song.mp3";
    std::ofstream(path) << "not music";
    {
        BMenu menu("popup");
        AddFileAndFolders(menu, RefOf(path));
        Names labels;
        for (int32 i = 0; i < menu.CountItems(); ++i) {
            labels.emplace_back(menu.ItemAt(i)->Label());
            EXPECT_EQ(menu.ItemAt(i)->IsEnabled(), i > 0) << labels.back();
        }
        // The root is the folder that calls itself ".".
        EXPECT_EQ(labels, (Names{"song.mp3", "below", std::string(folder).substr(5), "tmp", "Desktop"}));
    }
    std::filesystem::remove_all(folder);
}

} // namespace
