#include "MenuTriggers.h"

#include <InterfaceDefs.h>

#include <gtest/gtest.h>

namespace {

std::string Letters(const std::vector<MenuTriggerWish>& wishes) {
    std::string letters;
    for (const MenuTrigger& trigger : choose_triggers(wishes)) {
        letters += trigger.letter == 0 ? '-' : trigger.letter;
    }
    return letters;
}

TEST(MenuTriggers, EveryItemGetsTheFirstCapitalThatIsFree) {
    EXPECT_EQ("fcp", Letters({{"Find song..."}, {"Close"}, {"Copy Path"}}));
}

TEST(MenuTriggers, WithoutAFreeCapitalAnyLetterOrDigitWillDo) {
    EXPECT_EQ("cl1-", Letters({{"Close"}, {"Cl1"}, {"cl1"}, {"Cl"}}));
}

TEST(MenuTriggers, AWishIsGrantedAndKeptFromTheOthers) {
    const std::vector<MenuTrigger> triggers = choose_triggers({{"Find"}, {"Forget", 'F'}});

    EXPECT_EQ('i', triggers[0].letter);
    EXPECT_EQ(1, triggers[0].position);
    EXPECT_EQ('f', triggers[1].letter);
    EXPECT_EQ(0, triggers[1].position);
}

TEST(MenuTriggers, AWishThatIsNotInTheLabelHasNoPlaceToBeUnderlined) {
    const std::vector<MenuTrigger> triggers = choose_triggers({{"Find", 'x'}});

    EXPECT_EQ('x', triggers[0].letter);
    EXPECT_EQ(-1, triggers[0].position);
}

TEST(MenuTriggers, LabelsWithoutLettersGetNone) {
    const std::vector<MenuTrigger> triggers = choose_triggers({{""}, {"..."}, {"\xC3\x84\xC3\x96"}});

    EXPECT_EQ(0, triggers[0].letter);
    EXPECT_EQ(0, triggers[1].letter);
    EXPECT_EQ(0, triggers[2].letter);
    EXPECT_EQ(-1, triggers[2].position);
}

TEST(MenuTriggers, PositionsCountBytes) {
    const std::vector<MenuTrigger> triggers = choose_triggers({{"\xC3\x84 B"}});

    EXPECT_EQ('b', triggers[0].letter);
    EXPECT_EQ(3, triggers[0].position);
}

TEST(MenuTriggers, ShortcutsShowControlForBothKeysThatItCountsAs) {
    EXPECT_EQ("Ctrl+F", shortcut_text('F', B_COMMAND_KEY));
    EXPECT_EQ("Ctrl+F", shortcut_text('f', B_COMMAND_KEY | B_CONTROL_KEY));
    EXPECT_EQ("Ctrl+Shift+Z", shortcut_text('Z', B_COMMAND_KEY | B_SHIFT_KEY));
    EXPECT_EQ("Ctrl+Alt+1", shortcut_text('1', B_COMMAND_KEY | B_OPTION_KEY));
    EXPECT_EQ("Ctrl+Super+A", shortcut_text('A', B_COMMAND_KEY | B_MENU_KEY));
}

TEST(MenuTriggers, ShortcutsNameKeysThatPrintNothing) {
    EXPECT_EQ("Ctrl+Del", shortcut_text(B_DELETE, B_COMMAND_KEY));
    EXPECT_EQ("Ctrl+Enter", shortcut_text(B_ENTER, B_COMMAND_KEY));
    EXPECT_EQ("Ctrl+Page Up", shortcut_text(B_PAGE_UP, B_COMMAND_KEY));
    EXPECT_EQ("Ctrl+Left", shortcut_text(B_LEFT_ARROW, B_COMMAND_KEY));
    EXPECT_EQ("Ctrl+Space", shortcut_text(B_SPACE, B_COMMAND_KEY));
}

} // namespace
