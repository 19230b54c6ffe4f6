#include "bench/bench_nats_peer.h"

#include <chrono>
#include <condition_variable>
#include <cstdio>
#include <cstring>
#include <mutex>
#include <vector>

#include "netconf/nats_arm_client.h"
#include "platform/conference_null_sink.h"
#include "platform/poll_run_loop.h"
#include "platform/trace.h"

namespace {

constexpr double kPatienceSeconds = 60;

// What one receiver took: the delays of the paced lines and when the last line came.
class Tally {
public:
    // Takes one line; true once every line was taken.
    bool Take(const char* data, std::size_t length) {
        const std::int64_t now = MonotonicNanos();
        int sequence = 0;
        std::int64_t sent = 0;
        if (!ParseBenchLine(data, length, &sequence, &sent)) return false;
        const std::lock_guard<std::mutex> lock(m_mutex);
        if (sequence <= kPacedLines) m_delaysMicros.push_back((now - sent) / 1000);
        m_last = now;
        ++m_taken;
        m_done.notify_all();
        return m_taken >= kPacedLines + kBurstLines;
    }
    bool WaitAll(double seconds) {
        std::unique_lock<std::mutex> lock(m_mutex);
        return m_done.wait_for(lock, std::chrono::duration<double>(seconds),
                               [this] { return m_taken >= kPacedLines + kBurstLines; });
    }
    void Print() {
        const std::lock_guard<std::mutex> lock(m_mutex);
        std::printf("result %lld %d", static_cast<long long>(m_last), m_taken);
        for (const std::int64_t delay : m_delaysMicros)
            std::printf(" %lld", static_cast<long long>(delay));
        std::printf("\n");
        std::fflush(stdout);
    }

private:
    std::mutex m_mutex;
    std::condition_variable m_done;
    std::vector<std::int64_t> m_delaysMicros;
    std::int64_t m_last = 0;
    int m_taken = 0;
};

void SayReady() {
    std::printf("ready\n");
    std::fflush(stdout);
}

// A participant that joins, finds the bench cache by name and subscribes to it.
class ComponentReceiver final : public ArmNullSink {
public:
    ComponentReceiver(NatsArmClient& client, PollRunLoop& loop, Tally& tally)
        : m_client(client), m_loop(loop), m_tally(tally) {}

    int ConnectConfirm(short result, std::uint32_t) override {
        return result == 0 ? m_client.ConferenceJoin(0, kBenchConference, this, 3) : Fail(result);
    }
    int ConferenceJoinConfirm(std::uint16_t, const char*, short result, std::uint32_t) override {
        return result == 0 ? m_client.ApeAttach(this, 0, kBenchConference, &m_ape) : Fail(result);
    }
    int ApeAttachConfirm(std::uint32_t, short result, std::uint32_t) override {
        if (result != 0) return Fail(result);
        NameHandle entry{};
        std::snprintf(entry.name, sizeof entry.name, "%s", kBenchCacheName);
        return m_client.AllocNameHandle(m_ape, 1, &entry, this);
    }
    int AllocNameHandleConfirm(std::uint32_t, std::uint32_t count, NameHandle* handles,
                               short result, std::uint32_t) override {
        if (result != 0 || count != 1) return Fail(result);
        m_client.ApeRequestSharedDataEx(m_ape, handles[0].handle_value, 0, CACHE_REQUEST_SUBSCRIBE,
                                        255, this);
        // Listening once the consumer exists on the server.
        m_loop.Post([this] {
            m_client.Settle();
            SayReady();
        });
        return 0;
    }
    int SharedDataReceivedEx(std::uint32_t, std::uint32_t, std::uint32_t, std::uint32_t memHandle,
                             short, tagCacheAction, std::uint32_t, std::uint32_t,
                             std::uint16_t) override {
        char line[kLineBytes];
        std::uint32_t size = sizeof line;
        if (memHandle != 0 && m_client.ReadMemHandle(memHandle, 0, line, &size) == 0 &&
            m_tally.Take(line, size)) {
            m_loop.Quit();
        }
        return 0;
    }

private:
    int Fail(int result) {
        std::printf("failed %d\n", result);
        std::fflush(stdout);
        m_loop.Quit();
        return 0;
    }

