// The two ends of the networked-conference benchmark: the lines the sender sends (a sequence
// number and the monotonic time of sending, padded to a fixed size) and a receiver in a process
// of its own, taking them through the conference service or straight from JetStream.
#pragma once

#include <cstdint>
#include <string>

constexpr std::uint16_t kBenchConference = 7;
constexpr char kBenchCacheName[] = "bench_cache";
// The cache the plain JetStream run publishes to; no named handle is ever this large.
constexpr std::uint32_t kRawCacheHandle = 0x7fff0001;
constexpr int kPacedLines = 200;   // sent 10 ms apart: their delays are the latency
constexpr int kBurstLines = 1000;  // sent as fast as the sender can: the throughput
constexpr std::size_t kLineBytes = 200;

// Nanoseconds of the monotonic clock, which every process on the machine shares.
std::int64_t MonotonicNanos();
std::string BenchLine(int sequence);
// The sequence number and sending time of a line; false when it is not one.
bool ParseBenchLine(const char* data, std::size_t length, int* sequence, std::int64_t* sentNanos);

// Runs one receiver until it took every line or gave up; prints "ready" once it listens and
// "result <nanos of the last line> <lines taken> <delay of each paced line in microseconds>..."
// at the end. mode is "component" or "jetstream". Returns the process's exit status.
int RunBenchReceiver(const std::string& mode, const std::string& url, const std::string& user,
                     const std::string& password, std::uint32_t nodeId);
