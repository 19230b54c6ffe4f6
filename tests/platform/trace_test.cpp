#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <iterator>
#include <string>

#include <unistd.h>

#include "tests/support/trace_capture.h"

TEST(Trace, EachChannelReachesTheSinkWithItsLevelTagAndText) {
    TraceCapture capture;
    MacInfoTrace2("Chat", "Enter %s", "CChatClient::Initialize");
    MacWarnTrace2("Chat", "refused %d", 7);
    MacErrorTrace2("UI", "%s", "broken");
    ASSERT_EQ(capture.Lines().size(), 3u);
    EXPECT_TRUE(capture.Has(TraceLevel::Info, "Enter CChatClient::Initialize"));
    EXPECT_TRUE(capture.Has(TraceLevel::Warn, "refused 7"));
    EXPECT_TRUE(capture.Has(TraceLevel::Error, "broken"));
    EXPECT_EQ(capture.Lines()[0].tag, "Chat");
    EXPECT_EQ(capture.Lines()[2].tag, "UI");
}

TEST(Trace, FormatSignsInUserTextStayLiteralAndLongTextsAreCutAtTheBound) {
    TraceCapture capture;
    const std::string hostile = "%s%n%x";
    const std::string longText(kMaxTraceText + 500, 'a');
    MacInfoTrace2("Chat", "%s", hostile.c_str());
    MacInfoTrace2("Chat", "%s", longText.c_str());
    ASSERT_EQ(capture.Lines().size(), 2u);
    EXPECT_EQ(capture.Lines()[0].text, hostile);
    EXPECT_EQ(capture.Lines()[1].text, longText.substr(0, kMaxTraceText));
}

TEST(Trace, DefaultSinkWritesEveryLineToTheLogFileNamedByTheEnvironment) {
    char folder[] = "/tmp/qc-trace-XXXXXX";
    ASSERT_NE(mkdtemp(folder), nullptr);
    const std::string path = std::string(folder) + "/chat.log";
    setenv("QUINTARA_CHAT_LOG", path.c_str(), 1);
    SetTraceSink(nullptr);  // the default sink opens the file on its first line
    MacInfoTrace2("Chat", "hello %d", 1);
    MacWarnTrace2("Chat", "%s", "careful");
    SetTraceSink([](TraceLevel, const char*, const char*) {});
    unsetenv("QUINTARA_CHAT_LOG");

    std::ifstream file(path);
    const std::string text((std::istreambuf_iterator<char>(file)),
                           std::istreambuf_iterator<char>());
    EXPECT_NE(text.find(" INFO Chat hello 1\n"), std::string::npos) << text;
    EXPECT_NE(text.find(" WARN Chat careful\n"), std::string::npos) << text;
    std::remove(path.c_str());
    rmdir(folder);
}
