// Owning handles for the objects of the NATS C client, and small helpers around its messages.
#pragma once

#include <nats/nats.h>

#include <cstdint>
#include <memory>
#include <string>

struct NatsDeleter {
    void operator()(natsOptions* p) const { natsOptions_Destroy(p); }
    void operator()(natsConnection* p) const { natsConnection_Destroy(p); }
    void operator()(jsCtx* p) const { jsCtx_Destroy(p); }
    void operator()(natsMsg* p) const { natsMsg_Destroy(p); }
    void operator()(natsSubscription* p) const { natsSubscription_Destroy(p); }
    void operator()(jsPubAck* p) const { jsPubAck_Destroy(p); }
    void operator()(jsStreamInfo* p) const { jsStreamInfo_Destroy(p); }
    void operator()(jsConsumerInfo* p) const { jsConsumerInfo_Destroy(p); }
    void operator()(jsMsgMetaData* p) const { jsMsgMetaData_Destroy(p); }
};

template <typename T>
using NatsPtr = std::unique_ptr<T, NatsDeleter>;

// The status as text, with the client's more precise last error when it has one.
std::string NatsErrorText(natsStatus status);

// A header's value, or "" when the message has none.
std::string NatsHeader(natsMsg* msg, const char* key);
// Sets a header; false when the client refuses.
bool SetNatsHeader(natsMsg* msg, const char* key, const std::string& value);

// A decimal number of at most 20 digits; false for anything else.
bool ParseDecimal(const std::string& text, std::uint64_t* value);
