// The one way the PDU classes hand received text to tinyxml: with the checks of xml_limits.h
// first and an encoding fixed up front, so that no input can crash, stall or over-read it.
#pragma once

#include <string>

class TiXmlDocument;

// Empties doc, then parses text into it when the text is within the limits. The text counts
// up to its first NUL, as the parser reads it. Returns true when it parsed without error.
bool ParseWithinLimits(TiXmlDocument& doc, const std::string& text);
