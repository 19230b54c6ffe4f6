// The largest documents the PDU parsers hand to tinyxml, whose parser recurses once per nesting
// level, compares each new attribute with all earlier ones and allocates a few hundred bytes
// per node. Measured on this build: about 40000 levels overflow an 8 MiB stack, 5000 a 512 KiB
// one and 500 a 64 KiB one; 16000 attributes on one element take 0.6 s and 32000 take 2.5 s;
// 1 MiB of empty elements takes 240 MB. Chat documents are two levels deep, with one attribute
// and at most a dozen elements, so the caps below sit far under every breaking point.
#pragma once

#include <cstddef>

// Longest document: a 1 MiB chat line even with every "]]>" widened, plus the envelope.
constexpr size_t kMaxXmlBytes = 2 * 1024 * 1024;
// Deepest element nesting (the root counts as 1): a few KiB of stack even on small threads.
constexpr size_t kMaxXmlDepth = 32;
// Most attributes on one element: keeps the per-element comparisons under a few thousand.
constexpr size_t kMaxXmlAttributes = 64;
// Most nodes in one document (elements, text, comments and the like, attributes included):
// keeps the tree of a hostile document around a megabyte.
constexpr size_t kMaxXmlNodes = 4096;
