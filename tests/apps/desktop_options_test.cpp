// The desktop program's command line and credentials file: what is taken and what is refused
// with a message.
#include <gtest/gtest.h>

#include <vector>

#include "apps/quintara-chat/desktop_options.h"

namespace {

bool Parse(std::vector<const char*> extra, DesktopOptions* out, std::string* error) {
    std::vector<const char*> argv = {
        "quintara-chat", "--server", "nats://h:1", "--creds",      "c", "--name",
        "Ann Host",      "--node",   "11",         "--conference", "9"};
    argv.insert(argv.end(), extra.begin(), extra.end());
    return ParseDesktopOptions(static_cast<int>(argv.size()), argv.data(), out, error);
}

TEST(DesktopOptions, RolesTypeAndScriptAreTaken) {
    DesktopOptions options;
    std::string error;
    ASSERT_TRUE(Parse({"--host", "--panelist", "--meeting-type", "2", "--offscreen", "--script",
                       "s.chat", "--wait", "3"},
                      &options, &error))
        << error;
    EXPECT_EQ(options.serverUrl, "nats://h:1");
    EXPECT_EQ(options.displayName, "Ann Host");
    EXPECT_EQ(options.nodeId, 11u);
    EXPECT_EQ(options.conferenceId, 9);
    EXPECT_EQ(options.roles, 0x5u);
    EXPECT_EQ(options.meetingType, 2);
    EXPECT_TRUE(options.meetingTypeGiven);
    EXPECT_TRUE(options.offscreen);
    EXPECT_EQ(options.scriptPath, "s.chat");
    EXPECT_EQ(options.waitSeconds, 3);
}

TEST(DesktopOptions, BadValuesAreRefusedWithTheirReason) {
    const struct {
        std::vector<const char*> extra;
        const char* error;
    } cases[] = {
        {{"--conference", "65536"}, "--conference takes a conference number from 1 to 65535"},
        {{"--node", "0"}, "--node takes a node number above 0"},
        {{"--node", "12x"}, "--node takes a node number above 0"},
        {{"--meeting-type", "4"}, "--meeting-type takes 1, 2 or 3"},
        {{"--script"}, "--script takes a value"},
        {{"--color"}, "unknown argument --color"},
    };
    for (const auto& c : cases) {
        DesktopOptions options;
        std::string error;
        EXPECT_FALSE(Parse(c.extra, &options, &error)) << c.error;
        EXPECT_EQ(error, c.error);
    }
    DesktopOptions options;
    std::string error;
    const char* argv[] = {"quintara-chat", "--server", "nats://h:1", "--creds", "c"};
    EXPECT_FALSE(ParseDesktopOptions(5, argv, &options, &error));
    EXPECT_EQ(error, "--conference is missing");
}

TEST(DesktopOptions, CredentialsFiles) {
    const struct {
        const char* text;
        bool ok;
        const char* userOrError;
    } cases[] = {
        {"# mine\n  ann  pw-x # a comment\n\n", true, "ann"},
        {"ann pw\r\n", true, "ann"},
        {"ann\n", false, "line 1: a line takes a user name and a password"},
        {"ann pw extra\n", false, "line 1: a line takes a user name and a password"},
        {"ann.b pw\n", false, "line 1: a line takes a user name and a password"},
        {"ann pw\nbob pw\n", false, "line 2: one participant, one user"},
        {"# nobody\n", false, "no user name and password"},
    };
    for (const auto& c : cases) {
        DesktopCredentials creds;
        std::string error;
        EXPECT_EQ(ParseCredentials(c.text, &creds, &error), c.ok) << c.text;
        EXPECT_EQ(c.ok ? creds.user : error, c.userOrError) << c.text;
    }
    DesktopCredentials creds;
    std::string error;
    ASSERT_TRUE(ParseCredentials("ann pw-x\n", &creds, &error));
    EXPECT_EQ(creds.password, "pw-x");
    EXPECT_FALSE(ReadCredentials("/nonexistent/creds", &creds, &error));
    EXPECT_NE(error.find("cannot read /nonexistent/creds"), std::string::npos) << error;
}

}  // namespace
