// Send-to titles shortened to the popup's width, with their suffix kept and localised.
#include <gtest/gtest.h>

#include <QApplication>
#include <QFontMetricsF>

#include "ui/chat_menu_item.h"

namespace {

float Width(const ChatMenuItem& item) {
    return static_cast<float>(QFontMetricsF(item.font()).horizontalAdvance(item.text()));
}

// A title that fits is shown whole, in the colour of the item's state at the last compression.
TEST(ChatMenuItem, TitleThatFitsOrHasNoRoomIsShownWholeInTheColourOfItsState) {
    ChatMenuItem item("Ann", ChatItemAction::Select);
    item.compressTitlewithWidth(300);
    EXPECT_EQ(item.text(), "Ann");
    EXPECT_FALSE(item.isCompressed());
    EXPECT_TRUE(item.toolTip().isEmpty());
    EXPECT_EQ(item.foreground().color(), QColor(Qt::black));
    item.setEnabled(false);
    EXPECT_EQ(item.foreground().color(), QColor(Qt::black));
    item.compressTitlewithWidth(300);
    EXPECT_EQ(item.foreground().color(), QColor(Qt::gray));

    // No room at all leaves the title whole but marks it shortened.
    ChatMenuItem group("All Attendees (internal)", ChatItemAction::Select);
    group.setIsGroup(true);
    group.setFullTitle("All Attendees (internal)");
    group.compressTitlewithWidth(40.0f - 40.0f);
    EXPECT_TRUE(group.isCompressed());
    EXPECT_EQ(group.text(), "All Attendees (internal)");
    EXPECT_EQ(group.toolTip(), "All Attendees (internal)");
}

TEST(ChatMenuItem, LongTitleIsShortenedWithAnEllipsisToFit) {
    const QString name = "Maximiliane Katharina von Hohenzollern-Sigmaringen";
    for (const float width : {60.0f, 120.0f, 200.0f}) {
        ChatMenuItem item(name, ChatItemAction::Select);
        item.setFullTitle(name);
        item.compressTitlewithWidth(width);
        EXPECT_TRUE(item.isCompressed());
        EXPECT_TRUE(item.text().endsWith("...")) << item.text().toStdString();
        EXPECT_TRUE(name.startsWith(item.text().chopped(3)));
        EXPECT_LT(Width(item), width);
        EXPECT_EQ(item.toolTip(), name);
    }
}

TEST(ChatMenuItem, SuffixWithACommaIsCutAtTheCommaAndTheNameShortened) {
    const QString title = "Panelists of the quarterly review (host, presenter, panelists)";
    ChatMenuItem item(title, ChatItemAction::Select);
    item.setIsGroup(true);
    item.setFullTitle(title);
    item.compressTitlewithWidth(180);
    EXPECT_TRUE(item.isCompressed());
    EXPECT_TRUE(item.text().endsWith("... (host...)")) << item.text().toStdString();
    EXPECT_LT(Width(item), 180.0f);
    // Only the last parenthesised part is the suffix.
    QString base;
    QString suffix;
    ASSERT_TRUE(SplitTitleSuffix("a (b) (c, d)", &base, &suffix));
    EXPECT_EQ(base, "a (b)");
    EXPECT_EQ(suffix, " (c, d)");
    EXPECT_FALSE(SplitTitleSuffix("plain", &base, &suffix));
}

TEST(ChatMenuItem, SurrogatePairsAreNeverSplit) {
    QString title;
    for (int i = 0; i < 40; ++i)
        title += QString::fromUcs4(U"\U0001F600");
    ChatMenuItem item(title, ChatItemAction::Select);
    item.compressTitlewithWidth(90);
    const QString shown = item.text().chopped(3);
    EXPECT_TRUE(item.isCompressed());
    EXPECT_EQ(shown.size() % 2, 0);
    EXPECT_TRUE(title.startsWith(shown));
}

}  // namespace
