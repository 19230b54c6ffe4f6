// One chat engine behind a recording window, fed with hand-made application-roster reports,
// for the send-to menu and roster-change tests. Commands are described as short texts
// ("insert 3 bob", "select 0") so a test can state the exact sequence the window saw.
#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <deque>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "engine/chat_client.h"
#include "pdu/roster_info_pdu.h"
#include "platform/inproc_conference.h"
#include "platform/virtual_run_loop.h"
#include "tests/support/recording_window.h"
#include "tests/support/trace_capture.h"

namespace menutest {

constexpr std::uint32_t kSession = 77;
constexpr std::uint32_t kMyNode = 100;
constexpr std::uint32_t kMyUser = 1100;

// Who a roster report names.
struct Person {
    std::uint32_t node = 0;
    std::string name;
    std::uint32_t roles = 0;
    std::uint32_t tag = 0;
    std::uint32_t user() const { return node + 1000; }
};

// The enroll bytes a participant publishes.
inline std::string EnrollBytes(const Person& person) {
    CRosterInfoPDU pdu;
    pdu.SetNodeID(person.node);
    pdu.SetUserName(person.name);
    pdu.SetRoleSet(person.roles);
    pdu.SetVisible(1);
    pdu.SetUserType(1);
    pdu.SetUserExternalTag(person.tag);
    pdu.GenerateXMLPDU();
    return pdu.ToWireText();
}

// One entry of a report as the service lays it out: the user entry and the bytes it points at.
struct ReportEntry {
    std::uint32_t node = 0;
    std::uint32_t user = 0;
    std::string bytes;
};

inline ReportEntry EntryFor(const Person& person) {
    return {person.node, person.user(), EnrollBytes(person)};
}

// Records of one callback, back to back; each record carries its own user entries.
class RosterReport {
public:
    // Adds a record of the given session holding the entries.
    RosterReport& Record(std::uint32_t session, std::vector<ReportEntry> entries) {
        m_entries.push_back(std::move(entries));
        m_users.emplace_back();
        for (const ReportEntry& e : m_entries.back())
            m_users.back().push_back({e.node, e.user,
                                      reinterpret_cast<const std::uint8_t*>(e.bytes.data()),
                                      static_cast<std::int32_t>(e.bytes.size())});
        const auto count = static_cast<std::uint16_t>(m_users.back().size());
        m_records.push_back({0, session, 0, count, 0, m_users.back().data()});
        return *this;
    }
    // The records, valid while the report lives.
    ARMApeRoster* Records() { return m_records.data(); }

private:
    std::deque<std::vector<ReportEntry>> m_entries;  // a deque keeps what the records point at
    std::deque<std::vector<ARMApeUser>> m_users;
    std::vector<ARMApeRoster> m_records;
};

// How the engine starts.
struct Options {
    std::int32_t meetingType = 1;
    bool selector = false;
    std::int32_t tagMode = 0;
    std::uint32_t features = 0;
    bool answerBack = false;  // the window reports selections back as a real one does
    bool conference = false;  // attached through an in-process conference, caches and all
};

// Commands that name one menu position, by verb; others not described here keep their names.
inline std::string Describe(const RecordedCommand& c) {
    static const std::map<int, std::string> kAtIndex = {
        {msg_RemoveMenuItem, "remove"}, {msg_SelectedUserLeft, "left"},
        {msg_SelectMenuItem, "select"}, {msg_SelectMenuItemAndAllowInput, "select+input"},
        {msg_AllowUserInput, "input"},  {msg_SelectionChanged, "report"}};
    const std::string index = std::to_string(c.index);
    if (kAtIndex.count(c.id)) return kAtIndex.at(c.id) + " " + index;
    if (c.id == msg_InsertMenuItem)
        return "insert " + index + " " + (c.entry.bSeparator ? "---" : c.entry.strTitle);
    if (c.id == msg_RenameMenuItem) return "rename " + index + " " + c.text;
    if (c.id == msg_UpdateMenuItem) return "update " + index + (c.entry.bEnabled ? " on" : " off");
    return c.name;
}

// Has the engine add one group, or a separator (type 2).
inline void AddGroup(CChatClient& engine, std::uint32_t index, std::uint32_t type, std::uint32_t id,
                     const char* name, int intoMenu = 1) {
    _tagChatGroupInfo info{};
    info.dwIndex = index;
    info.dwGroupType = type;
    info.dwGroupId = id;
    info.cszGroupName = name;
    engine.AddGroup(&info, intoMenu);
}

// The menu as titles; separators as "---", the selected entry marked with "*".
inline std::vector<std::string> Titles(const CChatClient& engine) {
    std::vector<std::string> titles;
    for (const MenuStatus& e : engine.Menu())
        titles.push_back((e.bSelected ? "*" : "") + (e.bSeparator ? "---" : e.strTitle));
    return titles;
}

// The texts joined with "|", so that a table row states a whole menu or command run in one text.
inline std::string Join(const std::vector<std::string>& texts) {
    std::string joined;
    for (std::size_t i = 0; i < texts.size(); ++i)
        joined += (i ? "|" : "") + texts[i];
    return joined;
}

// "|"-joined texts apart again; an empty text holds none.
inline std::vector<std::string> Split(const std::string& joined) {
    std::vector<std::string> texts;
    for (std::size_t from = 0; !joined.empty() && from <= joined.size();) {
        const std::size_t bar = std::min(joined.find('|', from), joined.size());
        texts.push_back(joined.substr(from, bar - from));
        from = bar + 1;
    }
    return texts;
}

// What follows the prefix in each trace line that starts with it, joined with "|".
inline std::string Traced(const TraceCapture& trace, const std::string& prefix) {
    std::vector<std::string> rests;
    for (const std::string& text : trace.Texts())
        if (text.rfind(prefix, 0) == 0) rests.push_back(text.substr(prefix.size()));
    return Join(rests);
}

class MenuHarness {
public:
    explicit MenuHarness(const Options& options = Options()) {
        RecordingWindow::Install(options.answerBack);
        ChatData data{};
        data.dwSessionID = kSession;
        data.lpszUserName = "me";
        data.dwNodeID = kMyNode;
        data.lMeetingType = options.meetingType;
        data.bUseAttendeeSelector = options.selector ? 1 : 0;
        data.lExternalTagMode = options.tagMode;
        if (options.conference) {
            net = std::make_unique<Conference>();
            data.pArmClient = net->conference.CreateClient(net->loop, kMyNode);
            data.wConferenceID = net->conference.ConferenceId();
        }
        engine.Initialize(data);
        if (net) {
            net->loop.RunUntilIdle();
        } else {
            engine.ApeAttachConfirm(1, 0, kMyUser);
        }
        if (options.features) engine.SelectFeature(options.features, 0, 0, 0, 0, nullptr);
        window = RecordingWindow::Latest();
    }
    ~MenuHarness() { RecordingWindow::Uninstall(); }

