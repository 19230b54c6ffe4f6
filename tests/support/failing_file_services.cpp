#include "tests/support/failing_file_services.h"

FileResult FailingFileServices::Injected(FileOp op, const std::string& path) const {
    for (const Rule& rule : m_rules)
        if (rule.op == op && path.find(rule.pathPart) != std::string::npos) return rule.result;
    return kFileOk;
}

std::string FailingFileServices::PathOf(FileId file) const {
    const auto found = m_openPaths.find(file);
    return found == m_openPaths.end() ? std::string() : found->second;
}

FileResult FailingFileServices::Open(const std::string& path, FilePermission permission,
                                     FileId* file) {
    const FileResult result =
        Unless(FileOp::Open, path, [&] { return m_posix.Open(path, permission, file); });
    if (result == kFileOk) m_openPaths[*file] = path;
    return result;
}

FileResult FailingFileServices::Close(FileId file) {
    const FileResult injected = Injected(FileOp::Close, PathOf(file));
    m_openPaths.erase(file);
    // The descriptor is released whatever is reported, as a real close does.
    const FileResult result = m_posix.Close(file);
    return injected != kFileOk ? injected : result;
}

FileResult FailingFileServices::CreateUnique(const std::string& folder, const std::string& stem,
                                             std::uint32_t mode, std::string* name, FileId* file) {
    const FileResult result = Unless(FileOp::CreateUnique, PathInFolder(folder, stem), [&] {
        return m_posix.CreateUnique(folder, stem, mode, name, file);
    });
    if (result == kFileOk) m_openPaths[*file] = PathInFolder(folder, *name);
    return result;
}
