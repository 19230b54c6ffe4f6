// The scenario language: words, strings and options, comments, and errors with line numbers.
#include <gtest/gtest.h>

#include "sim/lang/scenario.h"

namespace {

TEST(ScenarioParser, WordsStringsOptionsAndComments) {
    std::vector<ScenarioCommand> commands;
    ScenarioError error;
    ASSERT_TRUE(
        ParseScenario("# a training session\n"
                      "conference type=3 qm start=\"2009-03-05 09:03:00\"   # the first line\n"
                      "\n"
                      "join ann node=0x65 name=\"Ann \\\"the host\\\" A.\" selector\n"
                      "say ann \"a # is no comment\\nin a string\\\\\" # but this is\n"
                      "privilege 71 ann bob carl\n"
                      "host node=9\n",
                      &commands, &error))
        << error.line << ": " << error.message;
    ASSERT_EQ(commands.size(), 5u);
    EXPECT_EQ(commands[0].line, 2);
    EXPECT_EQ(commands[0].verb, "conference");
    EXPECT_EQ(commands[0].Option("start")->value, "2009-03-05 09:03:00");
    EXPECT_TRUE(commands[0].Option("start")->quoted);
    ASSERT_EQ(commands[0].Positional().size(), 1u);
    EXPECT_EQ(commands[0].Positional()[0]->value, "qm");

    EXPECT_EQ(commands[1].line, 4);
    EXPECT_EQ(commands[1].Option("node")->value, "0x65");
    EXPECT_EQ(commands[1].Option("name")->value, "Ann \"the host\" A.");
    EXPECT_EQ(commands[1].Positional()[1]->value, "selector");

    EXPECT_EQ(commands[2].line, 5);
    ASSERT_EQ(commands[2].args.size(), 2u);
    EXPECT_EQ(commands[2].args[1].value, "a # is no comment\nin a string\\");
    EXPECT_EQ(commands[2].Option("missing"), nullptr);

    // Repeated and absent arguments.
    EXPECT_EQ(commands[3].Positional().size(), 4u);
    EXPECT_EQ(commands[4].Positional().size(), 0u);
}

TEST(ScenarioParser, ErrorsNameTheirLine) {
    const struct {
        const char* text;
        int line;
        const char* message;
    } cases[] = {
        {"join a node=1\n", 1, "a scenario begins with a conference line"},
        {"conference type=1\nconference type=1\n", 2, "only one conference line is allowed"},
        {"# nothing\n\n", 2, "the scenario has no conference line"},
        {"conference type=1\nsay a \"open\n", 2, "unterminated string"},
        {"conference type=1\nsay a \"ends in a backslash\\", 2, "unterminated string"},
        {"conference type=1\n\nsay a \"tab\\t\"\n", 3, "unknown escape \\t in a string"},
        {"conference type=1\nsay a \"x\"y\n", 2, "missing blank after \"x\""},
        {"conference type=1\n\"say\" a\n", 2, "a line must begin with a command word"},
        {"conference type=1\nshout a \"x\"\n", 2, "unknown command shout"},
        {"conference\n", 1, "conference needs type="},
        {"conference type=x1\n", 1, "type= needs a number, found x1"},
        {"conference type=1\njoin a node=1 node=2\n", 2, "option node= given twice"},
        {"conference type=1\njoin a node=1 colour=red\n", 2, "unknown option colour= for join"},
        {"conference type=1\nsay a\n", 2, "too few arguments for say"},
        {"conference type=1\nsay a b\n", 2, "expected a string in double quotes, found b"},
        {"conference type=1\nleave \"a\"\n", 2, "expected a word, found \"a\""},
        {"conference type=1\ntick 2 3\n", 2, "too many arguments for tick: 3"},
        {"conference type=1\nprivilege 0xZZ a\n", 2, "expected a number, found 0xZZ"},
        {"conference type=1\npractice maybe\n", 2, "expected one of on|off, found maybe"},
        {"conference type=1\nexpect a colour \"x\"\n", 2,
         "expected one of line|no-new-lines|menu|input|input-text|warning|sound|service-flags, "
         "found colour"},
        {"conference type=1\nhost a node=3\n", 2, "host takes a participant's name or node=N"},
        {"conference type=1\npresenter\n", 2, "presenter takes a participant's name or node=N"},
        {"conference type=1\nselect a\n", 2, "select takes a title in quotes or node=N"},
    };
    for (const auto& c : cases) {
        std::vector<ScenarioCommand> commands;
        ScenarioError error;
        EXPECT_FALSE(ParseScenario(c.text, &commands, &error)) << c.text;
        EXPECT_EQ(error.line, c.line) << c.text;
        EXPECT_EQ(error.message, c.message) << c.text;
    }
}

TEST(ScenarioParser, Numbers) {
    const struct {
        const char* text;
        std::optional<std::uint32_t> value;
    } cases[] = {{"0", 0u},
                 {"42", 42u},
                 {"0x10047", 0x10047u},
                 {"0XfF", 0xFFu},
                 {"4294967295", 0xFFFFFFFFu},
                 {"4294967296", std::nullopt},
                 {"0x", std::nullopt},
                 {"-1", std::nullopt},
                 {"12a", std::nullopt},
                 {"", std::nullopt}};
    for (const auto& c : cases)
        EXPECT_EQ(ParseScenarioNumber(c.text), c.value) << c.text;
}

}  // namespace
