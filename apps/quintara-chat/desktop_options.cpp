#include "apps/quintara-chat/desktop_options.h"

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <sstream>

#include "netconf/conference_credentials.h"

namespace {

// A whole decimal number within limit.
bool Number(const char* text, std::uint64_t limit, std::uint64_t* out) {
    if (!text || *text < '0' || *text > '9') return false;
    char* end = nullptr;
    errno = 0;
    const unsigned long long value = std::strtoull(text, &end, 10);
    if (errno != 0 || *end != '\0' || value > limit) return false;
    *out = value;
    return true;
}

}  // namespace

bool ParseDesktopOptions(int argc, const char* const* argv, DesktopOptions* out,
                         std::string* error) {
    DesktopOptions options;
    bool nodeGiven = false;
    bool conferenceGiven = false;
    for (int i = 1; i < argc; ++i) {
        const std::string arg = argv[i];
        const char* value = i + 1 < argc ? argv[i + 1] : nullptr;
        std::uint64_t number = 0;
        const auto needs = [&](const char* what) {
            *error = arg + " takes " + what;
            return false;
        };
        if (arg == "--host") {
            options.roles |= 0x1;
        } else if (arg == "--presenter") {
            options.roles |= 0x2;
        } else if (arg == "--panelist") {
            options.roles |= 0x4;
        } else if (arg == "--offscreen") {
            options.offscreen = true;
        } else if (arg == "--server" || arg == "--creds" || arg == "--name" || arg == "--script") {
            if (!value || !*value) return needs("a value");
            std::string& field = arg == "--server"  ? options.serverUrl
                                 : arg == "--creds" ? options.credsPath
                                 : arg == "--name"  ? options.displayName
                                                    : options.scriptPath;
            field = value;
            ++i;
        } else if (arg == "--conference") {
            if (!Number(value, 0xffff, &number) || number == 0)
                return needs("a conference number from 1 to 65535");
            options.conferenceId = static_cast<std::uint16_t>(number);
            conferenceGiven = true;
            ++i;
        } else if (arg == "--node") {
            if (!Number(value, 0xffffffff, &number) || number == 0)
                return needs("a node number above 0");
            options.nodeId = static_cast<std::uint32_t>(number);
            nodeGiven = true;
            ++i;
        } else if (arg == "--meeting-type") {
            if (!Number(value, 3, &number) || number == 0) return needs("1, 2 or 3");
            options.meetingType = static_cast<std::int32_t>(number);
            options.meetingTypeGiven = true;
            ++i;
        } else if (arg == "--wait") {
            if (!Number(value, 3600, &number) || number == 0)
                return needs("a number of seconds from 1 to 3600");
            options.waitSeconds = static_cast<double>(number);
            ++i;
        } else {
            *error = "unknown argument " + arg;
            return false;
        }
    }
    const char* missing = options.serverUrl.empty()     ? "--server"
                          : options.credsPath.empty()   ? "--creds"
                          : !conferenceGiven            ? "--conference"
                          : options.displayName.empty() ? "--name"
                          : !nodeGiven                  ? "--node"
                                                        : nullptr;
    if (missing) {
        *error = std::string(missing) + " is missing";
        return false;
    }
    *out = options;
    return true;
}

bool ParseCredentials(const std::string& text, DesktopCredentials* out, std::string* error) {
    std::vector<ConferenceCredential> pairs;
    if (!ParseConferenceCredentials(text, &pairs, error)) return false;
    if (pairs.size() > 1) {
        *error = "line " + std::to_string(pairs[1].line) + ": one participant, one user";
        return false;
    }
    if (pairs.empty()) {
        *error = "no user name and password";
        return false;
    }
    *out = {pairs[0].user, pairs[0].password};
    return true;
}

bool ReadCredentials(const std::string& path, DesktopCredentials* out, std::string* error) {
    std::ifstream file(path, std::ios::binary);
    if (!file) {
        *error = "cannot read " + path + ": " + std::strerror(errno);
        return false;
    }
    std::stringstream text;
    text << file.rdbuf();
    if (!ParseCredentials(text.str(), out, error)) {
        *error = path + ": " + *error;
        return false;
    }
    return true;
}
