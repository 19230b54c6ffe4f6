#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "newutil/macutil/debug_output.h"

// The assertion texts themselves are pinned where the byte stream and the vector raise them.
TEST(DebugOutput, SinkSeesTextsUntilTheDefaultIsRestored) {
    std::vector<std::string> texts;
    SetDebugOutputSink([&](const char* text) { texts.push_back(text); });
    OutputDebugString("one\n");
    OutputDebugString(nullptr);
    SetDebugOutputSink({});
    OutputDebugString("discarded\n");
    ReportAssertion("x", "f", "m");
    EXPECT_EQ(std::vector<std::string>{"one\n"}, texts);
}
