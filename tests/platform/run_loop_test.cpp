#include <gtest/gtest.h>

#include <chrono>
#include <functional>
#include <string>
#include <thread>
#include <vector>

#include "platform/poll_run_loop.h"
#include "platform/virtual_run_loop.h"
#include "tests/support/trace_capture.h"

namespace {

// Lets the same ordering cases run on every loop: "let this much time pass".
void Drive(VirtualRunLoop& loop, double seconds) {
    loop.AdvanceBy(seconds);
}
void Drive(PollRunLoop& loop, double seconds) {
    loop.RunFor(seconds);
}

template <typename Loop>
class AnyRunLoop : public ::testing::Test {
protected:
    Loop loop;
    std::vector<std::string> seen;
    RunLoop::Task Note(std::string what) {
        return [this, what] { seen.push_back(what); };
    }
};

using Loops = ::testing::Types<VirtualRunLoop, PollRunLoop>;
TYPED_TEST_SUITE(AnyRunLoop, Loops);

TYPED_TEST(AnyRunLoop, PostedWorkRunsLaterInOrderWithTheWorkItPosts) {
    this->loop.Post([this] {
        this->seen.push_back("a");
        this->loop.Post(this->Note("c"));
    });
    this->loop.Post(this->Note("b"));
    EXPECT_TRUE(this->seen.empty());  // never inside Post
    EXPECT_EQ(this->loop.RunUntilIdle(), 3u);
    EXPECT_EQ(this->seen, (std::vector<std::string>{"a", "b", "c"}));
    EXPECT_EQ(this->loop.RunUntilIdle(), 0u);
}

TYPED_TEST(AnyRunLoop, TimersFireInDueOrderAndEqualDelaysInTheOrderAdded) {
    this->loop.AddTimer(0.02, 0, this->Note("late"));
    this->loop.AddTimer(0.01, 0, this->Note("first"));
    this->loop.AddTimer(0.01, 0, this->Note("second"));
    this->loop.AddTimer(0, 0, this->Note("now"));
    Drive(this->loop, 0.05);
    EXPECT_EQ(this->seen, (std::vector<std::string>{"now", "first", "second", "late"}));
    Drive(this->loop, 0.05);  // interval 0: once only
    EXPECT_EQ(this->seen.size(), 4u);
}

TYPED_TEST(AnyRunLoop, CallbacksMayCancelTheirOwnTimerOrAnotherOneDueWithThem) {
    RunLoop::TimerId self = 0, other = 0;
    self = this->loop.AddTimer(0.01, 0.01, [&] {
        this->seen.push_back("self");
        this->loop.CancelTimer(self);
        this->loop.CancelTimer(other);
        this->loop.CancelTimer(other);  // twice, and unknown ids, do nothing
        this->loop.CancelTimer(0);
    });
    other = this->loop.AddTimer(0.01, 0, this->Note("other"));
    const RunLoop::TimerId once = this->loop.AddTimer(0, 0, [&] { this->loop.CancelTimer(once); });
    Drive(this->loop, 0.05);
    EXPECT_EQ(this->seen, (std::vector<std::string>{"self"}));
}

TYPED_TEST(AnyRunLoop, TheLoopIsCurrentWhileItRunsAndScopesRestoreThePrevious) {
    VirtualRunLoop outer;
    RunLoop* during = nullptr;
    this->loop.Post([&] { during = RunLoop::Current(); });
    {
        ScopedCurrentRunLoop scope(&outer);
        this->loop.RunUntilIdle();
        EXPECT_EQ(RunLoop::Current(), &outer);
    }
    EXPECT_EQ(during, &this->loop);
    EXPECT_EQ(RunLoop::Current(), nullptr);
}

TEST(VirtualRunLoop, ATimerFiresAtItsFirstDelayThenEveryIntervalOnTheVirtualClock) {
    VirtualRunLoop loop;
    std::vector<double> at;
    loop.AdvanceBy(0.25);
    loop.AddTimer(1.0, 0.5, [&] { at.push_back(loop.Now()); });
    loop.AdvanceBy(0.999);
    EXPECT_TRUE(at.empty());
    loop.AdvanceBy(2.001);
    EXPECT_EQ(at, (std::vector<double>{1.25, 1.75, 2.25, 2.75, 3.25}));
    EXPECT_DOUBLE_EQ(loop.Now(), 3.25);
    at.clear();
    loop.AdvanceBy(3600);  // a long advance still fires every slot
    EXPECT_EQ(at.size(), 7200u);
}

// A timer added later but due at the same instant as an earlier one fires after it.
TEST(VirtualRunLoop, WorkPostedByATimerRunsBeforeTheClockMovesOn) {
    VirtualRunLoop loop;
    std::vector<std::string> seen;
    loop.AddTimer(1.0, 0, [&] {
        loop.Post([&] { seen.push_back("posted@" + std::to_string(loop.Now())); });
        loop.AddTimer(0, 0, [&] { seen.push_back("added@" + std::to_string(loop.Now())); });
        loop.AddTimer(0.5, 0, [&] { seen.push_back("same@" + std::to_string(loop.Now())); });
    });
    loop.AddTimer(1.5, 0, [&] { seen.push_back("next@" + std::to_string(loop.Now())); });
    loop.Post([&] { seen.push_back("first@" + std::to_string(loop.Now())); });
    EXPECT_EQ(loop.PendingTasks(), 1u);
    loop.AdvanceBy(2);
    EXPECT_EQ(seen, (std::vector<std::string>{"first@0.000000", "posted@1.000000", "added@1.000000",
                                              "next@1.500000", "same@1.500000"}));
    EXPECT_EQ(loop.PendingTasks(), 0u);
}

TEST(VirtualRunLoop, ATinyIntervalIsBoundedWithinOneAdvanceAndKeepsItsPhase) {
    TraceCapture capture;
    VirtualRunLoop loop;
    std::size_t fired = 0;
    loop.AddTimer(0, 1e-12, [&] { ++fired; });  // rounds up to one virtual nanosecond
    loop.AdvanceBy(1.0);
    EXPECT_EQ(fired, kMaxTimerCatchUp);
    EXPECT_DOUBLE_EQ(loop.Now(), 1.0);
    EXPECT_TRUE(capture.Has(TraceLevel::Warn, "VirtualRunLoop: timer 1 skips 999900001 firings"));
    loop.AdvanceBy(1e-9);
    EXPECT_EQ(fired, kMaxTimerCatchUp + 1);
}

TEST(VirtualRunLoop, AnAdvanceInsideACallbackNeverTurnsTheClockBack) {
    VirtualRunLoop loop;
    std::vector<double> at;
    loop.AddTimer(1.0, 0, [&] { loop.AdvanceBy(5.0); });  // a modal wait inside a callback
    loop.AddTimer(3.0, 0, [&] { at.push_back(loop.Now()); });
    loop.AdvanceBy(2.0);
    EXPECT_EQ(at, (std::vector<double>{3.0}));
    EXPECT_DOUBLE_EQ(loop.Now(), 6.0);
}

TEST(PollRunLoop, QuitEndsOnlyTheInnermostRunAndLeavesTheRestQueued) {
    PollRunLoop loop;
    std::vector<std::string> seen;
    loop.Quit();  // not running: no effect on the next run
    loop.Post([&] {
        loop.Post([&] { loop.Quit(); });
        seen.push_back(loop.RunFor(10) ? "inner quit" : "inner ran out");
    });
    loop.AddTimer(0.005, 0, [&] { seen.push_back("timer"); });
    EXPECT_FALSE(loop.RunFor(10));  // returns once the timer fired: nothing is left
    EXPECT_EQ(seen, (std::vector<std::string>{"inner quit", "timer"}));
    EXPECT_FALSE(loop.RunFor(0));

    // Run goes on until Quit; work posted before it stays queued for the next run.
    int ticks = 0;
    loop.AddTimer(0.001, 0.001, [&] {
        if (++ticks < 3) return;
        loop.Post([&] { seen.push_back("after"); });
        loop.Quit();
    });
    loop.Run();
    EXPECT_EQ(ticks, 3);
    EXPECT_EQ(seen.size(), 2u);
    EXPECT_EQ(loop.RunUntilIdle(), 1u);
    EXPECT_EQ(seen.back(), "after");
}

TEST(PollRunLoop, ATaskThatKeepsPostingItselfStarvesNeitherTimersNorQuit) {
    PollRunLoop loop;
    int spins = 0;
    constexpr int kGiveUp = 10000000;  // a starving loop would only stop here
    std::function<void()> spin = [&] {
        if (++spins < kGiveUp) loop.Post(spin);
    };
    loop.Post(spin);
    loop.AddTimer(0.002, 0, [&] { loop.Quit(); });
    EXPECT_TRUE(loop.RunFor(10));
    EXPECT_GT(spins, 0);
    EXPECT_LT(spins, kGiveUp);
}

}  // namespace

TEST(PollRunLoop, WorkPostedFromOtherThreadsWakesALoopWaitingForALateTimer) {
    PollRunLoop loop;
    int ran = 0;  // only the loop's thread touches it
    const RunLoop::TimerId far = loop.AddTimer(3600, 0, [] {});
    std::vector<std::thread> posters;
    for (int t = 0; t < 4; ++t) {
        posters.emplace_back([&loop, &ran] {
            for (int i = 0; i < 250; ++i)
                loop.Post([&loop, &ran] {
                    if (++ran == 1000) loop.Quit();
                });
        });
    }
    const auto start = std::chrono::steady_clock::now();
    EXPECT_TRUE(loop.RunFor(3600));
    for (std::thread& poster : posters)
        poster.join();
    EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::minutes(1));
    EXPECT_EQ(1000, ran);
    loop.CancelTimer(far);
}