    NatsArmClient& m_client;
    PollRunLoop& m_loop;
    Tally& m_tally;
    std::uint32_t m_ape = 0;
};

int RunComponent(const std::string& url, const std::string& user, const std::string& password,
                 std::uint32_t nodeId, Tally& tally) {
    NatsConferenceOptions options;
    options.serverUrls = {url};
    options.conferenceId = kBenchConference;
    options.nodeId = nodeId;
    options.user = user;
    options.password = password;
    PollRunLoop loop;
    auto* client = new NatsArmClient(options, loop);
    ComponentReceiver receiver(*client, loop, tally);
    client->Connect(&receiver, user.c_str(), 0, 0, 0);
    // The deliveries come from the service's threads; the timer keeps the loop waiting for them.
    loop.AddTimer(kPatienceSeconds, 0, [&loop] { loop.Quit(); });
    loop.Run();
    client->Release();
    return 0;
}

void OnRawLine(natsConnection*, natsSubscription*, natsMsg* msg, void* closure) {
    static_cast<Tally*>(closure)->Take(natsMsg_GetData(msg),
                                       static_cast<std::size_t>(natsMsg_GetDataLength(msg)));
    natsMsg_Destroy(msg);
}

// The same lines taken by an ordered consumer of the conference's stream, without the service.
int RunJetStream(const std::string& url, const std::string& user, const std::string& password,
                 Tally& tally) {
    const ConferenceSubjects subjects(kBenchConference);
    const std::string inbox = ConferenceSubjects::InboxPrefix(user);
    natsOptions* rawOptions = nullptr;
    natsOptions_Create(&rawOptions);
    NatsPtr<natsOptions> options(rawOptions);
    natsOptions_SetURL(rawOptions, url.c_str());
    natsOptions_SetUserInfo(rawOptions, user.c_str(), password.c_str());
    natsOptions_SetCustomInboxPrefix(rawOptions, inbox.c_str());
    natsConnection* rawConnection = nullptr;
    if (natsConnection_Connect(&rawConnection, rawOptions) != NATS_OK) return 1;
    NatsPtr<natsConnection> connection(rawConnection);
    jsCtx* rawJs = nullptr;
    natsConnection_JetStream(&rawJs, rawConnection, nullptr);
    NatsPtr<jsCtx> js(rawJs);
    jsSubOptions subOptions;
    jsSubOptions_Init(&subOptions);
    const std::string stream = subjects.CacheStream();
    subOptions.Stream = stream.c_str();
    subOptions.Ordered = true;
    subOptions.Config.DeliverPolicy = js_DeliverNew;
    natsSubscription* rawSub = nullptr;
    jsErrCode error = static_cast<jsErrCode>(0);
    const std::string filter = subjects.CacheFilter(kRawCacheHandle);
    if (js_Subscribe(&rawSub, rawJs, filter.c_str(), &OnRawLine, &tally, nullptr, &subOptions,
                     &error) != NATS_OK) {
        return 1;
    }
    NatsPtr<natsSubscription> sub(rawSub);
    natsConnection_Flush(rawConnection);
    SayReady();
    tally.WaitAll(kPatienceSeconds);
    natsSubscription_Unsubscribe(rawSub);
    natsConnection_Close(rawConnection);
    return 0;
}

}  // namespace

std::int64_t MonotonicNanos() {
    return std::chrono::duration_cast<std::chrono::nanoseconds>(
               std::chrono::steady_clock::now().time_since_epoch())
        .count();
}

std::string BenchLine(int sequence) {
    std::string line = std::to_string(sequence) + " " + std::to_string(MonotonicNanos()) + " ";
    line.resize(kLineBytes, 'x');
    return line;
}

bool ParseBenchLine(const char* data, std::size_t length, int* sequence, std::int64_t* sentNanos) {
    const std::string line(data, length);
    long long sent = 0;
    return std::sscanf(line.c_str(), "%d %lld", sequence, &sent) == 2 && (*sentNanos = sent) > 0;
}

int RunBenchReceiver(const std::string& mode, const std::string& url, const std::string& user,
                     const std::string& password, std::uint32_t nodeId) {
    // Twenty receivers' connection notes would bury the figures.
    SetTraceSink([](TraceLevel, const char*, const char*) {});
    Tally tally;
    const int status = mode == "component" ? RunComponent(url, user, password, nodeId, tally)
                                           : RunJetStream(url, user, password, tally);
    tally.Print();
    return status;
}
