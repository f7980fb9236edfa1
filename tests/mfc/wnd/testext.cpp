// A test extension DLL: it joins the resource chain while it is loaded.
#include "afxwin.h"

static AFX_EXTENSION_MODULE s_extModule = {FALSE, NULL, NULL, NULL, NULL};

// A run-time class that exists only in this module.
class CExtOnlyObject : public CObject {
  DECLARE_DYNCREATE(CExtOnlyObject)
};
IMPLEMENT_DYNCREATE(CExtOnlyObject, CObject)

extern "C" BOOL WINAPI DllMain(HINSTANCE hInstance, DWORD dwReason, LPVOID) {
  if (dwReason == DLL_PROCESS_ATTACH) {
    if (!AfxInitExtensionModule(s_extModule, hInstance)) return FALSE;
    new CDynLinkLibrary(s_extModule);
  } else if (dwReason == DLL_PROCESS_DETACH) {
    AfxTermExtensionModule(s_extModule);
  }
  return TRUE;
}
