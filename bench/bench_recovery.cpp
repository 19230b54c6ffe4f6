// How fast a late joiner restores the chat history: the caches of an in-process conference
// hold 10,000 messages from 50 senders (7,500 to everyone in the everyone group's cache,
// 2,500 private lines among the senders in the customer cache), who have all left. Timed from
// the joiner's start until the last restored line is shown, beside the floor of parsing the
// same 10,000 documents bare with tinyxml (target: at most 3 times). Also prints the peak of
// the memory the restore allocated on top of what the joiner held before it joined.
//
// On the 2-core development VM at rest: restore 59-60 ms against a 20.7-21 ms floor, ratio
// 2.8 to 2.9, peak 9.5 MB (under load from other work the ratio drifts above 3). Every everyone line is parsed once, shown, and backed up into the
// customer cache (built, printed and appended: about a fifth of the restore), since none of
// them was copied there before; showing (title, transcript, host, traces) takes about as much.
#include <time.h>
#include <tinyxml.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <new>
#include <string>
#include <vector>

#include "engine/chat_client.h"
#include "pdu/chat_user_info_pdu.h"
#include "pdu/group_message_pdu.h"
#include "pdu/private_message_pdu.h"
#include "platform/conference_null_sink.h"
#include "platform/inproc_conference.h"
#include "platform/trace.h"
#include "platform/virtual_run_loop.h"

// ---- Allocation accounting: live bytes and their peak ----

namespace {
// The bench runs on one thread.
long long g_liveBytes = 0;
long long g_peakBytes = 0;

void* CountedAlloc(std::size_t size) {
    // The size is kept in front of the block so that the delete can count it back.
    auto* block = static_cast<std::size_t*>(std::malloc(size + sizeof(std::max_align_t)));
    if (!block) throw std::bad_alloc();
    *block = size;
    g_liveBytes += static_cast<long long>(size);
    if (g_liveBytes > g_peakBytes) g_peakBytes = g_liveBytes;
    return reinterpret_cast<char*>(block) + sizeof(std::max_align_t);
}

void CountedFree(void* p) {
    if (!p) return;
    auto* block = reinterpret_cast<std::size_t*>(static_cast<char*>(p) - sizeof(std::max_align_t));
    g_liveBytes -= static_cast<long long>(*block);
    std::free(block);
}
}  // namespace

void* operator new(std::size_t size) {
    return CountedAlloc(size);
}
void* operator new[](std::size_t size) {
    return CountedAlloc(size);
}
void operator delete(void* p) noexcept {
    CountedFree(p);
}
void operator delete[](void* p) noexcept {
    CountedFree(p);
}
void operator delete(void* p, std::size_t) noexcept {
    CountedFree(p);
}
void operator delete[](void* p, std::size_t) noexcept {
    CountedFree(p);
}

