// The engine's life: construction, start-up from the host's record, the chain of service
// calls up to enrolment, the half-second housekeeping tick, and the tear-down.
#include <cinttypes>
#include <string>

#include "engine/chat_client.h"
#include "engine/chat_recovery_mgr.h"
#include "pdu/faq_macro_info_pdu.h"
#include "pdu/roster_info_pdu.h"
#include "platform/func_trace.h"
#include "platform/trace.h"

namespace {

// The resource every participant asks for at enroll; its granted value prefixes cache names.
constexpr const char* kSessionResourceName = "c_session_id";

// The tick: first one second after start, then every half second.
constexpr double kFirstTickDelay = 1.0;
constexpr double kTickInterval = 0.5;

// The privilege countdown re-applies the privilege word when it reaches this count.
constexpr int kPrivilegeCountdownEnd = 10;
// After this many ticks the start-up window is over.
constexpr int kStartupTickCount = 20;

}  // namespace

CChatClient::CChatClient()
    : m_pRecoveryMgr(std::make_unique<ChatRecoveryMgr>()),
      m_pFAQMacroInfo(std::make_unique<CFAQMacroInfoPDU>()) {}

CChatClient::~CChatClient() {
    CFuncTrace trace("CChatClient::~CChatClient");
    m_nState = kStateIdle;
    Cleanup();
    RemoveTimer();
}

int CChatClient::NotifyUI(int command, void* inParam, void* outParam) {
    return NotifyCocoaUI(m_hChatUI, command, inParam, outParam);
}

int CChatClient::Initialize(_tagChatData data) {
    CFuncTrace trace("CChatClient::Initialize");
    m_bEnrolled = 0;

    m_pHostSink = data.pHostSink;
    m_dwMyNodeID = data.dwNodeID;
    m_hParentView = data.hParentView;
    m_bUseAttendeeSelector = data.bUseAttendeeSelector != 0;
    m_dwMeetingType = data.lMeetingType;
    m_lExternalTagMode = data.lExternalTagMode;
    if (m_lExternalTagMode != 0) m_dwUserExternalTag = data.dwUserExternalTag;

    NotifyUI(msg_FocusInput);

    if (data.lpszUserName) m_strMyName = data.lpszUserName;
    if (data.lpszReserved) m_strReserved = data.lpszReserved;
    m_wConferenceID = data.wConferenceID;
    m_dwSessionID = data.dwSessionID;

    // A second start keeps talking to the service of the first.
    if (!m_pArmClient) m_pArmClient = data.pArmClient;

    if (m_pArmClient) {
        const int result = m_pArmClient->Connect(this, m_strMyName.c_str(), 0, 0, 0);
        if (result == kArmAlreadyConnected) {
            MacInfoTrace2(kChatTag,
                          "CChatClient::already connected, now call ConnectConfirm() myself");
            ConnectConfirm(0, 77);
        } else if (result != kArmOk && result != kArmConnectPending) {
            Cleanup();
        }
    }

    ShowChatUI(1);
    SetChatPanelUI(0);
    InstallTimer(kTickInterval);
    m_nPrivilegeCountdown = 1;
    m_nStartupTicks = 1;
    m_bPrivilegePending = 1;

    // A repeated start keeps the first window, moved into the view the new record names.
    if (!m_hChatUI) {
        CreateUI(&m_hChatUI, m_hParentView, this);
    } else {
        m_hChatUI->SetSuperView(m_hParentView);
    }
    // A feature word set before the start found no window to hide the send-to list in.
    if (m_bEveryoneOnly) NotifyUI(msg_NoSendToItems);
    SetMeetingType(m_dwMeetingType);

    if (m_pHostSink) {
        m_pHostSink->OnChatModified(false);
        m_pHostSink->OnChatContentChanged(false);
    }
    return 0;
}

