// The protocol between the chat engine and its window: numbered commands the engine sends
// (engine to window) and numbered events the window raises (window to engine).
#pragma once

#include <cstdint>
#include <string>

// Engine to window: NotifyCocoaUI (window, command, inParam, outParam).
// Unless noted, a slot points at a value owned by the caller for the duration of the call.
enum ChatUICommand : int {
    msg_ClearChat = 1000,                    // -, -
    msg_FocusInput = 2000,                   // -, -
    msg_ShowChat = 2100,                     // -, -
    msg_SendDone = 2101,                     // -, -
    msg_AllowUserInput = 2103,               // int32_t* allow, -
    msg_HideUserList = 2104,                 // int8_t* hide, -
    msg_ShowText = 2200,                     // const char* body (UTF-8), -
    msg_ShowTitle = 2201,                    // const char* title (UTF-8), -
    msg_InsertMenuItem = 2301,               // MenuStatus*, int32_t* position or null (append)
    msg_RemoveMenuItem = 2302,               // int32_t* index, -
    msg_SelectedUserLeft = 2303,             // int32_t* index, -
    msg_RenameMenuItem = 2304,               // std::string* title, index by value
    msg_SelectMenuItem = 2305,               // int32_t* index, -
    msg_SelectMenuItemAndAllowInput = 2306,  // int32_t* index, -
    msg_UpdateMenuItem = 2307,               // MenuStatus*, index by value
    msg_EnableUserList = 2308,               // -, -
    msg_DisableUserList = 2309,              // -, -
    msg_NoSendToItems = 2310,                // -, -
    msg_RebuildMenu = 2400,                  // std::vector<MenuStatus>*, -
    msg_PanelStatusChanged = 2401,           // -, -
    msg_CloseAllDialogs = 2402,              // -, -
    msg_GetInputText = 2500,                 // std::string* receives the text, -
    msg_ClearInput = 2501,                   // -, -
    msg_SaveChatPanel = 2600,                // int32_t* out: confirmed; std::string* path
    msg_OpenChatPanel = 2601,                // int32_t* out: confirmed; std::string* path
    msg_WriteTextFile = 2602,                // const char* path, const char* content
    msg_ReadTextFile = 2603,                 // const char* path, std::string* content
    msg_AddAttendee = 2604,                  // AttendeeRecord*, -
    msg_CloseAttendeeDialog = 2605,          // -, -
    msg_CloseAttendeeWarning = 2606,         // -, int32_t* out: warning still showing
};

// Window to engine: IChatCommSinkForChatUI::HandleUIMessage (message, iParam, oParam).
enum ChatUIEvent : int {
    msg_SendChat = 5000,          // -, -
    msg_SelectionChanged = 5001,  // int32_t* selected index (-1 while a selected user has left)
    msg_ShowAttendeeList = 5002,  // int32_t* dialog created by this call
    msg_AttendeeSelected = 5003,  // uint32_t* node id, 0 for none
};

// The payload of msg_AddAttendee: one attendee the picker may list.
struct AttendeeRecord {
    std::string strName;
    std::uint32_t dwNodeID;
};

// Returns the protocol name of a command or event id ("msg_ShowText"), or null.
const char* ChatUIMessageName(int id);
