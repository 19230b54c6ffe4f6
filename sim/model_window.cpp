#include "sim/model_window.h"

#include <cstdint>

#include "engine/menu_status.h"
#include "platform/string_table.h"

namespace {

std::string Placeholder() {
    return GetLocalizedString("--- Please Select ---");
}

std::string SelectAttendeeTitle() {
    return GetLocalizedString("Select an Attendee...");
}

// Line breaks as the engine expects typed text: every LF and CR a CR, runs of two merged.
std::string NormaliseLineBreaks(const std::string& text) {
    std::string out;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool brk = text[i] == '\n' || text[i] == '\r';
        if (!brk) {
            out.push_back(text[i]);
            continue;
        }
        out.push_back('\r');
        if (i + 1 < text.size() && (text[i + 1] == '\n' || text[i + 1] == '\r')) ++i;
    }
    return out;
}

}  // namespace

int ModelWindow::HandleCommand(int command, void* inParam, void* outParam) {
    const auto index = [inParam] { return inParam ? *static_cast<std::int32_t*>(inParam) : -1; };
    switch (command) {
        case msg_ClearChat:
            m_strInput.clear();
            m_transcript.clear();
            break;
        case msg_AllowUserInput:
            m_bInputEnabled = !m_bSelectedUserLeft && (index() & 0xFF) != 0;
            break;
        case msg_ShowText:
        case msg_ShowTitle:
            if (inParam) m_transcript.emplace_back(static_cast<const char*>(inParam));
            break;
        case msg_InsertMenuItem: {
            const auto* entry = static_cast<const MenuStatus*>(inParam);
            if (!entry) break;
            RemovePlaceholder();
            int position = outParam ? *static_cast<std::int32_t*>(outParam) : -1;
            if (position < 0 || position > Count()) position = Count();
            Item item;
            item.shown.separator = entry->bSeparator;
            item.shown.title = entry->bSeparator ? "" : entry->strTitle;
            item.shown.enabled = entry->bEnabled;
            item.group = entry->nGroupID != -1;
            m_items.insert(m_items.begin() + position, item);
            if (m_nSelected >= position) ++m_nSelected;
            if (m_bSelectedUserLeft) AppendPlaceholder();
            break;
        }
        case msg_RemoveMenuItem:
            RemoveAt(index());
            break;
        case msg_SelectedUserLeft:
            RemovePlaceholder();
            RemoveAt(index());
            m_bSelectedUserLeft = true;
            AppendPlaceholder();
            m_nSelected = Count() - 1;
            m_bInputEnabled = false;
            ReportSelection();
            break;
        case msg_RenameMenuItem: {
            const int at = static_cast<int>(reinterpret_cast<std::intptr_t>(outParam));
            const auto* title = static_cast<const std::string*>(inParam);
            if (title && at >= 0 && at < Count() && !m_items[at].shown.separator &&
                !m_bSelectedUserLeft)
                m_items[at].shown.title = *title;
            break;
        }
        case msg_SelectMenuItem:
            if (m_bSelectedUserLeft) {
                ReportSelection();
            } else if (index() >= 0 && index() < Count() && index() != m_nSelected) {
                m_nSelected = index();
                ReportSelection();
            }
            break;
        case msg_SelectMenuItemAndAllowInput: {
            const bool hadPlaceholder = m_bSelectedUserLeft;
            RemovePlaceholder();
            if (index() >= 0 && index() < Count() && (index() != m_nSelected || hadPlaceholder)) {
                m_bSelectedUserLeft = false;
                m_nSelected = index();
                ReportSelection();
                m_bInputEnabled = true;
            } else if (m_bSelectedUserLeft) {
                AppendPlaceholder();
            }
            break;
        }
        case msg_UpdateMenuItem: {
            const auto* entry = static_cast<const MenuStatus*>(inParam);
            const int at = static_cast<int>(reinterpret_cast<std::intptr_t>(outParam));
            if (entry && at >= 0 && at < Count() && !m_items[at].shown.separator &&
                !m_bSelectedUserLeft)
                m_items[at].shown.enabled = entry->bEnabled;
            break;
        }
        case msg_EnableUserList:
            m_bPopupEnabled = true;
            break;
        case msg_DisableUserList:
            m_bPopupEnabled = false;
            break;
        case msg_NoSendToItems:
            m_bNoSendTo = true;
            break;
        case msg_RebuildMenu: {
            const auto* menu = static_cast<const MenuStatusList*>(inParam);
            m_items.clear();
            m_nSelected = -1;
            if (!menu) break;
            for (const MenuStatus& entry : *menu) {
                Item item;
                item.shown.separator = entry.bSeparator && entry.strTitle.empty();
                item.shown.title = entry.strTitle;
                item.shown.enabled = entry.bEnabled;
                item.group = entry.nGroupID != -1;
                m_items.push_back(item);
            }
            break;
        }
        case msg_GetInputText:
            if (inParam) *static_cast<std::string*>(inParam) = NormaliseLineBreaks(m_strInput);
            break;
        case msg_ClearInput:
            m_strInput.clear();
            break;
        case msg_SaveChatPanel:
        case msg_OpenChatPanel: {
            std::string path;
            const bool confirmed = m_answer && m_answer(command == msg_SaveChatPanel, &path);
            if (inParam) *static_cast<std::int32_t*>(inParam) = confirmed ? 1 : 0;
            if (confirmed && outParam) *static_cast<std::string*>(outParam) = path;
            break;
        }
        case msg_AddAttendee:
            if (inParam && m_bPickerOpen)
                m_attendees.push_back(*static_cast<const AttendeeRecord*>(inParam));
            break;
        case msg_CloseAttendeeDialog:
            CloseAttendeePicker();
            break;
        case msg_CloseAttendeeWarning:
            if (outParam) *static_cast<std::int32_t*>(outParam) = 0;
            break;
        default:
            break;
    }
    return 0;
}

