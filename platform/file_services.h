// The desktop's file services as the engine sees them: resolve a path, open, read, write,
// truncate, sync, delete, rename, create and examine files. "Not found" is told apart from other
// failures because callers treat a missing file as a normal case.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

enum FileResult {
    kFileOk = 0,
    kFileNotFound,    // the file, or a folder on its path, does not exist
    kFileExists,      // create: a file of that name is already there
    kFilePermission,  // access refused, or a write-protected volume
    kFileError,       // anything else: full disk, I/O error, a folder where a file should be
};

// How a file is opened; the values are those hosts pass as a signed byte.
enum FilePermission : std::int8_t {
    kFileRead = 1,
    kFileWrite = 2,
    kFileReadWrite = 3,
};

// What GetInfo tells about a file or folder.
struct FileInfo {
    std::uint64_t size = 0;
    bool isFolder = false;
    std::int64_t modifiedSeconds = 0;  // since the epoch
    std::uint32_t mode = 0;            // permission bits (0644 and the like)
};

// CreateUnique's mode for a file no other file lends its mode: 0666 less the umask.
constexpr std::uint32_t kDefaultFileMode = 0xFFFFFFFF;

// An open file, valid between a successful Open and its Close.
using FileId = int;

class FileServices {
public:
    virtual ~FileServices() = default;

    // kFileOk when path names an existing file or folder.
    virtual FileResult Resolve(const std::string& path) = 0;
    // Fills info for an existing file or folder.
    virtual FileResult GetInfo(const std::string& path, FileInfo* info) = 0;
    // Opens an existing file; never creates one.
    virtual FileResult Open(const std::string& path, FilePermission permission, FileId* file) = 0;
    // Reads exactly size bytes from the current position; kFileError when the file ends first.
    virtual FileResult Read(FileId file, void* buffer, std::size_t size) = 0;
    // Writes all size bytes at the current position.
    virtual FileResult Write(FileId file, const void* data, std::size_t size) = 0;
    // The file's size in bytes.
    virtual FileResult GetSize(FileId file, std::uint64_t* size) = 0;
    // Cuts or extends the file to size bytes.
    virtual FileResult Truncate(FileId file, std::uint64_t size) = 0;
    // Waits until the file's data has reached the disk.
    virtual FileResult Sync(FileId file) = 0;
    // Waits until the folder's entries (a file renamed into it, say) have reached the disk.
    virtual FileResult SyncFolder(const std::string& folder) = 0;
    // Closes the file; a failure means earlier writes may not have reached the disk.
    virtual FileResult Close(FileId file) = 0;
    // Removes a file.
    virtual FileResult Delete(const std::string& path) = 0;
    // Moves from onto to in one step, replacing a file at to.
    virtual FileResult Rename(const std::string& from, const std::string& to) = 0;
    // Creates the empty file name in folder (kFileExists when there is one). Type and
    // creator are desktop file tags ('TEXT', 'ttxt'); volumes without them ignore them.
    virtual FileResult Create(const std::string& folder, const std::string& name,
                              std::uint32_t type, std::uint32_t creator) = 0;
    // Creates a new empty file in folder whose name is stem followed by characters that make
    // it unused there, and opens it for writing. Its permission bits are mode, or 0666 less
    // the umask for kDefaultFileMode. *name receives the name; no existing file is touched.
    virtual FileResult CreateUnique(const std::string& folder, const std::string& stem,
                                    std::uint32_t mode, std::string* name, FileId* file) = 0;
};

// The services of an ordinary POSIX file system.
class PosixFileServices : public FileServices {
public:
    FileResult Resolve(const std::string& path) override;
    FileResult GetInfo(const std::string& path, FileInfo* info) override;
    FileResult Open(const std::string& path, FilePermission permission, FileId* file) override;
    FileResult Read(FileId file, void* buffer, std::size_t size) override;
    FileResult Write(FileId file, const void* data, std::size_t size) override;
    FileResult GetSize(FileId file, std::uint64_t* size) override;
    FileResult Truncate(FileId file, std::uint64_t size) override;
    FileResult Sync(FileId file) override;
    FileResult SyncFolder(const std::string& folder) override;
    FileResult Close(FileId file) override;
    FileResult Delete(const std::string& path) override;
    FileResult Rename(const std::string& from, const std::string& to) override;
    FileResult Create(const std::string& folder, const std::string& name, std::uint32_t type,
                      std::uint32_t creator) override;
    FileResult CreateUnique(const std::string& folder, const std::string& stem, std::uint32_t mode,
                            std::string* name, FileId* file) override;
};

// The path of name inside folder ("" is the current folder).
std::string PathInFolder(const std::string& folder, const std::string& name);

// The services in use: the POSIX ones unless others were installed.
FileServices& CurrentFileServices();
// Installs services for every later call (not owned); null restores the POSIX ones.
void SetFileServices(FileServices* services);

// An open file that is closed when it goes out of scope. Close() reports the result when
// the caller needs to know that the data reached the disk.
class OpenFile {
public:
    explicit OpenFile(FileServices& services) : m_services(services) {}
    ~OpenFile() { Close(); }
    OpenFile(const OpenFile&) = delete;
    OpenFile& operator=(const OpenFile&) = delete;

    // Opens path; any file open before is closed first.
    FileResult Open(const std::string& path, FilePermission permission);
    // Takes over a file opened elsewhere (by CreateUnique); any file open before is closed.
    void Adopt(FileId id);
    // Closes the file; kFileOk when none was open.
    FileResult Close();
    FileId Id() const { return m_id; }

private:
    FileServices& m_services;
    FileId m_id = -1;
    bool m_bOpen = false;
};

// A file type or creator tag from its four characters ('TEXT').
constexpr std::uint32_t FileTag(const char (&tag)[5]) {
    return (static_cast<std::uint32_t>(static_cast<unsigned char>(tag[0])) << 24) |
           (static_cast<std::uint32_t>(static_cast<unsigned char>(tag[1])) << 16) |
           (static_cast<std::uint32_t>(static_cast<unsigned char>(tag[2])) << 8) |
           static_cast<std::uint32_t>(static_cast<unsigned char>(tag[3]));
}
