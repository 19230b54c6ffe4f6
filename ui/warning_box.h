// The host's modal warning window in a Qt host: a message box with the warning's title and
// text, and a way to close the one that is showing.
#pragma once

// Makes ShowWarningWindow2 run a modal message box and CloseWarningWindow2 close it.
void InstallQtWarningBox();
