#include "engine/menu_model.h"

#include <strings.h>

#include <algorithm>
#include <cstring>

MenuStatusList MenuModel::ToList() const {
    MenuStatusList list;
    list.reserve(m_Entries.size());
    for (const MenuStatus* entry : m_Entries)
        list.push_back(*entry);
    return list;
}

MenuModel::~MenuModel() {
    Clear();
}

void MenuModel::Insert(std::size_t index, const MenuStatus& entry) {
    index = std::min(index, size());
    if (index > 0) CountPair(index - 1, -1);
    m_Entries.insert(m_Entries.begin() + index, new MenuStatus(entry));
    m_Nodes.insert(m_Nodes.begin() + index, entry.dwNodeID);
    m_Sections.insert(m_Sections.begin() + index, SectionOf(entry));
    Count(index, 1);
    CountNeighbours(index, 1);
}

void MenuModel::Erase(std::size_t index) {
    if (index >= size()) return;
    CountNeighbours(index, -1);
    Count(index, -1);
    delete m_Entries[index];
    m_Entries.erase(m_Entries.begin() + index);
    m_Nodes.erase(m_Nodes.begin() + index);
    m_Sections.erase(m_Sections.begin() + index);
    if (index > 0) CountPair(index - 1, 1);
}

void MenuModel::Clear() {
    for (MenuStatus* entry : m_Entries)
        delete entry;
    m_Entries.clear();
    m_Nodes.clear();
    m_Sections.clear();
    m_NodeEntries.clear();
    m_GroupEntries.clear();
    m_nWithNode = 0;
    m_nSelectedDisabled = 0;
    m_nDescents = 0;
}

void MenuModel::SetSelected(std::size_t index, bool bSelected) {
    MenuStatus& entry = *m_Entries[index];
    if (entry.bSelected == bSelected) return;
    if (!entry.bEnabled) m_nSelectedDisabled += bSelected ? 1 : -1;
    entry.bSelected = bSelected;
}

void MenuModel::SetEnabled(std::size_t index, bool bEnabled) {
    MenuStatus& entry = *m_Entries[index];
    if (entry.bEnabled == bEnabled) return;
    if (entry.bSelected) m_nSelectedDisabled += bEnabled ? -1 : 1;
    entry.bEnabled = bEnabled;
}

void MenuModel::SetGroupID(std::size_t index, std::int32_t groupId) {
    CountNeighbours(index, -1);
    Count(index, -1);
    m_Entries[index]->nGroupID = groupId;
    m_Sections[index] = SectionOf(*m_Entries[index]);
    Count(index, 1);
    CountNeighbours(index, 1);
}

void MenuModel::SetTitle(std::size_t index, const std::string& title) {
    CountNeighbours(index, -1);
    m_Entries[index]->strTitle = title;
    CountNeighbours(index, 1);
}

int MenuModel::IndexOfGroup(std::int32_t groupId) const {
    if (m_GroupEntries.count(groupId) == 0) return -1;
    for (std::size_t i = 0; i < m_Nodes.size(); ++i) {
        if (m_Nodes[i] == 0 && m_Entries[i]->nGroupID == groupId) return static_cast<int>(i);
    }
    return -1;
}

int MenuModel::IndexOfNode(std::uint32_t nodeId) const {
    return FindParticipant(nodeId, [](const MenuStatus&) { return true; });
}

int MenuModel::IndexOfParticipant(std::uint32_t nodeId, bool bRecent) const {
    return FindParticipant(nodeId,
                           [bRecent](const MenuStatus& entry) { return entry.bRecent == bRecent; });
}

template <typename Wanted>
int MenuModel::FindParticipant(std::uint32_t nodeId, Wanted wanted) const {
    if (nodeId == 0 || m_NodeEntries.count(nodeId) == 0) return -1;
    for (auto it = m_Nodes.begin(); (it = std::find(it, m_Nodes.end(), nodeId)) != m_Nodes.end();
         ++it) {
        const std::size_t i = static_cast<std::size_t>(it - m_Nodes.begin());
        if (m_Entries[i]->nGroupID == -1 && wanted(*m_Entries[i])) return static_cast<int>(i);
    }
    return -1;
}

std::size_t MenuModel::EndOfSection(std::size_t from, Section section) const {
    // Thirty-two sections at a time: a run of attendees can be most of the menu.
    const std::uint64_t eight = 0x0101010101010101ull * static_cast<std::uint8_t>(section);
    const std::size_t count = m_Sections.size();
    std::size_t i = from;
    for (std::uint64_t words[4]; i + sizeof words <= count; i += sizeof words) {
        std::memcpy(words, m_Sections.data() + i, sizeof words);
        if (((words[0] ^ eight) | (words[1] ^ eight) | (words[2] ^ eight) | (words[3] ^ eight)) !=
            0)
            break;
    }
    while (i < count && m_Sections[i] == section)
        ++i;
    return i;
}

int MenuModel::EndOfSortedRun(int from, const char* name, Section section) const {
    const std::size_t count = size();
    std::size_t i = std::min(static_cast<std::size_t>(std::max(from, 0)), count);
    if (m_nDescents != 0) {
        while (i < count && m_Sections[i] == section && TitleBelow(*m_Entries[i], name))
            ++i;
        return static_cast<int>(i);
    }
    const std::size_t end = EndOfSection(i, section);
    const auto first = m_Entries.begin() + static_cast<std::ptrdiff_t>(i);
    const auto last = m_Entries.begin() + static_cast<std::ptrdiff_t>(end);
    const auto found = std::partition_point(
        first, last, [name](const auto& entry) { return TitleBelow(*entry, name); });
    return static_cast<int>(found - m_Entries.begin());
}

bool MenuModel::TitleBelow(const MenuStatus& entry, const char* name) {
    return strcasecmp(entry.strTitle.c_str(), name) < 0;
}

MenuModel::Section MenuModel::SectionOf(const MenuStatus& entry) {
    if (entry.bPanelist) return Section::kPanelist;
    return entry.IsPlainParticipantEntry() ? Section::kPlain : Section::kOther;
}

void MenuModel::Count(std::size_t index, int sign) {
    const MenuStatus& entry = *m_Entries[index];
    if (entry.dwNodeID != 0) m_nWithNode += sign;
    if (entry.bSelected && !entry.bEnabled) m_nSelectedDisabled += sign;
    if (entry.nGroupID == -1 && entry.dwNodeID != 0) {
        if ((m_NodeEntries[entry.dwNodeID] += sign) == 0) m_NodeEntries.erase(entry.dwNodeID);
    }
    if (entry.dwNodeID == 0) {
        if ((m_GroupEntries[entry.nGroupID] += sign) == 0) m_GroupEntries.erase(entry.nGroupID);
    }
}

void MenuModel::CountPair(std::size_t left, int sign) {
    if (left + 1 >= size()) return;
    const Section section = m_Sections[left];
    if (section == Section::kOther || section != m_Sections[left + 1]) return;
    if (strcasecmp(m_Entries[left]->strTitle.c_str(), m_Entries[left + 1]->strTitle.c_str()) > 0)
        m_nDescents += sign;
}

void MenuModel::CountNeighbours(std::size_t index, int sign) {
    if (index > 0) CountPair(index - 1, sign);
    CountPair(index, sign);
}
