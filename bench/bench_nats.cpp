// Group lines from one participant to twenty others in processes of their own, on a nats-server
// of its own on loopback: once through the networked conference service (a cache append seen
// by every subscriber) and once as the same bytes published to JetStream and taken by ordered
// consumers without it. Prints the latency (median and 99th percentile of lines sent 10 ms
// apart) and the throughput of a burst, and the ratios between the two
// (targets: throughput at least half, median latency at most twice).
// Usage: bench_nats            (a receiver runs as: bench_nats --receive MODE URL USER PASSWORD
// NODE)
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

#include "bench/bench_nats_peer.h"
#include "netconf/nats_arm_client.h"
#include "platform/conference_null_sink.h"
#include "platform/poll_run_loop.h"
#include "platform/trace.h"
#include "tests/netconf/nats_server.h"

namespace {

constexpr int kReceivers = 20;
constexpr auto kPacedGap = std::chrono::milliseconds(10);

std::string UserOf(int index) {
    return "b" + std::to_string(index);
}

std::string PasswordOf(const std::string& user) {
    return "pw-" + user;
}

struct Figures {
    double medianMicros = 0;
    double p99Micros = 0;
    double linesPerSecond = 0;
    int missing = 0;  // lines some receiver never took
};

// The sender's own service object: joined, attached and holding the bench cache's handle.
class ComponentSender final : public ArmNullSink {
public:
    ComponentSender(NatsArmClient& client, PollRunLoop& loop) : m_client(client), m_loop(loop) {}

    int ConnectConfirm(short result, std::uint32_t) override {
        return result == 0 ? m_client.ConferenceJoin(0, kBenchConference, this, 3) : Stop();
    }
    int ConferenceJoinConfirm(std::uint16_t, const char*, short result, std::uint32_t) override {
        return result == 0 ? m_client.ApeAttach(this, 0, kBenchConference, &m_ape) : Stop();
    }
    int ApeAttachConfirm(std::uint32_t, short result, std::uint32_t) override {
        if (result != 0) return Stop();
        NameHandle entry{};
        std::snprintf(entry.name, sizeof entry.name, "%s", kBenchCacheName);
        return m_client.AllocNameHandle(m_ape, 1, &entry, this);
    }
    int AllocNameHandleConfirm(std::uint32_t, std::uint32_t count, NameHandle* handles,
                               short result, std::uint32_t) override {
        if (result == 0 && count == 1) m_cache = handles[0].handle_value;
        return Stop();
    }
    bool Ready() const { return m_cache != 0; }
    void Send(const std::string& line) {
        std::uint32_t mem = 0, size = static_cast<std::uint32_t>(line.size());
        m_client.AllocMemHandle(size, &mem);
        m_client.WriteMemHandle(mem, 0, line.data(), &size);
        m_client.ApeSharedDataActionEx(m_ape, m_cache, 0, 0, CACHE_APPEND, 0, mem, 0, 0);
        m_client.FreeMemHandle(mem);
        m_loop.RunUntilIdle();
    }

private:
    int Stop() {
        m_loop.Quit();
        return 0;
    }

