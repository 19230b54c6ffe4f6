// Result codes with which the networked conference answers when the server cannot help. Like
// the in-process refusals they never collide with the codes the component reacts to, so a
// ConnectConfirm carrying one of them is final.
#pragma once

constexpr short kArmServerUnreachable = 1120;  // no server address could be connected to
constexpr short kArmServerRefused = 1121;      // the server refused or did not answer in time
constexpr short kArmUserIdTaken = 1122;        // another user name holds the same user id
