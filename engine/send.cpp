// Sending chat: the typed text with its line ends normalised, the audience the selected
// send-to entry names, and the message handed to the service as an append to a group's cache
// or as private data. The input keeps the text until the service has taken the message.
#include <string>

#include "engine/chat_client.h"
#include "engine/line_ends.h"
#include "pdu/group_message_pdu.h"
#include "pdu/private_message_pdu.h"
#include "platform/func_trace.h"
#include "platform/telemetry.h"
#include "platform/trace.h"

namespace {

// Flags of a chat line appended to a group cache, and the recording flags that go with it.
constexpr std::uint32_t kChatLineFlags = 0x1000000;
constexpr std::uint32_t kRecordFlags = 0x90;
constexpr std::uint32_t kRecordFlagsNoOption = 0x92;
constexpr std::uint32_t kSaveForReportFlags = 0x100;
constexpr std::uint32_t kRecordForReportFlags = 0x200;

// The option code of SetSendOption, and the recording bit of the host's NBR option.
constexpr int kSendOptionCode = -200;
constexpr std::uint32_t kNBROptionBit = 0x1;

// Telemetry of a QM send, by audience.
constexpr int kTelemetrySendEveryone = 908;
constexpr int kTelemetrySendHost = 904;
constexpr int kTelemetrySendPresenter = 903;
constexpr int kTelemetrySendHostPresenter = 905;
constexpr int kTelemetrySendOther = 909;

// Receive ids of a private message that name a role audience rather than a person.
constexpr std::uint32_t kToHostPresenter = static_cast<std::uint32_t>(-2);
constexpr std::uint32_t kToPanelists = static_cast<std::uint32_t>(-4);
constexpr std::uint32_t kToPrivileged = static_cast<std::uint32_t>(-5);
constexpr std::uint32_t kToAttendees = static_cast<std::uint32_t>(-6);

// The group a selected entry's group id sends to, or 0 when the entry names a person.
std::uint32_t AudienceGroup(std::int32_t groupId) {
    switch (groupId) {
        case 0:
        case static_cast<std::int32_t>(GROUP_ATTENDEES):
            return GROUP_ATTENDEES;
        case static_cast<std::int32_t>(GROUP_HOST):
        case static_cast<std::int32_t>(GROUP_PRESENTER):
        case static_cast<std::int32_t>(GROUP_HOST_PRESENTER):
        case static_cast<std::int32_t>(GROUP_PANELISTS):
        case static_cast<std::int32_t>(GROUP_HOST_PRESENTER_PANELISTS):
        case static_cast<std::int32_t>(GROUP_EVERYONE):
            return static_cast<std::uint32_t>(groupId);
        default:
            return 0;
    }
}

int QMTelemetryAction(std::int32_t groupId) {
    switch (groupId) {
        case static_cast<std::int32_t>(GROUP_EVERYONE):
            return kTelemetrySendEveryone;
        case static_cast<std::int32_t>(GROUP_HOST):
            return kTelemetrySendHost;
        case static_cast<std::int32_t>(GROUP_PRESENTER):
            return kTelemetrySendPresenter;
        case static_cast<std::int32_t>(GROUP_HOST_PRESENTER):
            return kTelemetrySendHostPresenter;
        default:
            return kTelemetrySendOther;
    }
}

}  // namespace

void CChatClient::SendChat() {
    CFuncTrace trace("CChatClient::SendChat");
    SendTypedChat(false);
}

void CChatClient::SendChatInQM() {
    CFuncTrace trace("CChatClient::SendChatInQM");
    SendTypedChat(true);
}

