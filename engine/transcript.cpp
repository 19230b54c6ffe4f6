// Transcript files: saving the transcript as a time-stamped text file (save, save as, save
// into a folder), opening such files back into the transcript and the window, the modified
// flag and the tick's watch over the saved file.
#include <cstdint>
#include <string>
#include <utility>

#include "engine/chat_client.h"
#include "engine/transcript_format.h"
#include "platform/file_services.h"
#include "platform/func_trace.h"
#include "platform/string_table.h"
#include "platform/trace.h"
#include "platform/warning_window.h"

namespace {

// String-table keys of the texts the user sees.
constexpr const char* kWarningTitleKey = "Korvo Chat";
constexpr const char* kOpenFailedKey =
    "Unable to open this chat file, because either the file is damaged or the file format is "
    "not recognized.";
constexpr const char* kCannotReplaceKey =
    "Your cannot replace\"%s\" because you do not have the right privileges.";
constexpr const char* kSaveFailedKey =
    "Can't save this file \"%s\". Make sure that the disk or folder you want to save is not "
    "full, write-protected, or damaged.";
constexpr const char* kChatFileNameKey = "Chat.txt";

// Warning messages are cut to fit the host's 2048-byte message buffer.
constexpr std::size_t kMaxWarningBytes = 2047;

// The text after the last "/", or the whole path when there is none or it ends the path.
std::string FileNameOf(const std::string& path) {
    const std::size_t slash = path.rfind('/');
    if (slash == std::string::npos || slash + 1 == path.size()) return path;
    return path.substr(slash + 1);
}

// The localised message with the file name in place of its "%s"; the name is inserted as
// it is, never read as a format. Cut at a character boundary to the warning's bound.
std::string FillFileName(const std::string& format, const std::string& name) {
    std::string message = format;
    const std::size_t at = message.find("%s");
    if (at != std::string::npos) message.replace(at, 2, name);
    message.resize(Utf8FittingSize(message, kMaxWarningBytes));
    return message;
}

void ShowChatWarning(const std::string& message) {
    ShowWarningWindow2(GetLocalizedString(kWarningTitleKey).c_str(), message.c_str());
}

// Reads the whole file at path into bytes; false when any step fails.
bool ReadWholeFile(FileServices& files, const std::string& path, std::string* bytes) {
    OpenFile file(files);
    std::uint64_t fileSize = 0;
    if (file.Open(path, kFileRead) != kFileOk) return false;
    if (files.GetSize(file.Id(), &fileSize) != kFileOk) return false;
    if (fileSize > bytes->max_size()) return false;
    std::string buffer(static_cast<std::size_t>(fileSize), '\0');
    if (files.Read(file.Id(), buffer.data(), buffer.size()) != kFileOk) return false;
    if (file.Close() != kFileOk) return false;
    *bytes = std::move(buffer);
    return true;
}

// The start of the name of the file a save writes before renaming it over name: hidden and
// marked as an unfinished save. With the characters that make it unique it is no longer than
// the longest name a folder takes; a long name lends only its beginning, cut at a character
// boundary.
std::string SavingStemFor(const std::string& name) {
    constexpr std::size_t kMaxNameBytes = 255;
    constexpr std::size_t kUniqueBytes = 6;
    const std::string prefix = ".";
    const std::string suffix = ".saving-";
    const std::size_t keep =
        Utf8FittingSize(name, kMaxNameBytes - prefix.size() - suffix.size() - kUniqueBytes);
    return prefix + name.substr(0, keep) + suffix;
}

// Writes the whole transcript into a new file in folder and makes it the file at path: the
// bytes reach the disk before the rename, and the rename before the result is known, so a
// power loss leaves either the old file or the new one whole. The new file takes the mode of
// the one it replaces. kFileOk only when every step succeeded; no other file is touched.
FileResult ReplaceWithTranscript(FileServices& files, const std::string& folder,
                                 const std::string& name, const CChatContentStorage& content) {
    const std::string path = PathInFolder(folder, name);
    FileInfo old;
    const std::uint32_t mode = files.GetInfo(path, &old) == kFileOk ? old.mode : kDefaultFileMode;
    std::string tempName;
    FileId id = -1;
    FileResult result = files.CreateUnique(folder, SavingStemFor(name), mode, &tempName, &id);
    if (result != kFileOk) return result;
    const std::string tempPath = PathInFolder(folder, tempName);
    OpenFile file(files);
    file.Adopt(id);

    const std::string bytes = FormatTranscript(content);
    result = files.Write(file.Id(), bytes.data(), bytes.size());
    if (result == kFileOk) result = files.Sync(file.Id());
    const FileResult closed = file.Close();
    if (result == kFileOk) result = closed;
    if (result == kFileOk) result = files.Rename(tempPath, path);
    if (result != kFileOk) {
        files.Delete(tempPath);
        return result;
    }
    return files.SyncFolder(folder);
}

}  // namespace

void CChatClient::SetFileNeedSave(int bNeedSave) {
    CFuncTrace trace("CChatClient::SetFileNeedSave , bNeedSave = %d", bNeedSave);
    const int flag = bNeedSave != 0 ? 1 : 0;
    if (flag == m_bFileNeedSave) return;
    m_bFileNeedSave = flag;
    if (m_pHostSink) m_pHostSink->OnChatModified(flag != 0);
}

