#include "sim/lang/scenario_notation.h"

std::string QuotedScenarioText(const std::string& text) {
    std::string out = "\"";
    for (const char ch : text) {
        if (ch == '\n') {
            out += "\\n";
        } else if (ch == '\r') {
            out += "\\r";
        } else {
            if (ch == '"' || ch == '\\') out += '\\';
            out += ch;
        }
    }
    return out + "\"";
}

std::string QuotedScenarioList(const std::vector<std::string>& items) {
    std::string out;
    for (const std::string& item : items)
        out += (out.empty() ? "" : " ") + QuotedScenarioText(item);
    return out.empty() ? "(nothing)" : out;
}

std::string MenuEntryNotation(const std::string& title, bool separator, bool selected,
                              bool enabled) {
    if (separator) return "-";
    return std::string(selected ? "*" : "") + (enabled ? "" : "~") + title;
}
