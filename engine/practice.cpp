// Practice session and panelists: the host's practice switch and panel status.
#include <cstdint>

#include "engine/chat_client.h"

namespace {

// Panel states that close the attendee picker.
constexpr std::uint32_t kPanelStatusClosesPickerA = 32;
constexpr std::uint32_t kPanelStatusClosesPickerB = 64;

}  // namespace

void CChatClient::SetPracticeStatus(std::int8_t value) {
    if (value == m_bPractice) return;
    m_bPractice = value;
}

void CChatClient::SetPanelStatus(std::uint32_t status) {
    m_dwPanelStatus = status;
    if (status != 0) NotifyUI(msg_PanelStatusChanged);
    if (status == kPanelStatusClosesPickerA || status == kPanelStatusClosesPickerB)
        CloseSeltAttDlg();
}
