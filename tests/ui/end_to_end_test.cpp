// Components with their real Qt windows on the in-process conference: a user types and
// sends, the other sees the line; pictures of the windows are saved under the build folder.
#include <QDir>
#include <QTest>
#include <QTextDocument>

#include "api/quintarachat.h"
#include "engine/chat_client.h"
#include "platform/inproc_conference.h"
#include "tests/ui/window_fixture.h"
#include "ui/chat_select_attd_control.h"
#include "ui/chat_text_view.h"
#include "ui/qt_host.h"
#include "ui/qt_run_loop.h"

namespace {

constexpr std::uint32_t kHana = 11;
constexpr std::uint32_t kAnn = 22;

struct Participant {
    QWidget view;
    ChatHandle handle = nullptr;
    MyChatController* window = nullptr;
};

class EndToEnd : public testing::Test {
protected:
    // Only the library's own window is wanted, so the default factory is the one replaced:
    // an installed factory, even an empty one, would hide the default from later tests.
    EndToEnd() {
        SetDefaultChatWindowFactory([this] {
            IChatWindow* window = MakeQtChatWindow();
            made = static_cast<MyChatController*>(window);
            return window;
        });
    }
    ~EndToEnd() override {
        for (auto& p : people)
            ChDeleteInstance(p->handle);
        SetDefaultChatWindowFactory(nullptr);
    }

    Participant& Join(const char* name, std::uint32_t node, std::uint32_t roles) {
        people.push_back(std::make_unique<Participant>());
        Participant& p = *people.back();
        p.view.resize(420, 360);
        p.handle = ChNewInstance();
        ChSetRosters(p.handle, roles);
        _tagChatData data{};
        data.pArmClient = conference.CreateClient(loop, node);
        data.hParentView = &p.view;
        data.wConferenceID = conference.ConferenceId();
        data.dwSessionID = 1;
        data.lpszUserName = name;
        data.dwNodeID = node;
        data.lMeetingType = 3;
        data.bUseAttendeeSelector = 1;
        ChInitialize(p.handle, &data);
        p.window = made;
        p.view.show();
        return p;
    }

    static std::string Transcript(const Participant& p) {
        return p.window->textView()->document()->toPlainText().toStdString();
    }

    static void Save(QWidget* widget, const char* name) {
        QDir().mkpath(QC_UI_PICTURE_DIR);
        EXPECT_TRUE(widget->grab().save(QString(QC_UI_PICTURE_DIR "/%1.png").arg(name)));
    }

    QtRunLoop loop;
    ScopedCurrentRunLoop current{&loop};
    InProcessConference conference;
    MyChatController* made = nullptr;
    std::vector<std::unique_ptr<Participant>> people;
};

TEST_F(EndToEnd, TypedLineReachesEveryWindow) {
    Participant& hana = Join("Hana", kHana, ROLE_HOST);
    Participant& ann = Join("Ann", kAnn, 0);
    for (auto& p : people)
        ChSetHost(p->handle, kHana);
    // Enrolment, caches and the start-up ticks that apply the privileges.
    QTest::qWait(6000);

    // Hana adds the audience of everyone, picks it from her popup and types a line.
    const char* audience = "All Participants";
    _tagChatGroupInfo everyone{};
    everyone.dwIndex = static_cast<std::uint32_t>(hana.window->userlist()->numberOfItems());
    everyone.dwGroupType = 1;
    everyone.dwGroupId = GROUP_EVERYONE;
    everyone.cszGroupName = audience;
    ChAddGroup(hana.handle, &everyone);
    ChatPopUpButton* popup = hana.window->userlist();
    const int all = popup->indexOfItemWithTitle(audience);
    ASSERT_GE(all, 0);
    popup->setCurrentIndex(all);
    emit popup->activated(all);
    QTest::keyClicks(hana.window->editView(), "Hello from Hana, see www.example.com");
    QTest::keyClick(hana.window->editView(), Qt::Key_Return);

    const std::string line = "Hello from Hana, see www.example.com";
    ASSERT_TRUE(QTest::qWaitFor([&] { return Transcript(ann).find(line) != std::string::npos; }));
    EXPECT_NE(Transcript(hana).find(line), std::string::npos);
    EXPECT_NE(Transcript(ann).find("from Hana to All Participants"), std::string::npos);

    // A narrow window shows the audience shortened, with its full name as the tooltip.
    hana.view.resize(190, 360);
    QApplication::processEvents();
    EXPECT_TRUE(popup->selectedChatItem()->isCompressed());
    EXPECT_TRUE(popup->currentText().endsWith("..."));
    EXPECT_EQ(popup->toolTip(), audience);
    Save(&hana.view, "chat_window");
    Save(&ann.view, "chat_window_receiver");

    // The attendee picker, filled by the engine with the attendees.
    hana.window->popAttendeeList(popup);
    ASSERT_TRUE(QTest::qWaitFor([] {
        return ChatSelectAttdControl::instance() &&
               ChatSelectAttdControl::instance()->dataSource()->numberOfRowsInTableView() == 1;
    }));
    Save(ChatSelectAttdControl::instance(), "attendee_picker");
    ChatSelectAttdControl::instance()->Close();
}

}  // namespace
