// Measures what tinyxml would build from a text before it is parsed, without recursion, so that
// nesting, attribute and node counts beyond the caps of xml_limits.h never reach the parser.
#pragma once

#include <tinyxml.h>

// True when parsing the NUL-terminated text with this encoding stays within kMaxXmlDepth,
// kMaxXmlAttributes and kMaxXmlNodes. The walk reads the text with tinyxml's own lexing
// functions and follows its parser's steps; where it finds a step the parser fails, it counts
// every later element start and attribute sign as if the parser went on, so a wrong guess can
// only refuse a broken document, never let a deep one through.
bool FitsXmlLimits(const char* text, TiXmlEncoding encoding);
