#include "apps/quintara-chat/desktop_participant.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QEventLoop>
#include <QTimer>

#include "engine/chat_client.h"
#include "netconf/nats_arm_client.h"
#include "netconf/nats_conference.h"
#include "netconf/netconf_results.h"
#include "ui/my_chat_controller.h"
#include "ui/qt_host.h"

namespace {

constexpr std::uint32_t kSessionId = 1;

std::string ConnectFailure(short result, const std::string& url, const std::string& user) {
    switch (result) {
        case kArmServerUnreachable:
            return "cannot connect to " + url + " (no server there, or it refused user " + user +
                   ")";
        case kArmServerRefused:
            return "the server at " + url + " refused " + user +
                   " (wrong credentials, or no conference service there)";
        default:
            return "the server at " + url + " answered the connection with " +
                   std::to_string(result);
    }
}

}  // namespace

int DesktopParticipant::ConnectProbe::ConnectConfirm(short answer, std::uint32_t) {
    answered = true;
    result = answer;
    return 0;
}

DesktopParticipant::DesktopParticipant(DesktopOptions options, DesktopCredentials creds,
                                       QWidget* view)
    : m_options(std::move(options)), m_creds(std::move(creds)), m_view(view) {
    m_loop = QtApplicationRunLoop();
}

DesktopParticipant::~DesktopParticipant() {
    Leave();
    // A service the component never took is the program's to release.
    if (!m_serviceAlive.expired()) m_service->Release();
}

bool DesktopParticipant::Connect(double seconds, std::string* error) {
    NatsConferenceOptions options;
    options.serverUrls = {m_options.serverUrl};
    options.conferenceId = m_options.conferenceId;
    options.nodeId = m_options.nodeId;
    options.user = m_creds.user;
    options.password = m_creds.password;
    IArmClient* service = m_loop ? CreateNatsArmClient(options, *m_loop) : nullptr;
    if (!service) {
        *error = "cannot use the user name \"" + m_creds.user + "\" or the server address " +
                 m_options.serverUrl;
        return false;
    }
    m_service = static_cast<NatsArmClient*>(service);
    m_serviceAlive = m_service->Lifetime();
    const int asked = m_service->Connect(&m_probe, m_creds.user.c_str(), 0, 0, 0);
    if (asked != kArmConnectPending) {
        *error = "the conference service did not start connecting (" + std::to_string(asked) + ")";
        return false;
    }
    if (!RunUntil([this] { return m_probe.answered; }, seconds)) {
        *error = "no answer from " + m_options.serverUrl + " within " +
                 std::to_string(static_cast<int>(seconds)) + " seconds";
        return false;
    }
    if (m_probe.result != kArmOk) {
        *error = ConnectFailure(m_probe.result, m_options.serverUrl, m_creds.user);
        return false;
    }
    return true;
}

void DesktopParticipant::Start(bool bQM) {
    m_handle = ChNewInstance();
    // Roles known before the start go out with the first enrolment; set later they would
    // make the component enroll again, and everybody rebuild their send-to lists.
    if (m_options.roles != 0) ChSetRosters(m_handle, m_options.roles);
    _tagChatData data{};
    data.hParentView = m_view;
    data.pArmClient = m_service;
    data.wConferenceID = m_options.conferenceId;
    data.dwSessionID = kSessionId;
    data.lpszUserName = m_options.displayName.c_str();
    data.dwNodeID = m_options.nodeId;
    data.lMeetingType = m_options.meetingType;
    // The service is already connected: the component goes on from there.
    ChInitialize(m_handle, &data);
    if (bQM) ChSelectFeature(m_handle, FEATURE_QM_MODE, 0, 0, 0, 0, nullptr);
    if (m_options.roles & ROLE_HOST) ChSetHost(m_handle, m_options.nodeId);
    if (m_options.roles & ROLE_PRESENTER) ChSetPresenter(m_handle, m_options.nodeId);
}

bool DesktopParticipant::WaitEnrolled(double seconds) {
    return RunUntil([this] { return In() && Engine().State() == kStateEnrolled; }, seconds);
}

bool DesktopParticipant::WaitStartedUp(double seconds) {
    return RunUntil(
        [this] {
            return In() && Engine().State() == kStateEnrolled && Engine().PrivilegePending() == 0;
        },
        seconds);
}

bool DesktopParticipant::RunUntil(const std::function<bool()>& done, double seconds) {
    // done() is asked once per round and never again after it held.
    if (done()) return true;
    QElapsedTimer clock;
    clock.start();
    const qint64 limit = static_cast<qint64>(seconds * 1000);
    bool held = false;
    QEventLoop loop;
    QTimer poll;
    QObject::connect(&poll, &QTimer::timeout, &loop, [&] {
        held = done();
        if (held || clock.elapsed() >= limit) loop.quit();
    });
    poll.start(10);
    loop.exec();
    return held;
}

void DesktopParticipant::Settle() {
    // Each round waits for the server's answers; a quiet round ends it.
    for (int round = 0; round < 50; ++round) {
        const std::uint64_t activity = m_serviceAlive.expired() ? 0 : m_service->Settle();
        QCoreApplication::processEvents();
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
        if (activity == 0) return;
    }
}

void DesktopParticipant::Leave() {
    if (!m_handle) return;
    ChDeleteInstance(m_handle);
    m_handle = nullptr;
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
}

CChatClient& DesktopParticipant::Engine() const {
    return *static_cast<CChatClient*>(m_handle);
}

MyChatController* DesktopParticipant::Window() const {
    return m_handle ? dynamic_cast<MyChatController*>(Engine().ChatUI()) : nullptr;
}
