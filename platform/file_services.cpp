#include "platform/file_services.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <random>

namespace {

FileResult FromErrno(int error) {
    switch (error) {
        case ENOENT:
        case ENOTDIR:
            return kFileNotFound;
        case EEXIST:
            return kFileExists;
        case EACCES:
        case EPERM:
        case EROFS:
            return kFilePermission;
        default:
            return kFileError;
    }
}

int OpenFlags(FilePermission permission) {
    switch (permission) {
        case kFileWrite:
            return O_WRONLY;
        case kFileReadWrite:
            return O_RDWR;
        case kFileRead:
            break;
    }
    return O_RDONLY;
}

// Tries this many names before CreateUnique gives up.
constexpr int kUniqueNameTries = 100;

// Six characters that make a name unlikely to be in use.
std::string RandomSuffix() {
    static const char kChars[] = "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789";
    static std::mt19937 generator{std::random_device{}()};
    std::uniform_int_distribution<std::size_t> pick(0, sizeof kChars - 2);
    std::string suffix(6, ' ');
    for (char& c : suffix)
        c = kChars[pick(generator)];
    return suffix;
}

FileServices*& Installed() {
    static FileServices* services = nullptr;
    return services;
}

}  // namespace

FileResult PosixFileServices::Resolve(const std::string& path) {
    struct stat st;
    return ::stat(path.c_str(), &st) == 0 ? kFileOk : FromErrno(errno);
}

FileResult PosixFileServices::GetInfo(const std::string& path, FileInfo* info) {
    struct stat st;
    if (::stat(path.c_str(), &st) != 0) return FromErrno(errno);
    info->size = static_cast<std::uint64_t>(st.st_size);
    info->isFolder = S_ISDIR(st.st_mode);
    info->modifiedSeconds = st.st_mtime;
    info->mode = st.st_mode & 07777;
    return kFileOk;
}

FileResult PosixFileServices::Open(const std::string& path, FilePermission permission,
                                   FileId* file) {
    const int fd = ::open(path.c_str(), OpenFlags(permission) | O_CLOEXEC);
    if (fd < 0) return FromErrno(errno);
    *file = fd;
    return kFileOk;
}

FileResult PosixFileServices::Read(FileId file, void* buffer, std::size_t size) {
    char* at = static_cast<char*>(buffer);
    while (size > 0) {
        const ssize_t got = ::read(file, at, size);
        if (got < 0) {
            if (errno == EINTR) continue;
            return FromErrno(errno);
        }
        if (got == 0) return kFileError;  // the file ended early
        at += got;
        size -= static_cast<std::size_t>(got);
    }
    return kFileOk;
}

FileResult PosixFileServices::Write(FileId file, const void* data, std::size_t size) {
    const char* at = static_cast<const char*>(data);
    while (size > 0) {
        const ssize_t put = ::write(file, at, size);
        if (put < 0) {
            if (errno == EINTR) continue;
            return FromErrno(errno);
        }
        at += put;
        size -= static_cast<std::size_t>(put);
    }
    return kFileOk;
}

FileResult PosixFileServices::GetSize(FileId file, std::uint64_t* size) {
    struct stat st;
    if (::fstat(file, &st) != 0) return FromErrno(errno);
    *size = static_cast<std::uint64_t>(st.st_size);
    return kFileOk;
}

FileResult PosixFileServices::Truncate(FileId file, std::uint64_t size) {
    return ::ftruncate(file, static_cast<off_t>(size)) == 0 ? kFileOk : FromErrno(errno);
}

FileResult PosixFileServices::Sync(FileId file) {
    return ::fsync(file) == 0 ? kFileOk : FromErrno(errno);
}

FileResult PosixFileServices::SyncFolder(const std::string& folder) {
    const int fd =
        ::open(folder.empty() ? "." : folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (fd < 0) return FromErrno(errno);
    const bool synced = ::fsync(fd) == 0;
    const int error = errno;
    ::close(fd);
    return synced ? kFileOk : FromErrno(error);
}

FileResult PosixFileServices::Close(FileId file) {
    return ::close(file) == 0 ? kFileOk : FromErrno(errno);
}

FileResult PosixFileServices::Delete(const std::string& path) {
    return ::unlink(path.c_str()) == 0 ? kFileOk : FromErrno(errno);
}

FileResult PosixFileServices::Rename(const std::string& from, const std::string& to) {
    return std::rename(from.c_str(), to.c_str()) == 0 ? kFileOk : FromErrno(errno);
}

FileResult PosixFileServices::Create(const std::string& folder, const std::string& name,
                                     std::uint32_t, std::uint32_t) {
    const int fd =
        ::open(PathInFolder(folder, name).c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
    if (fd < 0) return FromErrno(errno);
    return ::close(fd) == 0 ? kFileOk : FromErrno(errno);
}

FileResult PosixFileServices::CreateUnique(const std::string& folder, const std::string& stem,
                                           std::uint32_t mode, std::string* name, FileId* file) {
    for (int i = 0; i < kUniqueNameTries; ++i) {
        const std::string candidate = stem + RandomSuffix();
        // Created with 0666, so the umask applies as to any new file.
        const int fd = ::open(PathInFolder(folder, candidate).c_str(),
                              O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
        if (fd < 0) {
            if (errno == EEXIST) continue;
            return FromErrno(errno);
        }
        if (mode != kDefaultFileMode && ::fchmod(fd, static_cast<mode_t>(mode)) != 0) {
            const int error = errno;
            ::close(fd);
            ::unlink(PathInFolder(folder, candidate).c_str());
            return FromErrno(error);
        }
        *name = candidate;
        *file = fd;
        return kFileOk;
    }
    return kFileExists;
}

std::string PathInFolder(const std::string& folder, const std::string& name) {
    if (folder.empty() || folder.back() == '/') return folder + name;
    return folder + "/" + name;
}

FileServices& CurrentFileServices() {
    static PosixFileServices posix;
    FileServices* installed = Installed();
    return installed ? *installed : posix;
}

void SetFileServices(FileServices* services) {
    Installed() = services;
}

FileResult OpenFile::Open(const std::string& path, FilePermission permission) {
    Close();
    FileId id = -1;
    const FileResult result = m_services.Open(path, permission, &id);
    if (result != kFileOk) return result;
    m_id = id;
    m_bOpen = true;
    return kFileOk;
}

void OpenFile::Adopt(FileId id) {
    Close();
    m_id = id;
    m_bOpen = true;
}

FileResult OpenFile::Close() {
    if (!m_bOpen) return kFileOk;
    m_bOpen = false;
    return m_services.Close(m_id);
}
