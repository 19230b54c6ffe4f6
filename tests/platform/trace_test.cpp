#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include "tests/support/temp_dir.h"
#include "tests/support/trace_capture.h"

TEST(Trace, EachChannelReachesTheSinkWithItsLevelTagAndLiteralBoundedText) {
    TraceCapture capture;
    const std::string hostile = "%s%n%x";
    const std::string longText(kMaxTraceText + 500, 'a');
    MacInfoTrace2("Chat", "Enter %s", "CChatClient::Initialize");
    MacWarnTrace2("Chat", "refused %d", 7);
    MacErrorTrace2("UI", "%s", hostile.c_str());
    MacInfoTrace2("Chat", "%s", longText.c_str());
    ASSERT_EQ(capture.Lines().size(), 4u);
    EXPECT_TRUE(capture.Has(TraceLevel::Info, "Enter CChatClient::Initialize"));
    EXPECT_TRUE(capture.Has(TraceLevel::Warn, "refused 7"));
    // Format signs in user text stay literal, and long texts are cut at the bound.
    EXPECT_TRUE(capture.Has(TraceLevel::Error, hostile));
    EXPECT_EQ(capture.Lines()[3].text, longText.substr(0, kMaxTraceText));
    EXPECT_EQ(capture.Lines()[0].tag, "Chat");
    EXPECT_EQ(capture.Lines()[2].tag, "UI");
}

TEST(Trace, DefaultSinkWritesEveryLineToTheLogFileNamedByTheEnvironment) {
    TempDir dir;
    setenv("QUINTARA_CHAT_LOG", dir.File("chat.log").c_str(), 1);
    SetTraceSink(nullptr);  // the default sink opens the file on its first line
    MacInfoTrace2("Chat", "hello %d", 1);
    MacWarnTrace2("Chat", "%s", "careful");
    SetTraceSink([](TraceLevel, const char*, const char*) {});
    unsetenv("QUINTARA_CHAT_LOG");

    const std::string text = FileBytes(dir.File("chat.log"));
    EXPECT_NE(text.find(" INFO Chat hello 1\n"), std::string::npos) << text;
    EXPECT_NE(text.find(" WARN Chat careful\n"), std::string::npos) << text;
}
