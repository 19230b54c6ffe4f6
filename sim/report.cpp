// Showing a participant: its transcript and its send-to list.
#include "engine/chat_client.h"
#include "sim/lang/scenario_notation.h"
#include "sim/simulator.h"
#include "sim/transcript_view.h"

namespace {

// A text's line breaks as continuation lines under the text's column.
std::string Indented(const std::string& text, std::size_t column) {
    std::string out;
    for (const char ch : text) {
        if (ch == '\r' || ch == '\n') {
            out += "\n" + std::string(column, ' ');
        } else {
            out += ch;
        }
    }
    return out;
}

}  // namespace

std::vector<std::string> Simulator::EngineMenu(const CChatClient& engine) {
    std::vector<std::string> items;
    for (const MenuStatus& entry : engine.Menu())
        items.push_back(MenuEntryNotation(entry.strTitle,
                                          entry.bSeparator && entry.strTitle.empty(),
                                          entry.bSelected, entry.bEnabled));
    return items;
}

std::vector<std::string> Simulator::PopupMenu(const SimWindow& window) {
    std::vector<std::string> items;
    for (const PopupItem& item : window.Popup())
        items.push_back(item.placeholder ? "?"
                                         : MenuEntryNotation(item.title, item.separator,
                                                             item.selected, item.enabled));
    return items;
}

void Simulator::PrintParticipant(const Participant& p) {
    std::FILE* out = m_options.out;
    const CChatClient& engine = Engine(p);
    std::fprintf(out, "== %s (%s, node %u)\n", p.name.c_str(), p.displayName.c_str(), p.nodeId);
    const CChatContentStorage& store = engine.ChatContent();
    std::fprintf(out, "  transcript:%s\n", store.GetLineCount() == 0 ? " (empty)" : "");
    for (std::size_t i = 0; i < store.GetLineCount(); ++i) {
        const TranscriptEntry entry = ReadTranscriptEntry(store, i);
        std::fprintf(out, "    %-8s %s:\n", entry.time.c_str(), entry.title.c_str());
        std::fprintf(out, "             %s\n", Indented(entry.text, 13).c_str());
    }
    std::fprintf(out, "  send-to list:");
    for (const std::string& item : EngineMenu(engine))
        std::fprintf(out, " [%s]", item.c_str());
    std::fprintf(out, "\n");
    if (p.window) {
        std::fprintf(out, "  input: %s\n", p.window->InputEnabled() ? "enabled" : "disabled");
    }
}