int CChatClient::ConnectConfirm(short result, std::uint32_t value) {
    CFuncTrace trace("CChatClient::ConnectConfirm");
    if (!m_pArmClient) return 0;
    if (result == kArmRetry) {
        m_pArmClient->Connect(this, m_strMyName.c_str(), 0, 0, 0);
    } else if (result == kArmOk) {
        const int join = m_pArmClient->ConferenceJoin(0, m_wConferenceID, this, 3);
        if (join == kArmAlreadyJoined) ConferenceJoinConfirm(m_wConferenceID, "99", 0, value);
    }
    return 0;
}

int CChatClient::DisconnectIndication(short reason) {
    CFuncTrace trace("CChatClient::DisconnectIndication, reason=%d.", reason);
    return 0;
}

int CChatClient::ConferenceJoinConfirm(std::uint16_t, const char*, short, std::uint32_t) {
    CFuncTrace trace("CChatClient::ConferenceJoinConfirm");
    if (!m_pArmClient) return -1;
    const int result = m_pArmClient->ApeAttach(this, 0, m_wConferenceID, &m_dwApeHandle);
    if (result == kArmOk) {
        m_nState = kStateAttaching;
        return 0;
    }
    MacErrorTrace2(kChatTag, "CChatClient::m_pArmClient->Attach user failed, nRetCode=%d, nRetCode",
                   result);
    return result;
}

int CChatClient::ApeAttachConfirm(std::uint32_t apeHandle, short result, std::uint32_t userId) {
    CFuncTrace trace("CChatClient::::ApeAttachConfirm, ape_handle = %d, result = %d, userId = %d",
                     apeHandle, result, userId);
    if (result != kArmOk) {
        Cleanup();
        m_nState = kStateIdle;
        return 0;
    }
    m_dwMyUserID = userId;
    Enroll();
    return 0;
}

int CChatClient::Enroll() {
    CFuncTrace trace("CChatClient::Enroll");
    // The service may already be gone (a failed connect, a refused enroll): nothing to ask.
    if (!m_pArmClient) return 1;
    CRosterInfoPDU pdu;
    if (!MakeRosterInfoPDU(&pdu)) return 1;
    const std::string text = pdu.ToWireText();

    ARMSessionResource resource{};
    resource.wResourceType = 1;
    resource.pszName = kSessionResourceName;
    resource.dwCount = 1;
    const int result =
        m_pArmClient->ApeEnroll(m_dwApeHandle, 1, m_dwSessionID, 0, 1, &resource, text.data(),
                                static_cast<std::uint32_t>(text.size()), 3);
    if (result != kArmOk) {
        MacErrorTrace2(kChatTag, "CChatClient::ApeEnroll failed. nRetCode = %d. ", result);
        m_nState = kStateIdle;
    }
    return result;
}

int CChatClient::MakeRosterInfoPDU(CRosterInfoPDU* pdu) {
    CFuncTrace trace("CChatClient::MakeRosterInfoPDU");
    if (!pdu) return 0;
    std::uint32_t roles = m_dwMyRosters;
    // Meeting type 1 has no panelists: the bit is kept locally but not announced.
    if (m_dwMeetingType == 1) roles &= ~ROLE_PANELIST;
    pdu->SetNodeID(m_dwMyNodeID);
    pdu->SetUserName(m_strMyName);
    pdu->SetRoleSet(roles);
    pdu->SetVisible(1);
    pdu->SetUserType(1);
    if (m_pFAQMacroInfo) {
        if (!m_pFAQMacroInfo->GetFirstName().empty())
            pdu->SetFirstName(m_pFAQMacroInfo->GetFirstName());
        if (!m_pFAQMacroInfo->GetLastName().empty())
            pdu->SetLastName(m_pFAQMacroInfo->GetLastName());
        if (!m_pFAQMacroInfo->GetPhoneNumber().empty())
            pdu->SetPhoneNumber(m_pFAQMacroInfo->GetPhoneNumber());
        if (!m_pFAQMacroInfo->GetEmailAddress().empty())
            pdu->SetEmailAddress(m_pFAQMacroInfo->GetEmailAddress());
    }
    if (m_pRecoveryMgr) pdu->SetCustomerId(m_pRecoveryMgr->GetCustomerId());
    pdu->SetUserExternalTag(m_dwUserExternalTag);
    return pdu->GenerateXMLPDU();
}

