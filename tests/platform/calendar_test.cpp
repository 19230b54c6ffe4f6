// Splitting seconds into calendar fields and back, and the virtual clock's calendar.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstdio>
#include <string>

#include "platform/calendar.h"
#include "platform/virtual_run_loop.h"

namespace {

std::string Text(const CalendarTime& t) {
    char text[64];
    std::snprintf(text, sizeof text, "%04d-%02d-%02d %02d:%02d:%02d%s", t.year, t.month, t.day,
                  t.hour, t.minute, t.second, t.valid ? "" : " invalid");
    return text;
}

TEST(Calendar, SecondsSplitIntoFieldsWithoutTimeZoneAndBack) {
    const struct {
        std::int64_t seconds;
        const char* text;
    } rows[] = {{0, "1970-01-01 00:00:00"},
                {1709251199, "2024-02-29 23:59:59"},
                {951868800, "2000-03-01 00:00:00"},
                {-1, "1969-12-31 23:59:59"},
                {253402300800, "0000-00-00 00:00:00 invalid"}};
    for (const auto& row : rows) {
        const CalendarTime time = CalendarFromUnixSeconds(row.seconds);
        EXPECT_EQ(Text(time), row.text);
        std::int64_t back = 7;
        EXPECT_EQ(UnixSecondsFromCalendar(time, &back), time.valid);
        EXPECT_EQ(back, time.valid ? row.seconds : 7);
    }
    std::int64_t unchanged = 7;
    EXPECT_FALSE(UnixSecondsFromCalendar({2023, 2, 29, 0, 0, 0, true}, &unchanged));
    EXPECT_FALSE(UnixSecondsFromCalendar({2023, 1, 1, 24, 0, 0, true}, &unchanged));
    EXPECT_EQ(unchanged, 7);
}

TEST(Calendar, TheVirtualClockCountsFromItsOriginAndIsWhatCodeOnItsLoopReads) {
    VirtualRunLoop loop;
    EXPECT_EQ(Text(loop.CalendarNow()), "2009-03-05 09:00:00");
    EXPECT_TRUE(loop.SetCalendarOrigin({2021, 12, 31, 23, 59, 58, true}));
    EXPECT_FALSE(loop.SetCalendarOrigin({2021, 2, 30, 0, 0, 0, true}));
    loop.AdvanceBy(2.0);
    CalendarTime seen;
    loop.Post([&seen] { seen = CurrentCalendarTime(); });
    loop.RunUntilIdle();
    EXPECT_EQ(Text(seen), "2022-01-01 00:00:00");
    EXPECT_TRUE(CurrentCalendarTime().valid);  // no loop: the local clock
}

}  // namespace
