// Showing received chat: who may see a message and with which title, then the line itself
// with its sound, host notification, time stamp, window commands and transcript entry.
#include <string>

#include "engine/chat_client.h"
#include "engine/chat_recovery_mgr.h"
#include "pdu/group_message_pdu.h"
#include "pdu/private_message_pdu.h"
#include "platform/calendar.h"
#include "platform/func_trace.h"
#include "platform/sound.h"
#include "platform/string_table.h"
#include "platform/trace.h"

namespace {

// Receive ids that stand for role audiences in a private message.
constexpr std::uint32_t kToAllParticipants = 0;
constexpr std::uint32_t kToHost = static_cast<std::uint32_t>(-1);
constexpr std::uint32_t kToHostPresenter = static_cast<std::uint32_t>(-2);
constexpr std::uint32_t kToPresenter = static_cast<std::uint32_t>(-3);
constexpr std::uint32_t kToAttendees = static_cast<std::uint32_t>(-6);

// Sound modes: never, while the panel shows, for the first line, for every line.
constexpr PlaySoundMode kSoundWhilePanel = 1;
constexpr PlaySoundMode kSoundFirstLine = 2;
constexpr PlaySoundMode kSoundAlways = 3;

std::string Title(const char* key, const std::string& name) {
    std::string title;
    FormatStringWithParameter(GetLocalizedString(key), name, title);
    return title;
}

std::string Title(const char* key, const std::string& from, const std::string& to) {
    std::string title;
    FormatStringWith2Parameters(GetLocalizedString(key), from, to, title);
    return title;
}

// A tag word as titles and the host show it: in the host's language, in parentheses; nothing
// for no word.
std::string TagMark(const std::string& word) {
    return word.empty() ? word : " (" + GetLocalizedString(word) + ")";
}

// The title of a message from sender to a role audience, or null when r names a person.
const char* RoleAudienceKey(std::uint32_t r) {
    switch (r) {
        case kToAttendees:
            return "from %@ to All Attendees";
        case kToPresenter:
            return "from %@ to Presenter (privately)";
        case kToHostPresenter:
            return "from %@ to Host & Presenter";
        case kToHost:
            return "from %@ to Host (privately)";
        case kToAllParticipants:
            return "from %@ to All Participants";
        default:
            return nullptr;
    }
}

}  // namespace

CChatClient::ChatSender CChatClient::FindChatSender(std::uint32_t sendId,
                                                    const std::string& pduName) const {
    ChatSender sender;
    sender.dwSendID = sendId;
    sender.dwNodeID = sendId;
    sender.strName = pduName;
    if (const UserItem* user = m_UserList.GetUserItemFromUserId(sendId)) {
        sender.bInRoster = true;
        sender.dwNodeID = user->dwNodeID;
        sender.dwExternalTag = user->dwExternalTag;
        sender.strName = user->strName.GetData() ? user->strName.GetData() : "";
    }
    return sender;
}

std::string CChatClient::SenderTagSuffix(const ChatSender& sender) const {
    return sender.bInRoster ? TagMark(GetUserExternalInternalString(sender.dwExternalTag, 0)) : "";
}

int CChatClient::ParseAndShowPrivateMessages(CPrivateMessagePDU* pdu, int) {
    CFuncTrace trace("CChatClient::ParseAndShowPrivateMessages");
    if (!pdu) return 0;
    const std::uint32_t r = pdu->GetReveID_DWORD();
    const ChatSender sender = FindChatSender(pdu->GetSendID_DWORD(), pdu->GetSenderName());
    const std::string myMark = TagMark(GetUserExternalInternalString(m_dwUserExternalTag, 0));
    const bool host = m_dwMyNodeID == m_dwHostID;
    const bool presenter = m_dwMyNodeID == m_dwPresenterID;

    std::string title;
    if (r == m_dwMyUserID) {
        std::string me;
        GetUserNameFromId(r, me);
        title = Title("from %@ to %@ (privately)", sender.strName + SenderTagSuffix(sender),
                      me + myMark);
    } else if (sender.dwSendID == m_dwMyUserID) {
        if (const char* key = RoleAudienceKey(r)) {
            title = Title(key, m_strMyName);
        } else {
            std::string receiver;
            GetUserNameFromId(r, receiver);
            const ChatSender to = FindChatSender(r, receiver);
            title = Title("from %@ to %@ (privately)", m_strMyName + myMark,
                          receiver + SenderTagSuffix(to));
        }
    } else if (const char* key = RoleAudienceKey(r)) {
        const bool shown = (r == kToAttendees && !host && !presenter) ||
                           (r == kToPresenter && presenter) ||
                           (r == kToHostPresenter && (host || presenter)) ||
                           (r == kToHost && host) || r == kToAllParticipants;
        if (!shown) return -1;
        title = Title(key, sender.strName);
    } else if (!m_pRecoveryMgr || m_pRecoveryMgr->ParsePrivateMsgTitle(pdu, title) != 1) {
        return -1;
    }
    ShowChatLine(title, pdu->GetMessageContent(), sender, true);
    return 0;
}

