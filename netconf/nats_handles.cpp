#include "netconf/nats_handles.h"

std::string NatsErrorText(natsStatus status) {
    std::string text = natsStatus_GetText(status);
    natsStatus last = NATS_OK;
    const char* detail = nats_GetLastError(&last);
    if (detail != nullptr && *detail != '\0' && text != detail) text += std::string(": ") + detail;
    return text;
}

std::string NatsHeader(natsMsg* msg, const char* key) {
    const char* value = nullptr;
    if (natsMsgHeader_Get(msg, key, &value) != NATS_OK || value == nullptr) return std::string();
    return value;
}

bool SetNatsHeader(natsMsg* msg, const char* key, const std::string& value) {
    return natsMsgHeader_Set(msg, key, value.c_str()) == NATS_OK;
}

bool ParseDecimal(const std::string& text, std::uint64_t* value) {
    if (text.empty() || text.size() > 20) return false;
    std::uint64_t result = 0;
    for (const char c : text) {
        if (c < '0' || c > '9') return false;
        const std::uint64_t digit = static_cast<std::uint64_t>(c - '0');
        if (result > (UINT64_MAX - digit) / 10) return false;
        result = result * 10 + digit;
    }
    *value = result;
    return true;
}
