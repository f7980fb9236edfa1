// Helpers shared by the window classes of the MFC subset (win_*.cpp, ctl_*.cpp,
// dlg_*.cpp).
#pragma once

#include "afxwin.h"

#include <commctrl.h>
#include <commdlg.h>

namespace qownd {

// The common controls and the common dialogs, loaded on first use instead of
// with the program. Wine's comctl32 registers its window classes as it is
// loaded, and that starts the desktop process: a quarter of a second and an X
// display, which a program that makes no window (a batch run) never needs.
// The common-dialog library loads the common controls itself.
struct CommonControls {
    decltype(&::ImageList_Create) ImageListCreate = nullptr;
    decltype(&::ImageList_Destroy) ImageListDestroy = nullptr;
    decltype(&::ImageList_GetImageCount) ImageListGetImageCount = nullptr;
    decltype(&::ImageList_ReplaceIcon) ImageListReplaceIcon = nullptr;
};
struct CommonDialogs {
    decltype(&::GetOpenFileNameA) GetOpenFileName = nullptr;
    decltype(&::GetSaveFileNameA) GetSaveFileName = nullptr;
};

// Loads the common controls once and registers their window classes (for
// the windows and dialogs made afterwards). A function that could not be
// found stays null; on Windows and Wine every one is there.
const CommonControls& ComCtl();
const CommonDialogs& ComDlg();

} // namespace qownd
