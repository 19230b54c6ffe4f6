// How fast the in-process conference carries chat on the real run loop: one cache append
// fanned out to 50 subscribers, and one private datum, each timed until it was delivered.
// These are the floors any chat-level measurement on this service stands on.
#include <benchmark/benchmark.h>

#include <cstdint>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

#include "platform/conference_null_sink.h"
#include "platform/inproc_conference.h"
#include "platform/poll_run_loop.h"

namespace {

constexpr int kSubscribers = 50;
// About the size of a group chat line as the component writes it.
const std::string kLine(240, 'c');

// Counts what reaches one participant and reads each delivered item, as a receiver would.
class CountingSink final : public ArmNullSink {
public:
    explicit CountingSink(IArmClient* client) : m_pClient(client) {}

    int ApeDataIndication(std::uint32_t, std::uint32_t, std::uint32_t, std::uint16_t,
                          const void* data, std::uint32_t length) override {
        benchmark::DoNotOptimize(data);
        m_bytes += length;
        ++m_received;
        return 0;
    }
    int SharedDataReceivedEx(std::uint32_t, std::uint32_t, std::uint32_t, std::uint32_t memHandle,
                             short, tagCacheAction, std::uint32_t, std::uint32_t,
                             std::uint16_t) override {
        char buffer[512];
        std::uint32_t size = sizeof buffer;
        if (m_pClient->ReadMemHandle(memHandle, 0, buffer, &size) == 0) m_bytes += size;
        ++m_received;
        return 0;
    }
    int AllocNameHandleConfirm(std::uint32_t, std::uint32_t count, NameHandle* handles, short,
                               std::uint32_t) override {
        if (count > 0) m_handle = handles[0].handle_value;
        return 0;
    }

    std::uint64_t Received() const { return m_received; }
    std::uint32_t Handle() const { return m_handle; }

private:
    IArmClient* m_pClient;
    std::uint64_t m_received = 0;
    std::uint64_t m_bytes = 0;
    std::uint32_t m_handle = 0;
};

// A conference whose participants all run on one real loop, attached and ready.
class Room {
public:
    explicit Room(int participants) {
        for (int i = 0; i < participants; ++i) {
            InProcessArmClient* client =
                m_conference.CreateClient(m_loop, static_cast<std::uint32_t>(100 + i));
            m_sinks.push_back(std::make_unique<CountingSink>(client));
            CountingSink* sink = m_sinks.back().get();
            client->Connect(sink, "bench", 0, 0, 0);
            client->ConferenceJoin(0, m_conference.ConferenceId(), sink, 3);
            std::uint32_t ape = 0;
            client->ApeAttach(sink, 0, m_conference.ConferenceId(), &ape);
            m_clients.push_back(client);
        }
        m_loop.RunUntilIdle();
    }

    InProcessArmClient& Client(int i) { return *m_clients[i]; }
    CountingSink& Sink(int i) { return *m_sinks[i]; }
    PollRunLoop& Loop() { return m_loop; }

private:
    PollRunLoop m_loop;
    InProcessConference m_conference;
    std::vector<InProcessArmClient*> m_clients;
    std::vector<std::unique_ptr<CountingSink>> m_sinks;
};

void BM_CacheAppendTo50Subscribers(benchmark::State& state) {
    Room room(kSubscribers + 1);
    InProcessArmClient& writer = room.Client(0);
    NameHandle entry{};
    std::strcpy(entry.name, "70001_chat_cache_15");
    writer.AllocNameHandle(writer.ApeHandle(), 1, &entry, &room.Sink(0));
    room.Loop().RunUntilIdle();
    const std::uint32_t cache = room.Sink(0).Handle();
    for (int i = 1; i <= kSubscribers; ++i) {
        room.Client(i).ApeRequestSharedDataEx(room.Client(i).ApeHandle(), cache, 0,
                                              CACHE_REQUEST_SUBSCRIBE, 255, &room.Sink(i));
    }

    for (auto _ : state) {
        std::uint32_t mem = 0, size = static_cast<std::uint32_t>(kLine.size());
        writer.AllocMemHandle(size, &mem);
        writer.WriteMemHandle(mem, 0, kLine.data(), &size);
        writer.ApeSharedDataActionEx(writer.ApeHandle(), cache, 0, 0, CACHE_APPEND, 0x2000000, mem,
                                     0, 1);
        writer.FreeMemHandle(mem);
        room.Loop().RunUntilIdle();
    }
    std::uint64_t delivered = 0;
    for (int i = 1; i <= kSubscribers; ++i)
        delivered += room.Sink(i).Received();
    if (delivered != static_cast<std::uint64_t>(state.iterations()) * kSubscribers)
        state.SkipWithError("deliveries lost");
    state.SetItemsProcessed(state.iterations());
    state.counters["deliveries/s"] =
        benchmark::Counter(static_cast<double>(delivered), benchmark::Counter::kIsRate);
}
BENCHMARK(BM_CacheAppendTo50Subscribers);

void BM_PrivateDatum(benchmark::State& state) {
    Room room(2);
    InProcessArmClient& sender = room.Client(0);
    const std::uint32_t receiver = room.Client(1).UserId();
    for (auto _ : state) {
        sender.ApeSendData(sender.ApeHandle(), receiver, 1, kLine.data(),
                           static_cast<std::uint32_t>(kLine.size()), 1, 1);
        room.Loop().RunUntilIdle();
    }
    if (room.Sink(1).Received() != static_cast<std::uint64_t>(state.iterations()))
        state.SkipWithError("data lost");
    state.SetItemsProcessed(state.iterations());
}
BENCHMARK(BM_PrivateDatum);

}  // namespace

BENCHMARK_MAIN();
