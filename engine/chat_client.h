// CChatClient: the chat engine, one per component instance. It answers the conference
// service's callbacks and the window's events, and owns roster, groups, menu and transcript.
// The implementation is split by concern: session.cpp, caches.cpp, commands.cpp,
// transcript.cpp, roster.cpp, roster_changes.cpp, groups.cpp, menu.cpp, privilege.cpp,
// roles.cpp, practice.cpp, receive.cpp.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "api/quintarachat.h"
#include "api/window_bridge.h"
#include "engine/chat_content_storage.h"
#include "engine/chat_data_cmd_process.h"
#include "engine/menu_status.h"
#include "engine/user_list_manager.h"
#include "engine/users_group_list.h"
#include "platform/arm_service.h"
#include "platform/run_loop.h"

class ChatRecoveryMgr;
class CFAQMacroInfoPDU;
class CRosterInfoPDU;

// Engine state while bringing the session up.
enum EngineState { kStateIdle = 0, kStateAttaching = 1, kStateEnrolled = 2 };

// When the incoming-chat sound plays: 0 never, 1 while the panel shows, 2 first line, 3 always.
using PlaySoundMode = std::int32_t;

// Role bits of roster items and of the local participant.
constexpr std::uint32_t ROLE_HOST = 0x1;
constexpr std::uint32_t ROLE_PRESENTER = 0x2;
constexpr std::uint32_t ROLE_PANELIST = 0x4;

// Group ids are role masks.
constexpr std::uint32_t GROUP_HOST = 1;
constexpr std::uint32_t GROUP_PRESENTER = 2;
constexpr std::uint32_t GROUP_HOST_PRESENTER = 3;
constexpr std::uint32_t GROUP_PANELISTS = 4;
constexpr std::uint32_t GROUP_HOST_PRESENTER_PANELISTS = 7;
constexpr std::uint32_t GROUP_ATTENDEES = 8;
constexpr std::uint32_t GROUP_EVERYONE = 15;
constexpr std::uint32_t GROUP_SELECT_ATTENDEE = 16;

// Feature bits of SelectFeature.
constexpr std::uint32_t FEATURE_GROUPS = 0x1;
constexpr std::uint32_t FEATURE_GROUP_SCHEME2 = 0x80;
constexpr std::uint32_t FEATURE_ALWAYS_RECORD = 0x100;
constexpr std::uint32_t FEATURE_GROUP_MSG_RECOVERY = 0x400;
constexpr std::uint32_t FEATURE_SAVE_FOR_REPORT = 0x8000;
constexpr std::uint32_t FEATURE_EVERYONE_ONLY = 0x100000;
constexpr std::uint32_t FEATURE_QM_MODE = 0x200000;

// The participant name of the network recorder, which never appears in roster or menu.
constexpr const char* kRecorderName = "kvo_ssr_987_recorder-654";

