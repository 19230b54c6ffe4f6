// The one main of every test program: quiet default trace sink and GoogleTest.
#include <gtest/gtest.h>

#include "platform/trace.h"
#include "tests/support/safec_guard.h"

int main(int argc, char** argv) {
    // Tests that look at log lines install their own sink; the rest stay silent.
    SetTraceSink([](TraceLevel, const char*, const char*) {});
    InstallSafecGuard();
    testing::InitGoogleTest(&argc, argv);
    return RUN_ALL_TESTS();
}