namespace {

constexpr int kSenders = 50;
constexpr int kEveryoneLines = 7500;
constexpr int kPrivateLines = 2500;
constexpr std::uint32_t kSessionId = 42;
constexpr std::uint32_t kCustomerId = 9001;
constexpr std::uint32_t kJoinerNode = 1;
constexpr int kRounds = 9;

// One sender's service object: attached, writing its own lines into the caches.
class Sender final : public ArmNullSink {
public:
    Sender(InProcessConference& conference, RunLoop& loop, std::uint32_t nodeId)
        : m_client(conference.CreateClient(loop, nodeId)) {
        m_client->Connect(this, "sender", 0, 0, 0);
        m_client->ConferenceJoin(0, conference.ConferenceId(), this, 3);
        std::uint32_t ape = 0;
        m_client->ApeAttach(this, 0, conference.ConferenceId(), &ape);
    }
    int AllocNameHandleConfirm(std::uint32_t, std::uint32_t count, NameHandle* handles, short,
                               std::uint32_t) override {
        for (std::uint32_t i = 0; i < count; ++i)
            m_Handles.push_back(handles[i].handle_value);
        return 0;
    }
    // Enrolls in the session (which grants its cache-name prefix) or leaves it again.
    void Enroll(std::uint32_t sessionId, int enroll) {
        ARMSessionResource resource{1, "c_session_id", 1, 0, 0};
        m_client->ApeEnroll(m_client->ApeHandle(), enroll, sessionId, 0, 1, &resource, "", 0, 3);
    }
    void AskHandles(const std::vector<std::string>& names) {
        std::vector<NameHandle> entries(names.size());
        for (std::size_t i = 0; i < names.size(); ++i)
            names[i].copy(entries[i].name, sizeof entries[i].name - 1);
        m_client->AllocNameHandle(m_client->ApeHandle(), static_cast<std::uint32_t>(names.size()),
                                  entries.data(), this);
    }
    void Write(std::uint32_t cache, tagCacheAction action, const std::string& bytes) {
        std::uint32_t mem = 0, size = static_cast<std::uint32_t>(bytes.size());
        m_client->AllocMemHandle(size, &mem);
        m_client->WriteMemHandle(mem, 0, bytes.data(), &size);
        m_client->ApeSharedDataActionEx(m_client->ApeHandle(), cache, 0, 0, action, 0x2000000, mem,
                                        0, 1);
        m_client->FreeMemHandle(mem);
    }
    std::uint32_t UserId() const { return m_client->UserId(); }
    // The handles granted so far, in the order they were asked for.
    const std::vector<std::uint32_t>& Handles() const { return m_Handles; }

private:
    InProcessArmClient* m_client;
    std::vector<std::uint32_t> m_Handles;
};

std::string UserInfo(std::uint32_t userId, int sender) {
    CChatUserInfoPDU pdu;
    pdu.SetUserID(userId);
    pdu.SetUserName("Participant " + std::to_string(sender));
    pdu.GenerateXMLPDU();
    return pdu.ToWireText();
}

std::string Line(int i) {
    return "message number " + std::to_string(i) + ", about the slides on the screen right now";
}

// Processor time of this process: the machine may be shared, so wall time says little.
double CpuMs() {
    timespec now{};
    clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &now);
    return now.tv_sec * 1e3 + now.tv_nsec / 1e6;
}

// What one round measured.
struct Round {
    double floorMs = 0;
    double restoreMs = 0;
    double peakMb = 0;
    bool ok = false;
};

