// File services for tests: the real POSIX ones, except that chosen operations fail with
// chosen results (tests run as root, where the file system itself refuses nothing).
// Installs itself while it lives.
#pragma once

#include <cstddef>
#include <map>
#include <string>
#include <vector>

#include "platform/file_services.h"

enum class FileOp {
    Resolve,
    GetInfo,
    Open,
    Read,
    Write,
    GetSize,
    Truncate,
    Sync,
    SyncFolder,
    Close,
    Delete,
    Rename,
    Create,
    CreateUnique
};

class FailingFileServices final : public FileServices {
public:
    FailingFileServices() : m_pPrevious(&CurrentFileServices()) { SetFileServices(this); }
    ~FailingFileServices() override { SetFileServices(m_pPrevious); }
    FailingFileServices(const FailingFileServices&) = delete;
    FailingFileServices& operator=(const FailingFileServices&) = delete;

    // Makes op fail with result on paths containing pathPart (every path when empty). For
    // Rename the path is the destination, for CreateUnique the folder and stem; for calls on
    // an open file it is the path it was opened or created with. A failed call does nothing, except
    // that a failed Close still releases the file, as a real one does.
    void Fail(FileOp op, FileResult result, const std::string& pathPart = "") {
        m_rules.push_back(Rule{op, result, pathPart});
    }

    FileResult Resolve(const std::string& path) override {
        return Unless(FileOp::Resolve, path, [&] { return m_posix.Resolve(path); });
    }
    FileResult GetInfo(const std::string& path, FileInfo* info) override {
        return Unless(FileOp::GetInfo, path, [&] { return m_posix.GetInfo(path, info); });
    }
    FileResult Read(FileId file, void* buffer, std::size_t size) override {
        return Unless(FileOp::Read, PathOf(file), [&] { return m_posix.Read(file, buffer, size); });
    }
    FileResult Write(FileId file, const void* data, std::size_t size) override {
        return Unless(FileOp::Write, PathOf(file), [&] { return m_posix.Write(file, data, size); });
    }
    FileResult GetSize(FileId file, std::uint64_t* size) override {
        return Unless(FileOp::GetSize, PathOf(file), [&] { return m_posix.GetSize(file, size); });
    }
    FileResult Truncate(FileId file, std::uint64_t size) override {
        return Unless(FileOp::Truncate, PathOf(file), [&] { return m_posix.Truncate(file, size); });
    }
    FileResult Sync(FileId file) override {
        return Unless(FileOp::Sync, PathOf(file), [&] { return m_posix.Sync(file); });
    }
    FileResult SyncFolder(const std::string& folder) override {
        return Unless(FileOp::SyncFolder, folder, [&] { return m_posix.SyncFolder(folder); });
    }
    FileResult Delete(const std::string& path) override {
        return Unless(FileOp::Delete, path, [&] { return m_posix.Delete(path); });
    }
    FileResult Rename(const std::string& from, const std::string& to) override {
        return Unless(FileOp::Rename, to, [&] { return m_posix.Rename(from, to); });
    }
    FileResult Create(const std::string& folder, const std::string& name, std::uint32_t type,
                      std::uint32_t creator) override {
        return Unless(FileOp::Create, PathInFolder(folder, name),
                      [&] { return m_posix.Create(folder, name, type, creator); });
    }
    FileResult Open(const std::string& path, FilePermission permission, FileId* file) override;
    FileResult Close(FileId file) override;
    FileResult CreateUnique(const std::string& folder, const std::string& stem, std::uint32_t mode,
                            std::string* name, FileId* file) override;

private:
    struct Rule {
        FileOp op;
        FileResult result;
        std::string pathPart;
    };
    // The injected result when a rule matches, else kFileOk.
    FileResult Injected(FileOp op, const std::string& path) const;
    std::string PathOf(FileId file) const;
    // The injected result when a rule matches, else what the real call returns.
    template <typename Call>
    FileResult Unless(FileOp op, const std::string& path, Call call) {
        const FileResult injected = Injected(op, path);
        return injected != kFileOk ? injected : call();
    }

    PosixFileServices m_posix;
    FileServices* m_pPrevious;
    std::vector<Rule> m_rules;
    std::map<FileId, std::string> m_openPaths;
};
