#include "tests/support/temp_dir.h"

#include <ftw.h>
#include <stdlib.h>
#include <sys/stat.h>

#include <cstdio>
#include <fstream>
#include <iterator>

TempDir::TempDir() {
    const char* base = std::getenv("TMPDIR");
    std::string pattern = std::string(base && *base ? base : "/tmp") + "/qc-test-XXXXXX";
    if (::mkdtemp(&pattern[0])) m_path = pattern;
}

TempDir::~TempDir() {
    // Deepest entries first, links themselves rather than what they point to.
    const auto remove = [](const char* path, const struct stat*, int, struct FTW*) {
        return ::remove(path);
    };
    if (!m_path.empty()) ::nftw(m_path.c_str(), remove, 16, FTW_DEPTH | FTW_PHYS);
}

bool PutFile(const std::string& path, const std::string& bytes) {
    std::ofstream out(path, std::ios::binary | std::ios::trunc);
    out.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    return static_cast<bool>(out);
}

std::string FileBytes(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

bool FileExists(const std::string& path) {
    struct stat st;
    return ::stat(path.c_str(), &st) == 0;
}
