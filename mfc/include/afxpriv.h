// The inner state of the window half of the MFC subset: the per-thread handle
// maps and creation hook, and the process-wide module state with the chain of
// extension modules. Only the MFC DLL itself uses this header.
#pragma once

#include "afxwin.h"
#include <unordered_map>

#ifdef QO_BUILDING_MFC

// Handle -> object for one kind of wrapper on one thread. Permanent entries
// belong to objects that attached themselves; temporary ones are made by
// FromHandle and deleted by DeleteTemp (at idle time).
template <class T, class H>
class CHandleMap {
public:
  typedef T* (*PFN_NEW)(H h);
  typedef void (*PFN_CLEAR)(T* p); // detaches a temporary before it is deleted

  CHandleMap(PFN_NEW pfnNew, PFN_CLEAR pfnClear) : m_pfnNew(pfnNew), m_pfnClear(pfnClear) {}
  ~CHandleMap() { DeleteTemp(); }

  T* LookupPermanent(H h) const {
    auto it = m_permanent.find(h);
    return it == m_permanent.end() ? NULL : it->second;
  }
  T* LookupTemporary(H h) const {
    auto it = m_temporary.find(h);
    return it == m_temporary.end() ? NULL : it->second;
  }
  T* FromHandle(H h) {
    if (h == NULL) return NULL;
    if (T* p = LookupPermanent(h)) return p;
    if (T* p = LookupTemporary(h)) return p;
    T* p = m_pfnNew(h);
    m_temporary[h] = p;
    return p;
  }
  void SetPermanent(H h, T* p) { m_permanent[h] = p; }
  void RemoveHandle(H h) { m_permanent.erase(h); }
  void DeleteTemp() {
    std::unordered_map<H, T*> temp;
    temp.swap(m_temporary);
    for (auto& kv : temp) {
      m_pfnClear(kv.second);
      delete kv.second;
    }
  }

private:
  PFN_NEW m_pfnNew;
  PFN_CLEAR m_pfnClear;
  std::unordered_map<H, T*> m_permanent;
  std::unordered_map<H, T*> m_temporary;
};

struct AFX_THREAD_STATE {
  AFX_THREAD_STATE();
  ~AFX_THREAD_STATE();

  CHandleMap<CWnd, HWND> m_wndMap;
  CHandleMap<CDC, HDC> m_dcMap;
  CHandleMap<CGdiObject, HGDIOBJ> m_gdiMap;
  CHandleMap<CMenu, HMENU> m_menuMap;

  CWinThread* m_pCurrentThread;
  CWnd* m_pWndInit;           // the CWnd waiting for its window (creation hook)
  HHOOK m_hHookCbt;
  MSG m_lastSentMsg;          // the message being handled (CWnd::Default)
  HWND m_hLockoutNotifyWindow; // UpdateData in progress: control notifications ignored
  char m_szClassName[128];    // AfxRegisterWndClass's result
};

// The state of the calling thread, made on first use.
AFX_THREAD_STATE* AfxGetThreadState();
// Frees the calling thread's state (end of a thread started by AfxBeginThread).
void AfxTermThreadState();

struct AFX_MODULE_STATE {
  CWinApp* m_pCurrentWinApp;
  HINSTANCE m_hCurrentInstanceHandle;
  HINSTANCE m_hCurrentResourceHandle;
  LPCTSTR m_lpszCurrentAppName;
  CDynLinkLibrary* m_pFirstDLL; // the chain, guarded by m_lock
  SRWLOCK m_lock;
};

AFX_MODULE_STATE* AfxGetModuleState();

