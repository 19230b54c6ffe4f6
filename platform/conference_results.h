// Result codes with which the in-process conference refuses a request. They never collide
// with the codes the component reacts to (0, 19, 1201, 1202, 1215).
#pragma once

constexpr short kArmInvalidArgument = 1100;   // null pointer, bad count or unknown option
constexpr short kArmNotConnected = 1101;      // ConferenceJoin before Connect
constexpr short kArmNotJoined = 1102;         // ApeAttach or ConferenceLeave outside a conference
constexpr short kArmBadApeHandle = 1103;      // the ape handle is not this object's attached one
constexpr short kArmUnknownHandle = 1104;     // memory or cache handle never given out, or freed
constexpr short kArmUnknownUser = 1105;       // ApeSendData to a user id nobody holds
constexpr short kArmTooLarge = 1106;          // block or payload above kArmMaxDataLength
constexpr short kArmNoSuchConference = 1107;  // a conference id other than the conference's own
constexpr short kArmOutOfRange = 1108;        // memory offset past the end of the block

// Largest memory block, payload or enroll info the conference accepts.
constexpr unsigned kArmMaxDataLength = 16u << 20;