int CChatClient::ApeEnrollConfirm(std::uint32_t apeHandle, short result, short resourceNumber,
                                  ARMSessionResource* resources) {
    CFuncTrace trace(
        "CChatClient::ApeEnrollConfirm, ape_handle = %d, result = %d, "
        "resource_number = %d",
        apeHandle, result, resourceNumber);
    if (result == kArmOk && !resources) return 0;
    if (result == kArmOk) {
        m_dwSessionValue = resources->dwValue;
        m_bEnrolled = 1;
        if (resources->wStatus == 0) {
            m_nState = kStateEnrolled;
            AllocAllNeededCacheHandle();
            if (m_pArmClient) m_pArmClient->RegisterSharedDataSink(m_dwApeHandle, this);
            return 0;
        }
    }
    // Refused: the service is released below, so the tick must not enroll again.
    m_bEnrolled = 0;
    m_nState = kStateIdle;
    Cleanup();
    return 0;
}

int CChatClient::SetRosterStatus(std::uint32_t inNeedRosterInfo,
                                 std::uint32_t inBroadcastRosterInfo) {
    CFuncTrace trace(
        "CChatClient::SetRosterStatus, inNeedRosterInfo = %d, "
        "inBroadcastRosterInfo = %d",
        inNeedRosterInfo, inBroadcastRosterInfo);
    bool changed = false;
    if (inNeedRosterInfo == 1 && m_bNeedRosterInfo == 0) {
        m_bNeedRosterInfo = 1;
        changed = true;
    } else if (inNeedRosterInfo == 0 && m_bNeedRosterInfo == 1) {
        m_bNeedRosterInfo = 0;
        changed = true;
    }
    if (inBroadcastRosterInfo == 1 && m_bBroadcastRosterInfo == 0) {
        m_bBroadcastRosterInfo = 1;
        changed = true;
    } else if (inBroadcastRosterInfo == 0 && m_bBroadcastRosterInfo == 1) {
        m_bBroadcastRosterInfo = 0;
        changed = true;
    }
    if (m_bNeedRosterInfo == 0 || m_bBroadcastRosterInfo == 0) m_nPrivilegeCountdown = 5;
    if (changed) Enroll();
    return 0;
}

void CChatClient::Cleanup() {
    CFuncTrace trace("CChatClient::Cleanup");
    if (m_pArmClient) {
        MacInfoTrace2(kChatTag, "CChatClient::ape detach");
        if (m_dwApeHandle != 0) {
            m_pArmClient->ApeDetach(m_dwApeHandle);
            m_dwApeHandle = 0;
        }
        MacInfoTrace2(kChatTag, "CChatClient::conference leave");
        m_pArmClient->ConferenceLeave(0, m_wConferenceID, this);
        MacInfoTrace2(kChatTag, "CChatClient::destroy");
        m_pArmClient->Destroy(this, 1);
        m_pArmClient->Release();
        MacInfoTrace2(kChatTag, "CChatClient::after destroy");
        m_pArmClient = nullptr;
    }
    if (m_hChatUI) {
        DestoryUI(m_hChatUI);
        m_hChatUI = nullptr;
    }
    m_pRecoveryMgr.reset();
    m_pFAQMacroInfo.reset();
}

void CChatClient::ShowChatUI(int bShow) {
    CFuncTrace trace("CChatClient::ShowChatUI, bShow = %d", bShow);
    NotifyUI(msg_ShowChat);
    SetChatPanelUI(-1);
}

void CChatClient::SetChatPanelUI(int inState) {
    CFuncTrace trace("CChatClient::SetChatPanelUI inState = %d", inState);
}

