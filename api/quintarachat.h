/* Quintara Chat: the public interface of the chat component.
 * A host creates one instance per conference with ChNewInstance, starts it with
 * ChInitialize and drives it through the other Ch* functions until ChDeleteInstance. */
#ifndef QUINTARACHAT_H
#define QUINTARACHAT_H

#include <stdint.h>

#if defined(__GNUC__)
#define QC_EXPORT __attribute__((visibility("default")))
#else
#define QC_EXPORT
#endif

#ifdef __cplusplus
class IArmClient;

/* The host's notification object; the component calls it on the host's main thread. */
class IHostChatSink {
public:
    /* A line was shown: the sender's display text, the message and the sender's node id. */
    virtual void OnIncomingChat(const char* sender, const char* message, uint32_t nodeId) = 0;
    /* Directly after OnIncomingChat. */
    virtual void OnChatShown() = 0;
    /* The transcript's modified flag changed to bModified. */
    virtual void OnChatModified(bool bModified) = 0;
    /* The transcript gained content (true) or was reset (false). */
    virtual void OnChatContentChanged(bool bChanged) = 0;

protected:
    ~IHostChatSink() = default;
};

typedef void* ChatHandle;
#else
/* A C host sees the service, the notification object and the instance only by pointer; it
 * has no way to implement the notification object and passes a null one. */
typedef struct IArmClient IArmClient;
typedef struct IHostChatSink IHostChatSink;
typedef struct ChatInstance* ChatHandle;
#endif

/* The start-up record ChInitialize copies. */
typedef struct _tagChatData {
    IHostChatSink* pHostSink; /* notifications; may be null */
    void* hParentView;        /* the host view the chat window lives in */
    IArmClient* pArmClient;   /* the conference service; a second ChInitialize keeps the first */
    uint16_t wConferenceID;
    uint32_t dwSessionID;     /* the chat application session */
    const char* lpszUserName; /* the local participant's display name; may be null */
    const char* lpszReserved; /* may be null */
    uint32_t dwNodeID;        /* the local participant's conference node id */
    uint32_t dwReserved;
    int32_t lMeetingType;         /* 1, 2 or 3 */
    uint8_t bUseAttendeeSelector; /* non-zero: attendees are picked through the attendee picker */
    int32_t lExternalTagMode;     /* 0 off, 1 mark internal users, 2 mark external users */
    uint32_t dwUserExternalTag;   /* taken only when lExternalTagMode is not 0 */
} ChatData;

/* A send-to group the host adds with ChAddGroup. */
typedef struct _tagChatGroupInfo {
    uint32_t dwIndex;     /* position in the group list and the send-to menu */
    uint32_t dwGroupType; /* 1 role group, 2 separator, 3 id group */
    uint32_t dwGroupId;   /* role mask; 0 for a separator */
    const char* cszGroupName;
    uint8_t bFlag1;
    uint8_t bFlag2;
    uint8_t bFlag3;
    uint32_t dwValue1;
    uint32_t dwValue2;
} ChatGroupInfo;

/* A file reference: on this platform simply the file's path. */
typedef struct FSRef {
    char path[1024]; /* NUL-terminated; empty = no file */
} FSRef;

#ifdef __cplusplus
extern "C" {
#endif

QC_EXPORT ChatHandle ChNewInstance(void);
QC_EXPORT int ChDeleteInstance(ChatHandle hComponent);
QC_EXPORT int ChInitialize(ChatHandle hComponent, const ChatData* pData);
QC_EXPORT int ChSetRosterStatus(ChatHandle hComponent, uint32_t inNeedRosterInfo,
                                uint32_t inBroadcastRosterInfo);
QC_EXPORT int ChSetRosters(ChatHandle hComponent, uint32_t lRosters);
QC_EXPORT int ChSetPrivilege(ChatHandle hComponent, uint32_t inValue);
QC_EXPORT int ChSetHost(ChatHandle hComponent, uint32_t inHostID);
QC_EXPORT int ChSetPresenter(ChatHandle hComponent, uint32_t inpresenterID);
QC_EXPORT int ChSetBeforeHostStatus(ChatHandle hComponent, int inStatus);
QC_EXPORT int ChSetPanelStatus(ChatHandle hComponent, uint32_t inStatus);
QC_EXPORT int ChSetPracticeStatus(ChatHandle hComponent, signed char inStatus);
QC_EXPORT int ChAddGroup(ChatHandle hComponent, ChatGroupInfo* pGroupInfo);
QC_EXPORT int ChSelectUserByNodeId(ChatHandle hComponent, uint32_t dwNodeID);
QC_EXPORT int ChCanChatWith(ChatHandle hComponent, uint32_t dwNodeID, signed char bMenuOnly);
QC_EXPORT int ChSwitchTarget(ChatHandle hComponent);
QC_EXPORT int ChCloseAllDlg(ChatHandle hComponent);
QC_EXPORT int ChFileOpen(ChatHandle hComponent);
QC_EXPORT int ChFileSave(ChatHandle hComponent);
QC_EXPORT int ChFileSaveAs(ChatHandle hComponent);
QC_EXPORT int ChSaveFileToFolder(ChatHandle hComponent, const char* lpszFolder);
QC_EXPORT int ChGetFileSaveState(ChatHandle hComponent);
QC_EXPORT int ChHasContent(ChatHandle hComponent);
QC_EXPORT int ChIsModified(ChatHandle hComponent);
QC_EXPORT int ChSetSoundMode(ChatHandle hComponent, long inBSoundWork);
QC_EXPORT int ChSetSoundFile(ChatHandle hComponent, FSRef inSoundFile);
QC_EXPORT int ChSelectFeature(ChatHandle hComponent, uint32_t dwFeatures, uint32_t dwReserved1,
                              long lReserved2, long lReserved3, uint32_t dwReserved4,
                              char* lpszReserved5);
QC_EXPORT int SetNBR2Status(ChatHandle hComponent, uint32_t dwStatus, uint32_t dwOption,
                            uint32_t dwReserved);
QC_EXPORT int ChSetConfig(ChatHandle hComponent, uint32_t dwConfigType, const char* lpszXml);
QC_EXPORT int ChAllowUserInput(ChatHandle hComponent, int bAllow);
QC_EXPORT int ChShowUserList(ChatHandle hComponent, int bShow);

#ifdef __cplusplus
} /* extern "C" */
#endif

#endif /* QUINTARACHAT_H */
