// A scenario run by the desktop program's one participant, named `me` in the script; others
// are named by their node numbers. Whatever depends on other machines (a remote line, a roster
// entry in the send-to list) is waited for, up to a bound, and reported as a timeout failure
// when it does not come.
#pragma once

#include <cstdio>
#include <set>
#include <string>
#include <vector>

#include "sim/lang/scenario.h"

class DesktopParticipant;
struct PopupItem;

class DesktopScript {
public:
    DesktopScript(DesktopParticipant& me, std::FILE* out);
    ~DesktopScript();
    DesktopScript(const DesktopScript&) = delete;
    DesktopScript& operator=(const DesktopScript&) = delete;

    // Runs every command after the conference line; the number of failures.
    int Run(const std::vector<ScenarioCommand>& commands);

private:
    using Check = std::string (DesktopScript::*)(const ScenarioCommand&);

    void Execute(const ScenarioCommand& c);
    void Fail(const ScenarioCommand& c, const std::string& message);
    // Waits until check gives no complaint; the last complaint once the wait is over.
    std::string WaitFor(const ScenarioCommand& c, Check check);
    // The component of the participant the argument names; null (reported) when not me.
    bool IsMe(const ScenarioCommand& c, std::size_t index);

    void HostCall(const ScenarioCommand& c);
    void Select(const ScenarioCommand& c);
    void Say(const ScenarioCommand& c);
    void Pick(const ScenarioCommand& c);
    void Expect(const ScenarioCommand& c);
    void Print();

    // Expectation checks: "" when it holds, else what was seen.
    std::string CheckLine(const ScenarioCommand& c);
    std::string CheckMenu(const ScenarioCommand& c);
    std::string CheckInput(const ScenarioCommand& c);
    std::string CheckInputText(const ScenarioCommand& c);
    std::string CheckWarning(const ScenarioCommand& c);
    std::string CheckSound(const ScenarioCommand& c);
    std::string SelectableNow(const ScenarioCommand& c);
    std::string InputOpen(const ScenarioCommand&);

    // The popup's index of the item a select names; -1 when it is not there.
    int SelectIndex(const ScenarioCommand& c) const;
    std::vector<std::string> EngineMenu() const;
    std::vector<std::string> PopupMenu() const;

    DesktopParticipant& m_me;
    std::FILE* m_out;
    int m_failures = 0;
    std::size_t m_linesSeen = 0;      // transcript entries at the last expect or print
    std::set<std::size_t> m_claimed;  // entries an `expect line` has matched
    std::vector<std::string> m_warnings;
    int m_sounds = 0;
};
