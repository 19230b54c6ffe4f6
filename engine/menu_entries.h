// Small builders and searches over the send-to menu model, shared by the menu, privilege,
// role and practice rules.
#pragma once

#include <string>

#include "engine/menu_model.h"
#include "engine/menu_status.h"

// A separator line.
inline MenuStatus SeparatorEntry() {
    MenuStatus entry;
    entry.bSeparator = true;
    return entry;
}

// A group entry with its (already localized) title.
inline MenuStatus GroupEntry(const std::string& title, std::int32_t groupId) {
    MenuStatus entry;
    entry.strTitle = title;
    entry.nGroupID = groupId;
    return entry;
}

// The first entry that can be chosen: enabled and not a separator; -1 when none.
inline int FirstSelectableIndex(const MenuModel& menu) {
    for (std::size_t i = 0; i < menu.size(); ++i) {
        if (menu[i].bEnabled && !menu[i].bSeparator) return static_cast<int>(i);
    }
    return -1;
}

// The first entry that denotes the same audience as like (group id, panelist mark and node
// id) and can be chosen; -1 when none.
inline int IndexOfEqualEntry(const MenuModel& menu, const MenuStatus& like) {
    for (std::size_t i = 0; i < menu.size(); ++i) {
        const MenuStatus& e = menu[i];
        if (e.bEnabled && !e.bSeparator && e.nGroupID == like.nGroupID &&
            e.bPanelist == like.bPanelist && e.dwNodeID == like.dwNodeID)
            return static_cast<int>(i);
    }
    return -1;
}
