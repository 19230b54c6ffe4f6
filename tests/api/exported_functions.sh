#!/usr/bin/env bash
# The shared library exports exactly the functions listed here: a function added to the
# component without being listed, or dropped from it, fails this test.
# Usage: exported_functions.sh LIBRARY
set -euo pipefail

# One exported function per line. A new exported function is added here, in any order.
expected="
ChNewInstance
ChDeleteInstance
ChInitialize
ChSetRosterStatus
ChSetRosters
ChSetPrivilege
ChSetHost
ChSetPresenter
ChSetBeforeHostStatus
ChSetPanelStatus
ChSetPracticeStatus
ChAddGroup
ChSelectUserByNodeId
ChCanChatWith
ChSwitchTarget
ChCloseAllDlg
ChFileOpen
ChFileSave
ChFileSaveAs
ChSaveFileToFolder
ChGetFileSaveState
ChHasContent
ChIsModified
ChSetSoundMode
ChSetSoundFile
ChSelectFeature
SetNBR2Status
ChSetConfig
ChAllowUserInput
ChShowUserList
"

listed=$(echo "$expected" | sed '/^$/d' | sort)
exported=$(nm -D --defined-only "$1" | awk '{print $3}' | sort)
if [ "$listed" != "$exported" ]; then
    echo "exported functions differ from the list (< listed, > exported):"
    diff <(echo "$listed") <(echo "$exported") || true
    exit 1
fi
echo "$(echo "$exported" | wc -l) functions exported, as listed"
