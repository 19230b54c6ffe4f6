// Credentials files of conference participants, shared by the programs that join a conference
// server: one "NAME PASSWORD" pair a line, separated by blanks, '#' starting a comment.
#pragma once

#include <string>
#include <vector>

struct ConferenceCredential {
    int line = 0;  // where the pair stands in the file, for messages
    std::string user;
    std::string password;
};

// Every pair of the text, in order. False with a message naming the first line that is not a
// usable conference user name followed by a password.
bool ParseConferenceCredentials(const std::string& text, std::vector<ConferenceCredential>* out,
                                std::string* error);
