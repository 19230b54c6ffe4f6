#include "tests/support/failing_file_services.h"

FailingFileServices::FailingFileServices() : m_pPrevious(&CurrentFileServices()) {
    SetFileServices(this);
}

FailingFileServices::~FailingFileServices() {
    SetFileServices(m_pPrevious);
}

void FailingFileServices::Fail(FileOp op, FileResult result, const std::string& pathPart) {
    m_rules.push_back(Rule{op, result, pathPart});
}

FileResult FailingFileServices::Injected(FileOp op, const std::string& path) const {
    for (const Rule& rule : m_rules)
        if (rule.op == op && path.find(rule.pathPart) != std::string::npos) return rule.result;
    return kFileOk;
}

std::string FailingFileServices::PathOf(FileId file) const {
    const auto found = m_openPaths.find(file);
    return found == m_openPaths.end() ? std::string() : found->second;
}

FileResult FailingFileServices::Resolve(const std::string& path) {
    const FileResult injected = Injected(FileOp::Resolve, path);
    return injected != kFileOk ? injected : m_posix.Resolve(path);
}

FileResult FailingFileServices::GetInfo(const std::string& path, FileInfo* info) {
    const FileResult injected = Injected(FileOp::GetInfo, path);
    return injected != kFileOk ? injected : m_posix.GetInfo(path, info);
}

FileResult FailingFileServices::Open(const std::string& path, FilePermission permission,
                                     FileId* file) {
    const FileResult injected = Injected(FileOp::Open, path);
    if (injected != kFileOk) return injected;
    const FileResult result = m_posix.Open(path, permission, file);
    if (result == kFileOk) m_openPaths[*file] = path;
    return result;
}

FileResult FailingFileServices::Read(FileId file, void* buffer, std::size_t size) {
    const FileResult injected = Injected(FileOp::Read, PathOf(file));
    return injected != kFileOk ? injected : m_posix.Read(file, buffer, size);
}

FileResult FailingFileServices::Write(FileId file, const void* data, std::size_t size) {
    const FileResult injected = Injected(FileOp::Write, PathOf(file));
    return injected != kFileOk ? injected : m_posix.Write(file, data, size);
}

FileResult FailingFileServices::GetSize(FileId file, std::uint64_t* size) {
    const FileResult injected = Injected(FileOp::GetSize, PathOf(file));
    return injected != kFileOk ? injected : m_posix.GetSize(file, size);
}

FileResult FailingFileServices::Truncate(FileId file, std::uint64_t size) {
    const FileResult injected = Injected(FileOp::Truncate, PathOf(file));
    return injected != kFileOk ? injected : m_posix.Truncate(file, size);
}

FileResult FailingFileServices::Sync(FileId file) {
    const FileResult injected = Injected(FileOp::Sync, PathOf(file));
    return injected != kFileOk ? injected : m_posix.Sync(file);
}

FileResult FailingFileServices::SyncFolder(const std::string& folder) {
    const FileResult injected = Injected(FileOp::SyncFolder, folder);
    return injected != kFileOk ? injected : m_posix.SyncFolder(folder);
}

FileResult FailingFileServices::Close(FileId file) {
    const FileResult injected = Injected(FileOp::Close, PathOf(file));
    m_openPaths.erase(file);
    // The descriptor is released whatever is reported, as a real close does.
    const FileResult result = m_posix.Close(file);
    return injected != kFileOk ? injected : result;
}

FileResult FailingFileServices::Delete(const std::string& path) {
    const FileResult injected = Injected(FileOp::Delete, path);
    return injected != kFileOk ? injected : m_posix.Delete(path);
}

FileResult FailingFileServices::Rename(const std::string& from, const std::string& to) {
    const FileResult injected = Injected(FileOp::Rename, to);
    return injected != kFileOk ? injected : m_posix.Rename(from, to);
}

FileResult FailingFileServices::Create(const std::string& folder, const std::string& name,
                                       std::uint32_t type, std::uint32_t creator) {
    const FileResult injected = Injected(FileOp::Create, PathInFolder(folder, name));
    return injected != kFileOk ? injected : m_posix.Create(folder, name, type, creator);
}

FileResult FailingFileServices::CreateUnique(const std::string& folder, const std::string& stem,
                                             std::uint32_t mode, std::string* name, FileId* file) {
    const FileResult injected = Injected(FileOp::CreateUnique, PathInFolder(folder, stem));
    if (injected != kFileOk) return injected;
    const FileResult result = m_posix.CreateUnique(folder, stem, mode, name, file);
    if (result == kFileOk) m_openPaths[*file] = PathInFolder(folder, *name);
    return result;
}
