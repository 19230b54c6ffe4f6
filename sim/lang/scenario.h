// The scenario language of the conference simulator: one command per line, read into a
// list of commands that keep their line numbers. Toolkit-free; the simulator executes them.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

// One argument: a bare word, a string in double quotes, or key=value (value a word or string).
struct ScenarioArg {
    std::string key;      // empty unless the argument was key=value
    std::string value;    // the word, the string's unescaped text, or the option's value
    bool quoted = false;  // the value was written in double quotes
};

struct ScenarioCommand {
    int line = 0;
    std::string verb;
    std::vector<ScenarioArg> args;

    // The arguments that are not key=value, in order.
    std::vector<const ScenarioArg*> Positional() const;
    // The option with that key, or null.
    const ScenarioArg* Option(std::string_view key) const;
};

struct ScenarioError {
    int line = 0;
    std::string message;
};

// A number as scenarios write them: decimal, or hexadecimal after 0x; nothing else, no sign,
// no overflow past 32 bits.
std::optional<std::uint32_t> ParseScenarioNumber(std::string_view text);

// Role words as scenarios write them: host, presenter, panelist and attendee (none) joined by
// commas, or a number. The roster's role bits, or nothing for an unknown word.
std::optional<std::uint32_t> ParseScenarioRoles(std::string_view text);

// Splits one line into its verb and arguments; a line that is empty or only a comment gives
// an empty verb. False, with a message, for an unterminated string, an unknown escape or a
// string glued to a word.
bool TokenizeScenarioLine(std::string_view line, ScenarioCommand* out, std::string* error);

// Reads a whole scenario: every line tokenized and checked against the language (known verb,
// argument counts, known options, numbers where numbers belong, `conference` first and only
// once). False with the first error and its line number.
bool ParseScenario(std::string_view text, std::vector<ScenarioCommand>* out, ScenarioError* error);
