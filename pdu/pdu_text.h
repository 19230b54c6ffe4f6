// Text forms shared by the PDU classes: decimal ids and counts, and the CDATA end-marker rule.
#pragma once

#include <cstdint>
#include <string>

// The unsigned decimal of value, no sign and no leading zeros.
std::string DwordText(uint32_t value);

// The signed decimal of value.
std::string IntText(int value);

// Reads a decimal with an optional sign after optional leading blanks and keeps the low 32
// bits, so "4294967295" and "-1" both give 0xFFFFFFFF. Reading stops at the first character
// that is not a digit; text without digits gives 0.
uint32_t DwordValue(const std::string& text);

// text with every "]]>" widened to "]] >", so that it can sit inside one CDATA section.
std::string ReplaceCdataEndMarkers(const std::string& text);
