// CChatClient: the chat engine, one per component instance. It answers the conference
// service's callbacks and the window's events, and owns roster, groups, menu and transcript.
// The implementation is split by concern: session.cpp, caches.cpp, commands.cpp,
// transcript.cpp, roster.cpp, roster_changes.cpp, groups.cpp, menu.cpp, privilege.cpp,
// roles.cpp, practice.cpp, send.cpp, receive.cpp, show.cpp.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "api/quintarachat.h"
#include "api/window_bridge.h"
#include "engine/chat_content_storage.h"
#include "engine/chat_data_cmd_process.h"
#include "engine/menu_model.h"
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
    int SharedDataReceived(std::uint32_t apeHandle, std::uint32_t entityId, std::uint32_t memHandle,
                           short result) override;
    int SharedDataReceivedEx(std::uint32_t apeHandle, std::uint32_t cacheId, std::uint32_t entityId,
                             std::uint32_t memHandle, short result, tagCacheAction action,
                             std::uint32_t senderId, std::uint32_t value,
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
    // The status cache answered a retrieve: join the caches or initialise them.
    void OnChatStatusCacheAnswer(std::uint32_t memHandle, short result, tagCacheAction action);
    // True when what is written now is flagged for recording.
    bool IsRecording() const;

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
    // Stores the modified flag; the host hears of it only when it changes.
    void SetFileNeedSave(int bNeedSave);
    // Saves to the current path (asks for one when there is none); warns when it fails.
    void SaveChatFile(int bPrompt);
    // Asks for a path and saves there.
    void SaveAsChatFile();
    // Runs the save panel; a confirmed path becomes the current one and is saved.
    void PopSaveDialog(bool bSaveAs);
    // Runs the open panel; a confirmed path becomes the current one and is opened.
    void PopChatFileOpenDialog();
    // Appends the file at the current path to the transcript and the window, all or nothing;
    // on failure warns and forgets the path.
    void OpenChatFile();
    // True when the transcript holds at least one entry.
    bool IsChatHaveContent();
    // Writes the transcript to path, replacing a file there only once the new one is
    // complete. True (and the modified flag cleared) when the file holds the transcript.
    bool WriteChatFileToFolder(const std::string& path);
    // Writes the transcript as the localised "Chat.txt" into folder and makes that the
    // current path: 0 when written, -1 when not (null or missing folder, failed write).
    int SaveFileToFolder(const char* folder);
    // False, after a warning, when an existing file at path cannot be opened with permission
    // (1 read, 2 write, 3 read-write); true when it can or when there is no file.
    bool CheckPrivileges(const char* path, signed char permission);
    // Warns that the file at path could not be saved; nothing for an empty path.
    void AlertForSaveFailed(const std::string& path);
    // True when the file at path exists and can be examined; otherwise warns and is false.
    bool AlertIfSaveFailed(const char* path);
    // The tick's watch: marks the transcript modified when its saved file has gone.
    void CheckSavedFileStillThere();
    // The file the transcript was last saved to or opened from; empty when none.
    const std::string& ChatFilePath() const { return m_strFilePath; }

    // ---- Sending chat (send.cpp) ----
    // Sends the typed text to the selected send-to entry's audience; the input is cleared only
    // when the service took the message. The QM form follows the QM audience rules.
    void SendChat();
    void SendChatInQM();
    // The flags of a group send under the QM rules: recording and save-for-report bits.
    std::uint32_t GetGroupSendPDUOption() const;
    // True when a private message with this receive id goes to one person (or host, presenter).
    bool IsPrivateChat(std::uint32_t userId) const;
    // The receive id the selected entry stands for: a role id, 0, or the person's user id.
    std::uint32_t GetSendUserChanelID() const;
    void SetSaveForReportFlag(int bSave);
    int SaveForReport() const { return m_bSaveForReport; }

    // ---- Receiving chat (receive.cpp) ----
    // Private data that is not a private message: not for chat, 0.
    int OnChatDataIndication(std::uint32_t senderId, const void* data, std::uint32_t length);
    // Copies a live group message, with the cache id it got, into the customer cache.
    void CacheGroupMsg2CustomerCache(const CGroupMessagePDU* pdu, std::uint32_t cacheId);

    // ---- Showing chat (show.cpp) ----
    // Shows the message when the local participant is in its audience.
    void ParseAndShowGroupMessages(CGroupMessagePDU* pdu, std::uint32_t cacheHandle) override;
    int ParseAndShowPrivateMessages(CPrivateMessagePDU* pdu, int reserved) override;
    // Plays the incoming-chat sound when the sound mode asks for it.
    void PlaySoundIfNeed();
    // Stamps the transcript with the calendar time of the engine's run loop.
    void InsertChatTime();

    // ---- Roster (roster.cpp, roster_changes.cpp) ----
    // True when a roster item has both the item's user id and its node id.
    bool IsUserExist(const UserItem* item) const;
    // Roster items that are host, presenter or panelist (the local participant included).
    std::uint32_t GetPanelistCount() const;
    // True while the meeting has no host, as far as the local participant can tell.
    bool IsBeforeHost() const;
    // Sets the local participant's roles (host or presenter bring the panelist bit outside
    // meeting type 1). bForce: stores only, 1. Else enrolled: the enroll result when the roles
    // changed, 1 when not; before enrolment 0 and the change waits for it.
    int SetRosters(std::uint32_t dwRoster, int bForce);
    // Makes the node a plain attendee: 0 when it is in the roster, else -1.
    int SetAttendee(std::uint32_t dwNodeId);
    // The local participant's role bits.
    std::uint32_t GetMyRosters() const { return m_dwMyRosters; }
    // True when own roles changed before enrolment and still wait to be announced.
    bool IsRostersPending() const { return m_bRostersPending != 0; }
    // Selected-user set (attendees picked in the picker, oldest first): membership is false
    // for nodes outside the roster; adding skips those and nodes already present; removing
    // drops every occurrence of a selected node.
    bool IsUserSelectedUser(std::uint32_t nodeId) const;
    void AddUserByUserSelected(std::uint32_t nodeId);
    void RemoveUserByUserID(std::uint32_t nodeId);
    // Copies the ids of the record's entry at index into item and, when its enroll data parses,
    // name, roles, visibility, user type and tag: 0; -1 when the entry has no enroll data.
    int ExtractEnrollInfoAndReturnLen(std::uint32_t index, UserItem* item,
                                      const ARMApeRoster* record);
    // Handle count records of added, left or changed participants (records of other sessions
    // are skipped) and keep roster, menu and privileges in step; 1.
    int ProcessAddEnrollInfo(std::uint32_t count, const ARMApeRoster* first);
    int ProcessDeleteEnrollInfo(std::uint32_t count, const ARMApeRoster* first);
    int ProcessModifyEnrollInfo(std::uint32_t count, const ARMApeRoster* first);

private:
    // Adds one enrolled participant, unless already known or the recorder, with the menu
    // entry the rules give it (roster_changes.cpp). bOwn: this is the local participant's
    // record; bOwnArrived: that record came in this report, at this entry or before it.
    void AddEnrolledUser(std::unique_ptr<UserItem> user, bool bOwn, bool bOwnArrived);
    // Under QM rules: titles the role entry the participant holds with the participant's name,
    // first creating the "Host" entry when another participant's host role has none.
    void TitleRoleEntryInQM(std::uint32_t nodeId, const std::string& name);

public:
    // ---- Send-to groups (groups.cpp) ----
    // Adds the host's group (a null info does nothing), with a menu entry at its index when
    // bAddToMenu is set, and has the window rebuild its menu.
    void AddGroup(const _tagChatGroupInfo* info, int bAddToMenu);
    // Stores the meeting type and adds its default groups and menu entries.
    void SetMeetingType(std::int32_t meetingType);
    // A group with every value the add operations take.
    struct GroupValues {
        std::uint32_t dwIndex = 0;
        std::uint32_t dwGroupType = 0;
        std::uint32_t dwGroupId = 0;
        const char* lpszGroupName = nullptr;
        std::uint32_t dwValueA = 0;
        std::uint32_t dwValueB = 0;
        std::uint32_t dwFlags = 0;
        const char* lpszGroupLabel = nullptr;
        std::uint32_t dwMemberCount = 0;
        const std::uint32_t* const* pMembers = nullptr;
    };

private:
    // Adds the group by type under the current insertion scheme and renumbers the rows; the
    // add operation's result, -1 for an unknown type.
    int AddGroup(const GroupValues& values);
    // Role groups and separators: updates a matching group in place or inserts a new one. The
    // first form returns the index (-1 before enrolment when the insertion failed), the second
    // the group's sequence number (-1 when it could not be inserted).
    int AddRoleGroup(const GroupValues& values);
    int AddRoleGroup2(const GroupValues& values);
    // Id groups: always inserts a new group; the insertion result.
    int AddIDGroup(const GroupValues& values);
    int AddIDGroup2(const GroupValues& values);
    // A role group with only a name, as AddRoleGroup; returns 1.
    int AddCacheGroup(std::uint32_t dwIndex, std::uint32_t dwGroupType, std::uint32_t dwGroupId,
                      const char* lpszGroupName);

public:
    // ---- Send-to menu model (menu.cpp) ----
    // Index of the group's entry (group id, no participant), or -1.
    int GetIndexOfMenuByGroup(std::int32_t groupId) const;
    // The group's entry, or null.
    const MenuStatus* GetMenuByGroupID(std::int32_t groupId) const;
    // Index of the participant's first entry (recent entries included), or -1.
    int GetIndexOfMenuByNodeID(std::uint32_t nodeId) const;
    // Selects the entry (the everyone entry in everyone-only mode) and tells the window;
    // nothing for an index outside the menu. The QM form also lets the window allow input.
    void SelectMenuItemByIndex(int index);
    void SelectMenuItemByIndexInQM(int index);
    // Enables or disables the group's entry; the window hears only of a change.
    void SetGroupMenuEnable(std::int32_t groupId, bool bEnable);
    bool GetHideSendToCombox() const { return m_bEveryoneOnly != 0; }
    // InsertChatUserName with the participant's internal/external mark on the title.
    void InsertExternalInternalChatUserName(const char* name, std::uint32_t nodeId,
                                            std::uint32_t tag);
    // Gives the participant a private-chat entry in its section, in title order. None for the
    // local participant, for anyone while an unprivileged local participant is in practice, or
    // under QM rules for panelists, presenter and host.
    void InsertChatUserName(const char* name, std::uint32_t nodeId, int bSelect);
    // Puts the participant at the top of the recent entries.
    void InsertRecentUserName(const char* name, std::uint32_t nodeId);
    // Take the participant's entry (or its recent entry) out with the separators it leaves
    // doubled; a selected entry's audience is replaced by a fallback one.
    void RemoveChatUserName(const char* name, std::uint32_t nodeId, int bNotify);
    void RemoveRecentUserName(const char* name, std::uint32_t nodeId);
    // Under QM rules: an attendee's entry goes; a host's or presenter's role entry goes only
    // when selected. A selected entry is announced as a departed audience and input stops.
    void RemoveChatUserNameInQM(const char* name, std::uint32_t nodeId);
    // Changes nothing: an entry keeps the title it got on arrival.
    void ModifyChatUserName(const char* name, std::uint32_t nodeId);
    // True when chat to the participant is possible; selects its entry unless test-only.
    bool SelectUserByNodeID(std::uint32_t nodeId, bool bTestOnly, bool bSelect);
    // True when the local participant may chat with the node (never in everyone-only mode).
    bool CanChatWith(std::uint32_t nodeId, bool bMenuOnly);
    // The participant's tag as the tagging mode shows it: 1 internal, 2 external, else 0.
    std::uint32_t GetUserExternalInternalTag(std::uint32_t nodeId);
    // The mark for a tag: "internal"/"external" alone (form 0), after ", " (1) or in " ()" (2);
    // empty when the tagging mode does not show the tag.
    std::string GetUserExternalInternalString(std::uint32_t tag, int form) const;

private:
    // Menu editing shared by the menu, roster-change, privilege and role rules (menu.cpp).
    // Inserts the entry at position (-1 or beyond the end: appended), tells the window and
    // returns the entry's index.
    int InsertMenuEntry(const MenuStatus& entry, int position);
    // Erases the entry at index and tells the window; nothing for an index outside the menu.
    void EraseMenuEntry(int index);
    // Erases the entry at index; a selected one is announced as a departed audience and
    // input is stopped, any other as a plain removal.
    void EraseSelectedAware(int index);
    // Erases a participant entry and a separator it leaves doubled (and a trailing one when
    // asked); re-selects a fallback entry when the erased one was selected.
    void EraseParticipantEntry(int index, bool bTrailingSeparator);
    // Selects the enabled everyone entry, else the first enabled entry that is not a separator.
    void SelectFallbackMenuItem();
    // Marks only the entry at index selected (the everyone entry in everyone-only mode); false
    // and nothing changed when the index is outside the menu.
    bool MarkMenuItemSelected(int& index);
    // Index of the node's first participant entry that is (or is not) a recent entry, or -1.
    int IndexOfParticipantEntry(std::uint32_t nodeId, bool bRecent) const;
    // True when some entry belongs to a participant.
    bool HasParticipantEntry() const;
    // Tell the window of the entry at index as it now stands / of the whole menu.
    void AnnounceUpdatedEntry(int index);
    void AnnounceRebuiltMenu();
    // True when, of the privilege flags, private chat alone is allowed.
    bool OnlyChatPrivately() const;
    // Another participant's roles: host and presenter by the holder ids, panelist by the roster.
    bool IsNodeHost(std::uint32_t nodeId) const;
    bool IsNodePresenter(std::uint32_t nodeId) const;
    bool IsNodePanelist(std::uint32_t nodeId) const;
    // Panelist, presenter or host.
    bool IsNodePrivileged(std::uint32_t nodeId) const;
    // Inserts a new participant entry at position and selects as InsertChatUserName asks.
    void AnnounceInsertedUser(const MenuStatus& entry, int position, int bSelect,
                              bool selectedWasDisabled);
    // Where an attendee's entry goes in meeting types 1 and 2 (-1: appended); may first append
    // the separator that opens the participant section under QM rules.
    int AttendeeInsertPosition(const char* name);
    // Where an attendee's entry goes in meeting type 3; may first insert the section separator.
    int PanelAttendeeInsertPosition(const char* name);
    // Where a recent entry goes in meeting type 3, or -1 when the menu has no place for it.
    int PanelRecentInsertPosition();
    // Moves the node to the front of the picked attendees (at most 20) and its recent entry
    // to the top of the recent section.
    void RememberRecentUser(std::uint32_t nodeId, const char* name);

public:
    // ---- Privilege and role policy (privilege.cpp) ----
    // Takes a privilege word (or re-applies the current one; bForce redoes the attendee menu
    // even when the word is unchanged); under QM rules hands over to OnPrivilegeChangedInQM.
    void OnPrivilegeChanged(std::uint32_t privilege, int bForce);
    // The QM rules' counterpart of OnPrivilegeChanged; it also governs the everyone flag.
    void OnPrivilegeChangedInQM(std::uint32_t privilege, int bForce);
    // Re-applies the current privilege word; the value is not examined.
    void OnBeforeHostChange(int value);

    // ---- Host and presenter changes (roles.cpp) ----
    // Records the new host (0: none) and the local participant's resulting role bits.
    void OnHostChanged(std::uint32_t hostId);
    // Records the new presenter (0: none) and the local participant's resulting role bits.
    void OnPresenterChanged(std::uint32_t presenterId);
    // Rebuilds a privileged participant's menu from the groups; with the flag selects everyone.
    void OnRosterChange(int bSelectEveryone);

    // ---- Practice session and panelists (practice.cpp) ----
    // Starts (non-zero) or ends practice; repeating the current value does nothing.
    void SetPracticeStatus(std::int8_t value);
    // Stores the panel status and tells the window of a non-zero one.
    void SetPanelStatus(std::uint32_t status);

    // Rebuilds the send-to menu of a panel-meeting attendee from the privilege flags.
    void OnAttendeePrivilegeChange();
    // Under QM rules: edits the role and everyone entries in place after the flags changed
    // from oldPrivilege (masked), or unconditionally with bForce.
    void OnAttendeePrivilegeChangeInQM(std::uint32_t oldPrivilege, int bForce);
    // Practice menus: an attendee keeps at most "All Attendees" (bFlag: the normal attendee
    // menu instead); panelists, presenter and host keep the audiences among themselves.
    void RebuildAttendeeMenuInPractice(std::int8_t bFlag);
    void RebuildPanelistMenuInPractice();
    // Menu repairs when a role holder is not in the roster.
    void CheckMenuSpelineWhenTPIsPresenterHost();
    void CheckMenuStateForTPSupport(int bFlag);

private:
    // Privilege rules shared by both rule sets (privilege.cpp, privilege_qm.cpp).
    // Stores the privilege word and splits it into the flags; the everyone flag only when asked.
    void StorePrivilege(std::uint32_t privilege, bool bWithEveryone);
    // Enables the group entries the flags and the local participant's roles allow.
    // Before host, lets a participant reach the attendees unless the picker holds a plain
    // attendee back; returns whether it is before host.
    bool ApplyBeforeHost(bool hostOrPresenter);
    void EnableGroupEntries(bool beforeHost);
    // Re-creates the participant entries the flags allow, panelists in their own section.
    void ReapplyParticipantEntries();
    void ReinsertRosterMembers();
    void ReinsertPanelists();
    // Erases every participant entry, or only the non-recent ones of privileged participants.
    void EraseParticipantEntries(bool bPrivilegedOnly);
    // Tells the window whether the send-to list and the input are usable (normal rules).
    void ApplyInputRules();
    // Appends the audiences of an attendee's or panelist's rebuilt menu ("Host" to
    // "All Participants"); bInPractice relaxes the everyone entry's panelist condition.
    void AppendAttendeeAudiences(bool bInPractice);
    // Appends one entry per group of the group list, leaving out the last dropLast groups.
    void AppendGroupEntries(std::uint32_t dropLast);
    // A copy of the selected entry, if any.
    std::optional<MenuStatus> SelectedMenuEntry() const;
    // Some host, presenter or panelist is there to reach, the local participant included.
    bool PanelistsPresent() const;
    void AllowUserInput(bool bAllow);
    // Erases the entry (a selected one announced as a departed audience) and a separator
    // that then stands at its index.
    void EraseEntryAndSeparator(int index);
    // A trailing separator goes.
    void EraseTrailingSeparator();
    // Another participant's roles as the roster has them; 0 for a node outside it.
    std::uint32_t RosterRoles(std::uint32_t nodeId) const;
    bool IsRosterPrivileged(std::uint32_t nodeId) const { return RosterRoles(nodeId) != 0; }
    // Under QM rules: re-titles and re-arranges the role entries after a host (bHost) or
    // presenter change, keeping the selected audience.
    void ArrangeRoleEntriesInQM(bool bHost);
    // Selects the entry that now reaches the audience (0: none) selected before a role change.
    void SelectAudienceAfterRoleChange(std::uint32_t audience, bool bHost);
    // Titles a role entry with its holder: name, " (", the role word, the holder's tag, ")".
    // The role word goes in as it is; only a newly created entry's own title is localized.
    void RetitleRoleEntry(int index, const std::string& name, std::uint32_t nodeId,
                          const char* role);
    // Takes the role bit from the node's roster item, when it has one.
    void ClearRosterRole(std::uint32_t nodeId, std::uint32_t role);

public:
    // ---- State read by tests and the component's functions ----
    const CUserListManager& UserList() const { return m_UserList; }
    const CUsersGroupList& GroupList() const { return m_GroupList; }
    // A copy of the send-to menu model's entries.
    MenuStatusList Menu() const { return m_MenuStatus.ToList(); }
    const CChatContentStorage& ChatContent() const { return m_ChatContent; }
    ChatRecoveryMgr* RecoveryMgr() const { return m_pRecoveryMgr.get(); }
    IArmClient* ArmClient() const { return m_pArmClient; }
    ChatUIHandle ChatUI() const { return m_hChatUI; }
    int FileNeedSave() const { return m_bFileNeedSave; }
    int State() const { return m_nState; }
    int Enrolled() const { return m_bEnrolled; }
    std::uint32_t SessionValue() const { return m_dwSessionValue; }
    std::uint32_t MyUserID() const { return m_dwMyUserID; }
    std::uint32_t MyNodeID() const { return m_dwMyNodeID; }
    std::uint32_t MyRosters() const { return m_dwMyRosters; }
    const std::string& MyName() const { return m_strMyName; }
    const std::string& Reserved() const { return m_strReserved; }
    std::uint32_t UserExternalTag() const { return m_dwUserExternalTag; }
    int NeedRosterInfo() const { return m_bNeedRosterInfo; }
    int BroadcastRosterInfo() const { return m_bBroadcastRosterInfo; }
    int PrivilegeCountdown() const { return m_nPrivilegeCountdown; }
    int PrivilegePending() const { return m_bPrivilegePending; }
    int StartupTicks() const { return m_nStartupTicks; }
    bool TimerInstalled() const { return m_pTimer != 0; }
    std::uint32_t Features() const { return m_dwFeatures; }
    std::uint32_t Privilege() const { return m_dwPrivilege; }
    const NameHandle& ChatStatusCacheHandle() const { return m_ChatStatusCacheHandle; }
    const NameHandle& UserInfoCacheHandle() const { return m_UserInfoCacheHandle; }
    const NameHandle& CustomerCacheHandle() const { return m_CustomerCacheHandle; }

private:
    // True when the local participant has the panelist bit or is presenter or host.
    bool IsPrivileged() const;
    // True when the local participant is the host or the presenter (node ids alone).
    bool IsHostOrPresenter() const;
    // Sets or appends bytes to a cache through a memory handle; false when nothing was written.
    bool WriteToCache(std::uint32_t cacheHandle, tagCacheAction action, const std::string& bytes,
                      std::uint32_t flags);
    // The first group with a cache (not a separator) of that id, or null.
    CUsersGroup* FindCacheGroup(std::uint32_t groupId);

    // Sending (send.cpp).
    void SendTypedChat(bool bQM);
    // Index of the first selected menu entry, or -1.
    int SelectedMenuIndex() const;
    // Tells the window that the typed text is gone.
    void ClearSentInput();
    // True when the service took the message.
    bool SendGroupChat(const std::string& text, std::uint32_t groupId, bool bQM);
    bool SendPrivateChat(const std::string& text, std::uint32_t receiveId, bool bQM);

    // Receiving and showing (receive.cpp, show.cpp).
    // What a show operation knows of a sender; copied, so that a host call may change the roster.
    struct ChatSender {
        std::uint32_t dwSendID = 0;
        std::string strName;  // roster name, else the name the message carries
        bool bInRoster = false;
        std::uint32_t dwNodeID = 0;  // roster node id, else the send id
        std::uint32_t dwExternalTag = 0;
    };
    ChatSender FindChatSender(std::uint32_t sendId, const std::string& pduName) const;
    // The sender's tag mark, " (external)" and the like; empty outside the roster.
    std::string SenderTagSuffix(const ChatSender& sender) const;
    // One group delivery read from a cache: checked, shown and, live, copied. The result of
    // SharedDataReceivedEx.
    int OnGroupDelivery(std::uint32_t cacheId, std::uint32_t entityId, std::uint32_t memHandle,
                        std::uint32_t senderId, bool bLive);
    // Shows a title and text: sound, host notification, time, window and transcript, then
    // selects the sender as the next target where the meeting asks for it.
    void ShowChatLine(const std::string& title, const std::string& text, const ChatSender& sender,
                      bool bPrivate);

    // Engine fields, in the order the component has always kept them.
    std::uint32_t m_dwMyRosters = 0;  // own role bits (ChSetRosters)
    int m_nPrivilegeCountdown = 0;    // 0 idle; else counts ticks up to 10
    int m_bPrivilegePending = 0;      // from Initialize until the countdown fires
    int m_nStartupTicks = 0;          // 1..20 after Initialize, then 0
    bool m_bAudienceChosen = false;   // the user picked another send-to entry in the window
    int m_bEnrolled = 0;              // an enroll confirmation arrived
    int m_bRostersPending = 0;        // roles changed before enrolment
    int m_bInitCaches = 0;            // this participant initialises the caches
    NameHandle m_ChatStatusCacheHandle{};
    NameHandle m_UserInfoCacheHandle{};
    NameHandle m_CustomerCacheHandle{};
    int m_bSaveForReport = 0;
    std::uint32_t m_dwMyRole = 0;      // bit 0 presenter, bit 1 host, after the last change
    std::uint32_t m_dwPrevMyRole = 0;  // the same before it
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
    std::string m_strFilePath;  // transcript file; empty = never saved or opened
    int m_bFileNeedSave = 0;    // transcript modified flag
    PlaySoundMode m_nSoundMode = 0;
    FSRef m_SoundFile{};
    bool m_bFirstMessage = true;            // sound mode 2 plays for the first line only
    std::uint32_t m_dwPrivilege = 0x1004F;  // every flag set: all allowed until the host says
    std::uint32_t m_dwFeatures = 0;
    std::uint32_t m_dwNBRStatus = 1;
    std::uint32_t m_dwNBROption = 1;
    MenuModel m_MenuStatus;
    RunLoop* m_pTimerLoop = nullptr;  // the loop the tick timer runs on
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
