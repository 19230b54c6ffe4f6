#include "apps/quintara-chat/desktop_options.h"

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <sstream>

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

std::string Trimmed(const std::string& text) {
    const std::size_t first = text.find_first_not_of(" \t\r");
    if (first == std::string::npos) return "";
    const std::size_t last = text.find_last_not_of(" \t\r");
    return text.substr(first, last - first + 1);
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
    DesktopCredentials creds;
    std::istringstream lines(text);
    std::string line;
    for (int number = 1; std::getline(lines, line); ++number) {
        line = Trimmed(line);
        if (line.empty() || line[0] == '#') continue;
        const std::size_t equals = line.find('=');
        const std::string key = Trimmed(line.substr(0, equals));
        if (equals == std::string::npos || (key != "user" && key != "password")) {
            *error =
                "line " + std::to_string(number) + ": expected user = NAME or password = SECRET";
            return false;
        }
        (key == "user" ? creds.user : creds.password) = Trimmed(line.substr(equals + 1));
    }
    if (creds.user.empty() || creds.password.empty()) {
        *error = creds.user.empty() ? "no user name" : "no password";
        return false;
    }
    *out = creds;
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