// A handler as stored in a map, seen through the type of its signature.
union MessageMapFunctions {
  AFX_PMSG pfn;
  // CCmdTarget
  void (AFX_MSG_CALL CCmdTarget::*pfnCmd_v_v)();
  BOOL (AFX_MSG_CALL CCmdTarget::*pfnCmd_b_v)();
  void (AFX_MSG_CALL CCmdTarget::*pfnCmd_v_u)(UINT);
  BOOL (AFX_MSG_CALL CCmdTarget::*pfnCmd_b_u)(UINT);
  void (AFX_MSG_CALL CCmdTarget::*pfnCmdUI)(CCmdUI*);
  void (AFX_MSG_CALL CCmdTarget::*pfnNotify_v)(NMHDR*, LRESULT*);
  BOOL (AFX_MSG_CALL CCmdTarget::*pfnNotify_b)(NMHDR*, LRESULT*);
  void (AFX_MSG_CALL CCmdTarget::*pfnNotify_RANGE)(UINT, NMHDR*, LRESULT*);
  BOOL (AFX_MSG_CALL CCmdTarget::*pfnNotify_EX)(UINT, NMHDR*, LRESULT*);
  // CWnd
  int (AFX_MSG_CALL CWnd::*pfn_is)(LPCREATESTRUCT);
  void (AFX_MSG_CALL CWnd::*pfn_vv)();
  BOOL (AFX_MSG_CALL CWnd::*pfn_bv)();
  UINT (AFX_MSG_CALL CWnd::*pfn_wv)();
  BOOL (AFX_MSG_CALL CWnd::*pfn_bD)(CDC*);
  void (AFX_MSG_CALL CWnd::*pfn_vwii)(UINT, int, int);
  void (AFX_MSG_CALL CWnd::*pfn_vii)(int, int);
  void (AFX_MSG_CALL CWnd::*pfn_vw)(UINT);
  void (AFX_MSG_CALL CWnd::*pfn_vbw)(BOOL, UINT);
  void (AFX_MSG_CALL CWnd::*pfn_vW)(CWnd*);
  void (AFX_MSG_CALL CWnd::*pfn_vwp)(UINT, CPoint);
  BOOL (AFX_MSG_CALL CWnd::*pfn_bwsp)(UINT, short, CPoint);
  void (AFX_MSG_CALL CWnd::*pfn_vWp)(CWnd*, CPoint);
  void (AFX_MSG_CALL CWnd::*pfn_vwww)(UINT, UINT, UINT);
  void (AFX_MSG_CALL CWnd::*pfn_vww)(UINT, UINT);
  BOOL (AFX_MSG_CALL CWnd::*pfn_bWww)(CWnd*, UINT, UINT);
  UINT (AFX_MSG_CALL CWnd::*pfn_wp)(CPoint);
  void (AFX_MSG_CALL CWnd::*pfn_vwwW)(UINT, UINT, CScrollBar*);
  void (AFX_MSG_CALL CWnd::*pfn_vOWNER)(int, void*);
  HBRUSH (AFX_MSG_CALL CWnd::*pfn_hDWw)(CDC*, CWnd*, UINT);
  HBRUSH (AFX_MSG_CALL CWnd::*pfn_hDw)(CDC*, UINT);
  void (AFX_MSG_CALL CWnd::*pfn_vwWb)(UINT, CWnd*, BOOL);
  void (AFX_MSG_CALL CWnd::*pfn_vbh)(BOOL, DWORD);
  void (AFX_MSG_CALL CWnd::*pfn_vwl)(UINT, LPARAM);
  void (AFX_MSG_CALL CWnd::*pfn_vs)(void*);
  void (AFX_MSG_CALL CWnd::*pfn_vHDROP)(HDROP);
  LRESULT (AFX_MSG_CALL CWnd::*pfn_lwl)(WPARAM, LPARAM);
  // CWinThread
  void (AFX_MSG_CALL CWinThread::*pfn_THREAD)(WPARAM, LPARAM);
};

// Handler of message nMsg in the map chain starting at pMap (0xC000 entries
// match registered messages through their variable); NULL if none.
const AFX_MSGMAP_ENTRY* AfxFindWindowMessage(const AFX_MSGMAP* pMap, UINT nMsg);

// Reports an exception that reached a window procedure or a thread's loop.
LRESULT AfxProcessWndProcException(CException* e, const MSG* pMsg);
void AfxReportForeignException(const char* lpszWhat);

#endif
