#include "sim/participant_loop.h"

#include <utility>

namespace {

std::string& ActingName() {
    static std::string name;
    return name;
}

}  // namespace

ParticipantLoop::ParticipantLoop(RunLoop& shared, std::string name)
    : m_shared(shared), m_name(std::move(name)) {}

void ParticipantLoop::Post(Task task) {
    m_shared.Post(Acting(std::move(task)));
}

RunLoop::TimerId ParticipantLoop::AddTimer(double firstDelay, double interval, Task task) {
    return m_shared.AddTimer(firstDelay, interval, Acting(std::move(task)));
}

void ParticipantLoop::CancelTimer(TimerId id) {
    m_shared.CancelTimer(id);
}

const std::string& ParticipantLoop::Acting() {
    return ActingName();
}

RunLoop::Task ParticipantLoop::Acting(Task task) {
    return [this, task = std::move(task)] {
        ActingScope scope(*this);
        task();
    };
}

ActingScope::ActingScope(ParticipantLoop& loop) : m_current(&loop), m_previous(ActingName()) {
    ActingName() = loop.Name();
}

ActingScope::~ActingScope() {
    ActingName() = m_previous;
}