void CChatClient::ParseAndShowGroupMessages(CGroupMessagePDU* pdu, std::uint32_t cacheHandle) {
    CFuncTrace trace("CChatClient::ParseAndShowgroupMessages");
    if (!pdu) return;
    const std::uint32_t g =
        cacheHandle != 0 ? GetGroupIdFormCacheHandle(cacheHandle) : pdu->GetGroupID_DWORD();
    ChatSender sender = FindChatSender(pdu->GetSendID_DWORD(), pdu->GetSenderName());
    if (sender.strName.empty() && m_pRecoveryMgr)
        m_pRecoveryMgr->ParseGroupSenderName(pdu, sender.strName);
    if (sender.strName.empty()) {
        MacWarnTrace2(kChatTag, "CChatClient::ParseAndShowGroupMessages,send_id=%d, name = NULL",
                      sender.dwSendID);
        return;
    }
    const bool mine = sender.dwSendID == m_dwMyUserID;
    const std::string name = (mine ? m_strMyName : sender.strName) + SenderTagSuffix(sender);
    const bool host = m_dwMyNodeID == m_dwHostID;
    const bool presenter = m_dwMyNodeID == m_dwPresenterID;

    const char* key = "";
    bool shownToOthers = false;
    switch (g) {
        case 0:
        case GROUP_ATTENDEES:
            key = "from %@ to All Attendees";
            shownToOthers = !host && !presenter;
            break;
        case GROUP_HOST:
            key = "from %@ to Host (privately)";
            shownToOthers = host;
            break;
        case GROUP_PRESENTER:
            key = "from %@ to Presenter (privately)";
            shownToOthers = presenter;
            break;
        case GROUP_HOST_PRESENTER:
            key = "from %@ to Host & Presenter";
            shownToOthers = host || presenter;
            break;
        // The panel groups are for privileged participants only, however a copy arrives.
        case GROUP_PANELISTS:
            key = "from %@ to All Panelists";
            shownToOthers = IsPrivileged();
            break;
        case GROUP_HOST_PRESENTER_PANELISTS:
            key = "from %@ to Host, Presenter & Panelists";
            shownToOthers = IsPrivileged();
            break;
        case GROUP_EVERYONE:
            key = m_bQMMode ? "from %@ to Everyone" : "from %@ to All Participants";
            shownToOthers = true;
            break;
        default:
            break;
    }
    if (!mine && !shownToOthers) return;
    ShowChatLine(Title(key, name), pdu->GetMessageContent(), sender, false);
}

void CChatClient::ShowChatLine(const std::string& title, const std::string& text,
                               const ChatSender& sender, bool bPrivate) {
    PlaySoundIfNeed();
    if (m_pHostSink) {
        const bool mine = sender.dwSendID == m_dwMyUserID;
        const std::string display = (mine ? m_strMyName : sender.strName) + SenderTagSuffix(sender);
        m_pHostSink->OnIncomingChat(display.c_str(), text.c_str(), sender.dwNodeID);
        m_pHostSink->OnChatShown();
    }
    InsertChatTime();
    std::string line = title;
    line += ":\r";
    NotifyUI(msg_ShowTitle, const_cast<char*>(line.c_str()));
    m_ChatContent.InsertNewLine(line);
    m_ChatContent.ModifyLatestLineByAdd(text);
    NotifyUI(msg_ShowText, const_cast<char*>(text.c_str()));
    SetFileNeedSave(1);

    // Where the attendee picker is in use, an answer goes back to whoever wrote; to group
    // chat only a privileged participant answers that way.
    const bool pickerInUse = m_bUseAttendeeSelector || m_dwMeetingType == 3;
    const bool mayAnswer = bPrivate || m_UserList.IsPanelist(m_dwMyNodeID, false) == 1;
    if (pickerInUse && mayAnswer && sender.bInRoster && sender.dwNodeID != 0 &&
        sender.dwNodeID != m_dwMyNodeID)
        SelectUserByNodeID(sender.dwNodeID, false, false);
}

void CChatClient::PlaySoundIfNeed() {
    CFuncTrace trace("CChatClient::PlaySoundIfNeed");
    if (m_nSoundMode == 0 || m_SoundFile.path[0] == '\0') return;
    const bool play = m_nSoundMode == kSoundAlways ||
                      (m_nSoundMode == kSoundFirstLine && m_bFirstMessage) ||
                      (m_nSoundMode == kSoundWhilePanel && m_dwPanelStatus != 0);
    if (!play) return;
    KVOPlaySoundFile(m_SoundFile.path);
    m_bFirstMessage = false;
}

void CChatClient::InsertChatTime() {
    const CalendarTime now = m_pTimerLoop ? m_pTimerLoop->CalendarNow() : CurrentCalendarTime();
    DateTimeRec time{};
    if (now.valid) {
        time.year = static_cast<std::uint16_t>(now.year);
        time.month = static_cast<std::uint16_t>(now.month);
        time.day = static_cast<std::uint16_t>(now.day);
        time.hour = static_cast<std::uint16_t>(now.hour);
        time.minute = static_cast<std::uint16_t>(now.minute);
        time.second = static_cast<std::uint16_t>(now.second);
        time.valid = 1;
    }
    m_ChatContent.InsertTime(time);
    if (m_pHostSink) m_pHostSink->OnChatContentChanged(true);
}