std::vector<PopupItem> ModelWindow::Popup() const {
    std::vector<PopupItem> popup;
    for (int i = 0; i < Count(); ++i) {
        PopupItem item = m_items[i].shown;
        item.selected = i == m_nSelected;
        popup.push_back(item);
    }
    return popup;
}

bool ModelWindow::TypeAndSend(const std::string& text) {
    if (!m_bInputEnabled) return false;
    m_strInput = text;
    if (m_nSelected >= 0 && m_nSelected < Count() &&
        m_items[m_nSelected].shown.title == SelectAttendeeTitle())
        return true;  // the attendee item is no audience: the send action does nothing
    Send(msg_SendChat, nullptr);
    return true;
}

bool ModelWindow::Choose(int index) {
    if (!m_bPopupEnabled || m_bNoSendTo || index < 0 || index >= Count()) return false;
    const PopupItem& item = m_items[index].shown;
    if (item.separator || !item.enabled || item.placeholder) return false;
    if (item.title == SelectAttendeeTitle()) {
        m_nSelected = index;
        m_bPickerOpen = true;
        m_attendees.clear();
        std::int32_t created = 1;
        Send(msg_ShowAttendeeList, &created);
        return true;
    }
    RemovePlaceholder();
    m_bSelectedUserLeft = false;
    m_nSelected = index;
    m_bInputEnabled = true;
    ReportSelection();
    return true;
}

bool ModelWindow::PickAttendee(const std::string& name) {
    int entry = -1;
    for (int i = 0; i < Count(); ++i)
        if (m_items[i].shown.title == SelectAttendeeTitle()) entry = i;
    if (entry < 0 || !Choose(entry)) return false;
    for (const AttendeeRecord& attendee : m_attendees) {
        if (attendee.strName != name) continue;
        std::uint32_t node = attendee.dwNodeID;
        Send(msg_AttendeeSelected, &node);
        CloseAttendeePicker();
        return true;
    }
    CloseAttendeePicker();
    return false;
}

void ModelWindow::CloseAttendeePicker() {
    if (!m_bPickerOpen) return;
    m_bPickerOpen = false;
    m_attendees.clear();
    std::uint32_t none = 0;
    Send(msg_AttendeeSelected, &none);
}

void ModelWindow::ReportSelection() {
    std::int32_t index = m_bNoSendTo ? 0 : (m_bSelectedUserLeft ? -1 : m_nSelected);
    Send(msg_SelectionChanged, &index);
}

void ModelWindow::RemoveAt(int index) {
    if (index < 0 || index >= Count()) return;
    m_items.erase(m_items.begin() + index);
    if (m_nSelected == index) {
        m_nSelected = -1;
    } else if (m_nSelected > index) {
        --m_nSelected;
    }
}

void ModelWindow::RemovePlaceholder() {
    for (int i = Count() - 1; i >= 0; --i)
        if (m_items[i].shown.placeholder) RemoveAt(i);
}

void ModelWindow::AppendPlaceholder() {
    Item item;
    item.shown.title = Placeholder();
    item.shown.placeholder = true;
    m_items.push_back(item);
    m_nSelected = Count() - 1;
}

void ModelWindow::Send(int message, void* param) {
    if (m_pSink) m_pSink->HandleUIMessage(message, param, nullptr);
}