// Fills a fresh conference's caches, parses the same documents bare, then times a joiner.
Round RunRound() {
    VirtualRunLoop loop;
    ScopedCurrentRunLoop current(&loop);
    InProcessConference conference;
    Round round;

    // The senders fill the caches of the session, then leave the conference to the joiner.
    std::vector<std::unique_ptr<Sender>> senders;
    for (int i = 0; i < kSenders; ++i)
        senders.push_back(std::make_unique<Sender>(conference, loop, 100 + i));
    loop.RunUntilIdle();
    senders[0]->Enroll(kSessionId, 1);
    loop.RunUntilIdle();
    senders[0]->Enroll(kSessionId, 0);
    const std::string prefix = std::to_string(conference.SessionValue(kSessionId));
    senders[0]->AskHandles({prefix + "_chat_status", prefix + "_Chat_User_Info",
                            "switch_cache_" + std::to_string(kCustomerId),
                            prefix + "_chat_cache_15"});
    loop.RunUntilIdle();
    const std::vector<std::uint32_t>& handles = senders[0]->Handles();
    if (handles.size() != 4) return round;
    const std::uint32_t status = handles[0], userInfo = handles[1], customer = handles[2],
                        everyone = handles[3];
    const std::string empty(2, '\0');
    for (std::uint32_t cache : {userInfo, customer, everyone})
        senders[0]->Write(cache, CACHE_SET, empty);
    senders[0]->Write(status, CACHE_SET, std::string("1", 2));

    std::vector<std::string> documents;
    for (int i = 0; i < kSenders; ++i)
        senders[i]->Write(userInfo, CACHE_APPEND, UserInfo(senders[i]->UserId(), i));
    for (int i = 0; i < kEveryoneLines; ++i) {
        CGroupMessagePDU pdu;
        pdu.SetSenderName("Participant " + std::to_string(i % kSenders));
        pdu.SetSendID(senders[i % kSenders]->UserId());
        pdu.SetGroupID(15u);
        pdu.SetMessageContent(Line(i));
        pdu.GenerateXMLPDU();
        documents.push_back(pdu.ToWireText());
        senders[i % kSenders]->Write(everyone, CACHE_APPEND, documents.back());
    }
    for (int i = 0; i < kPrivateLines; ++i) {
        CPrivateMessagePDU pdu;
        pdu.SetSenderName("Participant " + std::to_string(i % kSenders));
        pdu.SetSendID(senders[i % kSenders]->UserId());
        pdu.SetReveID(senders[(i + 1) % kSenders]->UserId());
        pdu.SetMessageContent(Line(i));
        pdu.GenerateXMLPDU();
        documents.push_back(pdu.ToWireText());
        senders[(i + 1) % kSenders]->Write(customer, CACHE_APPEND, documents.back());
    }
    loop.RunUntilIdle();

    // The floor: the same documents parsed bare.
    double start = CpuMs();
    std::size_t parsed = 0;
    for (const std::string& text : documents) {
        TiXmlDocument doc;
        doc.Parse(text.c_str());
        parsed += doc.Error() ? 0 : 1;
    }
    round.floorMs = CpuMs() - start;

    // The joiner, in QM mode with group recovery and the senders' customer id.
    InProcessArmClient* client = conference.CreateClient(loop, kJoinerNode);
    auto joiner = std::make_unique<CChatClient>();
    joiner->SelectFeature(FEATURE_QM_MODE | FEATURE_GROUP_MSG_RECOVERY, 0, 0, 0, 0, nullptr);
    const std::string config = "<chat ver=\"1.0\"><mtype>11</mtype><customerid>" +
                               std::to_string(kCustomerId) + "</customerid></chat>";
    joiner->SetConfig(3, config.c_str());
    _tagChatData data{};
    data.pArmClient = client;
    data.wConferenceID = conference.ConferenceId();
    data.dwSessionID = kSessionId;
    data.lpszUserName = "Late";
    data.dwNodeID = kJoinerNode;
    data.lMeetingType = 1;
    const long long baseline = g_liveBytes;
    g_peakBytes = baseline;
    start = CpuMs();
    joiner->Initialize(data);
    loop.RunUntilIdle();
    round.restoreMs = CpuMs() - start;
    round.peakMb = static_cast<double>(g_peakBytes - baseline) / 1e6;
    round.ok =
        parsed == documents.size() && joiner->ChatContent().GetTimeCount() ==
                                          static_cast<std::size_t>(kEveryoneLines + kPrivateLines);
    return round;
}

}  // namespace

int main() {
    SetTraceSink([](TraceLevel, const char*, const char*) {});
    Round best;
    best.floorMs = best.restoreMs = 1e9;
    bool ok = true;
    for (int i = 0; i < kRounds; ++i) {
        const Round round = RunRound();
        ok = ok && round.ok;
        best.floorMs = std::min(best.floorMs, round.floorMs);
        if (round.restoreMs < best.restoreMs) {
            best.restoreMs = round.restoreMs;
            best.peakMb = round.peakMb;
        }
    }
    std::printf(
        "late joiner restoring %d messages from %d senders, fastest of %d rounds "
        "(processor time)\n",
        kEveryoneLines + kPrivateLines, kSenders, kRounds);
    std::printf(
        "restore %7.2f ms   floor (bare tinyxml parse of the same documents) %6.2f ms   "
        "ratio %.2f (target <= 3)\n",
        best.restoreMs, best.floorMs, best.restoreMs / best.floorMs);
    std::printf("peak memory of the restore %.1f MB%s\n", best.peakMb,
                ok ? "" : "; NOT every line was shown once");
    return ok ? 0 : 1;
}
