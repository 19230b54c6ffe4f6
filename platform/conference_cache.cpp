#include "platform/conference_cache.h"

#include <algorithm>
#include <utility>

std::uint32_t ConferenceCache::Set(std::uint32_t senderId, std::uint32_t flags,
                                   std::shared_ptr<const std::vector<std::uint8_t>> bytes) {
    m_bSet = true;
    m_items.clear();
    const std::uint32_t cacheId = m_nextCacheId++;
    if (bytes) m_items.push_back({cacheId, senderId, flags, std::move(bytes)});
    return cacheId;
}

std::uint32_t ConferenceCache::Append(std::uint32_t senderId, std::uint32_t flags,
                                      std::shared_ptr<const std::vector<std::uint8_t>> bytes) {
    m_bSet = true;
    const std::uint32_t cacheId = m_nextCacheId++;
    m_items.push_back({cacheId, senderId, flags, std::move(bytes)});
    return cacheId;
}

void ConferenceCache::Subscribe(InProcessArmClient* client, IArmSharedDataSink* sink) {
    for (ConferenceCacheSubscriber& subscriber : m_subscribers) {
        if (subscriber.client == client) {
            subscriber.sink = sink;
            return;
        }
    }
    m_subscribers.push_back({client, sink});
}

void ConferenceCache::Unsubscribe(const InProcessArmClient* client) {
    m_subscribers.erase(std::remove_if(m_subscribers.begin(), m_subscribers.end(),
                                       [client](const ConferenceCacheSubscriber& subscriber) {
                                           return subscriber.client == client;
                                       }),
                        m_subscribers.end());
}
