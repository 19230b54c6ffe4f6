// The window's side of the engine's menu and input commands, the placeholder item included.
#include <QTest>
#include <tuple>

#include "tests/ui/window_fixture.h"
#include "ui/chat_menu_item.h"

namespace {

const std::string kPlaceholder = "--- Please Select ---";

// An insert appends without or past a position and makes any separator entry a separator; a
// rebuild keeps titled separator entries as items and shows disabled entries grey.
TEST_F(WindowTest, InsertAndRebuildMakeRowsWithoutReportingASelection) {
    Insert(Entry("Everyone", 15));
    Insert(Entry("Bob"), 7);
    Insert(Entry("Ann"), 0);
    Insert(SeparatorEntry("ignored"), 1);
    EXPECT_EQ(Rows(), (std::vector<std::string>{"Ann", "-", "Everyone", "Bob"}));
    EXPECT_TRUE(ChatMenuItem::From(window->userlist()->itemAtIndex(2))->isGroup());

    Rebuild({Entry("Everyone", 15), SeparatorEntry(), SeparatorEntry("Panelists"),
             Entry("Carl", -1, false)});
    EXPECT_EQ(Rows(), (std::vector<std::string>{"Everyone", "-", "Panelists", "Carl"}));
    QStandardItem* carl = window->userlist()->itemAtIndex(3);
    EXPECT_FALSE(carl->isEnabled());
    EXPECT_EQ(carl->foreground().color(), QColor(Qt::gray));
    EXPECT_TRUE(window->userlist()->itemAtIndex(0)->font().bold());
    // Removing from code never reports a selection by itself either.
    Command(msg_RemoveMenuItem, 9);
    Command(msg_RemoveMenuItem, -1);
    Command(msg_RemoveMenuItem, 1);
    EXPECT_EQ(Rows(), (std::vector<std::string>{"Everyone", "Panelists", "Carl"}));
    EXPECT_TRUE(engine.events.empty());
}

TEST_F(WindowTest, ThePopupShowsTheEnginesNewSelectionsOrNothing) {
    Rebuild({Entry("Everyone", 15), Entry("Ann"), Entry("Bob")});
    EXPECT_EQ(Selected(), -1);
    MenuStatus bob = Entry("Bob");
    bob.bSelected = true;
    Rebuild({Entry("Everyone", 15), SeparatorEntry(), Entry("Ann"), bob});
    EXPECT_EQ(Selected(), 3);
    Rebuild({});
    Insert(Entry("Ann"));
    Insert(bob);
    EXPECT_EQ(Selected(), -1);
    EXPECT_TRUE(engine.events.empty());
    // The engine's own choice is shown and reported, the first row included, but only when it
    // is new and in the list.
    Command(msg_SelectMenuItem, 0);
    Command(msg_SelectMenuItem, 0);
    Command(msg_SelectMenuItem, 2);
    EXPECT_EQ(Selected(), 0);
    EXPECT_EQ(engine.events, (std::vector<RecordedEvent>{{msg_SelectionChanged, 0}}));
    Command(msg_SelectMenuItem, -1);
    EXPECT_EQ(Selected(), -1);
    EXPECT_EQ(engine.events.back(), (RecordedEvent{msg_SelectionChanged, -1}));
}

TEST_F(WindowTest, SelectedUserLeftShowsThePlaceholderUntilATargetIsChosenAgain) {
    Rebuild({Entry("Everyone", 15), Entry("Ann"), Entry("Bob")});
    Command(msg_SelectMenuItem, 2);
    engine.events.clear();
    Command(msg_SelectedUserLeft, 2);
    EXPECT_EQ(Rows(), (std::vector<std::string>{"Everyone", "Ann", kPlaceholder}));
    EXPECT_EQ(Selected(), 2);
    EXPECT_FALSE(InputEnabled());
    EXPECT_EQ(engine.events, (std::vector<RecordedEvent>{{msg_SelectionChanged, -1}}));

    // Opening the popup hides the placeholder; closing it, or a command that closes it, brings
    // it back.
    ChatPopUpButton* popup = window->userlist();
    popup->showPopup();
    EXPECT_EQ(Rows(), (std::vector<std::string>{"Everyone", "Ann"}));
    EXPECT_EQ(Selected(), -1);
    popup->hidePopup();
    EXPECT_EQ(Rows(), (std::vector<std::string>{"Everyone", "Ann", kPlaceholder}));
    EXPECT_EQ(Selected(), 2);
    popup->showPopup();
    Command(msg_PanelStatusChanged);
    EXPECT_FALSE(window->menuPopup());
    EXPECT_EQ(Rows(), (std::vector<std::string>{"Everyone", "Ann", kPlaceholder}));
    EXPECT_EQ(Selected(), 2);

    // The placeholder is out of the popup while a command runs, so indexes from the engine
    // mean the same entries; afterwards it is last and selected again.
    MenuStatus renamed = Entry("Anna");
    std::string anna = "Anna";
    Command(msg_RenameMenuItem, &anna, reinterpret_cast<void*>(1));
    Command(msg_UpdateMenuItem, &renamed, reinterpret_cast<void*>(1));
    Insert(Entry("Carl"));
    Command(msg_SelectMenuItem, 0);
    std::int32_t allow = 1;
    Command(msg_AllowUserInput, &allow);
    EXPECT_EQ(Rows(), (std::vector<std::string>{"Everyone", "Anna", "Carl", kPlaceholder}));
    EXPECT_EQ(Selected(), 3);
    EXPECT_FALSE(InputEnabled());
    EXPECT_EQ(engine.events.back(), (RecordedEvent{msg_SelectionChanged, -1}));

    // Choosing a real target with the keyboard, or the engine's choice with input allowed,
    // removes the placeholder and enables input.
    popup->setFocus();
    QTest::keyClick(popup, Qt::Key_Up);
    EXPECT_EQ(Rows(), (std::vector<std::string>{"Everyone", "Anna", "Carl"}));
    EXPECT_EQ(Selected(), 2);
    EXPECT_TRUE(InputEnabled());
    EXPECT_EQ(engine.events.back(), (RecordedEvent{msg_SelectionChanged, 2}));
    Command(msg_SelectedUserLeft, 2);
    Command(msg_SelectMenuItemAndAllowInput, 1);
    EXPECT_EQ(Rows(), (std::vector<std::string>{"Everyone", "Anna"}));
    EXPECT_EQ(Selected(), 1);
    EXPECT_TRUE(InputEnabled());
    EXPECT_EQ(engine.events.back(), (RecordedEvent{msg_SelectionChanged, 1}));
}

TEST_F(WindowTest, InputIsNormalisedLimitedAndSentWithReturnToAChosenTarget) {
    // Each text typed and what the engine is given for it.
    const std::tuple<std::string, std::string> cases[] = {
        {"x\n\ny", "x\ry"},
        {"x\n\n\ny", "x\r\ry"},
        {"a\r\nb", "a\rb"},
        {"abc", "abc"},
        {std::string(1200, 'z'), std::string(1000, 'z')}};
    for (const auto& [typed, sent] : cases) {
        window->editView()->setStringValue(QString::fromStdString(typed));
        std::string text = "old";
        Command(msg_GetInputText, &text);
        EXPECT_EQ(text, sent) << typed;
    }
    Command(msg_ClearInput);
    EXPECT_TRUE(window->editView()->toPlainText().isEmpty());

    // Return sends, Shift+Return starts a new line, and the attendee item sends nothing.
    Rebuild({Entry("Everyone", 15), Entry("Select an Attendee...", 16)});
    QTest::keyClicks(window->editView(), "hi");
    QTest::keyClick(window->editView(), Qt::Key_Return, Qt::ShiftModifier);
    EXPECT_TRUE(engine.events.empty());
    EXPECT_EQ(window->editView()->toPlainText(), "hi\n");
    QTest::keyClick(window->editView(), Qt::Key_Return);
    EXPECT_EQ(engine.events, (std::vector<RecordedEvent>{{msg_SendChat, 0}}));

    window->userlist()->setCurrentIndex(1);
    window->onSend();
    EXPECT_EQ(engine.events.size(), 1u);
}

TEST_F(WindowTest, NoSendToModeHidesTheRowAndAlwaysReportsZero) {
    Rebuild({Entry("Everyone", 15), Entry("Ann")});
    Command(msg_NoSendToItems);
    EXPECT_FALSE(window->userlist()->isVisible());
    EXPECT_FALSE(window->sendToLabel()->isVisible());
    EXPECT_EQ(window->editView()->placeholderText(), "Type chat message, and send...");
    Command(msg_SelectMenuItem, 1);
    EXPECT_EQ(engine.events, (std::vector<RecordedEvent>{{msg_SelectionChanged, 0}}));
}

TEST_F(WindowTest, CommandsWithoutTheirSlotsOrUnknownIdsChangeNothing) {
    Rebuild({Entry("Everyone", 15)});
    window->editView()->setStringValue("draft");
    for (const int id : std::vector<int>{msg_SendDone, msg_ShowChat, 4242, msg_CloseAttendeeWarning,
                                         msg_AllowUserInput, msg_ShowText, msg_GetInputText,
                                         msg_WriteTextFile, msg_ReadTextFile})
        EXPECT_EQ(Command(id), 0) << id;
    EXPECT_EQ(Rows(), (std::vector<std::string>{"Everyone"}));
    EXPECT_EQ(window->editView()->toPlainText(), "draft");
    EXPECT_TRUE(engine.events.empty());
    // Without a sink the window reports nothing at all.
    window->SetSink(nullptr);
    Command(msg_SelectMenuItem, 0);
    window->onSend();
    EXPECT_TRUE(engine.events.empty());
}

}  // namespace
