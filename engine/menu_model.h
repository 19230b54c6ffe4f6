// The send-to menu model: its entries in menu order, with the searches the menu rules make on
// every arrival and every privilege re-application answered without walking the entries.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <unordered_map>
#include <vector>

#include "engine/menu_status.h"

class MenuModel {
public:
    // The sections whose participant entries stand sorted by title.
    enum class Section : std::uint8_t { kOther, kPlain, kPanelist };

    MenuModel() = default;
    ~MenuModel();
    MenuModel(const MenuModel&) = delete;
    MenuModel& operator=(const MenuModel&) = delete;

    std::size_t size() const { return m_Entries.size(); }
    bool empty() const { return m_Entries.empty(); }
    // The entry at index (index < size()); the last entry (not empty()).
    const MenuStatus& operator[](std::size_t index) const { return *m_Entries[index]; }
    const MenuStatus& back() const { return *m_Entries.back(); }
    // A copy of the entries in menu order, as the window receives them on a rebuild.
    MenuStatusList ToList() const;

    // Puts a copy of entry before index (index <= size()) or at the end; removes one entry.
    void Insert(std::size_t index, const MenuStatus& entry);
    void PushBack(const MenuStatus& entry) { Insert(size(), entry); }
    void Erase(std::size_t index);
    void Clear();
    // Changes one field of the entry at index.
    void SetSelected(std::size_t index, bool bSelected);
    void SetEnabled(std::size_t index, bool bEnabled);
    void SetGroupID(std::size_t index, std::int32_t groupId);
    void SetTitle(std::size_t index, const std::string& title);

    // The first group entry (no participant) with that group id, or -1.
    int IndexOfGroup(std::int32_t groupId) const;
    // The node's first participant entry (no group id), recent or not, or -1; -1 for node 0.
    int IndexOfNode(std::uint32_t nodeId) const;
    // The node's first participant entry that is recent or not as asked, or -1.
    int IndexOfParticipant(std::uint32_t nodeId, bool bRecent) const;
    // Some entry names a participant / some selected entry cannot be chosen.
    bool HasParticipantEntry() const { return m_nWithNode != 0; }
    bool HasSelectedDisabledEntry() const { return m_nSelectedDisabled != 0; }

    // From `from` on, the index of the first entry that is outside the section or whose title
    // does not sort below name; size() when there is none.
    int EndOfSortedRun(int from, const char* name, Section section) const;
    // Titles order case-insensitively.
    static bool TitleBelow(const MenuStatus& entry, const char* name);

private:
    static Section SectionOf(const MenuStatus& entry);
    // The node's first participant entry that is wanted, or -1.
    template <typename Wanted>
    int FindParticipant(std::uint32_t nodeId, Wanted wanted) const;
    // The first index from `from` on whose entry lies outside the section; size() when none.
    std::size_t EndOfSection(std::size_t from, Section section) const;
    // Adds (sign 1) or takes out (sign -1) the entry at index from the counts, and the pair
    // of neighbours starting at left from the count of titles out of order.
    void Count(std::size_t index, int sign);
    void CountPair(std::size_t left, int sign);
    // The neighbours of the entry at index, taken out of (sign -1) or put back into the count.
    void CountNeighbours(std::size_t index, int sign);

    // The entries, owned (plain pointers, so that making room moves only pointers), and per
    // entry its node id and section, searched without touching the entries.
    std::vector<MenuStatus*> m_Entries;
    std::vector<std::uint32_t> m_Nodes;
    std::vector<Section> m_Sections;
    // Participant entries per node and group entries per group id, so that an absent one is
    // known without a search.
    std::unordered_map<std::uint32_t, std::int64_t> m_NodeEntries;
    std::unordered_map<std::int32_t, std::int64_t> m_GroupEntries;
    // Entries naming a participant; selected entries that are disabled.
    std::int64_t m_nWithNode = 0;
    std::int64_t m_nSelectedDisabled = 0;
    // Neighbours of one section whose titles stand out of order. While there are none every
    // section's run is sorted and is searched by halving.
    std::int64_t m_nDescents = 0;
};
