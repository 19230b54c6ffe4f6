// The scenario language's grammar: which commands exist, what arguments each takes.
#include "sim/lang/scenario.h"

#include <cstring>

namespace {

// One command's shape. Positional kinds, separated by blanks: `w` a word, `s` a string, `#` a
// number, `a` a word or a string, `{x|y}` one of the listed words; a `?` after a kind makes it
// optional and a `*` lets it repeat (both only at the end). Options list `key` or `key#` (a
// number); required options must be given.
struct Grammar {
    const char* verb;
    const char* positional;
    const char* options;
    const char* required;
};

constexpr Grammar kGrammar[] = {
    {"conference", "{qm}?", "type# start session#", "type"},
    {"join", "w {selector}?", "node# name tag# extmode# roles features# privilege# customer# faq",
     "node"},
    {"host", "w?", "node#", ""},
    {"presenter", "w?", "node#", ""},
    {"roles", "w w", "", ""},
    {"privilege", "# w*", "", ""},
    {"before-host", "w*", "", ""},
    {"practice", "{on|off} w*", "", ""},
    {"panel", "# w*", "", ""},
    {"feature", "# w*", "", ""},
    {"nbr", "# # w*", "", ""},
    {"config", "# s w*", "", ""},
    {"roster-status", "# # w*", "", ""},
    {"add-group", "w # # # s", "", ""},
    {"select-node", "w w", "", ""},
    {"sound", "# s w*", "", ""},
    {"close-dialogs", "w*", "", ""},
    {"select", "w s?", "node#", ""},
    {"say", "w s", "", ""},
    {"pick", "w w", "", ""},
    {"answer", "{save|open|warning} a", "", ""},
    {"save", "w s", "", ""},
    {"open", "w s", "", ""},
    {"leave", "w", "", ""},
    {"fail", "w w #", "times#", ""},
    {"inject", "w {private|group|bytes} a a?", "sender#", ""},
    {"expect", "w {line|no-new-lines|menu|input|input-text|warning|sound|service-flags} a*", "",
     ""},
    {"print", "w*", "", ""},
    {"tick", "#", "", ""},
    {"startup", "", "", ""},
};

const Grammar* FindGrammar(const std::string& verb) {
    for (const Grammar& grammar : kGrammar)
        if (verb == grammar.verb) return &grammar;
    return nullptr;
}

std::vector<std::string> Split(const char* text) {
    std::vector<std::string> parts;
    std::string part;
    for (const char* p = text;; ++p) {
        if (*p == ' ' || *p == '\0') {
            if (!part.empty()) parts.push_back(part);
            part.clear();
            if (*p == '\0') break;
        } else {
            part.push_back(*p);
        }
    }
    return parts;
}

// Checks one argument against one kind; kind has its `?`/`*` already removed.
bool Matches(const std::string& kind, const ScenarioArg& arg, std::string* error) {
    if (kind == "a") return true;
    if (kind == "s") {
        if (arg.quoted) return true;
        *error = "expected a string in double quotes, found " + arg.value;
        return false;
    }
    if (arg.quoted) {
        *error = "expected a word, found \"" + arg.value + "\"";
        return false;
    }
    if (kind == "w") return true;
    if (kind == "#") {
        if (ParseScenarioNumber(arg.value)) return true;
        *error = "expected a number, found " + arg.value;
        return false;
    }
    // {x|y}
    const std::string choices = kind.substr(1, kind.size() - 2);
    std::size_t start = 0;
    while (start <= choices.size()) {
        std::size_t bar = choices.find('|', start);
        if (bar == std::string::npos) bar = choices.size();
        if (choices.compare(start, bar - start, arg.value) == 0) return true;
        start = bar + 1;
    }
    *error = "expected one of " + choices + ", found " + arg.value;
    return false;
}

bool CheckPositional(const Grammar& grammar, const std::vector<const ScenarioArg*>& args,
                     std::string* error) {
    std::size_t next = 0;
    for (std::string kind : Split(grammar.positional)) {
        const char suffix = kind.back();
        const bool optional = suffix == '?';
        const bool repeats = suffix == '*';
        if (optional || repeats) kind.pop_back();
        if (next == args.size()) {
            if (optional || repeats) return true;
            *error = std::string("too few arguments for ") + grammar.verb;
            return false;
        }
        do {
            if (!Matches(kind, *args[next], error)) return false;
            ++next;
        } while (repeats && next < args.size());
    }
    if (next == args.size()) return true;
    *error = std::string("too many arguments for ") + grammar.verb + ": " + args[next]->value;
    return false;
}

bool CheckOptions(const Grammar& grammar, const ScenarioCommand& command, std::string* error) {
    const std::vector<std::string> options = Split(grammar.options);
    for (const ScenarioArg& arg : command.args) {
        if (arg.key.empty()) continue;
        bool known = false;
        for (const std::string& option : options) {
            const bool numeric = option.back() == '#';
            if (option.compare(0, option.size() - (numeric ? 1 : 0), arg.key) != 0 ||
                option.size() - (numeric ? 1 : 0) != arg.key.size())
                continue;
            known = true;
            if (numeric && (arg.quoted || !ParseScenarioNumber(arg.value))) {
                *error = arg.key + "= needs a number, found " + arg.value;
                return false;
            }
        }
        if (!known) {
            *error = "unknown option " + arg.key + "= for " + grammar.verb;
            return false;
        }
        if (command.Option(arg.key) != &arg) {
            *error = "option " + arg.key + "= given twice";
            return false;
        }
    }
    for (const std::string& key : Split(grammar.required)) {
        if (!command.Option(key)) {
            *error = std::string(grammar.verb) + " needs " + key + "=";
            return false;
        }
    }
    return true;
}

// Rules a single grammar line cannot say.
bool CheckSpecial(const ScenarioCommand& command, std::size_t positional, std::string* error) {
    const bool byNode = command.Option("node") != nullptr;
    if (command.verb == "host" || command.verb == "presenter") {
        if (byNode == (positional == 1)) {
            *error = command.verb + " takes a participant's name or node=N";
            return false;
        }
    }
    if (command.verb == "select" && byNode == (positional == 2)) {
        *error = "select takes a title in quotes or node=N";
        return false;
    }
    return true;
}

bool CheckCommand(const ScenarioCommand& command, std::string* error) {
    const Grammar* grammar = FindGrammar(command.verb);
    if (!grammar) {
        *error = "unknown command " + command.verb;
        return false;
    }
    const std::vector<const ScenarioArg*> positional = command.Positional();
    return CheckPositional(*grammar, positional, error) && CheckOptions(*grammar, command, error) &&
           CheckSpecial(command, positional.size(), error);
}

}  // namespace

