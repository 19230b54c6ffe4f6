// The component's exported functions: each opens a scoped trace, checks the instance
// handle and forwards to one engine operation.
#include <cstdint>

#include "api/quintarachat.h"
#include "engine/chat_client.h"
#include "platform/func_trace.h"
#include "platform/run_loop.h"

namespace {

CChatClient* Engine(ChatHandle hComponent) {
    return static_cast<CChatClient*>(hComponent);
}

// The handle as the traces print it.
unsigned Hex(ChatHandle hComponent) {
    return static_cast<unsigned>(reinterpret_cast<std::uintptr_t>(hComponent));
}

}  // namespace

extern "C" {

ChatHandle ChNewInstance(void) {
    CFuncTrace trace("ChNewInstance");
    return new CChatClient;
}

int ChDeleteInstance(ChatHandle hComponent) {
    CFuncTrace trace("ChDeleteInstalnce, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return -1;
    // The window drops its references while the engine still exists.
    Engine(hComponent)->NotifyUI(msg_ClearChat);
    delete Engine(hComponent);
    return 0;
}

int ChInitialize(ChatHandle hComponent, const _tagChatData* pData) {
    CFuncTrace trace("Chinitlize, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent || !pData) return -1;
    if (!RunLoop::FindCurrent())
        MacWarnTrace2(kChatTag,
                      "ChInitialize: no run loop is current and no Qt application runs; the "
                      "component runs without its half-second tick");
    Engine(hComponent)->Initialize(*pData);
    return 0;
}

int ChSetRosterStatus(ChatHandle hComponent, uint32_t inNeedRosterInfo,
                      uint32_t inBroadcastRosterInfo) {
    CFuncTrace trace(
        "ChSetRosterStatus, hComponent = 0x%x, inNeedRosterInfo = %d, inBroadcastRosterInfo = %d",
        Hex(hComponent), inNeedRosterInfo, inBroadcastRosterInfo);
    if (!hComponent) return -1;
    Engine(hComponent)->SetRosterStatus(inNeedRosterInfo, inBroadcastRosterInfo);
    return 0;
}

int ChSetRosters(ChatHandle hComponent, uint32_t lRosters) {
    CFuncTrace trace("ChSetRosters, hComponent = 0x%x, lRosters = %d", Hex(hComponent), lRosters);
    if (!hComponent) return -1;
    Engine(hComponent)->SetRosters(lRosters, 0);
    return 0;
}

int ChSetPrivilege(ChatHandle hComponent, uint32_t inValue) {
    CFuncTrace trace("ChSetPrivilege, hComponent = 0x%x, inValue = %d", Hex(hComponent), inValue);
    if (!hComponent) return -1;
    Engine(hComponent)->OnPrivilegeChanged(inValue, 0);
    return 0;
}

int ChSetHost(ChatHandle hComponent, uint32_t inHostID) {
    CFuncTrace trace("ChSetHost, hComponent = 0x%x, inHostID =%d", Hex(hComponent), inHostID);
    if (!hComponent) return -1;
    Engine(hComponent)->OnHostChanged(inHostID);
    return 0;
}

int ChSetPresenter(ChatHandle hComponent, uint32_t inpresenterID) {
    CFuncTrace trace("ChSetPresenter, hComponent = 0x%x, inpresenterID= %d", Hex(hComponent),
                     inpresenterID);
    if (!hComponent) return -1;
    Engine(hComponent)->OnPresenterChanged(inpresenterID);
    return 0;
}

int ChSetBeforeHostStatus(ChatHandle hComponent, int inStatus) {
    CFuncTrace trace("ChSetBeforeHostStatus, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return -1;
    Engine(hComponent)->OnBeforeHostChange(inStatus);
    return 0;
}

int ChSetPanelStatus(ChatHandle hComponent, uint32_t inStatus) {
    CFuncTrace trace("ChSetPanelStatus, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return -1;
    Engine(hComponent)->SetPanelStatus(inStatus);
    return 0;
}

int ChSetPracticeStatus(ChatHandle hComponent, signed char inStatus) {
    CFuncTrace trace("ChSetPracticeStatus, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return -1;
    Engine(hComponent)->SetPracticeStatus(inStatus);
    return 0;
}

int ChAddGroup(ChatHandle hComponent, _tagChatGroupInfo* pGroupInfo) {
    CFuncTrace trace("ChAddGroup, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return -1;
    Engine(hComponent)->AddGroup(pGroupInfo, 1);
    return 0;
}

int ChSelectUserByNodeId(ChatHandle hComponent, uint32_t dwNodeID) {
    CFuncTrace trace("ChSelectuserByNodeId, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return -1;
    CChatClient* engine = Engine(hComponent);
    engine->NotifyUI(msg_CloseAttendeeDialog);
    engine->SelectUserByNodeID(dwNodeID, false, true);
    engine->NotifyUI(msg_FocusInput);
    return 0;
}

int ChCanChatWith(ChatHandle hComponent, uint32_t dwNodeID, signed char bMenuOnly) {
    if (!hComponent) return 0;
    return Engine(hComponent)->CanChatWith(dwNodeID, bMenuOnly != 0) ? 1 : 0;
}

int ChSwitchTarget(ChatHandle hComponent) {
    CFuncTrace trace("ChSwitchTarget, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return -1;
    Engine(hComponent)->NotifyUI(msg_FocusInput);
    return 0;
}

int ChCloseAllDlg(ChatHandle hComponent) {
    CFuncTrace trace("ChCloseAllDlg, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return -1;
    Engine(hComponent)->CloseAllDlg();
    return 0;
}

int ChFileOpen(ChatHandle hComponent) {
    CFuncTrace trace("ChFileOpen, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return -1;
    Engine(hComponent)->PopChatFileOpenDialog();
    return 0;
}

int ChFileSave(ChatHandle hComponent) {
    CFuncTrace trace("ChFileSave, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return -1;
    Engine(hComponent)->SaveChatFile(1);
    return 0;
}

int ChFileSaveAs(ChatHandle hComponent) {
    CFuncTrace trace("ChFileSaveAs, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return -1;
    Engine(hComponent)->SaveAsChatFile();
    return 0;
}

int ChSaveFileToFolder(ChatHandle hComponent, const char* lpszFolder) {
    CFuncTrace trace("ChSaveFileToFolder, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent || !lpszFolder) return -1;
    return Engine(hComponent)->SaveFileToFolder(lpszFolder);
}

int ChGetFileSaveState(ChatHandle hComponent) {
    CFuncTrace trace("ChGetFileSaveState, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return 0;
    return Engine(hComponent)->IsChatHaveContent() ? 1 : 0;
}

int ChHasContent(ChatHandle hComponent) {
    CFuncTrace trace("ChHasContent, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return 0;
    return Engine(hComponent)->IsChatHaveContent() ? 1 : 0;
}

int ChIsModified(ChatHandle hComponent) {
    CFuncTrace trace("ChIsModified, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return 0;
    return Engine(hComponent)->FileNeedSave();
}

int ChSetSoundMode(ChatHandle hComponent, long inBSoundWork) {
    CFuncTrace trace("ChSetSoundMode, hComponent = 0x%x,inBSoundWork = %d", Hex(hComponent),
                     static_cast<int>(inBSoundWork));
    if (!hComponent) return -1;
    Engine(hComponent)->SetSoundIncomingChat(static_cast<PlaySoundMode>(inBSoundWork));
    return 0;
}

int ChSetSoundFile(ChatHandle hComponent, FSRef inSoundFile) {
    CFuncTrace trace("ChSetSoundFile, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return -1;
    Engine(hComponent)->SetSoundFSSpec(inSoundFile);
    return 0;
}

int ChSelectFeature(ChatHandle hComponent, uint32_t dwFeatures, uint32_t dwReserved1,
                    long lReserved2, long lReserved3, uint32_t dwReserved4, char* lpszReserved5) {
    CFuncTrace trace("ChSelectFeature, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return -1;
    return Engine(hComponent)
        ->SelectFeature(dwFeatures, dwReserved1, lReserved2, lReserved3, dwReserved4,
                        lpszReserved5);
}

int SetNBR2Status(ChatHandle hComponent, uint32_t dwStatus, uint32_t dwOption,
                  uint32_t dwReserved) {
    CFuncTrace trace(
        "SetNBR2Status, hComponent = 0x%x, dwStatus = %d, dwOption = %d, "
        "dwReserved = %d ",
        Hex(hComponent), dwStatus, dwOption, dwReserved);
    if (!hComponent) return -1;
    return Engine(hComponent)->SetNBRStatus(dwStatus, dwOption, dwReserved);
}

int ChSetConfig(ChatHandle hComponent, uint32_t dwConfigType, const char* lpszXml) {
    CFuncTrace trace("ChSetConfig, hComponent = 0x%x", Hex(hComponent));
    if (!hComponent) return -1;
    return Engine(hComponent)->SetConfig(dwConfigType, lpszXml);
}

int ChAllowUserInput(ChatHandle, int) {
    return 0;
}

int ChShowUserList(ChatHandle, int) {
    return 0;
}

}  // extern "C"