void CChatClient::SendTypedChat(bool bQM) {
    std::string typed;
    NotifyUI(msg_GetInputText, &typed);
    if (typed.empty()) return;
    const std::string text = NormaliseLineEnds(typed);

    const int index = SelectedMenuIndex();
    MacInfoTrace2(kChatTag, "sender index = %d",
                  index == -1 ? static_cast<int>(m_MenuStatus.size()) : index);
    if (index == -1) return;
    const MenuStatus& entry = m_MenuStatus[index];
    // Only what the user could choose is sent to: the window may report a stale index.
    if (!entry.bEnabled || entry.bSeparator ||
        (m_bEveryoneOnly && entry.nGroupID != static_cast<std::int32_t>(GROUP_EVERYONE))) {
        MacWarnTrace2(kChatTag, "CChatClient::SendChat, send-to entry %d cannot be chosen", index);
        return;
    }
    if (!m_pArmClient) {
        MacWarnTrace2(kChatTag, "CChatClient::SendChat, no conference service");
        return;
    }
    const std::int32_t groupId = entry.nGroupID;
    std::uint32_t group =
        bQM ? (groupId == static_cast<std::int32_t>(GROUP_EVERYONE) ? GROUP_EVERYONE : 0)
            : AudienceGroup(groupId);
    std::uint32_t receiveId = 0;
    if (group == 0) {
        std::uint32_t node = entry.dwNodeID;
        if (bQM && (groupId == static_cast<std::int32_t>(GROUP_HOST) ||
                    groupId == static_cast<std::int32_t>(GROUP_HOST_PRESENTER)))
            node = m_dwHostID;
        if (bQM && groupId == static_cast<std::int32_t>(GROUP_PRESENTER)) node = m_dwPresenterID;
        const UserItem* user = m_UserList.GetUserItemFromNodeId(node);
        if (!user) return;
        receiveId = user->dwUserID;
    }
    if (bQM) SendTelemetryActionByID(QMTelemetryAction(groupId));
    const bool sent =
        group != 0 ? SendGroupChat(text, group, bQM) : SendPrivateChat(text, receiveId, bQM);
    if (sent) SetFileNeedSave(1);
}

int CChatClient::SelectedMenuIndex() const {
    for (std::size_t i = 0; i < m_MenuStatus.size(); ++i)
        if (m_MenuStatus[i].bSelected) return static_cast<int>(i);
    return -1;
}

void CChatClient::ClearSentInput() {
    NotifyUI(msg_ClearInput);
    NotifyUI(msg_SendDone);
}

bool CChatClient::SendGroupChat(const std::string& text, std::uint32_t groupId, bool bQM) {
    // A group without a cache cannot carry the line: the user keeps it to send elsewhere.
    const std::uint32_t cacheHandle = GetCacheHandleFormGroupId(groupId);
    if (cacheHandle == 0) {
        MacWarnTrace2(kChatTag, "CChatClient::SendChat, group %u has no cache, nothing sent",
                      groupId);
        return false;
    }
    CGroupMessagePDU pdu;
    pdu.SetSenderName(m_strMyName);
    pdu.SetSendID(m_dwMyUserID);
    pdu.SetGroupID(groupId);
    pdu.SetMessageContent(text);
    if (groupId == GROUP_EVERYONE && GetNeedSendGroupInfoStatus(GROUP_EVERYONE) && IsRecording()) {
        SendGroupInfoToCache(GROUP_EVERYONE);
        SetNeedSendGroupInfoStatus(GROUP_EVERYONE, 0);
    }
    pdu.GenerateXMLPDU();
    std::uint32_t flags = GetGroupSendPDUOption();
    if (!bQM) {
        const bool withOption = groupId == GROUP_EVERYONE || (m_dwNBROption & kNBROptionBit) != 0;
        flags = kChatLineFlags |
                (IsRecording() ? (withOption ? kRecordFlags : kRecordFlagsNoOption) : 0);
    }
    const std::string bytes = pdu.ToWireText();
    std::uint32_t size = static_cast<std::uint32_t>(bytes.size());
    const std::uint32_t mem = GetATMemHandle(size, bytes.data());
    if (mem == 0) {
        MacWarnTrace2(kChatTag, "CChatClient::SendChat, no memory handle for %u bytes", size);
        return false;
    }
    const int result = m_pArmClient->ApeSharedDataActionEx(m_dwApeHandle, cacheHandle, 0, 0,
                                                           CACHE_APPEND, flags, mem, 0, 1);
    m_pArmClient->FreeMemHandle(mem);
    if (result != 0) {
        if (bQM) {
            MacWarnTrace2(kChatTag, "CChatClient::SendChatInQM:ApeSharedDataActionEx error =%d",
                          result);
        } else if (groupId == GROUP_EVERYONE) {
            MacWarnTrace2(kChatTag,
                          "CChatClient::SendChat:ApeSharedDataActionEx dwCacheHandle=%d,error =%d",
                          cacheHandle, result);
        } else {
            MacWarnTrace2(kChatTag,
                          "CChatClient::SendChat:ApeSharedDataActionEx dwCacheHandle=%d, error =%d",
                          cacheHandle, result);
        }
        return false;
    }
    ClearSentInput();
    // Without a subscription the line never comes back: its sender sees it now.
    int subscribed = 0, requestType = 0, cacheSet = 0;
    GetGroupCacheStatus(groupId, subscribed, requestType, cacheSet);
    if (!subscribed) ParseAndShowGroupMessages(&pdu, cacheHandle);
    return true;
}

