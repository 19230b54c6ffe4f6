// One entry of the send-to menu model; the engine keeps the model, the window mirrors it.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

struct MenuStatus {
    std::string strTitle;        // text shown
    std::uint32_t dwNodeID = 0;  // participant of a participant entry; 0 otherwise
    bool bEnabled = true;        // the entry can be chosen
    bool bSelected = false;      // the current audience; at most one entry is selected
    std::uint8_t bReserved = 0;
    std::int32_t nGroupID = -1;  // group id of a group entry; -1 otherwise
    bool bSeparator = false;     // a separator line
    bool bPanelist = false;      // participant entry in the panelist section
    bool bRecent = false;        // participant entry in the recent-users section
    std::uint32_t dwExternalTag = 0;

    // A group entry: a group id and no participant.
    bool IsGroupEntry() const { return nGroupID != -1 && dwNodeID == 0; }
    // A participant entry: no group id, a participant.
    bool IsParticipantEntry() const { return nGroupID == -1 && dwNodeID != 0; }
    // A participant entry outside the panelist section (recent entries count as plain).
    bool IsPlainParticipantEntry() const { return !bPanelist && nGroupID == -1 && !bSeparator; }
};

using MenuStatusList = std::vector<MenuStatus>;
