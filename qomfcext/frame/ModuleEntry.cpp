// The module entry of qomfcext.dll: joins the library to the host's MFC as an
// extension module, so that the host finds the library's dialogs, strings,
// icons and runtime classes through its resource chain.
#include <afxwin.h>

#include "CQoErrorDlg.h"

static AFX_EXTENSION_MODULE qomfcextDLL = { FALSE, NULL };

extern "C" BOOL WINAPI DllMain(HINSTANCE hInstance, DWORD dwReason, LPVOID)
{
    if (dwReason == DLL_PROCESS_ATTACH) {
        if (!AfxInitExtensionModule(qomfcextDLL, hInstance))
            return FALSE;
        // Kept by MFC in its list of extension modules for the life of the process.
        new CDynLinkLibrary(qomfcextDLL);
        CQoErrorDlg::AddMessage(20001, "Dies ist ein Testeintrag für einen Fehler der qomfcext DLL");
    } else if (dwReason == DLL_PROCESS_DETACH) {
        AfxTermExtensionModule(qomfcextDLL);
    }
    return TRUE;
}
