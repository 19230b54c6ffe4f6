#include "tests/support/spy_arm_client.h"

#include <algorithm>
#include <cstring>

void SpyArmClient::Put(std::string& out, std::int64_t value) {
    out += (out.empty() ? "" : ", ") + std::to_string(value);
}

void SpyArmClient::Put(std::string& out, const char* text) {
    out += (out.empty() ? "" : ", ") + std::string(text ? text : "null");
}

void SpyArmClient::Put(std::string& out, const Resources& resources) {
    std::string list = resources.list ? "" : "null";
    for (int i = 0; resources.list && i < resources.count; ++i) {
        std::string one;
        Put(one, resources.list[i].wResourceType);
        Put(one, resources.list[i].pszName);
        Put(one, resources.list[i].dwCount);
        list += "{" + one + "}";
    }
    Put(out, list.c_str());
}

std::vector<std::string> SpyArmClient::Calls() const {
    std::vector<std::string> names;
    for (const std::string& call : m_details)
        names.push_back(call.substr(0, call.find('(')));
    return names;
}

std::size_t SpyArmClient::Count(const std::string& name) const {
    const std::vector<std::string> names = Calls();
    return static_cast<std::size_t>(std::count(names.begin(), names.end(), name));
}

int SpyArmClient::ApeAttach(IArmApeSink* sink, std::uint32_t reserved, std::uint16_t conferenceId,
                            std::uint32_t* apeHandle) {
    const int result = Call("ApeAttach", &Arm::ApeAttach, sink, reserved, conferenceId, apeHandle);
    if (apeHandle) m_apeHandle = *apeHandle;
    return result;
}

int SpyArmClient::ApeEnroll(std::uint32_t apeHandle, int enroll, std::uint32_t sessionId,
                            std::uint32_t reserved, int resourceCount,
                            ARMSessionResource* resources, const void* enrollInfo,
                            std::uint32_t enrollInfoLength, int mode) {
    m_enrollPayloads.emplace_back(static_cast<const char*>(enrollInfo), enrollInfoLength);
    return Call("ApeEnroll", &Arm::ApeEnroll, apeHandle, enroll, sessionId, reserved, resourceCount,
                Resources{resources, resourceCount}, enrollInfo, enrollInfoLength, mode);
}

int SpyArmClient::AllocNameHandle(std::uint32_t apeHandle, std::uint32_t count, NameHandle* entries,
                                  IArmAllocHandleSink* sink) {
    m_handleRequests.emplace_back(entries, entries + count);
    m_handleNames.clear();
    for (std::uint32_t i = 0; i < count; ++i)
        m_handleNames.emplace_back(entries[i].name,
                                   strnlen(entries[i].name, sizeof entries[i].name));
    return Call("AllocNameHandle", &Arm::AllocNameHandle, apeHandle, count, entries, sink);
}