void CChatClient::InstallTimer(double seconds) {
    RemoveTimer();
    m_pTimerLoop = RunLoop::Current();
    if (!m_pTimerLoop) return;
    m_pTimer = m_pTimerLoop->AddTimer(kFirstTickDelay, seconds, [this] { OnTick(); });
}

void CChatClient::RemoveTimer() {
    if (m_pTimerLoop && m_pTimer != 0) m_pTimerLoop->CancelTimer(m_pTimer);
    m_pTimer = 0;
    m_pTimerLoop = nullptr;
}

void CChatClient::OnTick() {
    if (m_bSelectDlgOpen) {
        std::int32_t stillShowing = 0;
        NotifyUI(msg_CloseAttendeeWarning, nullptr, &stillShowing);
        if (stillShowing == 0) {
            NotifyUI(msg_CloseAttendeeDialog);
            m_bSelectDlgOpen = 0;
        }
    }
    if (m_bRostersPending && m_bEnrolled) {
        Enroll();
        m_bRostersPending = 0;
    }
    CheckSavedFileStillThere();
    if (m_nPrivilegeCountdown != 0) {
        ++m_nPrivilegeCountdown;
        if (m_nPrivilegeCountdown >= kPrivilegeCountdownEnd) {
            OnPrivilegeChanged(m_dwPrivilege, 0);
            m_bPrivilegePending = 0;
            m_nPrivilegeCountdown = 0;
        }
    }
    if (m_nStartupTicks != 0) {
        ++m_nStartupTicks;
        if (m_nStartupTicks > kStartupTickCount) m_nStartupTicks = 0;
    }
}

// Callbacks of the service that the chat has no use for.

int CChatClient::TransportStatusIndication(std::uint32_t) {
    return 0;
}
int CChatClient::DisconnectConfirm(short) {
    return 0;
}
int CChatClient::ConferenceLeaveIndication(std::uint16_t, short) {
    return 0;
}
int CChatClient::ConferenceRosterConfirm(std::uint16_t, short) {
    return 0;
}
int CChatClient::ConferenceRosterChanged(std::uint16_t, std::uint32_t) {
    return 0;
}
int CChatClient::ApeRosterConfirm(std::uint16_t, short) {
    return 0;
}
int CChatClient::ApeRosterChanged(std::uint16_t, std::uint32_t) {
    return 0;
}
int CChatClient::ApeBufferFullIndication(std::uint32_t) {
    return 0;
}
int CChatClient::TokenGrabConfirm(std::uint32_t, std::uint32_t, short) {
    return 0;
}
int CChatClient::TokenInhibitConfirm(std::uint32_t, std::uint32_t, short) {
    return 0;
}
int CChatClient::TokenGiveIndication(std::uint32_t, std::uint32_t, std::uint32_t) {
    return 0;
}
int CChatClient::TokenGiveConfirm(std::uint32_t, std::uint32_t, short) {
    return 0;
}
int CChatClient::TokenPleaseIndication(std::uint32_t, std::uint32_t, std::uint32_t) {
    return 0;
}
int CChatClient::TokenReleaseConfirm(std::uint32_t, std::uint32_t, short) {
    return 0;
}
int CChatClient::TokenTestConfirm(std::uint32_t, std::uint32_t, std::uint32_t) {
    return 0;
}
int CChatClient::ApeRosterInquireConfirm(std::uint32_t, short) {
    return 0;
}
int CChatClient::ApeRosterRefreshConfirm(std::uint32_t, short) {
    return 0;
}
int CChatClient::ApeRosterReportIndication(std::uint32_t, std::uint32_t) {
    return 0;
}
int CChatClient::ApeDetachIndication(std::uint32_t, short) {
    return 0;
}
int CChatClient::ApeDataIndicationEx(std::uint32_t, std::uint32_t, const void*, std::uint32_t) {
    return 0;
}
int CChatClient::AllocHandleConfirm(std::uint32_t, std::uint32_t, short) {
    return 0;
}
