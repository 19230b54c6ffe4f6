#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "newutil/macutil/debug_output.h"

TEST(DebugOutput, SinkSeesAssertionsUntilTheDefaultIsRestored) {
    EXPECT_EQ(1, GetTraceLevel());
    std::vector<std::string> texts;
    SetDebugOutputSink([&](const char* text) { texts.push_back(text); });
    OutputDebugString("one\n");
    OutputDebugString(nullptr);
    ReportAssertion("nIndex >= 0", "SetAt", "newutil/macutil");
    SetDebugOutputSink({});
    OutputDebugString("discarded\n");
    ReportAssertion("x", "f", "m");
    EXPECT_EQ(
        (std::vector<std::string>{"one\n", "Assert -- nIndex >= 0 in SetAt of newutil/macutil\n"}),
        texts);
}
