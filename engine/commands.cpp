// The host's tuning commands (feature word, recording status, configuration XML, sound)
// and the events the chat window raises.
#include <cstring>

#include "engine/chat_client.h"
#include "engine/chat_recovery_mgr.h"
#include "pdu/customer_id_pdu.h"
#include "pdu/faq_macro_info_pdu.h"
#include "platform/func_trace.h"
#include "platform/telemetry.h"

namespace {

// Configuration kinds of SetConfig.
constexpr std::uint32_t kConfigFAQMacro = 2;
constexpr std::uint32_t kConfigCustomerId = 3;

// Telemetry: the user picked the everyone entry.
constexpr int kTelemetryEveryoneSelected = 902;

// Recording status values that mean the session is being recorded.
bool IsRecordingStatus(std::uint32_t status) {
    return status == 0 || status == 3;
}

}  // namespace

int CChatClient::SelectFeature(std::uint32_t features, std::uint32_t, long, long, std::uint32_t,
                               char*) {
    CFuncTrace trace("CChatClient::SelectFeature");
    m_dwFeatures = features;
    m_bQMMode = (features & FEATURE_QM_MODE) ? 1 : 0;
    if (m_bQMMode) SetMeetingType(m_dwMeetingType);
    m_bSaveForReport = (features & FEATURE_SAVE_FOR_REPORT) ? 1 : 0;
    if (m_pRecoveryMgr) m_pRecoveryMgr->InitParameters(this, features);
    m_bEveryoneOnly = (features & FEATURE_EVERYONE_ONLY) ? 1 : 0;
    if (m_bEveryoneOnly) NotifyUI(msg_NoSendToItems);
    return 0;
}

int CChatClient::SetNBRStatus(std::uint32_t status, std::uint32_t option, std::uint32_t reserved) {
    CFuncTrace trace("CChatClient::SetNBRStatus, dwStatus = %d, dwOption = %d, dwReserved = %d",
                     status, option, reserved);
    m_dwNBRStatus = status;
    m_dwNBROption = option;
    if (IsRecordingStatus(status)) SetAllCacheSendGroupInfoStatus(1);
    return 0;
}

int CChatClient::SetConfig(std::uint32_t type, const char* xml) {
    if (type == kConfigFAQMacro) {
        HandleFAQMacroInfoConfig(xml);
    } else if (type == kConfigCustomerId) {
        HandleCustomerIdConfig(xml);
    }
    return 0;
}

int CChatClient::HandleCustomerIdConfig(const char* xml) {
    CFuncTrace trace("CChatClient::HandleCustomerIdConfig()");
    if (!m_pRecoveryMgr || !xml) return 0;
    CCustomerIdPDU pdu;
    if (!pdu.ParseXMLPDU(std::string(xml))) return 0;
    m_pRecoveryMgr->SetCustomerId(pdu.GetCustomerId_DWORD());
    return 1;
}

int CChatClient::HandleFAQMacroInfoConfig(const char* xml) {
    CFuncTrace trace("CChatClient::HandleFAQMacroInfoConfig()");
    if (!m_pFAQMacroInfo || !xml) return 0;
    return m_pFAQMacroInfo->ParseXMLPDU(std::string(xml)) ? 1 : 0;
}

void CChatClient::SetSoundIncomingChat(PlaySoundMode mode) {
    CFuncTrace trace("CChatClient::SetSourndIncomingChat, inSoundWork = %d", mode);
    m_nSoundMode = mode;
}

void CChatClient::SetSoundFSSpec(const FSRef& file) {
    CFuncTrace trace("CChatClient::SetSoundFSSpec");
    m_SoundFile = file;
    m_SoundFile.path[sizeof m_SoundFile.path - 1] = '\0';
}

int CChatClient::HandleUIMessage(int message, void* iParam, void*) {
    switch (message) {
        case msg_SendChat:
            if (m_bQMMode) {
                SendChatInQM();
            } else {
                SendChat();
            }
            return 0;
        case msg_SelectionChanged: {
            if (!iParam) return 0;
            // Without a send-to list the window reports index 0 whatever it shows; the one
            // audience there is everyone.
            const int index = m_bEveryoneOnly ? GetIndexOfMenuByGroup(GROUP_EVERYONE)
                                              : *static_cast<std::int32_t*>(iParam);
            const bool valid = index >= 0 && index < static_cast<int>(m_MenuStatus.size());
            if (valid && m_MenuStatus[index].nGroupID == static_cast<int>(GROUP_EVERYONE))
                SendTelemetryActionByID(kTelemetryEveryoneSelected);
            // The window also reports the selections the engine makes; only a report of an
            // entry other than the engine's own selected one is the user's choice.
            if (valid && !m_MenuStatus[index].bSelected) m_bAudienceChosen = true;
            for (std::size_t i = 0; i < m_MenuStatus.size(); ++i)
                m_MenuStatus.SetSelected(i, static_cast<int>(i) == index);
            return 0;
        }
        case msg_ShowAttendeeList:
            OnShowAttendee();
            return 0;
        case msg_AttendeeSelected: {
            if (!iParam) return 1;
            const std::uint32_t nodeId = *static_cast<std::uint32_t*>(iParam);
            if (nodeId == 0) {
                for (std::size_t i = 0; i < m_MenuStatus.size(); ++i) {
                    if (!m_MenuStatus[i].bSelected) continue;
                    std::int32_t index = static_cast<std::int32_t>(i);
                    NotifyUI(msg_SelectMenuItem, &index);
                    break;
                }
            } else if (m_dwMeetingType != 3) {
                if (const UserItem* user = m_UserList.GetUserItemFromNodeId(nodeId))
                    InsertChatUserName(user->strName.GetData(), nodeId, 1);
            } else {
                SelectUserByNodeID(nodeId, false, true);
            }
            return 1;
        }
        default:
            return 1;
    }
}

void CChatClient::OnShowAttendee() {
    for (std::uint32_t i = 0; i < m_UserList.GetCount(); ++i) {
        const UserItem* user = m_UserList.GetUserItemByIndex(i);
        if (!user || (user->dwRoles != 0 && user->dwRoles != 8)) continue;
        const char* name = user->strName.GetData();
        AttendeeRecord record{name ? name : "", user->dwNodeID};
        NotifyUI(msg_AddAttendee, &record);
    }
}

void CChatClient::CloseAllDlg() {
    NotifyUI(msg_CloseAllDialogs);
}

void CChatClient::CloseSeltAttDlg() {
    std::int32_t stillShowing = 0;
    NotifyUI(msg_CloseAttendeeWarning, nullptr, &stillShowing);
    if (stillShowing) {
        m_bSelectDlgOpen = 1;
    } else {
        NotifyUI(msg_CloseAttendeeDialog);
    }
}
