// One chat engine behind a recording window, fed with hand-made application-roster reports,
// for the send-to menu and roster-change tests. Commands are described as short texts
// ("insert 3 bob", "select 0") so a test can state the exact sequence the window saw.
#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "engine/chat_client.h"
#include "pdu/roster_info_pdu.h"
#include "tests/support/recording_window.h"

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
    bool withData = true;
};

// Records of one callback, back to back; each record carries its own user entries.
class RosterReport {
public:
    // Adds a record of the given session holding the entries.
    RosterReport& Record(std::uint32_t session, std::vector<ReportEntry> entries) {
        m_entries.push_back(std::move(entries));
        m_sessions.push_back(session);
        return *this;
    }
    // The records, valid while the report lives and is not changed.
    ARMApeRoster* Records() {
        m_users.clear();
        m_records.assign(m_entries.size(), ARMApeRoster{});
        for (std::size_t i = 0; i < m_entries.size(); ++i) {
            m_users.emplace_back(m_entries[i].size());
            for (std::size_t j = 0; j < m_entries[i].size(); ++j) {
                const ReportEntry& e = m_entries[i][j];
                ARMApeUser& u = m_users.back()[j];
                u.dwNodeID = e.node;
                u.dwUserID = e.user;
                u.pEnrollInfo =
                    e.withData ? reinterpret_cast<const std::uint8_t*>(e.bytes.data()) : nullptr;
                u.nEnrollInfoLen = e.withData ? static_cast<std::int32_t>(e.bytes.size()) : -1;
            }
            m_records[i].dwSessionID = m_sessions[i];
            m_records[i].wUserCount = static_cast<std::uint16_t>(m_entries[i].size());
            m_records[i].pUsers = m_users.back().data();
        }
        return m_records.data();
    }

private:
    std::vector<std::vector<ReportEntry>> m_entries;
    std::vector<std::uint32_t> m_sessions;
    std::vector<std::vector<ARMApeUser>> m_users;
    std::vector<ARMApeRoster> m_records;
};

inline ReportEntry EntryFor(const Person& person) {
    return {person.node, person.user(), EnrollBytes(person), true};
}

// How the engine starts.
struct Options {
    std::int32_t meetingType = 1;
    bool selector = false;
    std::int32_t tagMode = 0;
    std::uint32_t features = 0;
};

inline std::string Describe(const RecordedCommand& c) {
    const std::string index = std::to_string(c.index);
    const std::string title = c.entry.bSeparator ? "---" : c.entry.strTitle;
    switch (c.id) {
        case msg_InsertMenuItem:
            return "insert " + index + " " + title;
        case msg_RemoveMenuItem:
            return "remove " + index;
        case msg_SelectedUserLeft:
            return "left " + index;
        case msg_RenameMenuItem:
            return "rename " + index + " " + c.text;
        case msg_SelectMenuItem:
            return "select " + index;
        case msg_SelectMenuItemAndAllowInput:
            return "select+input " + index;
        case msg_UpdateMenuItem:
            return "update " + index + (c.entry.bEnabled ? " on" : " off");
        case msg_RebuildMenu:
            return "rebuild";
        case msg_AllowUserInput:
            return "input " + index;
        case msg_EnableUserList:
            return "enable list";
        case msg_DisableUserList:
            return "disable list";
        case msg_ClearInput:
            return "clear input";
        default:
            return c.name;
    }
}

class MenuHarness {
public:
    explicit MenuHarness(const Options& options = Options()) {
        RecordingWindow::Install();
        ChatData data{};
        data.dwSessionID = kSession;
        data.lpszUserName = "me";
        data.dwNodeID = kMyNode;
        data.lMeetingType = options.meetingType;
        data.bUseAttendeeSelector = options.selector ? 1 : 0;
        data.lExternalTagMode = options.tagMode;
        engine.Initialize(data);
        engine.ApeAttachConfirm(1, 0, kMyUser);
        if (options.features) engine.SelectFeature(options.features, 0, 0, 0, 0, nullptr);
        window = RecordingWindow::Latest();
    }
    ~MenuHarness() { RecordingWindow::Uninstall(); }

    // Appends group entries (and "---" separators) to the menu.
    void Seed(const std::vector<std::pair<std::string, std::uint32_t>>& groups) {
        for (const auto& group : groups) {
            const bool separator = group.first == "---";
            _tagChatGroupInfo info{};
            info.dwIndex = 1000;
            info.dwGroupType = separator ? 2 : 1;
            info.dwGroupId = separator ? 0 : group.second;
            info.cszGroupName = separator ? nullptr : group.first.c_str();
            engine.AddGroup(&info, 1);
        }
    }

    void Enroll(const std::vector<Person>& people) {
        std::vector<ReportEntry> entries;
        for (const Person& p : people)
            entries.push_back(EntryFor(p));
        RosterReport report;
        report.Record(kSession, entries);
        engine.ApeRosterChanged(1, 0, 1, 0, 0, report.Records());
    }
    void Leave(const Person& person) {
        RosterReport report;
        report.Record(kSession, {EntryFor(person)});
        engine.ApeRosterChanged(1, 0, 0, 1, 0, report.Records());
    }
    void Modify(const Person& person) {
        RosterReport report;
        report.Record(kSession, {EntryFor(person)});
        engine.ApeRosterChanged(1, 0, 0, 0, 1, report.Records());
    }

    // The menu as titles; separators as "---", the selected entry marked with "*".
    std::vector<std::string> Titles() const {
        std::vector<std::string> titles;
        for (const MenuStatus& e : engine.Menu())
            titles.push_back((e.bSelected ? "*" : "") + (e.bSeparator ? "---" : e.strTitle));
        return titles;
    }
    // The commands the window saw since the last call, described.
    std::vector<std::string> Commands() {
        std::vector<std::string> out;
        for (const RecordedCommand& c : window->Commands())
            out.push_back(Describe(c));
        window->Clear();
        return out;
    }

    CChatClient engine;
    RecordingWindow* window = nullptr;
};

}  // namespace menutest
