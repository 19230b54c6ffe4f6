// The attendee picker: ordered rows, find with wrap-around, its warnings and its flows with
// the chat window.
#include <QHeaderView>
#include <QLineEdit>
#include <QPushButton>
#include <QTableView>

#include "platform/warning_window.h"
#include "tests/ui/window_fixture.h"
#include "ui/chat_select_attd_control.h"

namespace {

class AttendeeDialogTest : public WindowTest {
protected:
    AttendeeDialogTest() {
        SetWarningPresenter(
            [this](const char*, const char* message) { warnings.push_back(message); });
        Rebuild({Entry("Everyone", 15), Entry("Select an Attendee...", 16)});
    }
    ~AttendeeDialogTest() override {
        SetWarningPresenter(nullptr);
        if (ChatSelectAttdControl* dialog = ChatSelectAttdControl::instance()) dialog->Close();
        QApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    }

    // Picks "Select an Attendee..." the way a user does and answers with attendees.
    ChatSelectAttdControl* Open(const std::vector<std::pair<std::string, std::uint32_t>>& people) {
        engine.onEvent = [this, people](int id) {
            if (id != msg_ShowAttendeeList) return;
            for (const auto& [name, node] : people) {
                AttendeeRecord record{name, node};
                Command(msg_AddAttendee, &record);
            }
        };
        window->userlist()->setCurrentIndex(1);
        emit window->userlist()->activated(1);
        engine.onEvent = nullptr;
        return window->attendeeDialog();
    }

    std::vector<std::string> Names(const ChatSelectAttdControl* dialog) const {
        std::vector<std::string> names;
        for (int i = 0; i < dialog->dataSource()->numberOfRowsInTableView(); ++i)
            names.push_back(dialog->dataSource()->itemNameAtIndex(i).toStdString());
        return names;
    }

    int SelectedRow(const ChatSelectAttdControl* dialog) const {
        const QModelIndexList rows = dialog->tableView()->selectionModel()->selectedRows();
        return rows.isEmpty() ? -1 : rows.first().row();
    }

    void Find(ChatSelectAttdControl* dialog, const char* text) {
        dialog->findTextField()->setText(text);
        dialog->onFind();
    }

    std::vector<std::string> warnings;
};

TEST_F(AttendeeDialogTest, RowsArriveInOrderAndReverseWithTheColumn) {
    ChatSelectAttdControl* dialog = Open({{"Carl", 3}, {"alice", 1}, {"Bob", 2}});
    ASSERT_NE(dialog, nullptr);
    EXPECT_EQ(engine.events, (std::vector<RecordedEvent>{{msg_ShowAttendeeList, 1}}));
    EXPECT_EQ(Names(dialog), (std::vector<std::string>{"alice", "Bob", "Carl"}));
    dialog->tableView()->horizontalHeader()->setSortIndicator(0, Qt::DescendingOrder);
    EXPECT_EQ(Names(dialog), (std::vector<std::string>{"Carl", "Bob", "alice"}));
    AttendeeRecord bert{"bert", 4};
    Command(msg_AddAttendee, &bert);
    EXPECT_EQ(Names(dialog), (std::vector<std::string>{"Carl", "Bob", "bert", "alice"}));
    EXPECT_EQ(dialog->dataSource()->itemIDAtIndex(9), 0u);
    EXPECT_TRUE(dialog->dataSource()->itemNameAtIndex(-1).isNull());

    // Opening again gives the same dialog, cleared.
    engine.events.clear();
    EXPECT_EQ(Open({}), dialog);
    EXPECT_EQ(engine.events, (std::vector<RecordedEvent>{{msg_ShowAttendeeList, 0}}));
    EXPECT_TRUE(Names(dialog).empty());
}

TEST_F(AttendeeDialogTest, FindWrapsAroundAndWarns) {
    ChatSelectAttdControl* dialog = Open({{"anna", 1}, {"Bob", 2}, {"bobby", 3}});
    Find(dialog, "xyz");
    EXPECT_EQ(warnings, (std::vector<std::string>{"No attendee of that name is in the list."}));
    EXPECT_EQ(SelectedRow(dialog), -1);
    dialog->tableView()->selectRow(1);
    Find(dialog, "BOB");
    EXPECT_EQ(SelectedRow(dialog), 2);
    Find(dialog, "BOB");
    EXPECT_EQ(SelectedRow(dialog), 1);
    Find(dialog, " \t ");
    EXPECT_EQ(warnings.back(), "Type an attendee's name, then click Find.");
    EXPECT_EQ(SelectedRow(dialog), 1);
}

TEST_F(AttendeeDialogTest, OkIsOnlyForANonZeroIdAndSendsItThenNoneAsDoesAnotherTarget) {
    ChatSelectAttdControl* dialog = Open({{"Ghost", 0}, {"Zoe", 9}});
    EXPECT_FALSE(dialog->okButton()->isEnabled());
    dialog->tableView()->selectRow(0);
    EXPECT_FALSE(dialog->okButton()->isEnabled());
    dialog->tableView()->selectRow(1);
    EXPECT_TRUE(dialog->okButton()->isEnabled());
    engine.events.clear();
    dialog->okButton()->click();
    EXPECT_EQ(engine.events,
              (std::vector<RecordedEvent>{{msg_AttendeeSelected, 9}, {msg_AttendeeSelected, 0}}));
    EXPECT_EQ(window->attendeeDialog(), nullptr);
    EXPECT_EQ(ChatSelectAttdControl::instance(), nullptr);

    // Choosing another target closes it with none chosen.
    Open({{"Ann", 1}});
    engine.events.clear();
    window->userlist()->setCurrentIndex(0);
    emit window->userlist()->activated(0);
    EXPECT_EQ(engine.events,
              (std::vector<RecordedEvent>{{msg_SelectionChanged, 0}, {msg_AttendeeSelected, 0}}));
    EXPECT_EQ(window->attendeeDialog(), nullptr);
}

// The engine's tick asks the window to close the warning, then closes the dialog; a dialog closed
// while its warning runs is freed only after the warning returns.
TEST_F(AttendeeDialogTest, EngineClosesTheWarningAndTheDialogFreedAfterIt) {
    ChatSelectAttdControl* dialog = Open({{"Ann", 1}});
    QPointer<ChatSelectAttdControl> guard(dialog);
    std::vector<std::int32_t> answers;
    const auto tick = [&] {
        std::int32_t showing = -1;
        Command(msg_CloseAttendeeWarning, nullptr, &showing);
        answers.push_back(showing);
    };
    int closed = 0;
    bool aliveWhileShowing = false;
    SetWarningPresenter(
        [&](const char*, const char*) {
            tick();
            Command(msg_CloseAttendeeDialog);
            QApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
            aliveWhileShowing = !guard.isNull();
        },
        [&closed] { ++closed; });
    tick();
    Find(dialog, " ");
    EXPECT_EQ(answers, (std::vector<std::int32_t>{0, 1}));
    EXPECT_EQ(closed, 1);
    EXPECT_TRUE(aliveWhileShowing);
    EXPECT_EQ(window->attendeeDialog(), nullptr);
    QApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    EXPECT_TRUE(guard.isNull());
}

}  // namespace
