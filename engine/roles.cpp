// Host and presenter changes: who holds the roles, what the local participant held before
// and after, and the local participant's own role bits.
#include <cstdint>

#include "engine/chat_client.h"
#include "platform/func_trace.h"

namespace {

// Bits of m_dwMyRole and m_dwPrevMyRole.
constexpr std::uint32_t kMyRolePresenter = 0x1;
constexpr std::uint32_t kMyRoleHost = 0x2;

}  // namespace

void CChatClient::OnHostChanged(std::uint32_t hostId) {
    CFuncTrace trace("CChatClient::OnHostChanged, inHostID = %d", hostId);
    const bool wasHost = m_dwHostID == m_dwMyNodeID;
    const bool isHost = hostId == m_dwMyNodeID;
    m_dwPrevMyRole =
        (m_dwPresenterID == m_dwMyNodeID ? kMyRolePresenter : 0) | (wasHost ? kMyRoleHost : 0);
    m_dwMyRole = m_dwPrevMyRole;
    if (wasHost && !isHost) m_dwMyRole &= ~kMyRoleHost;

    m_dwPrevHostID = m_dwHostID;
    m_dwHostID = hostId;

    if (isHost) {
        m_dwMyRosters |= ROLE_HOST;
    } else {
        m_dwMyRosters &= ~ROLE_HOST;
    }
    if (isHost || m_dwPresenterID == m_dwMyNodeID) m_dwMyRosters |= ROLE_PANELIST;
}

void CChatClient::OnPresenterChanged(std::uint32_t presenterId) {
    CFuncTrace trace("CChatClient::OnPresenterChanged, inPresenterID -= %d", presenterId);
    const bool wasPresenter = m_dwPresenterID == m_dwMyNodeID;
    const bool isPresenter = presenterId == m_dwMyNodeID;
    m_dwPrevMyRole =
        (wasPresenter ? kMyRolePresenter : 0) | (m_dwHostID == m_dwMyNodeID ? kMyRoleHost : 0);
    m_dwMyRole = m_dwPrevMyRole;
    if (wasPresenter && !isPresenter) m_dwMyRole &= ~kMyRolePresenter;

    m_dwPrevPresenterID = m_dwPresenterID;
    m_dwPresenterID = presenterId;

    if (isPresenter) {
        m_dwMyRosters |= ROLE_PRESENTER;
    } else {
        m_dwMyRosters &= ~ROLE_PRESENTER;
    }
    if (isPresenter || m_dwHostID == m_dwMyNodeID) m_dwMyRosters |= ROLE_PANELIST;
}

void CChatClient::OnRosterChange(int) {
    // The menu of a privileged participant is not rebuilt from the groups yet; the roster
    // rules call in here so that the rebuild lands in one place.
}
