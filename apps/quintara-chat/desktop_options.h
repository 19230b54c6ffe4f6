// The desktop program's command line and its credentials file.
#pragma once

#include <cstdint>
#include <string>

struct DesktopOptions {
    std::string serverUrl;  // nats://HOST:PORT
    std::string credsPath;
    std::uint16_t conferenceId = 0;
    std::string displayName;
    std::uint32_t nodeId = 0;
    std::uint32_t roles = 0;  // host 0x1, presenter 0x2, panelist 0x4
    std::int32_t meetingType = 3;
    bool meetingTypeGiven = false;
    bool offscreen = false;
    std::string scriptPath;
    double waitSeconds = 10;  // how long a script waits for what others do
};

// Reads the command line; false with a message for anything missing, unknown or malformed.
bool ParseDesktopOptions(int argc, const char* const* argv, DesktopOptions* out,
                         std::string* error);

struct DesktopCredentials {
    std::string user;
    std::string password;
};

// Reads a credentials file as the simulator's: "NAME PASSWORD" on a line, '#' starting a
// comment; here it holds one user. False with a message when the file cannot be read, a line
// is not a usable user name and a password, or there is not exactly one.
bool ReadCredentials(const std::string& path, DesktopCredentials* out, std::string* error);
// The same, from the file's text.
bool ParseCredentials(const std::string& text, DesktopCredentials* out, std::string* error);
