// The line ends of typed chat: every break a user can type leaves as CR LF.
#pragma once

#include <string>

// A copy of text with every from replaced by to. Each replacement looks again from the start
// of the text as it now stands, so a replacement that completes an earlier match is replaced
// too; when to itself holds from, each original occurrence is replaced once. Empty from: text.
std::string replace_all(const std::string& text, const std::string& from, const std::string& to);

// The five passes a typed text goes through before it is sent: CR LF and LF CR become CR,
// CR becomes two LFs, two LFs become CR LF, and a line separator (U+2028) becomes CR LF.
std::string NormaliseLineEnds(const std::string& text);
