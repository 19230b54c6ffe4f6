// Bounded memory and text operations for fixed-size buffers. Each checks the bounded library's
// result, so a refused operation is never mistaken for a done one. What the library refuses is
// also reported to its constraint handler (the tests make that handler fail the test).
#pragma once

#include <cstddef>

// Moves n bytes from src to dst (the ranges may overlap); dstSize is the room at dst.
// Returns true when moved (n == 0 moves nothing and succeeds). Returns false when dst or src is
// null, n exceeds dstSize or dstSize exceeds 256 MiB; then nothing is moved, but dst may have
// been zero-filled up to dstSize.
bool SafeMove(void* dst, size_t dstSize, const void* src, size_t n);

// Copies the text src into dst, cut to dstSize - 1 bytes, and always terminates it.
// A null src copies the empty text. Returns the number of bytes copied (without the terminator),
// so a result below the text's length means it was cut. With a null dst or dstSize 0 nothing is
// written and 0 is returned.
size_t SafeCopyText(char* dst, size_t dstSize, const char* src);

// The length of text, counting at most maxLen bytes; 0 for a null text. Unlike the bounded
// library's own length function it has no upper limit on maxLen.
size_t SafeTextLength(const char* text, size_t maxLen);

// True when the n bytes at a and b are equal (n == 0: true). A null pointer or a refused
// comparison (n above 256 MiB) answers false, never "equal".
bool SafeBytesEqual(const void* a, const void* b, size_t n);
