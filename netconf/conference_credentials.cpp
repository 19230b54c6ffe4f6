#include "netconf/conference_credentials.h"

#include <sstream>

#include "netconf/conference_subjects.h"

bool ParseConferenceCredentials(const std::string& text, std::vector<ConferenceCredential>* out,
                                std::string* error) {
    std::vector<ConferenceCredential> pairs;
    std::istringstream lines(text);
    std::string line;
    for (int number = 1; std::getline(lines, line); ++number) {
        const std::size_t comment = line.find('#');
        if (comment != std::string::npos) line.erase(comment);
        std::istringstream words(line);
        std::string user, password, extra;
        if (!(words >> user)) continue;
        if (!(words >> password) || (words >> extra) || !IsValidConferenceUser(user)) {
            *error = "line " + std::to_string(number) + ": a line takes a user name and a password";
            return false;
        }
        pairs.push_back({number, user, password});
    }
    *out = std::move(pairs);
    return true;
}
