// Splitting one scenario line into words, strings and key=value options.
#include <cctype>

#include "engine/chat_client.h"
#include "sim/lang/scenario.h"

namespace {

bool IsSpace(char c) {
    return c == ' ' || c == '\t' || c == '\r';
}

// Reads a string whose opening quote is at text[*pos]; leaves *pos after the closing quote.
bool ReadString(std::string_view text, std::size_t* pos, std::string* out, std::string* error) {
    std::size_t i = *pos + 1;
    out->clear();
    while (i < text.size()) {
        const char c = text[i++];
        if (c == '"') {
            *pos = i;
            return true;
        }
        if (c != '\\') {
            out->push_back(c);
            continue;
        }
        if (i == text.size()) break;
        const char escaped = text[i++];
        if (escaped == 'n') {
            out->push_back('\n');
        } else if (escaped == '"' || escaped == '\\') {
            out->push_back(escaped);
        } else {
            *error = std::string("unknown escape \\") + escaped + " in a string";
            return false;
        }
    }
    *error = "unterminated string";
    return false;
}

// Reads a bare word at text[*pos]: everything up to a blank, a quote or a comment sign.
std::string ReadWord(std::string_view text, std::size_t* pos) {
    const std::size_t start = *pos;
    while (*pos < text.size() && !IsSpace(text[*pos]) && text[*pos] != '"' && text[*pos] != '#')
        ++*pos;
    return std::string(text.substr(start, *pos - start));
}

}  // namespace

bool TokenizeScenarioLine(std::string_view line, ScenarioCommand* out, std::string* error) {
    out->verb.clear();
    out->args.clear();
    std::size_t pos = 0;
    while (pos < line.size()) {
        if (IsSpace(line[pos])) {
            ++pos;
            continue;
        }
        if (line[pos] == '#') break;
        ScenarioArg arg;
        if (line[pos] == '"') {
            if (!ReadString(line, &pos, &arg.value, error)) return false;
            arg.quoted = true;
        } else {
            std::string word = ReadWord(line, &pos);
            const std::size_t eq = word.find('=');
            if (eq != std::string::npos && eq > 0) {
                arg.key = word.substr(0, eq);
                arg.value = word.substr(eq + 1);
                if (arg.value.empty() && pos < line.size() && line[pos] == '"') {
                    if (!ReadString(line, &pos, &arg.value, error)) return false;
                    arg.quoted = true;
                }
            } else {
                arg.value = std::move(word);
            }
        }
        // A string must stand apart from what follows it: `"a"b` is a typing error.
        if (pos < line.size() && !IsSpace(line[pos]) && line[pos] != '#') {
            *error = "missing blank after \"" + arg.value + "\"";
            return false;
        }
        if (out->verb.empty() && !arg.quoted && arg.key.empty()) {
            out->verb = std::move(arg.value);
            continue;
        }
        if (out->verb.empty()) {
            *error = "a line must begin with a command word";
            return false;
        }
        out->args.push_back(std::move(arg));
    }
    return true;
}

std::optional<std::uint32_t> ParseScenarioNumber(std::string_view text) {
    unsigned base = 10;
    if (text.size() > 2 && text[0] == '0' && (text[1] == 'x' || text[1] == 'X')) {
        base = 16;
        text.remove_prefix(2);
    }
    if (text.empty()) return std::nullopt;
    std::uint64_t value = 0;
    for (const char c : text) {
        const unsigned char u = static_cast<unsigned char>(c);
        unsigned digit;
        if (std::isdigit(u)) {
            digit = u - '0';
        } else if (base == 16 && std::isxdigit(u)) {
            digit = static_cast<unsigned>(std::tolower(u) - 'a' + 10);
        } else {
            return std::nullopt;
        }
        value = value * base + digit;
        if (value > 0xFFFFFFFFu) return std::nullopt;
    }
    return static_cast<std::uint32_t>(value);
}

std::optional<std::uint32_t> ParseScenarioRoles(std::string_view text) {
    if (const auto number = ParseScenarioNumber(text)) return number;
    static const std::pair<std::string_view, std::uint32_t> kWords[] = {
        {"host", ROLE_HOST},
        {"presenter", ROLE_PRESENTER},
        {"panelist", ROLE_PANELIST},
        {"attendee", 0}};
    std::uint32_t roles = 0;
    std::size_t start = 0;
    while (start <= text.size()) {
        std::size_t comma = text.find(',', start);
        if (comma == std::string_view::npos) comma = text.size();
        const std::string_view word = text.substr(start, comma - start);
        bool known = false;
        for (const auto& [name, bit] : kWords) {
            if (word == name) roles |= bit, known = true;
        }
        if (!known) return std::nullopt;
        start = comma + 1;
    }
    return roles;
}