std::vector<const ScenarioArg*> ScenarioCommand::Positional() const {
    std::vector<const ScenarioArg*> positional;
    for (const ScenarioArg& arg : args)
        if (arg.key.empty()) positional.push_back(&arg);
    return positional;
}

const ScenarioArg* ScenarioCommand::Option(std::string_view key) const {
    for (const ScenarioArg& arg : args)
        if (arg.key == key) return &arg;
    return nullptr;
}

bool ParseScenario(std::string_view text, std::vector<ScenarioCommand>* out, ScenarioError* error) {
    out->clear();
    int lineNumber = 0;
    std::size_t start = 0;
    while (start < text.size()) {
        std::size_t end = text.find('\n', start);
        if (end == std::string_view::npos) end = text.size();
        ++lineNumber;
        ScenarioCommand command;
        command.line = lineNumber;
        std::string message;
        const std::string_view line = text.substr(start, end - start);
        start = end + 1;
        if (!TokenizeScenarioLine(line, &command, &message) ||
            (!command.verb.empty() && !CheckCommand(command, &message))) {
            *error = {lineNumber, message};
            return false;
        }
        if (command.verb.empty()) continue;
        if ((command.verb == "conference") != out->empty()) {
            *error = {lineNumber, out->empty() ? "a scenario begins with a conference line"
                                               : "only one conference line is allowed"};
            return false;
        }
        out->push_back(std::move(command));
    }
    if (out->empty()) {
        *error = {lineNumber, "the scenario has no conference line"};
        return false;
    }
    return true;
}
