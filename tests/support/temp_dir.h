// A fresh folder under the system's temporary folder for one test, removed with everything
// in it when the test ends; plus small helpers to put and read whole files.
#pragma once

#include <string>

class TempDir {
public:
    TempDir();
    ~TempDir();
    TempDir(const TempDir&) = delete;
    TempDir& operator=(const TempDir&) = delete;

    // The folder, without a trailing "/".
    const std::string& Path() const { return m_path; }
    // Path() + "/" + name.
    std::string File(const std::string& name) const { return m_path + "/" + name; }

private:
    std::string m_path;
};

// Writes bytes as the whole content of path; false when it cannot.
bool PutFile(const std::string& path, const std::string& bytes);
// The whole content of path, or empty when it cannot be read.
std::string FileBytes(const std::string& path);
// True when path names an existing file or folder.
bool FileExists(const std::string& path);
