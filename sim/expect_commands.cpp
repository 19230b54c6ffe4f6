// Expectations: what a participant sees, compared with what the scenario says.
#include <cstdio>

#include "engine/chat_client.h"
#include "sim/lang/scenario_notation.h"
#include "sim/simulator.h"
#include "sim/transcript_view.h"

void Simulator::Expect(const ScenarioCommand& c) {
    const auto args = c.Positional();
    Participant* p = Find(c, args[0]->value);
    if (!p) return;
    const std::string& kind = args[1]->value;
    const CChatContentStorage& store = Engine(*p).ChatContent();
    const std::size_t lines = store.GetLineCount();
    const auto needArgs = [&](std::size_t count) {
        if (args.size() == count + 2) return true;
        Fail(c, "expect " + kind + " takes " + std::to_string(count) + " argument(s)");
        return false;
    };

    if (kind == "line") {
        if (!needArgs(2)) return;
        const std::string& title = args[2]->value;
        const std::string& text = args[3]->value;
        if (lines == 0) {
            Fail(c, p->name + "'s transcript is empty");
        } else {
            const TranscriptEntry entry = ReadTranscriptEntry(store, lines - 1);
            if (entry.title != title || entry.text != text)
                Fail(c, p->name + "'s newest line is " + QuotedScenarioText(entry.title) + " " +
                            QuotedScenarioText(entry.text));
        }
    } else if (kind == "no-new-lines") {
        if (!needArgs(0)) return;
        if (lines != p->linesSeen) {
            const TranscriptEntry entry = ReadTranscriptEntry(store, lines - 1);
            Fail(c, p->name + " got " + std::to_string(lines - p->linesSeen) +
                        " new line(s), the newest " + QuotedScenarioText(entry.title) + " " +
                        QuotedScenarioText(entry.text));
        }
    } else if (kind == "menu") {
        std::vector<std::string> expected;
        for (std::size_t i = 2; i < args.size(); ++i)
            expected.push_back(args[i]->value);
        std::vector<std::string> modelExpected;
        for (const std::string& item : expected)
            if (item != "?") modelExpected.push_back(item);
        const std::vector<std::string> model = EngineMenu(Engine(*p));
        if (model != modelExpected)
            Fail(c, p->name + "'s send-to list is " + QuotedScenarioList(model));
        if (p->window) {
            const std::vector<std::string> popup = PopupMenu(*p->window);
            if (popup != expected) Fail(c, p->name + "'s popup shows " + QuotedScenarioList(popup));
        }
    } else if (kind == "input") {
        if (!needArgs(1)) return;
        const std::string& want = args[2]->value;
        if (want != "enabled" && want != "disabled")
            return Fail(c, "expect input takes enabled or disabled");
        const bool enabled = p->window && p->window->InputEnabled();
        if (enabled != (want == "enabled"))
            Fail(c, p->name + "'s input is " + (enabled ? "enabled" : "disabled"));
    } else if (kind == "input-text") {
        if (!needArgs(1)) return;
        const std::string text = p->window ? p->window->InputText() : "";
        if (text != args[2]->value) Fail(c, p->name + "'s input holds " + QuotedScenarioText(text));
    } else if (kind == "warning") {
        if (!needArgs(1)) return;
        if (p->warnings.empty()) {
            Fail(c, p->name + " saw no warning");
        } else if (p->warnings.back() != args[2]->value) {
            Fail(c, p->name + "'s newest warning is " + QuotedScenarioText(p->warnings.back()));
        }
        p->warnings.clear();
    } else if (kind == "sound") {
        if (!needArgs(1)) return;
        const auto want = ParseScenarioNumber(args[2]->value);
        if (!want) return Fail(c, "expect sound takes a number");
        if (static_cast<std::uint32_t>(p->sounds) != *want)
            Fail(c, p->name + " heard " + std::to_string(p->sounds) + " sound(s)");
    } else if (kind == "service-flags") {
        if (!needArgs(1)) return;
        const auto want = ParseScenarioNumber(args[2]->value);
        if (!want) return Fail(c, "expect service-flags takes a number");
        const auto flags = p->service->LastCacheWriteFlags();
        if (!flags) {
            Fail(c, p->name + " has written no cache");
        } else if (*flags != *want) {
            char seen[16];
            std::snprintf(seen, sizeof(seen), "0x%x", *flags);
            Fail(c, p->name + "'s last cache write carried flags " + seen);
        }
    } else {
        Fail(c, "expect " + kind + " is not available in this build");
    }
    p->linesSeen = lines;
}

void Simulator::Print(const ScenarioCommand& c) {
    std::vector<Participant*> targets;
    if (!Targets(c, 0, &targets)) return;
    for (Participant* p : targets) {
        PrintParticipant(*p);
        p->linesSeen = Engine(*p).ChatContent().GetLineCount();
    }
}
