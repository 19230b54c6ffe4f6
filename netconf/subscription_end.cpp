#include "netconf/subscription_end.h"

#include <chrono>

void SubscriptionEnd::Watch(natsSubscription* sub) {
    const std::lock_guard<std::mutex> lock(m_mutex);
    m_ended = false;
    m_watching =
        natsSubscription_SetOnCompleteCB(sub, &SubscriptionEnd::OnComplete, this) == NATS_OK;
}

bool SubscriptionEnd::Close(natsSubscription* sub, std::int64_t ms) {
    if (natsSubscription_Drain(sub) == NATS_OK) {
        natsSubscription_WaitForDrainCompletion(sub, ms);
    } else {
        natsSubscription_Unsubscribe(sub);
    }
    return Ended(ms);
}

bool SubscriptionEnd::Ended(std::int64_t ms) {
    std::unique_lock<std::mutex> lock(m_mutex);
    return m_changed.wait_for(lock, std::chrono::milliseconds(ms),
                              [this] { return m_ended || !m_watching; });
}

void SubscriptionEnd::OnComplete(void* closure) {
    auto* self = static_cast<SubscriptionEnd*>(closure);
    const std::lock_guard<std::mutex> lock(self->m_mutex);
    self->m_ended = true;
    self->m_changed.notify_all();
}
