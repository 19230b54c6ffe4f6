// How the scenario language writes back what a participant sees: strings quoted with the
// language's escapes, lists of them, and send-to entries with their selection marks.
#pragma once

#include <string>
#include <vector>

// The text in double quotes, with '"', '\' and line breaks escaped as a scenario writes them.
std::string QuotedScenarioText(const std::string& text);
// Each item quoted, joined by spaces; "(nothing)" for none.
std::string QuotedScenarioList(const std::vector<std::string>& items);
// One send-to entry as `expect ... menu` writes it: "-" for a separator, else the title
// behind "*" when selected and "~" when disabled.
std::string MenuEntryNotation(const std::string& title, bool separator, bool selected,
                              bool enabled);