    // Appends group entries (and "---" separators) to the menu.
    void Seed(const std::vector<std::pair<std::string, std::uint32_t>>& groups) {
        for (const auto& g : groups) {
            const bool separator = g.first == "---";
            AddGroup(engine, 1000, separator ? 2 : 1, g.second,
                     separator ? nullptr : g.first.c_str());
        }
    }

    // The same from "|"-joined "title id" texts, e.g. "Host 1|---|All Attendees 8".
    void Seed(const char* groups) {
        for (const std::string& g : Split(groups)) {
            const std::size_t space = g.rfind(' ');
            const int id = g == "---" ? 0 : std::atoi(g.c_str() + space + 1);
            Seed({{g.substr(0, space), static_cast<std::uint32_t>(id)}});
        }
    }

    // The people in one record of this session, reported as added, deleted or modified.
    void Report(const std::vector<Person>& people, std::uint32_t added, std::uint32_t deleted,
                std::uint32_t modified) {
        std::vector<ReportEntry> entries;
        for (const Person& p : people)
            entries.push_back(EntryFor(p));
        RosterReport report;
        report.Record(kSession, std::move(entries));
        engine.ApeRosterChanged(1, 0, added, deleted, modified, report.Records());
    }
    void Enroll(const std::vector<Person>& people) { Report(people, 1, 0, 0); }
    void Leave(const Person& person) { Report({person}, 0, 1, 0); }
    void Modify(const Person& person) { Report({person}, 0, 0, 1); }

    std::vector<std::string> Titles() const { return menutest::Titles(engine); }
    std::string Menu() const { return Join(Titles()); }
    // The commands the window saw since the last call, described.
    std::vector<std::string> Commands() {
        std::vector<std::string> out;
        for (const RecordedCommand& c : window->Commands())
            out.push_back(Describe(c));
        window->Clear();
        return out;
    }
    std::string Seen() { return Join(Commands()); }

    // The conference an engine started with the conference option is attached through.
    struct Conference {
        VirtualRunLoop loop;
        ScopedCurrentRunLoop current{&loop};
        InProcessConference conference;
    };
    std::unique_ptr<Conference> net;
    CChatClient engine;
    RecordingWindow* window = nullptr;
};

}  // namespace menutest
