// The one participant of the desktop program: its networked service object, its chat
// component and the component's window in a view the program provides. The program connects
// the service itself first, so an unreachable or refusing server is told before any chat starts.
#pragma once

#include <QWidget>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>

#include "api/quintarachat.h"
#include "apps/quintara-chat/desktop_options.h"
#include "platform/arm_service.h"

class CChatClient;
class MyChatController;
class NatsArmClient;
class RunLoop;

class DesktopParticipant {
public:
    // view is where the chat window goes; it must outlive the participant.
    DesktopParticipant(DesktopOptions options, DesktopCredentials creds, QWidget* view);
    ~DesktopParticipant();
    DesktopParticipant(const DesktopParticipant&) = delete;
    DesktopParticipant& operator=(const DesktopParticipant&) = delete;

    // Connects to the server, waiting at most seconds; false with a message for the user
    // when the server is unreachable, refuses the credentials or does not answer.
    bool Connect(double seconds, std::string* error);
    // Starts the component and hands it what the host knows: QM, roles, own host or presenter.
    void Start(bool bQM);
    // Waits until the component is enrolled in the conference; false after seconds.
    bool WaitEnrolled(double seconds);
    // Waits until it is enrolled and has re-applied its privileges after the start (which
    // resets the send-to choice to everyone); false after seconds.
    bool WaitStartedUp(double seconds);
    // Runs the program's loop until done() holds or seconds passed; whether done() held.
    static bool RunUntil(const std::function<bool()>& done, double seconds);
    // Lets everything in flight arrive: the service's answers and deliveries, then the loop.
    void Settle();
    // Ends the component (the participant leaves the conference).
    void Leave();

    bool In() const { return m_handle != nullptr; }
    ChatHandle Handle() const { return m_handle; }
    CChatClient& Engine() const;
    MyChatController* Window() const;
    const DesktopOptions& Options() const { return m_options; }

private:
    // Hears the answer to the program's own connect.
    class ConnectProbe final : public IArmNodeControllerSink {
    public:
        int ConnectConfirm(short result, std::uint32_t) override;
        int DisconnectIndication(short) override { return 0; }
        int TransportStatusIndication(std::uint32_t) override { return 0; }
        int DisconnectConfirm(short) override { return 0; }
        bool answered = false;
        short result = 0;
    };

    const DesktopOptions m_options;
    const DesktopCredentials m_creds;
    QWidget* m_view;
    RunLoop* m_loop = nullptr;
    ConnectProbe m_probe;  // declared before the service: answers may reach it until Release
    NatsArmClient* m_service = nullptr;
    std::weak_ptr<const void> m_serviceAlive;
    ChatHandle m_handle = nullptr;
};