bool CChatClient::IsChatHaveContent() {
    CFuncTrace trace("CChatClient::IsChatHaveContent");
    return m_ChatContent.GetTimeCount() > 0;
}

void CChatClient::SaveChatFile(int bPrompt) {
    CFuncTrace trace("CChatClient::SaveChatFile");
    if (m_strFilePath.empty()) {
        PopSaveDialog(false);
        return;
    }
    // Copied: a dialog run from here may replace the current path.
    const std::string path = m_strFilePath;
    if (!CheckPrivileges(path.c_str(), kFileReadWrite)) {
        if (bPrompt != 0) PopSaveDialog(false);
        return;
    }
    if (!WriteChatFileToFolder(path)) {
        AlertForSaveFailed(path);
        return;
    }
    AlertIfSaveFailed(path.c_str());
}

void CChatClient::SaveAsChatFile() {
    CFuncTrace trace("CChatClient::SaveAsChatFile");
    PopSaveDialog(true);
}

void CChatClient::PopSaveDialog(bool bSaveAs) {
    std::int32_t confirmed = bSaveAs ? 1 : 0;
    std::string path;
    // Without a window nobody answered: the flag still holds what was passed in.
    if (NotifyUI(msg_SaveChatPanel, &confirmed, &path) != 0 || confirmed == 0) return;
    m_strFilePath = path;
    SaveChatFile(0);
}

void CChatClient::PopChatFileOpenDialog() {
    CFuncTrace trace("CChatClient::PopChatFileOpenDialog");
    std::int32_t confirmed = 0;
    std::string path;
    if (NotifyUI(msg_OpenChatPanel, &confirmed, &path) != 0 || confirmed == 0) return;
    m_strFilePath = path;
    OpenChatFile();
}

void CChatClient::OpenChatFile() {
    const bool hadEntries = IsChatHaveContent();
    std::string bytes;
    CChatContentStorage content;
    // The file is read whole first, and whether it opens is settled by its first entry,
    // before anything is shown; a file that fails leaves the transcript and the window as
    // they were.
    const auto show = [this](bool bTitle, const std::string& text) {
        NotifyUI(bTitle ? msg_ShowTitle : msg_ShowText, const_cast<char*>(text.c_str()));
    };
    if (!ReadWholeFile(CurrentFileServices(), m_strFilePath, &bytes) ||
        !ParseTranscript(bytes, &content, show)) {
        MacWarnTrace2(kChatTag, "CChatClient::OpenChatFile failed, path = %s",
                      m_strFilePath.c_str());
        ShowChatWarning(GetLocalizedString(kOpenFailedKey));
        m_strFilePath.clear();
        return;
    }
    m_ChatContent.AppendEntries(std::move(content));
    if (hadEntries) SetFileNeedSave(1);
    if (m_pHostSink) m_pHostSink->OnChatContentChanged(true);
}

bool CChatClient::WriteChatFileToFolder(const std::string& path) {
    const std::size_t slash = path.rfind('/');
    const std::size_t nameAt = slash == std::string::npos ? 0 : slash + 1;
    const FileResult result = ReplaceWithTranscript(CurrentFileServices(), path.substr(0, nameAt),
                                                    path.substr(nameAt), m_ChatContent);
    if (result != kFileOk) {
        MacErrorTrace2(kChatTag, "CChatClient::WriteChatFileToFolder failed, result = %d",
                       static_cast<int>(result));
        return false;
    }
    SetFileNeedSave(0);
    return true;
}

int CChatClient::SaveFileToFolder(const char* folder) {
    if (!folder || CurrentFileServices().Resolve(folder) != kFileOk) return -1;
    const std::string path = std::string(folder) + "/" + GetLocalizedString(kChatFileNameKey);
    if (!WriteChatFileToFolder(path)) return -1;
    m_strFilePath = path;
    return 0;
}

bool CChatClient::CheckPrivileges(const char* path, signed char permission) {
    if (!path) return true;
    FileServices& files = CurrentFileServices();
    if (files.Resolve(path) == kFileNotFound) return true;
    OpenFile file(files);
    const FileResult result = file.Open(path, static_cast<FilePermission>(permission));
    if (result == kFileOk || result == kFileNotFound) return true;
    ShowChatWarning(FillFileName(GetLocalizedString(kCannotReplaceKey), FileNameOf(path)));
    return false;
}

void CChatClient::AlertForSaveFailed(const std::string& path) {
    if (path.empty()) return;
    ShowChatWarning(FillFileName(GetLocalizedString(kSaveFailedKey), FileNameOf(path)));
}

bool CChatClient::AlertIfSaveFailed(const char* path) {
    FileServices& files = CurrentFileServices();
    FileInfo info;
    if (path && *path && files.Resolve(path) == kFileOk && files.GetInfo(path, &info) == kFileOk) {
        return true;
    }
    AlertForSaveFailed(path ? path : "");
    return false;
}

void CChatClient::CheckSavedFileStillThere() {
    if (m_bFileNeedSave != 0 || m_strFilePath.empty()) return;
    FileServices& files = CurrentFileServices();
    FileInfo info;
    if (files.Resolve(m_strFilePath) == kFileOk && files.GetInfo(m_strFilePath, &info) == kFileOk) {
        return;
    }
    MacInfoTrace2(kChatTag, "CChatClient::OnTick() SetFileNeedSave(true)");
    SetFileNeedSave(1);
}