    NatsArmClient& m_client;
    PollRunLoop& m_loop;
    std::uint32_t m_ape = 0;
    std::uint32_t m_cache = 0;
};

// The same lines published to the conference's stream by a plain client, one acknowledged
// publish after the other as the service does.
class JetStreamSender {
public:
    JetStreamSender(const std::string& url, const std::string& user) {
        natsOptions* rawOptions = nullptr;
        natsOptions_Create(&rawOptions);
        NatsPtr<natsOptions> options(rawOptions);
        natsOptions_SetURL(rawOptions, url.c_str());
        natsOptions_SetUserInfo(rawOptions, user.c_str(), PasswordOf(user).c_str());
        const std::string inbox = ConferenceSubjects::InboxPrefix(user);
        natsOptions_SetCustomInboxPrefix(rawOptions, inbox.c_str());
        natsConnection* rawConnection = nullptr;
        if (natsConnection_Connect(&rawConnection, rawOptions) != NATS_OK) return;
        m_connection.reset(rawConnection);
        jsCtx* rawJs = nullptr;
        natsConnection_JetStream(&rawJs, rawConnection, nullptr);
        m_js.reset(rawJs);
        m_subject = ConferenceSubjects(kBenchConference).CacheAction(kRawCacheHandle, user);
    }
    bool Ready() const { return m_js != nullptr; }
    void Send(const std::string& line) {
        jsPubAck* rawAck = nullptr;
        js_Publish(&rawAck, m_js.get(), m_subject.c_str(), line.data(),
                   static_cast<int>(line.size()), nullptr, nullptr);
        NatsPtr<jsPubAck> ack(rawAck);
    }

private:
    NatsPtr<natsConnection> m_connection;
    NatsPtr<jsCtx> m_js;
    std::string m_subject;
};

double Percentile(std::vector<long long>& values, double fraction) {
    if (values.empty()) return 0;
    const std::size_t at =
        std::min(values.size() - 1, static_cast<std::size_t>(fraction * values.size()));
    std::nth_element(values.begin(), values.begin() + at, values.end());
    return static_cast<double>(values[at]);
}

// Starts the receivers, waits until all listen, sends through send and collects the figures.
template <typename Sender>
Figures Measure(const char* self, const std::string& mode, const std::string& url, Sender& sender) {
    std::vector<FILE*> receivers;
    for (int i = 1; i <= kReceivers; ++i) {
        const std::string command = std::string(self) + " --receive " + mode + " " + url + " " +
                                    UserOf(i) + " " + PasswordOf(UserOf(i)) + " " +
                                    std::to_string(i + 1);
        receivers.push_back(popen(command.c_str(), "r"));
    }
    char word[16] = {};
    for (FILE* receiver : receivers) {
        if (receiver == nullptr || std::fscanf(receiver, "%15s", word) != 1 ||
            std::string(word) != "ready") {
            std::fprintf(stderr, "%s: a receiver did not start (%s)\n", mode.c_str(), word);
        }
    }
    int sequence = 0;
    for (int i = 0; i < kPacedLines; ++i) {
        sender.Send(BenchLine(++sequence));
        std::this_thread::sleep_for(kPacedGap);
    }
    const std::int64_t burstStart = MonotonicNanos();
    for (int i = 0; i < kBurstLines; ++i)
        sender.Send(BenchLine(++sequence));

    Figures figures;
    std::vector<long long> delays;
    std::int64_t lastTaken = burstStart;
    for (FILE* receiver : receivers) {
        long long last = 0;
        int taken = 0;
        if (receiver == nullptr) {
            figures.missing += kPacedLines + kBurstLines;
            continue;
        }
        if (std::fscanf(receiver, "%15s %lld %d", word, &last, &taken) != 3) taken = 0;
        for (long long delay; static_cast<int>(delays.size()) < kPacedLines * kReceivers &&
                              std::fscanf(receiver, " %lld", &delay) == 1;) {
            delays.push_back(delay);
        }
        figures.missing += kPacedLines + kBurstLines - taken;
        lastTaken = std::max<std::int64_t>(lastTaken, last);
        pclose(receiver);
    }
    figures.medianMicros = Percentile(delays, 0.5);
    figures.p99Micros = Percentile(delays, 0.99);
    figures.linesPerSecond = kBurstLines / ((lastTaken - burstStart) / 1e9);
    return figures;
}

void Print(const char* name, const Figures& figures) {
    std::printf(
        "%-10s latency median %8.0f us, p99 %8.0f us; throughput %8.0f lines/s "
        "(%.2f MB/s to %d receivers)%s\n",
        name, figures.medianMicros, figures.p99Micros, figures.linesPerSecond,
        figures.linesPerSecond * kLineBytes * kReceivers / 1e6, kReceivers,
        figures.missing == 0 ? "" : (" MISSING " + std::to_string(figures.missing)).c_str());
}

}  // namespace

int main(int argc, char** argv) {
    if (argc == 7 && std::string(argv[1]) == "--receive") {
        return RunBenchReceiver(argv[2], argv[3], argv[4], argv[5],
                                static_cast<std::uint32_t>(std::strtoul(argv[6], nullptr, 10)));
    }
    SetTraceSink([](TraceLevel, const char*, const char*) {});
    ConferenceServerOptions serverOptions;
    serverOptions.conferenceId = kBenchConference;
    serverOptions.port = 0;
    for (int i = 0; i <= kReceivers; ++i)
        serverOptions.participants.push_back({UserOf(i), PasswordOf(UserOf(i))});
    NatsServer server(serverOptions);
    if (!server.Start()) {
        std::fprintf(stderr, "nats-server did not start:\n%s\n", server.Log().c_str());
        return 1;
    }

    NatsConferenceOptions options;
    options.serverUrls = {server.Url()};
    options.conferenceId = kBenchConference;
    options.nodeId = 1;
    options.user = UserOf(0);
    options.password = PasswordOf(options.user);
    PollRunLoop loop;
    auto* client = new NatsArmClient(options, loop);
    ComponentSender component(*client, loop);
    client->Connect(&component, options.user.c_str(), 0, 0, 0);
    // The answers come from the service's threads; the timer keeps the loop waiting for them.
    loop.AddTimer(30, 0, [&loop] { loop.Quit(); });
    loop.Run();
    JetStreamSender jetstream(server.Url(), options.user);
    if (!component.Ready() || !jetstream.Ready()) {
        std::fprintf(stderr, "the sender could not join the conference\n");
        client->Release();
        return 1;
    }

    std::printf("%d lines of %zu bytes to %d receivers: %d sent 10 ms apart, then %d at once\n",
                kPacedLines + kBurstLines, kLineBytes, kReceivers, kPacedLines, kBurstLines);
    // The receivers are this program again; the shell that starts them needs its real path.
    char self[4096] = {};
    if (readlink("/proc/self/exe", self, sizeof self - 1) <= 0) return 1;
    const Figures service = Measure(self, "component", server.Url(), component);
    client->Settle();
    const Figures plain = Measure(self, "jetstream", server.Url(), jetstream);
    client->Release();
    Print("component", service);
    Print("jetstream", plain);
    const double throughputRatio = service.linesPerSecond / plain.linesPerSecond;
    const double latencyRatio = service.medianMicros / std::max(1.0, plain.medianMicros);
    std::printf("throughput component/jetstream %.2f (target >= 0.50): %s\n", throughputRatio,
                throughputRatio >= 0.5 ? "met" : "NOT MET");
    std::printf("median latency component/jetstream %.2f (target <= 2.00): %s\n", latencyRatio,
                latencyRatio <= 2.0 ? "met" : "NOT MET");
    return service.missing == 0 && plain.missing == 0 ? 0 : 1;
}
