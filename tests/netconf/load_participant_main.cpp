// One participant of the fault-and-load run, in a process of its own. It enrolls, subscribes
// to the load cache and prints "ready" once it sees its two peers; after "go" on its input it
// sends its share, alternating a group line (cache append) and a private line to the next peer,
// each "<user> <number>". It checks that every line meant for it arrives exactly once and in
// its sender's order, and prints "received group=G private=P duplicates=D disorder=O" when all
// came or the time is up (exit status 0 only when everything came in order). Never told
// "go", it only stays enrolled until it is killed or its time is up.
// Usage: netconf_load_participant URLS USER PASSWORD NODE COUNT NEXT_PEER PEER...
#include <cstdio>
#include <cstdlib>
#include <iostream>
#include <map>
#include <set>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

#include "netconf/conference_subjects.h"
#include "netconf/nats_conference.h"
#include "platform/conference_null_sink.h"
#include "platform/poll_run_loop.h"

namespace {

constexpr std::uint16_t kConference = 5;
constexpr std::uint32_t kSession = 7;
constexpr double kSendInterval = 0.002;
constexpr double kPatience = 45;

class LoadParticipant final : public ArmNullSink {
public:
    LoadParticipant(IArmClient& client, std::string user, int count, std::string next,
                    std::size_t peers)
        : m_client(client),
          m_user(std::move(user)),
          m_count(count),
          m_nextId(ConferenceUserId(next)),
          m_peers(peers) {}

    void Go(PollRunLoop& loop) {
        m_going = true;
        loop.AddTimer(kSendInterval, kSendInterval, [this] { SendOne(); });
    }
    // Whether it was told to go and every line meant for it arrived.
    bool Complete() const {
        return m_going && m_group == m_count / 2 * static_cast<int>(m_peers + 1) &&
               m_private == m_count / 2;
    }
    // Prints what came; whether all of it came, once and in order.
    bool Report() const {
        std::printf("received group=%d private=%d duplicates=%d disorder=%d\n", m_group, m_private,
                    m_duplicates, m_disorder);
        std::fflush(stdout);
        return Complete() && m_duplicates == 0 && m_disorder == 0;
    }

    int ConnectConfirm(short result, std::uint32_t) override {
        return result == 0 ? m_client.ConferenceJoin(0, kConference, this, 3) : Fail(result);
    }
    int ConferenceJoinConfirm(std::uint16_t, const char*, short result, std::uint32_t) override {
        return result == 0 ? m_client.ApeAttach(this, 0, kConference, &m_ape) : Fail(result);
    }
    int ApeAttachConfirm(std::uint32_t, short result, std::uint32_t) override {
        if (result != 0) return Fail(result);
        m_client.RegisterSharedDataSink(m_ape, this);
        ARMSessionResource resource{1, "c_session_id", 1, 0, 0};
        return m_client.ApeEnroll(m_ape, 1, kSession, 0, 1, &resource, m_user.data(),
                                  static_cast<std::uint32_t>(m_user.size()), 3);
    }
    int ApeEnrollConfirm(std::uint32_t, short result, short, ARMSessionResource*) override {
        if (result != 0) return Fail(result);
        NameHandle entry{};
        std::snprintf(entry.name, sizeof entry.name, "load_cache");
        return m_client.AllocNameHandle(m_ape, 1, &entry, this);
    }
    int AllocNameHandleConfirm(std::uint32_t, std::uint32_t count, NameHandle* handles,
                               short result, std::uint32_t) override {
        if (result != 0 || count != 1) return Fail(result);
        m_cache = handles[0].handle_value;
        m_client.ApeRequestSharedDataEx(m_ape, m_cache, 0, CACHE_REQUEST_SUBSCRIBE, 255, this);
        CheckReady();
        return 0;
    }
    int ApeRosterChanged(std::uint32_t, std::uint16_t, std::uint32_t added, std::uint32_t deleted,
                         std::uint32_t, ARMApeRoster* records) override {
        for (std::uint32_t r = 0; r < added + deleted; ++r) {
            for (std::uint16_t u = 0; u < records[r].wUserCount; ++u) {
                const std::uint32_t id = records[r].pUsers[u].dwUserID;
                m_members.erase(id);
                if (r < added) m_members.insert(id);
            }
        }
        CheckReady();
        return 0;
    }
    int ApeDataIndication(std::uint32_t, std::uint32_t senderId, std::uint32_t, std::uint16_t,
                          const void* data, std::uint32_t length) override {
        Take(senderId, std::string(static_cast<const char*>(data), length), &m_private);
        return 0;
    }
    int SharedDataReceivedEx(std::uint32_t, std::uint32_t, std::uint32_t, std::uint32_t memHandle,
                             short, tagCacheAction, std::uint32_t senderId, std::uint32_t,
                             std::uint16_t) override {
        char buffer[128];
        std::uint32_t size = sizeof buffer;
        if (memHandle == 0 || m_client.ReadMemHandle(memHandle, 0, buffer, &size) != 0) return 0;
        Take(senderId, std::string(buffer, size), &m_group);
        return 0;
    }

private:
    void CheckReady() {
        if (m_ready || m_cache == 0 || m_members.size() < m_peers + 1) return;
        m_ready = true;
        std::printf("ready\n");
        std::fflush(stdout);
    }
    void SendOne() {
        if (m_sent >= m_count) return;
        const std::string line = m_user + " " + std::to_string(m_sent / 2 + 1);
        if (m_sent % 2 == 0) {
            std::uint32_t mem = 0, size = static_cast<std::uint32_t>(line.size());
            m_client.AllocMemHandle(size, &mem);
            m_client.WriteMemHandle(mem, 0, line.data(), &size);
            m_client.ApeSharedDataActionEx(m_ape, m_cache, 0, 0, CACHE_APPEND, 0x2000000, mem, 0,
                                           1);
            m_client.FreeMemHandle(mem);
        } else {
            m_client.ApeSendData(m_ape, m_nextId, 1, line.data(),
                                 static_cast<std::uint32_t>(line.size()), 1, 1);
        }
        ++m_sent;
    }
    // One line "<user> <number>" from senderId: the next number of that sender and kind.
    void Take(std::uint32_t senderId, const std::string& line, int* counter) {
        std::istringstream in(line);
        std::string user;
        int number = 0;
        in >> user >> number;
        if (ConferenceUserId(user) != senderId) ++m_disorder;
        int& last = m_last[{counter == &m_group, senderId}];
        if (number <= last) {
            ++m_duplicates;
            return;
        }
        if (number != last + 1) ++m_disorder;
        last = number;
        ++*counter;
    }
    int Fail(int result) {
        std::printf("failed %d\n", result);
        std::fflush(stdout);
        std::_Exit(1);
    }

