// One shared-data cache of an in-process conference: its items in cache-id order and the
// participants subscribed to its later actions.
//
// A CACHE_SET replaces the whole contents: with bytes the cache then holds exactly one item
// with those bytes (so a status cache marked with "1\0" reads back as one non-empty item, and
// a cache initialised with a 2-byte zero block reads back that block); without bytes (memory
// handle 0) the cache is set and empty. Every action takes the next cache id, starting at 1;
// ids are never reused, also not after a SET.
#pragma once

#include <cstdint>
#include <memory>
#include <vector>

class IArmSharedDataSink;
class InProcessArmClient;

// One stored entry: the bytes a writer gave, its user id and the action flags.
struct ConferenceCacheItem {
    std::uint32_t cacheId;
    std::uint32_t senderId;
    std::uint32_t flags;
    std::shared_ptr<const std::vector<std::uint8_t>> bytes;  // never null
};

// A participant receiving every later action through the sink it subscribed with.
struct ConferenceCacheSubscriber {
    InProcessArmClient* client;
    IArmSharedDataSink* sink;
};

class ConferenceCache {
public:
    // True once a SET or an APPEND reached the cache.
    bool IsSet() const { return m_bSet; }

    // Replaces the contents with bytes (empty contents when bytes is null); returns the
    // action's cache id.
    std::uint32_t Set(std::uint32_t senderId, std::uint32_t flags,
                      std::shared_ptr<const std::vector<std::uint8_t>> bytes);
    // Adds one item; returns its cache id.
    std::uint32_t Append(std::uint32_t senderId, std::uint32_t flags,
                         std::shared_ptr<const std::vector<std::uint8_t>> bytes);
    // The stored items in cache-id order.
    const std::vector<ConferenceCacheItem>& Items() const { return m_items; }

    // Adds the participant, or gives an existing subscription the new sink.
    void Subscribe(InProcessArmClient* client, IArmSharedDataSink* sink);
    // Removes the participant's subscription, if any.
    void Unsubscribe(const InProcessArmClient* client);
    // Subscribers in the order they first subscribed.
    const std::vector<ConferenceCacheSubscriber>& Subscribers() const { return m_subscribers; }

private:
    bool m_bSet = false;
    std::uint32_t m_nextCacheId = 1;
    std::vector<ConferenceCacheItem> m_items;
    std::vector<ConferenceCacheSubscriber> m_subscribers;
};
