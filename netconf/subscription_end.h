// The end of an asynchronous subscription: the client calls back once the subscription is
// closed and its message handler has returned for the last time; only then may what the
// handler uses go.
#pragma once

#include <nats/nats.h>

#include <condition_variable>
#include <cstdint>
#include <mutex>

class SubscriptionEnd {
public:
    // Asks the client to report sub's end here; the object must stay until Ended().
    void Watch(natsSubscription* sub);
    // Closes sub (letting what was delivered be handled first) and waits up to ms for the
    // handler's last return. True once it returned; also when nothing was watched.
    bool Close(natsSubscription* sub, std::int64_t ms);
    // Waits up to ms more for the end of a subscription already closed.
    bool Ended(std::int64_t ms);

private:
    static void OnComplete(void* closure);

    std::mutex m_mutex;
    std::condition_variable m_changed;
    bool m_watching = false;
    bool m_ended = false;
};