    IArmClient& m_client;
    const std::string m_user;
    const int m_count;
    const std::uint32_t m_nextId;
    const std::size_t m_peers;
    std::uint32_t m_ape = 0;
    std::uint32_t m_cache = 0;
    std::set<std::uint32_t> m_members;
    bool m_ready = false;
    bool m_going = false;
    int m_sent = 0;
    int m_group = 0, m_private = 0, m_duplicates = 0, m_disorder = 0;
    std::map<std::pair<bool, std::uint32_t>, int> m_last;
};

}  // namespace

int main(int argc, char** argv) {
    if (argc < 8) {
        std::fprintf(stderr, "usage: %s URLS USER PASSWORD NODE COUNT NEXT_PEER PEER...\n",
                     argv[0]);
        return 2;
    }
    NatsConferenceOptions options;
    std::stringstream urls(argv[1]);
    for (std::string url; std::getline(urls, url, ',');)
        options.serverUrls.push_back(url);
    options.user = argv[2];
    options.password = argv[3];
    options.nodeId = static_cast<std::uint32_t>(std::strtoul(argv[4], nullptr, 10));
    options.conferenceId = kConference;
    options.replicas = options.serverUrls.size() >= 3 ? 3 : 1;
    PollRunLoop loop;
    IArmClient* client = CreateNatsArmClient(options, loop);
    if (client == nullptr) return 2;
    LoadParticipant participant(*client, options.user, std::atoi(argv[5]), argv[6],
                                static_cast<std::size_t>(argc - 7));
    if (client->Connect(&participant, options.user.c_str(), 0, 0, 0) != kArmConnectPending) {
        return 1;
    }
    // "go" arrives on the input; the loop learns of it through a posted task.
    std::thread([&loop, &participant] {
        std::string word;
        if (std::cin >> word && word == "go") loop.Post([&] { participant.Go(loop); });
    }).detach();
    loop.AddTimer(0.05, 0.05, [&] {
        if (participant.Complete()) loop.Quit();
    });
    loop.AddTimer(kPatience, 0, [&loop] { loop.Quit(); });
    loop.Run();
    const bool clean = participant.Report();
    client->Release();
    std::_Exit(clean ? 0 : 1);
}
