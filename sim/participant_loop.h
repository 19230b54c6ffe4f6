// One participant's view of the simulator's single virtual clock: work and timers go to the
// shared loop, and while they run the participant counts as the one acting, so that every log
// line can carry its name.
#pragma once

#include <string>

#include "platform/run_loop.h"

class ParticipantLoop final : public RunLoop {
public:
    ParticipantLoop(RunLoop& shared, std::string name);
    ParticipantLoop(const ParticipantLoop&) = delete;
    ParticipantLoop& operator=(const ParticipantLoop&) = delete;

    const std::string& Name() const { return m_name; }

    void Post(Task task) override;
    TimerId AddTimer(double firstDelay, double interval, Task task) override;
    void CancelTimer(TimerId id) override;
    CalendarTime CalendarNow() const override { return m_shared.CalendarNow(); }

    // The participant acting now (the one whose work runs, or whom the script addresses);
    // empty when nobody is.
    static const std::string& Acting();

private:
    // Wraps a task so that it runs with this participant acting.
    Task Acting(Task task);

    RunLoop& m_shared;
    const std::string m_name;
};

// Makes a participant the acting one (and its loop the current one) for a scope.
class ActingScope {
public:
    explicit ActingScope(ParticipantLoop& loop);
    ~ActingScope();
    ActingScope(const ActingScope&) = delete;
    ActingScope& operator=(const ActingScope&) = delete;

private:
    ScopedCurrentRunLoop m_current;
    std::string m_previous;
};
