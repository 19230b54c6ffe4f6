// Calendar time as the component stamps chat lines: the current time split into year, month,
// day, hour, minute and second. Run loops answer what "now" is; these helpers do the splitting.
#pragma once

#include <cstdint>

struct CalendarTime {
    int year = 0;
    int month = 0;       // 1 to 12
    int day = 0;         // 1 to 31
    int hour = 0;        // 0 to 23
    int minute = 0;      // 0 to 59
    int second = 0;      // 0 to 59
    bool valid = false;  // false when the clock could not be read or split
};

// The fields of a count of seconds since 1970-01-01 00:00:00, without any time zone.
CalendarTime CalendarFromUnixSeconds(std::int64_t seconds);
// The reverse; false when a field is out of range (the day is checked against its month).
bool UnixSecondsFromCalendar(const CalendarTime& time, std::int64_t* seconds);
// The system clock in the host's local time zone.
CalendarTime LocalCalendarNow();
// The calendar time of the calling thread's run loop, or the local time without one.
CalendarTime CurrentCalendarTime();
