// Splitting seconds into calendar fields and back, and the virtual clock's calendar.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstdio>
#include <string>

#include "platform/calendar.h"
#include "platform/virtual_run_loop.h"

namespace {

std::string Text(const CalendarTime& t) {
    char text[40];
    std::snprintf(text, sizeof text, "%04d-%02d-%02d %02d:%02d:%02d%s", t.year, t.month, t.day,
                  t.hour, t.minute, t.second, t.valid ? "" : " invalid");
    return text;
}

TEST(Calendar, SecondsSplitIntoFieldsWithoutTimeZone) {
    const struct {
        std::int64_t seconds;
        const char* text;
    } rows[] = {
        {0, "1970-01-01 00:00:00"},
        {1236243600, "2009-03-05 09:00:00"},
        {1709251199, "2024-02-29 23:59:59"},
        {951868800, "2000-03-01 00:00:00"},
        {-1, "1969-12-31 23:59:59"},
        {253402300800, "0000-00-00 00:00:00 invalid"},  // year 10000
    };
    for (const auto& row : rows) {
        EXPECT_EQ(Text(CalendarFromUnixSeconds(row.seconds)), row.text) << row.seconds;
        std::int64_t back = 0;
        const CalendarTime time = CalendarFromUnixSeconds(row.seconds);
        EXPECT_EQ(UnixSecondsFromCalendar(time, &back), time.valid);
        if (time.valid) {
            EXPECT_EQ(back, row.seconds);
        }
    }
    std::int64_t unchanged = 7;
    EXPECT_FALSE(UnixSecondsFromCalendar({2023, 2, 29, 0, 0, 0, true}, &unchanged));
    EXPECT_FALSE(UnixSecondsFromCalendar({2023, 13, 1, 0, 0, 0, true}, &unchanged));
    EXPECT_FALSE(UnixSecondsFromCalendar({2023, 1, 1, 24, 0, 0, true}, &unchanged));
    EXPECT_EQ(unchanged, 7);
}

TEST(Calendar, TheVirtualClockCountsFromItsOrigin) {
    VirtualRunLoop loop;
    EXPECT_EQ(Text(loop.CalendarNow()), "2009-03-05 09:00:00");
    EXPECT_TRUE(loop.SetCalendarOrigin({2021, 12, 31, 23, 59, 58, true}));
    EXPECT_FALSE(loop.SetCalendarOrigin({2021, 2, 30, 0, 0, 0, true}));
    loop.AdvanceBy(1.5);
    EXPECT_EQ(Text(loop.CalendarNow()), "2021-12-31 23:59:59");
    loop.AdvanceBy(0.5);
    EXPECT_EQ(Text(loop.CalendarNow()), "2022-01-01 00:00:00");
    // Code running on the loop reads it; without a current loop the local clock answers.
    CalendarTime seen;
    loop.Post([&seen] { seen = CurrentCalendarTime(); });
    loop.RunUntilIdle();
    EXPECT_EQ(Text(seen), "2022-01-01 00:00:00");
    EXPECT_TRUE(CurrentCalendarTime().valid);
}

}  // namespace
