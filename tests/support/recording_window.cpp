#include "tests/support/recording_window.h"

#include "api/ui_protocol.h"

namespace {
std::int32_t IndexAt(void* param) {
    return param ? *static_cast<std::int32_t*>(param) : -2;
}
}  // namespace

void RecordingWindow::SetSink(IChatCommSinkForChatUI* sink) {
    m_pSink = sink;
    // A real window reports its selection as soon as it has a sink, before any menu exists.
    if (sink) ReportSelection(m_selectedIndex);
}

void RecordingWindow::ReportSelection(std::int32_t index) {
    if (!m_bAnswerBack || !m_pSink) return;
    RecordedCommand rec;
    rec.id = msg_SelectionChanged;
    rec.name = ChatUIMessageName(msg_SelectionChanged);
    rec.index = index;
    m_commands.push_back(rec);
    m_pSink->HandleUIMessage(msg_SelectionChanged, &index, nullptr);
}

int RecordingWindow::HandleCommand(int command, void* inParam, void* outParam) {
    RecordedCommand rec;
    rec.id = command;
    const char* name = ChatUIMessageName(command);
    rec.name = name ? name : "";
    switch (command) {
        case msg_AllowUserInput:
        case msg_RemoveMenuItem:
        case msg_SelectedUserLeft:
        case msg_SelectMenuItem:
        case msg_SelectMenuItemAndAllowInput:
            rec.index = IndexAt(inParam);
            break;
        case msg_ShowText:
        case msg_ShowTitle:
            if (inParam) rec.text = static_cast<const char*>(inParam);
            break;
        case msg_InsertMenuItem:
            if (inParam) rec.entry = *static_cast<MenuStatus*>(inParam);
            rec.index = outParam ? *static_cast<std::int32_t*>(outParam) : -1;
            break;
        case msg_RenameMenuItem:
            if (inParam) rec.text = *static_cast<std::string*>(inParam);
            rec.index = static_cast<std::int32_t>(reinterpret_cast<std::intptr_t>(outParam));
            break;
        case msg_UpdateMenuItem:
            if (inParam) rec.entry = *static_cast<MenuStatus*>(inParam);
            rec.index = static_cast<std::int32_t>(reinterpret_cast<std::intptr_t>(outParam));
            break;
        case msg_RebuildMenu:
            if (inParam) rec.menu = *static_cast<MenuStatusList*>(inParam);
            break;
        case msg_GetInputText:
            if (inParam) *static_cast<std::string*>(inParam) = inputText;
            break;
        case msg_SaveChatPanel:
        case msg_OpenChatPanel:
            if (inParam) *static_cast<std::int32_t*>(inParam) = dialogConfirmed;
            if (outParam && dialogConfirmed) *static_cast<std::string*>(outParam) = dialogPath;
            break;
        case msg_AddAttendee:
            if (inParam) rec.attendee = *static_cast<AttendeeRecord*>(inParam);
            break;
        case msg_CloseAttendeeWarning:
            if (outParam) *static_cast<std::int32_t*>(outParam) = warningShowing;
            break;
        default:
            break;
    }
    m_commands.push_back(rec);
    // The selection reports a real window sends from inside these commands.
    if (command == msg_SelectedUserLeft) {
        m_bSelectedUserLeft = true;
        ReportSelection(-1);
    } else if (command == msg_SelectMenuItem && m_bSelectedUserLeft) {
        ReportSelection(-1);
    } else if ((command == msg_SelectMenuItem || command == msg_SelectMenuItemAndAllowInput) &&
               (rec.index != m_selectedIndex || m_bSelectedUserLeft)) {
        m_selectedIndex = rec.index;
        m_bSelectedUserLeft = false;
        ReportSelection(rec.index);
    }
    return 0;
}

std::vector<int> RecordingWindow::IdsSince(std::size_t first) const {
    std::vector<int> ids;
    for (std::size_t i = first; i < m_commands.size(); ++i)
        ids.push_back(m_commands[i].id);
    return ids;
}
