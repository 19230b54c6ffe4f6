// Privilege and role policy: the host's privilege word and the flags split from it, which
// decide the audiences an attendee may choose. Hosts and presenters are never restricted.
#include <cstdint>

#include "engine/chat_client.h"
#include "platform/func_trace.h"

namespace {

// Bits of the privilege word.
constexpr std::uint32_t kPrivilegeAttendees = 0x1;
constexpr std::uint32_t kPrivilegeHost = 0x2;
constexpr std::uint32_t kPrivilegePresenter = 0x4;
constexpr std::uint32_t kPrivilegePrivately = 0x8;
constexpr std::uint32_t kPrivilegePanelists = 0x40;
constexpr std::uint32_t kPrivilegeEveryone = 0x10000;

}  // namespace

void CChatClient::OnPrivilegeChanged(std::uint32_t privilege, int bForce) {
    if (m_bQMMode) {
        OnPrivilegeChangedInQM(privilege, bForce);
        return;
    }
    CFuncTrace trace("CChatClient::OnPrivilegeChanged , in_dwPrivilege = %d", privilege);
    StorePrivilege(privilege, false);
}

void CChatClient::OnPrivilegeChangedInQM(std::uint32_t privilege, int bForce) {
    CFuncTrace trace("CChatClient::OnPrivilegeChanged , in_dwPrivilege = %d, bDefault = %d",
                     privilege, bForce);
    StorePrivilege(privilege, true);
}

void CChatClient::OnBeforeHostChange(int) {
    OnPrivilegeChanged(m_dwPrivilege, 0);
}

void CChatClient::StorePrivilege(std::uint32_t privilege, bool bWithEveryone) {
    m_dwPrivilege = privilege;
    m_bChatAttendees = (privilege & kPrivilegeAttendees) != 0;
    m_bChatHost = (privilege & kPrivilegeHost) != 0;
    m_bChatPresenter = (privilege & kPrivilegePresenter) != 0;
    m_bChatPrivately = (privilege & kPrivilegePrivately) != 0;
    m_bChatPanelists = (privilege & kPrivilegePanelists) != 0;
    if (bWithEveryone) m_bChatEveryone = (privilege & kPrivilegeEveryone) != 0;
}
