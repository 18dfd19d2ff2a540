// Alerts as they are laid out and drawn; what they answer needs a screen.
#include "AlertIcon.h"
#include "AlertLayout.h"

#include <Alert.h>
#include <Bitmap.h>

#include <gtest/gtest.h>

namespace {

// Every byte is ten pixels wide.
float TenEach(std::string_view text) {
    return 10 * static_cast<float>(text.size());
}

std::vector<std::string> Wrapped(std::string_view text, float width) {
    return wrapped_lines(text, width, &TenEach);
}

using Lines = std::vector<std::string>;

AlertContents Contents(std::vector<float> labelWidths, button_width width = B_WIDTH_AS_USUAL) {
    AlertContents contents;
    contents.hasIcon = true;
    contents.textWidth = 200;
    contents.textHeight = 45;
    contents.labelWidths = std::move(labelWidths);
    contents.buttonHeight = 24;
    contents.width = width;
    return contents;
}

std::vector<float> WidthsOf(const AlertLayout& layout) {
    std::vector<float> widths;
    for (const BRect& button : layout.buttons) {
        widths.push_back(button.Width());
    }
    return widths;
}

} // namespace

TEST(AlertText, LinesAreBrokenBetweenWords) {
    EXPECT_EQ((Lines{"one two", "three"}), Wrapped("one two three", 100));
    EXPECT_EQ((Lines{"one two three"}), Wrapped("one two three", 130));
}

TEST(AlertText, LineBreaksOfTheTextAreKept) {
    EXPECT_EQ((Lines{"one", "", "two", ""}), Wrapped("one\n\ntwo\n", 100));
    EXPECT_EQ((Lines{""}), Wrapped("", 100));
}

TEST(AlertText, AWordWiderThanTheLineIsBrokenBetweenCharacters) {
    EXPECT_EQ((Lines{"abcdef", "gh ij"}), Wrapped("abcdefgh ij", 60));
    EXPECT_EQ((Lines{"\xC3\xA4\xC3\xA4", "\xC3\xA4"}), Wrapped("\xC3\xA4\xC3\xA4\xC3\xA4", 50));
    EXPECT_EQ((Lines{"a", "b"}), Wrapped("ab", 1));
}

TEST(AlertLayout, ButtonsStandAtTheRightBelowTextAndIcon) {
    const AlertLayout layout = lay_out_alert(Contents({50, 50}));

    EXPECT_EQ(BRect(58, 12, 258, 57), layout.text);
    EXPECT_EQ(BRect(14, 12, 45, 43), layout.icon);
    ASSERT_EQ(2U, layout.buttons.size());
    EXPECT_EQ(BRect(213, 69, 288, 93), layout.buttons[1]);
    EXPECT_EQ(BRect(128, 69, 203, 93), layout.buttons[0]);
    EXPECT_EQ(BRect(0, 0, 300, 105), layout.bounds);
    EXPECT_EQ(BRect(0, 0, 30, 105), layout.stripe);
}

TEST(AlertLayout, ButtonsAreAsWideAsAsked) {
    EXPECT_EQ((std::vector<float>{75, 90}), WidthsOf(lay_out_alert(Contents({50, 90}))));
    EXPECT_EQ((std::vector<float>{90, 90}), WidthsOf(lay_out_alert(Contents({50, 90}, B_WIDTH_FROM_WIDEST))));
    EXPECT_EQ((std::vector<float>{50, 90}), WidthsOf(lay_out_alert(Contents({50, 90}, B_WIDTH_FROM_LABEL))));
}

TEST(AlertLayout, TheFirstOfThreeButtonsIsSetOffWhereAsked) {
    AlertContents contents = Contents({50, 50, 50});
    const AlertLayout even = lay_out_alert(contents);
    contents.offsetFirst = true;
    const AlertLayout offset = lay_out_alert(contents);

    EXPECT_EQ(10, even.buttons[1].left - even.buttons[0].right);
    EXPECT_EQ(40, offset.buttons[1].left - offset.buttons[0].right);
    EXPECT_EQ(10, offset.buttons[2].left - offset.buttons[1].right);
}

TEST(AlertLayout, AnAlertGrowsWithItsTextAndItsButtons) {
    AlertContents contents = Contents({50});
    contents.textWidth = 380;
    EXPECT_EQ(58 + 380 + 12, lay_out_alert(contents).bounds.right);

    contents = Contents({200, 200, 200});
    EXPECT_EQ(30 + 12 + 620 + 12, lay_out_alert(contents).bounds.right);
}

TEST(AlertLayout, WithoutAnIconTheTextStandsAtTheLeft) {
    AlertContents contents = Contents({50});
    contents.hasIcon = false;
    const AlertLayout layout = lay_out_alert(contents);

    EXPECT_EQ(12, layout.text.left);
    EXPECT_FALSE(layout.stripe.IsValid());
    EXPECT_FALSE(layout.icon.IsValid());
}

TEST(AlertIcon, EveryTypeButTheEmptyOneHasAPicture) {
    EXPECT_EQ(nullptr, alert_icon(B_EMPTY_ALERT));
    for (const alert_type type : {B_INFO_ALERT, B_IDEA_ALERT, B_WARNING_ALERT, B_STOP_ALERT}) {
        const std::unique_ptr<BBitmap> icon = alert_icon(type);
        ASSERT_NE(nullptr, icon);
        const auto* const pixels = static_cast<const uint32*>(icon->Bits());
        // Nothing in the corner, the sign in the middle.
        EXPECT_EQ(0U, pixels[0] >> 24);
        EXPECT_EQ(255U, pixels[64 * 128 + 64] >> 24);
    }
}
