#include "kyutil/safe_mem.h"

#include <safeclib/safe_mem_lib.h>

#include <cstring>

bool SafeMove(void* dst, size_t dstSize, const void* src, size_t n) {
    if (n == 0) return true;
    return memmove_s(dst, dstSize, src, n) == EOK;
}

size_t SafeCopyText(char* dst, size_t dstSize, const char* src) {
    if (dst == nullptr || dstSize == 0) return 0;
    const size_t n = SafeTextLength(src, dstSize - 1);
    if (!SafeMove(dst, dstSize, src, n)) {
        dst[0] = '\0';
        return 0;
    }
    dst[n] = '\0';
    return n;
}

size_t SafeTextLength(const char* text, size_t maxLen) {
    return text == nullptr ? 0 : strnlen(text, maxLen);
}

bool SafeBytesEqual(const void* a, const void* b, size_t n) {
    if (n == 0) return true;
    int diff = 1;
    return memcmp_s(a, n, b, n, &diff) == EOK && diff == 0;
}
