// A host built from an installed tree alone: a Qt application runs two components with their
// windows on the in-process conference of the host kit. The host types a line into one window
// and exits 0 only when the other window and its host notification show it.
#include <QApplication>
#include <QElapsedTimer>
#include <QKeyEvent>
#include <QPlainTextEdit>
#include <QTextEdit>
#include <QWidget>
#include <cstdio>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "platform/inproc_conference.h"
#include "platform/run_loop.h"
#include "quintarachat.h"

namespace {

constexpr std::uint32_t kHostRole = 0x1;
const char* const kLine = "Hello from an installed host";

// The lines the component announces to its host.
class LineSink final : public IHostChatSink {
public:
    void OnIncomingChat(const char* sender, const char* message, uint32_t) override {
        lines.push_back(std::string(sender) + ": " + message);
    }
    void OnChatShown() override {}
    void OnChatModified(bool) override {}
    void OnChatContentChanged(bool) override {}

    std::vector<std::string> lines;
};

struct Participant {
    QWidget view;
    LineSink sink;
    ChatHandle handle = nullptr;

    ~Participant() { ChDeleteInstance(handle); }
    // The window's widgets, as the host finds them in its view.
    QPlainTextEdit* Input() const { return view.findChild<QPlainTextEdit*>(); }
    QTextEdit* Transcript() const { return view.findChild<QTextEdit*>(); }
};

bool RunUntil(const std::function<bool()>& done) {
    QElapsedTimer clock;
    clock.start();
    while (!done() && clock.elapsed() < 8000)
        QApplication::processEvents(QEventLoop::AllEvents, 10);
    return done();
}

std::unique_ptr<Participant> Join(InProcessConference& conference, RunLoop& loop, const char* name,
                                  std::uint32_t node, std::uint32_t roles) {
    auto p = std::make_unique<Participant>();
    p->view.resize(400, 320);
    p->handle = ChNewInstance();
    ChSetRosters(p->handle, roles);
    ChatData data{};
    data.pHostSink = &p->sink;
    data.hParentView = &p->view;
    data.pArmClient = conference.CreateClient(loop, node);
    data.wConferenceID = conference.ConferenceId();
    data.dwSessionID = 1;
    data.lpszUserName = name;
    data.dwNodeID = node;
    data.lMeetingType = 3;
    if (ChInitialize(p->handle, &data) != 0) return nullptr;
    p->view.show();
    return p;
}

int Fail(const char* what) {
    std::fprintf(stderr, "installed host: %s\n", what);
    return 1;
}

}  // namespace

int main(int argc, char** argv) {
    QApplication app(argc, argv);
    // The component uses the application's loop; the conference answers on the same one.
    RunLoop* loop = RunLoop::FindCurrent();
    if (!loop) return Fail("the library found no run loop in the Qt application");
    InProcessConference conference;
    const std::uint32_t hanaNode = 11;
    const std::uint32_t annNode = 22;
    std::unique_ptr<Participant> hana = Join(conference, *loop, "Hana", hanaNode, kHostRole);
    std::unique_ptr<Participant> ann = Join(conference, *loop, "Ann", annNode, 0);
    if (!hana || !ann) return Fail("ChInitialize failed");
    ChSetHost(hana->handle, hanaNode);
    ChSetHost(ann->handle, hanaNode);
    if (!hana->Input() || !ann->Transcript()) return Fail("the components made no windows");

    // Once both are enrolled Hana may write to Ann; she picks her and types the line.
    if (!RunUntil([&] { return ChCanChatWith(hana->handle, annNode, 0) == 1; }))
        return Fail("the participants never met");
    ChSelectUserByNodeId(hana->handle, annNode);
    QPlainTextEdit* input = hana->Input();
    if (!RunUntil([&] { return input->isEnabled(); })) return Fail("the input stays disabled");
    input->setPlainText(kLine);
    QKeyEvent press(QEvent::KeyPress, Qt::Key_Return, Qt::NoModifier);
    QApplication::sendEvent(input, &press);

    QTextEdit* transcript = ann->Transcript();
    if (!RunUntil(
            [&] { return transcript->toPlainText().contains(kLine) && !ann->sink.lines.empty(); }))
        return Fail("Ann's window never showed the line");
    if (ann->sink.lines.front() != std::string("Hana: ") + kLine)
        return Fail("Ann's host heard another line");
    if (!input->toPlainText().isEmpty()) return Fail("the sent line stayed in the input");
    std::printf("installed host: Ann's window shows \"%s\"\n", kLine);
    return 0;
}
