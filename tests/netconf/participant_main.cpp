// One participant in a process of its own: connects to a conference, enrolls and stays until
// it is killed. Prints "enrolled" once the enrolment is confirmed, "failed <step> <result>"
// when a step is refused.
// Usage: netconf_participant URL USER PASSWORD NODE SESSION PAYLOAD
#include <cstdio>
#include <cstdlib>
#include <string>

#include "netconf/nats_conference.h"
#include "platform/conference_null_sink.h"
#include "platform/poll_run_loop.h"

namespace {

constexpr std::uint16_t kConference = 5;

class Participant final : public ArmNullSink {
public:
    Participant(IArmClient& client, std::uint32_t session, std::string payload)
        : m_client(client), m_session(session), m_payload(std::move(payload)) {}

    int ConnectConfirm(short result, std::uint32_t) override {
        if (result != 0) return Fail("connect", result);
        const int joined = m_client.ConferenceJoin(0, kConference, this, 3);
        return joined == 0 ? 0 : Fail("join", joined);
    }
    int ConferenceJoinConfirm(std::uint16_t, const char*, short result, std::uint32_t) override {
        if (result != 0) return Fail("join", result);
        const int attached = m_client.ApeAttach(this, 0, kConference, &m_ape);
        return attached == 0 ? 0 : Fail("attach", attached);
    }
    int ApeAttachConfirm(std::uint32_t, short result, std::uint32_t) override {
        if (result != 0) return Fail("attach", result);
        ARMSessionResource resource{1, "c_session_id", 1, 0, 0};
        const int enrolled =
            m_client.ApeEnroll(m_ape, 1, m_session, 0, 1, &resource, m_payload.data(),
                               static_cast<std::uint32_t>(m_payload.size()), 3);
        return enrolled == 0 ? 0 : Fail("enroll", enrolled);
    }
    int ApeEnrollConfirm(std::uint32_t, short result, short, ARMSessionResource*) override {
        if (result != 0) return Fail("enroll", result);
        std::printf("enrolled\n");
        std::fflush(stdout);
        return 0;
    }

private:
    int Fail(const char* step, int result) {
        std::printf("failed %s %d\n", step, result);
        std::fflush(stdout);
        std::exit(1);
    }

    IArmClient& m_client;
    std::uint32_t m_ape = 0;
    const std::uint32_t m_session;
    const std::string m_payload;
};

}  // namespace

int main(int argc, char** argv) {
    if (argc != 7) {
        std::fprintf(stderr, "usage: %s URL USER PASSWORD NODE SESSION PAYLOAD\n", argv[0]);
        return 2;
    }
    NatsConferenceOptions options;
    options.serverUrls = {argv[1]};
    options.user = argv[2];
    options.password = argv[3];
    options.nodeId = static_cast<std::uint32_t>(std::strtoul(argv[4], nullptr, 10));
    options.conferenceId = kConference;
    PollRunLoop loop;
    IArmClient* client = CreateNatsArmClient(options, loop);
    if (client == nullptr) return 2;
    Participant participant(*client, static_cast<std::uint32_t>(std::strtoul(argv[5], nullptr, 10)),
                            argv[6]);
    client->Connect(&participant, options.user.c_str(), 0, 0, 0);
    // Stays until it is killed; the timer keeps the loop waiting for the service's answers.
    loop.AddTimer(1, 1, [] {});
    loop.Run();
    return 0;
}
