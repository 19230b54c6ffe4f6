// The bits of the privilege word the host hands the engine, each allowing one kind of
// audience, shared by the normal and the QM privilege rules.
#pragma once

#include <cstdint>

constexpr std::uint32_t kPrivilegeAttendees = 0x1;
constexpr std::uint32_t kPrivilegeHost = 0x2;
constexpr std::uint32_t kPrivilegePresenter = 0x4;
constexpr std::uint32_t kPrivilegePrivately = 0x8;
constexpr std::uint32_t kPrivilegePanelists = 0x40;
constexpr std::uint32_t kPrivilegeEveryone = 0x10000;
