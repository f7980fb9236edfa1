// CQoMfcHelper - static helpers around the Windows shell: delete a file or a
// folder to the recycle bin, copy a file with the shell's progress display,
// and show the system text of a Win32 error code.
//
// Paths are handed to the shell in fixed buffers of MAX_SHELL_PATH characters;
// a longer path is refused (the operation answers false) rather than cut.
#pragma once

#include <afxwin.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CQoMfcHelper
{
public:
    enum { MAX_SHELL_PATH = 512 };

    CQoMfcHelper();
    CQoMfcHelper(const CQoMfcHelper&);
    CQoMfcHelper& operator=(const CQoMfcHelper&);
    virtual ~CQoMfcHelper();

    // Deletes a file or a directory with its contents to the recycle bin and
    // logs it. The shell's progress and error displays stay on; with noConfirm
    // it does not ask. True when the shell succeeded and the user did not abort.
    static bool RemoveDirectoryA(const CString& path, bool noConfirm);
    // The same operation under a second name.
    static bool RemoveFile(const CString& path, bool noConfirm);

    // Copies source to target (target names the copy, an existing one is
    // replaced). True on success, and when there is nothing to do: an empty
    // source or target, or equal paths (compared case-sensitively). Without
    // fullUi the shell shows a simple progress titled with the source and no
    // error boxes.
    static bool CopyFileA(CString source, const CString& target, bool fullUi);

    // Shows the system's text for a Win32 error code in a message box, below
    // the prefix when there is one.
    static void ShowGetLastError(long error, const char* prefix);
};