class CChatClient : public IArmNodeControllerSink,
                    public IArmConferenceSink,
                    public IArmApeSink,
                    public IArmSharedDataSink,
                    public IArmAllocHandleSink,
                    public IChatCommSinkForChatUI,
                    public IChatDataCmdProcess {
public:
    CChatClient();
    virtual ~CChatClient();
    CChatClient(const CChatClient&) = delete;
    CChatClient& operator=(const CChatClient&) = delete;

    // ---- Session (session.cpp) ----
    // Starts the engine from the host's record; always 0.
    int Initialize(_tagChatData data);
    // Releases the service, the window and the owned objects; safe to repeat.
    void Cleanup();
    // The ApeEnroll result, or 1 when the roster record could not be built or there is
    // no service to enroll with.
    int Enroll();
    // Stores the roster-info switches and enrolls again when they changed; always 0.
    int SetRosterStatus(std::uint32_t inNeedRosterInfo, std::uint32_t inBroadcastRosterInfo);
    // Fills and generates the local participant's roster record; 0 for a null pointer.
    int MakeRosterInfoPDU(CRosterInfoPDU* pdu);
    void ShowChatUI(int bShow);
    void SetChatPanelUI(int inState);
    void InstallTimer(double seconds);
    void RemoveTimer();
    void OnTick();
    // Sends one window command; 3 when there is no window.
    int NotifyUI(int command, void* inParam = nullptr, void* outParam = nullptr);

    // IArmNodeControllerSink
    int ConnectConfirm(short result, std::uint32_t value) override;
    int DisconnectIndication(short reason) override;
    int TransportStatusIndication(std::uint32_t status) override;
    int DisconnectConfirm(short result) override;
    // IArmConferenceSink
    int ConferenceJoinConfirm(std::uint16_t conferenceId, const char* conferenceName, short result,
                              std::uint32_t value) override;
    int ConferenceLeaveIndication(std::uint16_t conferenceId, short reason) override;
    int ConferenceRosterConfirm(std::uint16_t conferenceId, short result) override;
    int ConferenceRosterChanged(std::uint16_t conferenceId, std::uint32_t nodeCount) override;
    int ApeRosterConfirm(std::uint16_t conferenceId, short result) override;
    int ApeRosterChanged(std::uint16_t conferenceId, std::uint32_t sessionId) override;
    // IArmApeSink
    int ApeAttachConfirm(std::uint32_t apeHandle, short result, std::uint32_t userId) override;
    int ApeEnrollConfirm(std::uint32_t apeHandle, short result, short resourceNumber,
                         ARMSessionResource* resources) override;
    int ApeDataIndication(std::uint32_t apeHandle, std::uint32_t senderId, std::uint32_t value,
                          std::uint16_t flags, const void* data, std::uint32_t length) override;
    int ApeBufferFullIndication(std::uint32_t apeHandle) override;
    int TokenGrabConfirm(std::uint32_t apeHandle, std::uint32_t tokenId, short result) override;
    int TokenInhibitConfirm(std::uint32_t apeHandle, std::uint32_t tokenId, short result) override;
    int TokenGiveIndication(std::uint32_t apeHandle, std::uint32_t tokenId,
                            std::uint32_t fromUserId) override;
    int TokenGiveConfirm(std::uint32_t apeHandle, std::uint32_t tokenId, short result) override;
    int TokenPleaseIndication(std::uint32_t apeHandle, std::uint32_t tokenId,
                              std::uint32_t fromUserId) override;
    int TokenReleaseConfirm(std::uint32_t apeHandle, std::uint32_t tokenId, short result) override;
    int TokenTestConfirm(std::uint32_t apeHandle, std::uint32_t tokenId,
                         std::uint32_t status) override;
    int ApeRosterInquireConfirm(std::uint32_t apeHandle, short result) override;
    int ApeRosterRefreshConfirm(std::uint32_t apeHandle, short result) override;
    int ApeRosterReportIndication(std::uint32_t apeHandle, std::uint32_t sessionId) override;
    int ApeRosterChanged(std::uint32_t serviceId, std::uint16_t value, std::uint32_t addedCount,
                         std::uint32_t deletedCount, std::uint32_t modifiedCount,
                         ARMApeRoster* records) override;
    int ApeDetachIndication(std::uint32_t apeHandle, short reason) override;
    int ApeDataIndicationEx(std::uint32_t apeHandle, std::uint32_t senderId, const void* data,
                            std::uint32_t length) override;
    int ApeCacheActionConfirmEx(std::uint32_t apeHandle, std::uint32_t entityId,
                                tagCacheAction action, std::uint32_t requestIdx,
                                std::uint32_t cacheId, short result) override;
    // IArmSharedDataSink
    int SharedDataReceived(std::uint32_t apeHandle, std::uint32_t entityId,
                           std::uint32_t memHandle, short result) override;
    int SharedDataReceivedEx(std::uint32_t apeHandle, std::uint32_t cacheId,
                             std::uint32_t entityId, std::uint32_t memHandle, short result,
                             tagCacheAction action, std::uint32_t senderId, std::uint32_t value,
                             std::uint16_t flags) override;
    // IArmAllocHandleSink
    int AllocHandleConfirm(std::uint32_t apeHandle, std::uint32_t handle, short result) override;
    int AllocNameHandleConfirm(std::uint32_t apeHandle, std::uint32_t count, NameHandle* handles,
                               short result, std::uint32_t reserved) override;

    // ---- Shared-data caches and named handles (caches.cpp) ----
    // 1 when a handle request was sent, else 0.
    int AllocAllNeededCacheHandle();
    void CheckChatStatus();
    void SetAllCaches();
    void SetChatStatusCache();
    void SetCustomerCache() override;
    int SendOwnUserInfoToCache();
    void SetAllGroupCacheSetFlag();
    void SendCopyToCustomerCache(CKvoChatXMLPDU* pdu) override;
    // 1 when a request was passed to the service, 0 when nothing was sent.
    int SubscribeGroupCache(std::uint32_t groupId, tagCacheRequestType type);
    int UnSubscribeGroupCache(std::uint32_t groupId);
    void SubscribeAllGroupCaches();
    void ReSubscribeGroupCaches();
    void SubscribeAndRetriveGroupAllUsersGroupCache();
    bool GetGroupCacheStatus(std::uint32_t groupId, int& subscribed, int& requestType,
                             int& cacheSet);
    void SetGroupCacheStatus(std::uint32_t groupId, int subscribed, int requestType);
    void SetNeedSendGroupInfoStatus(std::uint32_t groupId, int status);
    bool GetNeedSendGroupInfoStatus(std::uint32_t groupId);
    void SetAllCacheSendGroupInfoStatus(int status);
    int SendGroupInfoToCache(std::uint32_t groupId);
    int SendGroupInfoToCache(std::uint32_t groupId, const char* groupName);
    std::uint32_t GetGroupIdFormCacheName(const char* cacheName) override;
    std::uint32_t GetGroupIdFormCacheHandle(std::uint32_t cacheHandle) override;
    std::uint32_t GetCacheHandleFormGroupId(std::uint32_t groupId) override;
    std::uint32_t GetCacheHandleFromGroupId(std::uint32_t groupId);
    const char* GetGroupNameFromGroupCacheHandle(std::uint32_t cacheHandle) override;
    int GetUserNameFromId(std::uint32_t userId, std::string& out) override;
    // A new memory handle holding the bytes, or 0.
    std::uint32_t GetATMemHandle(std::uint32_t& size, const void* data);
    int ParseATMemHandle(std::uint32_t memHandle, char* buffer, std::uint32_t* size) override;
    // The number of bytes read into a new zero-terminated buffer (freed with delete[]), or 0.
    std::uint32_t AllocAsciiStringForMemoryHandle(std::uint32_t memHandle, char*& out);
    bool AllocStringForMemoryHandle(std::uint32_t memHandle, std::string& out) override;
    int ChatRequestSharedDataEx(std::uint32_t cacheHandle, tagCacheRequestType type,
                                short maxItems) override;

    // ---- Host commands, configuration and window events (commands.cpp) ----
    int SelectFeature(std::uint32_t features, std::uint32_t reserved1, long reserved2,
                      long reserved3, std::uint32_t reserved4, char* reserved5);
    int SetNBRStatus(std::uint32_t status, std::uint32_t option, std::uint32_t reserved);
    int SetConfig(std::uint32_t type, const char* xml);
    int HandleCustomerIdConfig(const char* xml);
    int HandleFAQMacroInfoConfig(const char* xml);
    void SetSoundIncomingChat(PlaySoundMode mode);
    void SetSoundFSSpec(const FSRef& file);
    int HandleUIMessage(int message, void* iParam, void* oParam) override;
    void OnShowAttendee();
    void CloseAllDlg();
    void CloseSeltAttDlg();

    // ---- Transcript files (transcript.cpp) ----
    void SetFileNeedSave(int bNeedSave);
    void SaveChatFile(int bPrompt);
    void SaveAsChatFile();
    void PopSaveDialog(bool bSaveAs);
    void PopChatFileOpenDialog();
    void OpenChatFile();
    bool IsChatHaveContent();

    // ---- Receiving chat (receive.cpp) ----
    void ParseAndShowGroupMessages(CGroupMessagePDU* pdu, std::uint32_t cacheHandle) override;
    int ParseAndShowPrivateMessages(CPrivateMessagePDU* pdu, int reserved) override;

    // ---- Roster (roster.cpp, roster_changes.cpp) ----
    bool IsUserExist(const UserItem* item);
    std::uint32_t GetPanelistCount();
    bool IsBeforeHost();
    int SetRosters(std::uint32_t dwRoster, int bForce);
    int SetAttendee(std::uint32_t dwNodeId);
    bool IsUserSelectedUser(std::uint32_t nodeId);
    void AddUserByUserSelected(std::uint32_t nodeId);
    void RemoveUserByUserID(std::uint32_t nodeId);
    int ExtractEnrollInfoAndReturnLen(std::uint32_t index, UserItem* item,
                                      const ARMApeRoster* record);
    int ProcessAddEnrollInfo(std::uint32_t count, const ARMApeRoster* first);
    int ProcessDeleteEnrollInfo(std::uint32_t count, const ARMApeRoster* first);
    int ProcessModifyEnrollInfo(std::uint32_t count, const ARMApeRoster* first);

    // ---- Send-to groups (groups.cpp) ----
    void AddGroup(const _tagChatGroupInfo* info, int bAddToMenu);
    void SetMeetingType(std::int32_t meetingType);

    // ---- Send-to menu model (menu.cpp) ----
    int GetIndexOfMenuByGroup(std::int32_t groupId) const;
    const MenuStatus* GetMenuByGroupID(std::int32_t groupId) const;
    int GetIndexOfMenuByNodeID(std::uint32_t nodeId) const;
    void SelectMenuItemByIndex(int index);
    void SelectMenuItemByIndexInQM(int index);
    void SetGroupMenuEnable(std::int32_t groupId, bool bEnable);
    bool GetHideSendToCombox() const { return m_bEveryoneOnly != 0; }
    void InsertExternalInternalChatUserName(const char* name, std::uint32_t nodeId,
                                            std::uint32_t tag);
    void InsertChatUserName(const char* name, std::uint32_t nodeId, int bSelect);
    void InsertRecentUserName(const char* name, std::uint32_t nodeId);
    void RemoveChatUserName(const char* name, std::uint32_t nodeId, int bNotify);
    void RemoveChatUserNameInQM(const char* name, std::uint32_t nodeId);
    void RemoveRecentUserName(const char* name, std::uint32_t nodeId);
    void ModifyChatUserName(const char* name, std::uint32_t nodeId);
    bool SelectUserByNodeID(std::uint32_t nodeId, bool bTestOnly, bool bSelect);
    bool CanChatWith(std::uint32_t nodeId, bool bMenuOnly);
    std::uint32_t GetUserExternalInternalTag(std::uint32_t nodeId);
    std::string GetUserExternalInternalString(std::uint32_t tag, int form) const;

    // ---- Privilege and role policy (privilege.cpp) ----
    void OnPrivilegeChanged(std::uint32_t privilege, int bForce);
    void OnBeforeHostChange(int value);

    // ---- Host and presenter changes (roles.cpp) ----
    void OnHostChanged(std::uint32_t hostId);
    void OnPresenterChanged(std::uint32_t presenterId);
    void OnRosterChange(int bSelectEveryone);

    // ---- Practice session and panelists (practice.cpp) ----
    void SetPracticeStatus(std::int8_t value);
    void SetPanelStatus(std::uint32_t status);

    // ---- State read by tests and the component's functions ----
    const CUserListManager& UserList() const { return m_UserList; }
    const CUsersGroupList& GroupList() const { return m_GroupList; }
    const MenuStatusList& Menu() const { return m_MenuStatus; }
    const CChatContentStorage& ChatContent() const { return m_ChatContent; }
    ChatRecoveryMgr* RecoveryMgr() const { return m_pRecoveryMgr.get(); }
    IArmClient* ArmClient() const { return m_pArmClient; }
    ChatUIHandle ChatUI() const { return m_hChatUI; }
    int FileNeedSave() const { return m_bFileNeedSave; }

private:
    // True when the local participant has the panelist bit or is presenter or host.
    bool IsPrivileged() const;
    // True when the local participant is the host or the presenter (node ids alone).
    bool IsHostOrPresenter() const;

    // Engine fields, in the order the component has always kept them.
    std::uint32_t m_dwMyRosters = 0;     // own role bits (ChSetRosters)
    int m_nPrivilegeCountdown = 0;       // 0 idle; else counts ticks up to 10
    int m_bPrivilegePending = 0;         // from Initialize until the countdown fires
    int m_nStartupTicks = 0;             // 1..20 after Initialize, then 0
    int m_bEnrolled = 0;                 // an enroll confirmation arrived
    int m_bRostersPending = 0;           // roles changed before enrolment
    int m_bInitCaches = 0;               // this participant initialises the caches
    NameHandle m_ChatStatusCacheHandle{};
    NameHandle m_UserInfoCacheHandle{};
    NameHandle m_CustomerCacheHandle{};
    int m_bSaveForReport = 0;
    std::uint32_t m_dwMyRole = 0;        // bit 0 presenter, bit 1 host, after the last change
    std::uint32_t m_dwPrevMyRole = 0;    // the same before it
    std::int32_t m_dwMeetingType = 0;
    std::unique_ptr<ChatRecoveryMgr> m_pRecoveryMgr;
    std::unique_ptr<CFAQMacroInfoPDU> m_pFAQMacroInfo;
    int m_bEveryoneOnly = 0;
    IArmClient* m_pArmClient = nullptr;  // the host's service object; released in Cleanup
    IHostChatSink* m_pHostSink = nullptr;
    std::uint32_t m_dwMyNodeID = 0;
    std::string m_strMyName;
    std::string m_strReserved;
    std::uint16_t m_wConferenceID = 0;
    std::uint32_t m_dwSessionID = 0;
    std::uint32_t m_dwApeHandle = 0;
    std::uint32_t m_dwMyUserID = 0;
    std::uint32_t m_dwSessionValue = 0;  // granted "c_session_id": prefix of cache names
    int m_bNeedRosterInfo = 1;
    int m_bBroadcastRosterInfo = 1;
    int m_nState = kStateIdle;
    std::uint32_t m_dwHostID = 0;
    std::uint32_t m_dwPresenterID = 0;

    // Menu and privilege state.
    std::uint32_t m_dwPrevHostID = 0;
    std::uint32_t m_dwPrevPresenterID = 0;
    std::uint32_t m_dwLastHostID = 0;       // host whose entry was last removed (QM)
    std::uint32_t m_dwLastPresenterID = 0;  // presenter whose entry was last removed (QM)
    int m_bChatAttendees = 1;
    int m_bChatHost = 1;
    int m_bChatPresenter = 1;
    int m_bChatPrivately = 1;
    int m_bChatPanelists = 1;
    int m_bChatEveryone = 1;
    std::int8_t m_bPractice = 0;
    std::uint32_t m_dwPanelStatus = 0;

    CChatContentStorage m_ChatContent;
    CUserListManager m_UserList;
    CUsersGroupList m_GroupList;
    std::string m_strFilePath;           // transcript file; empty = never saved or opened
    int m_bFileNeedSave = 0;             // transcript modified flag
    PlaySoundMode m_nSoundMode = 0;
    FSRef m_SoundFile{};
    bool m_bFirstMessage = true;         // sound mode 2 plays for the first line only
    std::uint32_t m_dwPrivilege = 0x10047;
    std::uint32_t m_dwFeatures = 0;
    std::uint32_t m_dwNBRStatus = 1;
    std::uint32_t m_dwNBROption = 1;
    MenuStatusList m_MenuStatus;
    RunLoop* m_pTimerLoop = nullptr;     // the loop the tick timer runs on
    RunLoop::TimerId m_pTimer = 0;
    ChatUIHandle m_hChatUI = nullptr;
    void* m_hParentView = nullptr;
    int m_bSelectDlgOpen = 0;
    bool m_bUseAttendeeSelector = false;
    std::vector<std::uint32_t> m_SelectedUsers;  // attendees picked, oldest first
    int m_bQMMode = 0;
    std::uint32_t m_dwUserExternalTag = 0;
    std::int32_t m_lExternalTagMode = 0;
};