bool CChatClient::SendPrivateChat(const std::string& text, std::uint32_t receiveId, bool bQM) {
    CPrivateMessagePDU pdu;
    pdu.SetSenderName(m_strMyName);
    pdu.SetReveID(receiveId);
    pdu.SetSendID(m_dwMyUserID);
    pdu.SetMessageContent(text);
    pdu.GenerateXMLPDU();
    const std::string bytes = pdu.ToWireText();

    ARMSendOption option{m_dwApeHandle, 0};
    if (bQM && IsRecording() && receiveId >= 1 && receiveId <= 3)
        option.dwOption = (m_dwNBROption & kNBROptionBit) ? kRecordFlags : kRecordFlagsNoOption;
    m_pArmClient->SetSendOption(kSendOptionCode, &option);
    const int result = m_pArmClient->ApeSendData(m_dwApeHandle, receiveId, 1, bytes.data(),
                                                 static_cast<std::uint32_t>(bytes.size()), 1, 1);
    if (result != 0) {
        if (bQM) {
            MacWarnTrace2(kChatTag, "CChatClient::SendChatInQM:ApeSendData error =%d", result);
        } else {
            MacWarnTrace2(kChatTag, "CChatClient::SendChat:ApeSendData error =%d", result);
        }
        return false;
    }
    ClearSentInput();
    ParseAndShowPrivateMessages(&pdu, 0);
    if (bQM) SendCopyToCustomerCache(&pdu);
    return true;
}

std::uint32_t CChatClient::GetGroupSendPDUOption() const {
    const bool recording = IsRecording();
    std::uint32_t flags = recording ? kRecordFlags : 0;
    if (!recording && m_bSaveForReport) flags = kSaveForReportFlags;
    if (recording && m_bSaveForReport) flags |= kRecordForReportFlags;
    return flags | kChatLineFlags;
}

bool CChatClient::IsPrivateChat(std::uint32_t userId) const {
    CFuncTrace trace("CChatClient::IsPrivateChat,userID = %d", userId);
    return userId != 0 && userId != kToHostPresenter && userId != kToPanelists &&
           userId != kToPrivileged && userId != kToAttendees;
}

std::uint32_t CChatClient::GetSendUserChanelID() const {
    CFuncTrace trace("CChatClient::GetSendUserChanelID");
    const int index = SelectedMenuIndex();
    if (index == -1) return kToAttendees;
    const MenuStatus& entry = m_MenuStatus[index];
    switch (entry.nGroupID) {
        case 0:
            return kToAttendees;
        case static_cast<std::int32_t>(GROUP_HOST):
            return static_cast<std::uint32_t>(-1);
        case static_cast<std::int32_t>(GROUP_PRESENTER):
            return static_cast<std::uint32_t>(-3);
        case static_cast<std::int32_t>(GROUP_HOST_PRESENTER):
            return kToHostPresenter;
        default:
            break;
    }
    if (entry.nGroupID > static_cast<std::int32_t>(GROUP_HOST_PRESENTER)) return 0;
    // A person's entry: the channel is that person's user id, 0 when they are not known.
    const UserItem* user = m_UserList.GetUserItemFromNodeId(entry.dwNodeID);
    return user ? user->dwUserID : 0;
}

void CChatClient::SetSaveForReportFlag(int bSave) {
    m_bSaveForReport = bSave != 0 ? 1 : 0;
}
