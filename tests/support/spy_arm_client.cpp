#include "tests/support/spy_arm_client.h"

#include <algorithm>

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
