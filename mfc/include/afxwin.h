// The window half of the MFC subset: command targets and message maps, threads
// and the application object, windows, dialogs with data exchange, the standard
// controls, device contexts with the GDI objects, menus, and the extension
// module chain through which resources of the application and of every
// extension DLL are found.
//
// Use:
//   - one global object of a CWinApp subclass in the executable; a GUI program
//     links mfcmain (WinMain -> AfxWinMain), a console program calls AfxWinInit;
//   - derive windows and dialogs from CWnd/CDialog, put DECLARE_MESSAGE_MAP() in
//     the class and BEGIN_MESSAGE_MAP(CMyDlg, CDialog) ... END_MESSAGE_MAP() in its
//     source; entries name the handler without qualification, as in
//     ON_BN_CLICKED(IDC_GO, OnGo);
//   - an extension DLL calls AfxInitExtensionModule in its DllMain and creates a
//     CDynLinkLibrary, which puts its resources into the chain.
//
// Every window procedure runs through AfxWndProc, which catches every exception:
// none unwinds through a Win32 frame.
#pragma once

#include "afx.h"
#include "afxres.h"
#include <commctrl.h>
#include <shellapi.h>

// windowsx.h's macro of this name would hide CWnd::SubclassWindow.
#ifdef SubclassWindow
#undef SubclassWindow
#endif

// MFC lets GetSafeHwnd() and friends be called through a NULL pointer; the
// volatile read keeps the compiler from assuming that `this` is never NULL.
inline bool AfxIsNullThis(const void* p) {
  const void* volatile q = p;
  return q == NULL;
}

class CCmdTarget;
class CCmdUI;
class CWinThread;
class CWinApp;
class CWnd;
class CDialog;
class CDC;
class CGdiObject;
class CPen;
class CBrush;
class CFont;
class CBitmap;
class CMenu;
class CScrollBar;
class CDataExchange;

// ---------------------------------------------------------------------------
// Message maps
// ---------------------------------------------------------------------------

#define afx_msg
#define AFX_MSG_CALL

// The obsolete WM_CTLCOLOR number stands for every WM_CTLCOLOR* message in maps.
#ifndef WM_CTLCOLOR
#define WM_CTLCOLOR 0x0019
#endif
// Messages reflected from a parent back to the control that sent them are
// looked up in the control's map under WM_REFLECT_BASE + message.
#define WM_REFLECT_BASE 0xBC00
// Sent by modal loops when the queue is empty.
#define WM_KICKIDLE 0x036A

// Codes of commands routed through OnCmdMsg.
#define CN_COMMAND 0
#define CN_UPDATE_COMMAND_UI ((UINT)(-1))

typedef void (AFX_MSG_CALL CCmdTarget::*AFX_PMSG)(void);
typedef void (AFX_MSG_CALL CWnd::*AFX_PMSGW)(void);
typedef void (AFX_MSG_CALL CWinThread::*AFX_PMSGT)(void);

// Handler signatures; the dispatcher calls the handler through the matching type.
enum AfxSig {
  AfxSig_end = 0,
  // commands (CCmdTarget)
  AfxSigCmd_v,        // void ()
  AfxSigCmd_b,        // BOOL ()
  AfxSigCmd_RANGE,    // void (UINT nID)
  AfxSigCmd_EX,       // BOOL (UINT nID)
  AfxSigCmdUI,        // void (CCmdUI*)
  AfxSigNotify_v,     // void (NMHDR*, LRESULT*)
  AfxSigNotify_b,     // BOOL (NMHDR*, LRESULT*)
  AfxSigNotify_RANGE, // void (UINT nID, NMHDR*, LRESULT*)
  AfxSigNotify_EX,    // BOOL (UINT nID, NMHDR*, LRESULT*)
  // window messages (CWnd)
  AfxSig_is,     // int (LPCREATESTRUCT)
  AfxSig_vv,     // void ()
  AfxSig_bv,     // BOOL ()
  AfxSig_wv,     // UINT ()
  AfxSig_bD,     // BOOL (CDC*)
  AfxSig_vwii,   // void (UINT, int, int)
  AfxSig_vii,    // void (int, int)
  AfxSig_vw,     // void (UINT)
  AfxSig_vbw,    // void (BOOL, UINT)
  AfxSig_vW,     // void (CWnd*)
  AfxSig_vwp,    // void (UINT, CPoint)
  AfxSig_bwsp,   // BOOL (UINT, short, CPoint)
  AfxSig_vWp,    // void (CWnd*, CPoint)
  AfxSig_vwww,   // void (UINT, UINT, UINT)
  AfxSig_vww,    // void (UINT, UINT)           (reflected scroll messages)
  AfxSig_bWww,   // BOOL (CWnd*, UINT, UINT)
  AfxSig_wp,     // UINT (CPoint)
  AfxSig_vwwW,   // void (UINT, UINT, CScrollBar*)
  AfxSig_vOWNER, // void (int, LPxxxSTRUCT)
  AfxSig_hDWw,   // HBRUSH (CDC*, CWnd*, UINT)
  AfxSig_hDw,    // HBRUSH (CDC*, UINT)        (reflected WM_CTLCOLOR)
  AfxSig_vwWb,   // void (UINT, CWnd*, BOOL)
  AfxSig_vbh,    // void (BOOL, DWORD)
  AfxSig_vwl,    // void (UINT, LPARAM)
  AfxSig_vs,     // void (LPxxxSTRUCT)
  AfxSig_vHDROP, // void (HDROP)
  AfxSig_lwl,    // LRESULT (WPARAM, LPARAM)
  // thread messages (CWinThread)
  AfxSig_vWPLP   // void (WPARAM, LPARAM)
};

struct AFX_MSGMAP_ENTRY {
  UINT nMessage;  // window message, or 0xC000 for a registered message
  UINT nCode;     // control or notification code
  UINT nID;       // control id, or 0 for window messages
  UINT nLastID;   // last id of a range
  UINT_PTR nSig;  // AfxSig, or the address of the registered message number
  AFX_PMSG pfn;   // the handler
};

struct AFX_MSGMAP {
  const AFX_MSGMAP* (PASCAL* pfnGetBaseMap)(); // NULL for CCmdTarget
  const AFX_MSGMAP_ENTRY* lpEntries;
};

// Extra data of a WM_NOTIFY routed through OnCmdMsg.
struct AFX_NOTIFY {
  LRESULT* pResult;
  NMHDR* pNMHDR;
};

#define DECLARE_MESSAGE_MAP()                       \
protected:                                          \
  static const AFX_MSGMAP* PASCAL GetThisMessageMap(); \
  virtual const AFX_MSGMAP* GetMessageMap() const;

#define BEGIN_MESSAGE_MAP(theClass, baseClass)                                   \
  const AFX_MSGMAP* theClass::GetMessageMap() const { return GetThisMessageMap(); } \
  const AFX_MSGMAP* PASCAL theClass::GetThisMessageMap() {                       \
    typedef theClass ThisClass;                                                  \
    typedef baseClass TheBaseClass;                                              \
    (void)sizeof(ThisClass*);                                                    \
    static const AFX_MSGMAP_ENTRY _messageEntries[] = {

#define END_MESSAGE_MAP()                                                        \
    {0, 0, 0, 0, AfxSig_end, (AFX_PMSG)0}};                                      \
    static const AFX_MSGMAP messageMap = {&TheBaseClass::GetThisMessageMap,      \
                                          &_messageEntries[0]};                  \
    return &messageMap;                                                          \
  }

#define AFX_WMSG(sig, type, fn) \
  (AFX_PMSG)(AFX_PMSGW)(static_cast<type>(&ThisClass::fn))

// Commands and control notifications
#define ON_COMMAND(id, memberFxn) \
  {WM_COMMAND, CN_COMMAND, (WORD)(id), (WORD)(id), AfxSigCmd_v, static_cast<AFX_PMSG>(&ThisClass::memberFxn)},
#define ON_COMMAND_EX(id, memberFxn)                                              \
  {WM_COMMAND, CN_COMMAND, (WORD)(id), (WORD)(id), AfxSigCmd_EX,                \
   (AFX_PMSG)(static_cast<BOOL (AFX_MSG_CALL CCmdTarget::*)(UINT)>(&ThisClass::memberFxn))},
#define ON_COMMAND_RANGE(id, idLast, memberFxn)                                   \
  {WM_COMMAND, CN_COMMAND, (WORD)(id), (WORD)(idLast), AfxSigCmd_RANGE,         \
   (AFX_PMSG)(static_cast<void (AFX_MSG_CALL CCmdTarget::*)(UINT)>(&ThisClass::memberFxn))},
#define ON_UPDATE_COMMAND_UI(id, memberFxn)                                       \
  {WM_COMMAND, CN_UPDATE_COMMAND_UI, (WORD)(id), (WORD)(id), AfxSigCmdUI,       \
   (AFX_PMSG)(static_cast<void (AFX_MSG_CALL CCmdTarget::*)(CCmdUI*)>(&ThisClass::memberFxn))},
#define ON_CONTROL(wNotifyCode, id, memberFxn) \
  {WM_COMMAND, (WORD)(wNotifyCode), (WORD)(id), (WORD)(id), AfxSigCmd_v, static_cast<AFX_PMSG>(&ThisClass::memberFxn)},
#define ON_CONTROL_RANGE(wNotifyCode, id, idLast, memberFxn)                      \
  {WM_COMMAND, (WORD)(wNotifyCode), (WORD)(id), (WORD)(idLast), AfxSigCmd_RANGE, \
   (AFX_PMSG)(static_cast<void (AFX_MSG_CALL CCmdTarget::*)(UINT)>(&ThisClass::memberFxn))},
#define ON_NOTIFY(wNotifyCode, id, memberFxn)                                     \
  {WM_NOTIFY, (WORD)(int)(wNotifyCode), (WORD)(id), (WORD)(id), AfxSigNotify_v, \
   (AFX_PMSG)(static_cast<void (AFX_MSG_CALL CCmdTarget::*)(NMHDR*, LRESULT*)>(&ThisClass::memberFxn))},
#define ON_NOTIFY_RANGE(wNotifyCode, id, idLast, memberFxn)                           \
  {WM_NOTIFY, (WORD)(int)(wNotifyCode), (WORD)(id), (WORD)(idLast), AfxSigNotify_RANGE, \
   (AFX_PMSG)(static_cast<void (AFX_MSG_CALL CCmdTarget::*)(UINT, NMHDR*, LRESULT*)>(&ThisClass::memberFxn))},
#define ON_NOTIFY_EX(wNotifyCode, id, memberFxn)                                  \
  {WM_NOTIFY, (WORD)(int)(wNotifyCode), (WORD)(id), (WORD)(id), AfxSigNotify_EX, \
   (AFX_PMSG)(static_cast<BOOL (AFX_MSG_CALL CCmdTarget::*)(UINT, NMHDR*, LRESULT*)>(&ThisClass::memberFxn))},
#define ON_NOTIFY_EX_RANGE(wNotifyCode, id, idLast, memberFxn)                        \
  {WM_NOTIFY, (WORD)(int)(wNotifyCode), (WORD)(id), (WORD)(idLast), AfxSigNotify_EX, \
   (AFX_PMSG)(static_cast<BOOL (AFX_MSG_CALL CCmdTarget::*)(UINT, NMHDR*, LRESULT*)>(&ThisClass::memberFxn))},

// Reflected notifications: entries in the control's own map
#define ON_CONTROL_REFLECT(wNotifyCode, memberFxn) \
  {WM_COMMAND + WM_REFLECT_BASE, (WORD)(wNotifyCode), 0, 0, AfxSigCmd_v, static_cast<AFX_PMSG>(&ThisClass::memberFxn)},
#define ON_CONTROL_REFLECT_EX(wNotifyCode, memberFxn)                 \
  {WM_COMMAND + WM_REFLECT_BASE, (WORD)(wNotifyCode), 0, 0, AfxSigCmd_b, \
   (AFX_PMSG)(static_cast<BOOL (AFX_MSG_CALL CCmdTarget::*)()>(&ThisClass::memberFxn))},
#define ON_NOTIFY_REFLECT(wNotifyCode, memberFxn)                         \
  {WM_NOTIFY + WM_REFLECT_BASE, (WORD)(int)(wNotifyCode), 0, 0, AfxSigNotify_v, \
   (AFX_PMSG)(static_cast<void (AFX_MSG_CALL CCmdTarget::*)(NMHDR*, LRESULT*)>(&ThisClass::memberFxn))},
#define ON_NOTIFY_REFLECT_EX(wNotifyCode, memberFxn)                      \
  {WM_NOTIFY + WM_REFLECT_BASE, (WORD)(int)(wNotifyCode), 0, 0, AfxSigNotify_b, \
   (AFX_PMSG)(static_cast<BOOL (AFX_MSG_CALL CCmdTarget::*)(NMHDR*, LRESULT*)>(&ThisClass::memberFxn))},
#define ON_WM_CTLCOLOR_REFLECT() \
  {WM_CTLCOLOR + WM_REFLECT_BASE, 0, 0, 0, AfxSig_hDw, AFX_WMSG(hDw, HBRUSH (AFX_MSG_CALL CWnd::*)(CDC*, UINT), CtlColor)},
#define ON_WM_DRAWITEM_REFLECT() \
  {WM_DRAWITEM + WM_REFLECT_BASE, 0, 0, 0, AfxSig_vs, AFX_WMSG(vs, void (AFX_MSG_CALL CWnd::*)(LPDRAWITEMSTRUCT), DrawItem)},
#define ON_WM_MEASUREITEM_REFLECT() \
  {WM_MEASUREITEM + WM_REFLECT_BASE, 0, 0, 0, AfxSig_vs, AFX_WMSG(vs, void (AFX_MSG_CALL CWnd::*)(LPMEASUREITEMSTRUCT), MeasureItem)},
#define ON_WM_HSCROLL_REFLECT() \
  {WM_HSCROLL + WM_REFLECT_BASE, 0, 0, 0, AfxSig_vww, AFX_WMSG(vww, void (AFX_MSG_CALL CWnd::*)(UINT, UINT), HScroll)},
#define ON_WM_VSCROLL_REFLECT() \
  {WM_VSCROLL + WM_REFLECT_BASE, 0, 0, 0, AfxSig_vww, AFX_WMSG(vww, void (AFX_MSG_CALL CWnd::*)(UINT, UINT), VScroll)},
#define ON_WM_PARENTNOTIFY_REFLECT() \
  {WM_PARENTNOTIFY + WM_REFLECT_BASE, 0, 0, 0, AfxSig_vwl, AFX_WMSG(vwl, void (AFX_MSG_CALL CWnd::*)(UINT, LPARAM), ParentNotify)},

// Button, edit, combo box and list box notifications
#define ON_BN_CLICKED(id, memberFxn) ON_CONTROL(BN_CLICKED, id, memberFxn)
#define ON_BN_DOUBLECLICKED(id, memberFxn) ON_CONTROL(BN_DOUBLECLICKED, id, memberFxn)
#define ON_EN_CHANGE(id, memberFxn) ON_CONTROL(EN_CHANGE, id, memberFxn)
#define ON_EN_KILLFOCUS(id, memberFxn) ON_CONTROL(EN_KILLFOCUS, id, memberFxn)
#define ON_EN_SETFOCUS(id, memberFxn) ON_CONTROL(EN_SETFOCUS, id, memberFxn)
#define ON_EN_UPDATE(id, memberFxn) ON_CONTROL(EN_UPDATE, id, memberFxn)
#define ON_CBN_SELCHANGE(id, memberFxn) ON_CONTROL(CBN_SELCHANGE, id, memberFxn)
#define ON_CBN_EDITCHANGE(id, memberFxn) ON_CONTROL(CBN_EDITCHANGE, id, memberFxn)
#define ON_CBN_DROPDOWN(id, memberFxn) ON_CONTROL(CBN_DROPDOWN, id, memberFxn)
#define ON_CBN_CLOSEUP(id, memberFxn) ON_CONTROL(CBN_CLOSEUP, id, memberFxn)
#define ON_CBN_KILLFOCUS(id, memberFxn) ON_CONTROL(CBN_KILLFOCUS, id, memberFxn)
#define ON_CBN_SELENDOK(id, memberFxn) ON_CONTROL(CBN_SELENDOK, id, memberFxn)
#define ON_LBN_SELCHANGE(id, memberFxn) ON_CONTROL(LBN_SELCHANGE, id, memberFxn)
#define ON_LBN_DBLCLK(id, memberFxn) ON_CONTROL(LBN_DBLCLK, id, memberFxn)

// User-defined, registered and thread messages
#define ON_MESSAGE(message, memberFxn) \
  {(UINT)(message), 0, 0, 0, AfxSig_lwl, AFX_WMSG(lwl, LRESULT (AFX_MSG_CALL CWnd::*)(WPARAM, LPARAM), memberFxn)},
#define ON_REGISTERED_MESSAGE(nMessageVariable, memberFxn)             \
  {0xC000, 0, 0, 0, (UINT_PTR)(UINT*)(&nMessageVariable),           \
   AFX_WMSG(lwl, LRESULT (AFX_MSG_CALL CWnd::*)(WPARAM, LPARAM), memberFxn)},
#define ON_THREAD_MESSAGE(message, memberFxn)                                \
  {(UINT)(message), 0, 0, 0, AfxSig_vWPLP,                                  \
   (AFX_PMSG)(AFX_PMSGT)(static_cast<void (AFX_MSG_CALL CWinThread::*)(WPARAM, LPARAM)>(&ThisClass::memberFxn))},
#define ON_REGISTERED_THREAD_MESSAGE(nMessageVariable, memberFxn)            \
  {0xC000, 0, 0, 0, (UINT_PTR)(UINT*)(&nMessageVariable),                   \
   (AFX_PMSG)(AFX_PMSGT)(static_cast<void (AFX_MSG_CALL CWinThread::*)(WPARAM, LPARAM)>(&ThisClass::memberFxn))},

// Window messages with MFC's handler signatures
#define AFX_ON_WM(msg, sig, type, fn) {msg, 0, 0, 0, sig, AFX_WMSG(sig, type, fn)},
#define ON_WM_CREATE() AFX_ON_WM(WM_CREATE, AfxSig_is, int (AFX_MSG_CALL CWnd::*)(LPCREATESTRUCT), OnCreate)
#define ON_WM_DESTROY() AFX_ON_WM(WM_DESTROY, AfxSig_vv, void (AFX_MSG_CALL CWnd::*)(), OnDestroy)
#define ON_WM_NCDESTROY() AFX_ON_WM(WM_NCDESTROY, AfxSig_vv, void (AFX_MSG_CALL CWnd::*)(), OnNcDestroy)
#define ON_WM_CLOSE() AFX_ON_WM(WM_CLOSE, AfxSig_vv, void (AFX_MSG_CALL CWnd::*)(), OnClose)
#define ON_WM_PAINT() AFX_ON_WM(WM_PAINT, AfxSig_vv, void (AFX_MSG_CALL CWnd::*)(), OnPaint)
#define ON_WM_ERASEBKGND() AFX_ON_WM(WM_ERASEBKGND, AfxSig_bD, BOOL (AFX_MSG_CALL CWnd::*)(CDC*), OnEraseBkgnd)
#define ON_WM_SIZE() AFX_ON_WM(WM_SIZE, AfxSig_vwii, void (AFX_MSG_CALL CWnd::*)(UINT, int, int), OnSize)
#define ON_WM_MOVE() AFX_ON_WM(WM_MOVE, AfxSig_vii, void (AFX_MSG_CALL CWnd::*)(int, int), OnMove)
#define ON_WM_TIMER() AFX_ON_WM(WM_TIMER, AfxSig_vw, void (AFX_MSG_CALL CWnd::*)(UINT), OnTimer)
#define ON_WM_SHOWWINDOW() AFX_ON_WM(WM_SHOWWINDOW, AfxSig_vbw, void (AFX_MSG_CALL CWnd::*)(BOOL, UINT), OnShowWindow)
#define ON_WM_SETFOCUS() AFX_ON_WM(WM_SETFOCUS, AfxSig_vW, void (AFX_MSG_CALL CWnd::*)(CWnd*), OnSetFocus)
#define ON_WM_KILLFOCUS() AFX_ON_WM(WM_KILLFOCUS, AfxSig_vW, void (AFX_MSG_CALL CWnd::*)(CWnd*), OnKillFocus)
#define ON_WM_LBUTTONDOWN() AFX_ON_WM(WM_LBUTTONDOWN, AfxSig_vwp, void (AFX_MSG_CALL CWnd::*)(UINT, CPoint), OnLButtonDown)
#define ON_WM_LBUTTONUP() AFX_ON_WM(WM_LBUTTONUP, AfxSig_vwp, void (AFX_MSG_CALL CWnd::*)(UINT, CPoint), OnLButtonUp)
#define ON_WM_LBUTTONDBLCLK() AFX_ON_WM(WM_LBUTTONDBLCLK, AfxSig_vwp, void (AFX_MSG_CALL CWnd::*)(UINT, CPoint), OnLButtonDblClk)
#define ON_WM_RBUTTONDOWN() AFX_ON_WM(WM_RBUTTONDOWN, AfxSig_vwp, void (AFX_MSG_CALL CWnd::*)(UINT, CPoint), OnRButtonDown)
#define ON_WM_RBUTTONUP() AFX_ON_WM(WM_RBUTTONUP, AfxSig_vwp, void (AFX_MSG_CALL CWnd::*)(UINT, CPoint), OnRButtonUp)
#define ON_WM_MBUTTONDOWN() AFX_ON_WM(WM_MBUTTONDOWN, AfxSig_vwp, void (AFX_MSG_CALL CWnd::*)(UINT, CPoint), OnMButtonDown)
#define ON_WM_MOUSEMOVE() AFX_ON_WM(WM_MOUSEMOVE, AfxSig_vwp, void (AFX_MSG_CALL CWnd::*)(UINT, CPoint), OnMouseMove)
#define ON_WM_MOUSEWHEEL() AFX_ON_WM(WM_MOUSEWHEEL, AfxSig_bwsp, BOOL (AFX_MSG_CALL CWnd::*)(UINT, short, CPoint), OnMouseWheel)
#define ON_WM_CONTEXTMENU() AFX_ON_WM(WM_CONTEXTMENU, AfxSig_vWp, void (AFX_MSG_CALL CWnd::*)(CWnd*, CPoint), OnContextMenu)
#define ON_WM_KEYDOWN() AFX_ON_WM(WM_KEYDOWN, AfxSig_vwww, void (AFX_MSG_CALL CWnd::*)(UINT, UINT, UINT), OnKeyDown)
#define ON_WM_KEYUP() AFX_ON_WM(WM_KEYUP, AfxSig_vwww, void (AFX_MSG_CALL CWnd::*)(UINT, UINT, UINT), OnKeyUp)
#define ON_WM_CHAR() AFX_ON_WM(WM_CHAR, AfxSig_vwww, void (AFX_MSG_CALL CWnd::*)(UINT, UINT, UINT), OnChar)
#define ON_WM_SYSKEYDOWN() AFX_ON_WM(WM_SYSKEYDOWN, AfxSig_vwww, void (AFX_MSG_CALL CWnd::*)(UINT, UINT, UINT), OnSysKeyDown)
#define ON_WM_GETDLGCODE() AFX_ON_WM(WM_GETDLGCODE, AfxSig_wv, UINT (AFX_MSG_CALL CWnd::*)(), OnGetDlgCode)
#define ON_WM_SETCURSOR() AFX_ON_WM(WM_SETCURSOR, AfxSig_bWww, BOOL (AFX_MSG_CALL CWnd::*)(CWnd*, UINT, UINT), OnSetCursor)
#define ON_WM_NCHITTEST() AFX_ON_WM(WM_NCHITTEST, AfxSig_wp, UINT (AFX_MSG_CALL CWnd::*)(CPoint), OnNcHitTest)
#define ON_WM_HSCROLL() AFX_ON_WM(WM_HSCROLL, AfxSig_vwwW, void (AFX_MSG_CALL CWnd::*)(UINT, UINT, CScrollBar*), OnHScroll)
#define ON_WM_VSCROLL() AFX_ON_WM(WM_VSCROLL, AfxSig_vwwW, void (AFX_MSG_CALL CWnd::*)(UINT, UINT, CScrollBar*), OnVScroll)
#define ON_WM_DRAWITEM() AFX_ON_WM(WM_DRAWITEM, AfxSig_vOWNER, void (AFX_MSG_CALL CWnd::*)(int, LPDRAWITEMSTRUCT), OnDrawItem)
#define ON_WM_MEASUREITEM() AFX_ON_WM(WM_MEASUREITEM, AfxSig_vOWNER, void (AFX_MSG_CALL CWnd::*)(int, LPMEASUREITEMSTRUCT), OnMeasureItem)
#define ON_WM_CTLCOLOR() AFX_ON_WM(WM_CTLCOLOR, AfxSig_hDWw, HBRUSH (AFX_MSG_CALL CWnd::*)(CDC*, CWnd*, UINT), OnCtlColor)
#define ON_WM_ACTIVATE() AFX_ON_WM(WM_ACTIVATE, AfxSig_vwWb, void (AFX_MSG_CALL CWnd::*)(UINT, CWnd*, BOOL), OnActivate)
#define ON_WM_ACTIVATEAPP() AFX_ON_WM(WM_ACTIVATEAPP, AfxSig_vbh, void (AFX_MSG_CALL CWnd::*)(BOOL, DWORD), OnActivateApp)
#define ON_WM_SYSCOMMAND() AFX_ON_WM(WM_SYSCOMMAND, AfxSig_vwl, void (AFX_MSG_CALL CWnd::*)(UINT, LPARAM), OnSysCommand)
#define ON_WM_GETMINMAXINFO() AFX_ON_WM(WM_GETMINMAXINFO, AfxSig_vs, void (AFX_MSG_CALL CWnd::*)(MINMAXINFO*), OnGetMinMaxInfo)
#define ON_WM_WINDOWPOSCHANGED() AFX_ON_WM(WM_WINDOWPOSCHANGED, AfxSig_vs, void (AFX_MSG_CALL CWnd::*)(WINDOWPOS*), OnWindowPosChanged)
#define ON_WM_DROPFILES() AFX_ON_WM(WM_DROPFILES, AfxSig_vHDROP, void (AFX_MSG_CALL CWnd::*)(HDROP), OnDropFiles)
#define ON_WM_QUERYENDSESSION() AFX_ON_WM(WM_QUERYENDSESSION, AfxSig_bv, BOOL (AFX_MSG_CALL CWnd::*)(), OnQueryEndSession)

// ---------------------------------------------------------------------------
// CCmdTarget: the base of everything that has a message map.
// ---------------------------------------------------------------------------

struct AFX_CMDHANDLERINFO {
  CCmdTarget* pTarget;
  AFX_PMSG pmf;
};

class AFX_API CCmdTarget : public CObject {
  DECLARE_DYNAMIC(CCmdTarget)
public:
  CCmdTarget();
  virtual ~CCmdTarget();

  // Routes a command or notification through the map: nCode is the control
  // code, or MAKELONG(code, message) for WM_NOTIFY and reflected messages.
  virtual BOOL OnCmdMsg(UINT nID, int nCode, void* pExtra, AFX_CMDHANDLERINFO* pHandlerInfo);

  // Counted wait cursor of the application.
  void BeginWaitCursor();
  void EndWaitCursor();
  void RestoreWaitCursor();

protected:
  static const AFX_MSGMAP* PASCAL GetThisMessageMap();
  virtual const AFX_MSGMAP* GetMessageMap() const;
};

// The entry of nMsg/nCode/nID in one map's entries, or NULL.
AFX_API const AFX_MSGMAP_ENTRY* AFXAPI AfxFindMessageEntry(const AFX_MSGMAP_ENTRY* lpEntry, UINT nMsg,
                                                           UINT nCode, UINT nID);

// The state of a user-interface item that a handler of ON_UPDATE_COMMAND_UI sets:
// a control (m_pOther) or an item of a menu (m_pMenu, m_nIndex).
class AFX_API CCmdUI {
public:
  CCmdUI();
  virtual ~CCmdUI() {}

  virtual void Enable(BOOL bOn = TRUE);
  virtual void SetCheck(int nCheck = 1); // 0, 1 or 2 (indeterminate)
  virtual void SetRadio(BOOL bOn = TRUE);
  virtual void SetText(LPCTSTR lpszText);
  void ContinueRouting() { m_bContinueRouting = TRUE; }

  // Asks pTarget's map; without a handler the item is disabled if
  // bDisableIfNoHndler. TRUE if a handler answered.
  BOOL DoUpdate(CCmdTarget* pTarget, BOOL bDisableIfNoHndler);

  UINT m_nID;
  UINT m_nIndex;
  CMenu* m_pMenu;
  CMenu* m_pSubMenu;
  CWnd* m_pOther;
  UINT m_nIndexMax;
  BOOL m_bEnableChanged;
  BOOL m_bContinueRouting;
};

// ---------------------------------------------------------------------------
// CWinThread: a thread with an optional message loop.
// ---------------------------------------------------------------------------

typedef UINT(AFX_CDECL* AFX_THREADPROC)(LPVOID);

class AFX_API CWinThread : public CCmdTarget {
  DECLARE_DYNAMIC(CWinThread)
public:
  CWinThread();
  CWinThread(AFX_THREADPROC pfnThreadProc, LPVOID pParam);
  virtual ~CWinThread();

  // Starts the thread; CREATE_SUSPENDED leaves it waiting for ResumeThread. The
  // thread's message queue exists when this returns, so messages may be posted
  // to m_nThreadID at once.
  BOOL CreateThread(DWORD dwCreateFlags = 0, UINT nStackSize = 0,
                    LPSECURITY_ATTRIBUTES lpSecurityAttrs = NULL);

  int GetThreadPriority();
  BOOL SetThreadPriority(int nPriority);
  DWORD SuspendThread();
  DWORD ResumeThread();
  BOOL PostThreadMessage(UINT message, WPARAM wParam, LPARAM lParam);
  operator HANDLE() const { return AfxIsNullThis(this) ? NULL : m_hThread; }

  // Virtual functions you might override
  virtual BOOL InitInstance();
  virtual int ExitInstance();
  virtual int Run();
  virtual BOOL PreTranslateMessage(MSG* pMsg);
  virtual BOOL PumpMessage();
  virtual BOOL OnIdle(LONG lCount);
  virtual BOOL IsIdleMessage(MSG* pMsg);
  virtual CWnd* GetMainWnd();
  virtual void Delete(); // deletes the object when m_bAutoDelete
  virtual LRESULT ProcessWndProcException(CException* e, const MSG* pMsg);

  // Hands a thread message (hwnd NULL) to the map; TRUE if a handler took it.
  BOOL DispatchThreadMessageEx(MSG* pMsg);

  CWnd* m_pMainWnd;
  CWnd* m_pActiveWnd;
  BOOL m_bAutoDelete;
  HANDLE m_hThread;
  DWORD m_nThreadID;
  MSG m_msgCur;

  // Worker threads
  LPVOID m_pThreadParams;
  AFX_THREADPROC m_pfnThreadProc;

protected:
  void CommonConstruct();
  DECLARE_MESSAGE_MAP()
};

AFX_API CWinThread* AFXAPI AfxBeginThread(AFX_THREADPROC pfnThreadProc, LPVOID pParam,
                                          int nPriority = THREAD_PRIORITY_NORMAL, UINT nStackSize = 0,
                                          DWORD dwCreateFlags = 0, LPSECURITY_ATTRIBUTES lpSecurityAttrs = NULL);
AFX_API CWinThread* AFXAPI AfxBeginThread(CRuntimeClass* pThreadClass, int nPriority = THREAD_PRIORITY_NORMAL,
                                          UINT nStackSize = 0, DWORD dwCreateFlags = 0,
                                          LPSECURITY_ATTRIBUTES lpSecurityAttrs = NULL);
// Ends the calling thread, which must be one started by AfxBeginThread.
AFX_API void AFXAPI AfxEndThread(UINT nExitCode, BOOL bDelete = TRUE);
// The CWinThread of the calling thread (the application object on the main thread).
AFX_API CWinThread* AFXAPI AfxGetThread();
// One message through the current thread's PreTranslateMessage; FALSE on WM_QUIT.
AFX_API BOOL AFXAPI AfxPumpMessage();
AFX_API BOOL AFXAPI AfxPreTranslateMessage(MSG* pMsg);
AFX_API void AFXAPI AfxPostQuitMessage(int nExitCode);

// ---------------------------------------------------------------------------
// CWinApp: the application, one global object in the executable.
// ---------------------------------------------------------------------------

class AFX_API CWinApp : public CWinThread {
  DECLARE_DYNAMIC(CWinApp)
public:
  explicit CWinApp(LPCTSTR lpszAppName = NULL);
  virtual ~CWinApp();

  LPCTSTR m_pszAppName;  // caption of message boxes
  LPCTSTR m_pszExeName;  // file name of the executable without extension
  LPCTSTR m_pszHelpFilePath;
  LPCTSTR m_pszProfileName;
  LPCTSTR m_pszRegistryKey;
  HINSTANCE m_hInstance;
  HINSTANCE m_hPrevInstance;
  LPTSTR m_lpCmdLine;
  int m_nCmdShow;

  HICON LoadIcon(LPCTSTR lpszResourceName) const;
  HICON LoadIcon(UINT nIDResource) const;
  HICON LoadStandardIcon(LPCTSTR lpszIconName) const;
  HCURSOR LoadCursor(LPCTSTR lpszResourceName) const;
  HCURSOR LoadCursor(UINT nIDResource) const;
  HCURSOR LoadStandardCursor(LPCTSTR lpszCursorName) const;

  // Virtual functions you might override
  virtual BOOL InitApplication();
  virtual BOOL InitInstance();
  virtual int ExitInstance();
  virtual int Run();
  virtual BOOL OnIdle(LONG lCount);
  // Shows a message box owned by the main window; the button id, 0 on failure.
  virtual int DoMessageBox(LPCTSTR lpszPrompt, UINT nType, UINT nIDPrompt);
  // nCode 1 shows the wait cursor (counted), -1 takes one back, 0 restores it.
  virtual void DoWaitCursor(int nCode);

  void BeginWaitCursor() { DoWaitCursor(1); }
  void EndWaitCursor() { DoWaitCursor(-1); }

  // Fills m_strCmdFile... from __argc/__argv: the first argument that is not a
  // switch ("/x" or "-x") is the file; switches are kept in m_astrSwitches.
  void ParseCommandLine();
  CString m_strCmdFile;
  CStringArray m_astrSwitches;

  int m_nWaitCursorCount;
  HCURSOR m_hcurWaitCursorRestore;

  // Sets names and handles from the executable; called by AfxWinInit.
  void SetCurrentHandles();

protected:
  DECLARE_MESSAGE_MAP()

private:
  CString m_strAppName;
  CString m_strExeName;
};

// The application's main routine: AfxWinInit, InitInstance, Run, AfxWinTerm.
AFX_API int AFXAPI AfxWinMain(HINSTANCE hInstance, HINSTANCE hPrevInstance, LPTSTR lpCmdLine, int nCmdShow);
// Prepares MFC for a program with or without WinMain (console programs call it from main).
AFX_API BOOL AFXAPI AfxWinInit(HINSTANCE hInstance, HINSTANCE hPrevInstance, LPTSTR lpCmdLine, int nCmdShow);
AFX_API void AFXAPI AfxWinTerm();

AFX_API CWinApp* AFXAPI AfxGetApp();
AFX_API CWnd* AFXAPI AfxGetMainWnd();
AFX_API HINSTANCE AFXAPI AfxGetInstanceHandle();
AFX_API HINSTANCE AFXAPI AfxGetResourceHandle();
AFX_API void AFXAPI AfxSetResourceHandle(HINSTANCE hInstResource);
AFX_API LPCTSTR AFXAPI AfxGetAppName();
// The module that holds the resource: the application's resource module, then
// every extension module of the chain; AfxGetResourceHandle() if none has it.
AFX_API HINSTANCE AFXAPI AfxFindResourceHandle(LPCTSTR lpszName, LPCTSTR lpszType);

AFX_API int AFXAPI AfxMessageBox(LPCTSTR lpszText, UINT nType = MB_OK, UINT nIDHelp = 0);
AFX_API int AFXAPI AfxMessageBox(UINT nIDPrompt, UINT nType = MB_OK, UINT nIDHelp = (UINT)-1);

// A class name registered for these attributes ("Afx:..."); valid until the next call.
AFX_API LPCTSTR AFXAPI AfxRegisterWndClass(UINT nClassStyle, HCURSOR hCursor = 0, HBRUSH hbrBackground = 0,
                                           HICON hIcon = 0);

// Frees the temporary CWnd, CDC, CGdiObject and CMenu objects of this thread.
AFX_API void AFXAPI AfxDeleteTempMaps();

class CWaitCursor {
public:
  CWaitCursor() { AfxGetApp()->BeginWaitCursor(); }
  ~CWaitCursor() { AfxGetApp()->EndWaitCursor(); }
  void Restore() { AfxGetApp()->DoWaitCursor(0); }
};

// ---------------------------------------------------------------------------
// Extension modules and the resource chain
// ---------------------------------------------------------------------------

class COleObjectFactory;

struct AFX_EXTENSION_MODULE {
  BOOL bInitialized;
  HMODULE hModule;
  HMODULE hResource;
  CRuntimeClass* pFirstSharedClass;     // run-time classes register themselves for FromName
  COleObjectFactory* pFirstSharedFactory;
};

// Call from DLL_PROCESS_ATTACH of an extension DLL; FALSE on failure.
AFX_API BOOL AFXAPI AfxInitExtensionModule(AFX_EXTENSION_MODULE& state, HMODULE hModule);
// Call from DLL_PROCESS_DETACH: removes the module's CDynLinkLibrary objects
// (every one with bAll).
AFX_API void AFXAPI AfxTermExtensionModule(AFX_EXTENSION_MODULE& state, BOOL bAll = FALSE);

// One link of the resource chain: while it exists, the module's resources are
// found by AfxFindResourceHandle, CString::LoadString, CDialog and friends.
class AFX_API CDynLinkLibrary : public CCmdTarget {
  DECLARE_DYNAMIC(CDynLinkLibrary)
public:
  explicit CDynLinkLibrary(AFX_EXTENSION_MODULE& state, BOOL bSystem = FALSE);
  CDynLinkLibrary(HINSTANCE hModule, HINSTANCE hResource);
  virtual ~CDynLinkLibrary();

  HMODULE m_hModule;
  HMODULE m_hResource;
  BOOL m_bSystem;
  CDynLinkLibrary* m_pNextDLL;

private:
  void AddToChain();
};

// ---------------------------------------------------------------------------
// GDI objects and device contexts: thin wrappers; the object owns its handle
// unless it was made by FromHandle (temporary) or the handle is Detach()ed.
// ---------------------------------------------------------------------------

class AFX_API CGdiObject : public CObject {
  DECLARE_DYNCREATE(CGdiObject)
public:
  CGdiObject() : m_hObject(NULL) {}
  virtual ~CGdiObject();

  HGDIOBJ m_hObject;
  operator HGDIOBJ() const { return AfxIsNullThis(this) ? NULL : m_hObject; }
  HGDIOBJ GetSafeHandle() const { return AfxIsNullThis(this) ? NULL : m_hObject; }

  static CGdiObject* PASCAL FromHandle(HGDIOBJ hObject);
  BOOL Attach(HGDIOBJ hObject);
  HGDIOBJ Detach();
  BOOL DeleteObject();
  int GetObject(int nCount, LPVOID lpObject) const;
  BOOL CreateStockObject(int nIndex);
};

class AFX_API CPen : public CGdiObject {
  DECLARE_DYNAMIC(CPen)
public:
  CPen() {}
  CPen(int nPenStyle, int nWidth, COLORREF crColor);
  static CPen* PASCAL FromHandle(HPEN hPen) { return (CPen*)CGdiObject::FromHandle(hPen); }
  BOOL CreatePen(int nPenStyle, int nWidth, COLORREF crColor);
  operator HPEN() const { return (HPEN)GetSafeHandle(); }
};

class AFX_API CBrush : public CGdiObject {
  DECLARE_DYNAMIC(CBrush)
public:
  CBrush() {}
  explicit CBrush(COLORREF crColor);
  static CBrush* PASCAL FromHandle(HBRUSH hBrush) { return (CBrush*)CGdiObject::FromHandle(hBrush); }
  BOOL CreateSolidBrush(COLORREF crColor);
  BOOL CreateSysColorBrush(int nIndex);
  BOOL CreateHatchBrush(int nIndex, COLORREF crColor);
  operator HBRUSH() const { return (HBRUSH)GetSafeHandle(); }
};

class AFX_API CFont : public CGdiObject {
  DECLARE_DYNAMIC(CFont)
public:
  CFont() {}
  static CFont* PASCAL FromHandle(HFONT hFont) { return (CFont*)CGdiObject::FromHandle(hFont); }
  BOOL CreateFontIndirect(const LOGFONT* lpLogFont);
  BOOL CreateFont(int nHeight, int nWidth, int nEscapement, int nOrientation, int nWeight, BYTE bItalic,
                  BYTE bUnderline, BYTE cStrikeOut, BYTE nCharSet, BYTE nOutPrecision, BYTE nClipPrecision,
                  BYTE nQuality, BYTE nPitchAndFamily, LPCTSTR lpszFacename);
  // nPointSize in tenths of a point, for pDC (the screen when NULL).
  BOOL CreatePointFont(int nPointSize, LPCTSTR lpszFaceName, CDC* pDC = NULL);
  BOOL CreatePointFontIndirect(const LOGFONT* lpLogFont, CDC* pDC = NULL);
  int GetLogFont(LOGFONT* pLogFont);
  operator HFONT() const { return (HFONT)GetSafeHandle(); }
};

class AFX_API CBitmap : public CGdiObject {
  DECLARE_DYNAMIC(CBitmap)
public:
  CBitmap() {}
  static CBitmap* PASCAL FromHandle(HBITMAP hBitmap) { return (CBitmap*)CGdiObject::FromHandle(hBitmap); }
  // From the resource chain.
  BOOL LoadBitmap(LPCTSTR lpszResourceName);
  BOOL LoadBitmap(UINT nIDResource);
  BOOL LoadOEMBitmap(UINT nIDBitmap);
  BOOL CreateCompatibleBitmap(CDC* pDC, int nWidth, int nHeight);
  BOOL CreateBitmap(int nWidth, int nHeight, UINT nPlanes, UINT nBitcount, const void* lpBits);
  int GetBitmap(BITMAP* pBitMap);
  operator HBITMAP() const { return (HBITMAP)GetSafeHandle(); }
};

class AFX_API CDC : public CObject {
  DECLARE_DYNCREATE(CDC)
public:
  CDC();
  virtual ~CDC();

  HDC m_hDC;
  HDC m_hAttribDC;
  operator HDC() const { return AfxIsNullThis(this) ? NULL : m_hDC; }
  HDC GetSafeHdc() const { return AfxIsNullThis(this) ? NULL : m_hDC; }

  static CDC* PASCAL FromHandle(HDC hDC);
  BOOL Attach(HDC hDC);
  HDC Detach();
  BOOL DeleteDC();
  BOOL CreateCompatibleDC(CDC* pDC);
  CWnd* GetWindow() const;

  int SaveDC();
  BOOL RestoreDC(int nSavedDC);
  int GetDeviceCaps(int nIndex) const;

  // Selection: the previous object (temporary for the ones this DC did not make)
  CPen* SelectObject(CPen* pPen);
  CBrush* SelectObject(CBrush* pBrush);
  virtual CFont* SelectObject(CFont* pFont);
  CBitmap* SelectObject(CBitmap* pBitmap);
  CGdiObject* SelectObject(CGdiObject* pObject);
  HGDIOBJ SelectObject(HGDIOBJ hObject);
  CGdiObject* SelectStockObject(int nIndex);
  CFont* GetCurrentFont() const;

  COLORREF GetTextColor() const;
  virtual COLORREF SetTextColor(COLORREF crColor);
  COLORREF GetBkColor() const;
  virtual COLORREF SetBkColor(COLORREF crColor);
  int GetBkMode() const;
  int SetBkMode(int nBkMode);
  int SetROP2(int nDrawMode);
  UINT SetTextAlign(UINT nFlags);

  // Drawing
  void FillSolidRect(LPCRECT lpRect, COLORREF clr);
  void FillSolidRect(int x, int y, int cx, int cy, COLORREF clr);
  void FillRect(LPCRECT lpRect, CBrush* pBrush);
  void FrameRect(LPCRECT lpRect, CBrush* pBrush);
  void Draw3dRect(LPCRECT lpRect, COLORREF clrTopLeft, COLORREF clrBottomRight);
  void DrawFocusRect(LPCRECT lpRect);
  BOOL Rectangle(int x1, int y1, int x2, int y2);
  BOOL Rectangle(LPCRECT lpRect);
  BOOL Ellipse(LPCRECT lpRect);
  CPoint MoveTo(int x, int y);
  CPoint MoveTo(POINT point);
  BOOL LineTo(int x, int y);
  BOOL LineTo(POINT point);
  BOOL DrawIcon(int x, int y, HICON hIcon);
  BOOL DrawIcon(POINT point, HICON hIcon);
  BOOL BitBlt(int x, int y, int nWidth, int nHeight, CDC* pSrcDC, int xSrc, int ySrc, DWORD dwRop);
  int IntersectClipRect(LPCRECT lpRect);
  BOOL PatBlt(int x, int y, int nWidth, int nHeight, DWORD dwRop);
  // A brush of alternating pixels, for drawing with PATINVERT (drag marks); shared, never deleted.
  static CBrush* PASCAL GetHalftoneBrush();

  // Text
  virtual int DrawText(LPCTSTR lpszString, int nCount, LPRECT lpRect, UINT nFormat);
  int DrawText(const CString& str, LPRECT lpRect, UINT nFormat);
  virtual BOOL TextOut(int x, int y, LPCTSTR lpszString, int nCount);
  BOOL TextOut(int x, int y, const CString& str);
  BOOL ExtTextOut(int x, int y, UINT nOptions, LPCRECT lpRect, LPCTSTR lpszString, UINT nCount, LPINT lpDxWidths);
  CSize GetTextExtent(LPCTSTR lpszString, int nCount) const;
  CSize GetTextExtent(const CString& str) const;
  BOOL GetTextMetrics(LPTEXTMETRIC lpMetrics) const;

private:
  CDC(const CDC&) = delete;
  CDC& operator=(const CDC&) = delete;
};

// The DC of WM_PAINT: BeginPaint in the constructor, EndPaint in the destructor.
class AFX_API CPaintDC : public CDC {
  DECLARE_DYNAMIC(CPaintDC)
public:
  explicit CPaintDC(CWnd* pWnd);
  virtual ~CPaintDC();
  PAINTSTRUCT m_ps;

protected:
  HWND m_hWnd;
};

// The client-area DC of a window (GetDC/ReleaseDC).
class AFX_API CClientDC : public CDC {
  DECLARE_DYNAMIC(CClientDC)
public:
  explicit CClientDC(CWnd* pWnd);
  virtual ~CClientDC();

protected:
  HWND m_hWnd;
};

// The DC of the whole window including its frame (GetWindowDC/ReleaseDC).
class AFX_API CWindowDC : public CDC {
  DECLARE_DYNAMIC(CWindowDC)
public:
  explicit CWindowDC(CWnd* pWnd);
  virtual ~CWindowDC();

protected:
  HWND m_hWnd;
};

// ---------------------------------------------------------------------------
// CMenu: a menu handle; the destructor destroys a menu the object still owns.
// ---------------------------------------------------------------------------

class AFX_API CMenu : public CObject {
  DECLARE_DYNCREATE(CMenu)
public:
  CMenu();
  virtual ~CMenu();

  HMENU m_hMenu;
  operator HMENU() const { return AfxIsNullThis(this) ? NULL : m_hMenu; }
  HMENU GetSafeHmenu() const { return AfxIsNullThis(this) ? NULL : m_hMenu; }

  static CMenu* PASCAL FromHandle(HMENU hMenu);
  BOOL Attach(HMENU hMenu);
  HMENU Detach();

  BOOL CreateMenu();
  BOOL CreatePopupMenu();
  // From the resource chain.
  BOOL LoadMenu(LPCTSTR lpszResourceName);
  BOOL LoadMenu(UINT nIDResource);
  BOOL DestroyMenu();

  BOOL AppendMenu(UINT nFlags, UINT_PTR nIDNewItem = 0, LPCTSTR lpszNewItem = NULL);
  BOOL InsertMenu(UINT nPosition, UINT nFlags, UINT_PTR nIDNewItem = 0, LPCTSTR lpszNewItem = NULL);
  BOOL ModifyMenu(UINT nPosition, UINT nFlags, UINT_PTR nIDNewItem = 0, LPCTSTR lpszNewItem = NULL);
  BOOL RemoveMenu(UINT nPosition, UINT nFlags);
  BOOL DeleteMenu(UINT nPosition, UINT nFlags);
  // With TPM_RETURNCMD the chosen command (0 for none); otherwise TRUE/FALSE.
  BOOL TrackPopupMenu(UINT nFlags, int x, int y, CWnd* pWnd, LPCRECT lpRect = NULL);
  UINT EnableMenuItem(UINT nIDEnableItem, UINT nEnable);
  UINT CheckMenuItem(UINT nIDCheckItem, UINT nCheck);
  BOOL CheckMenuRadioItem(UINT nIDFirst, UINT nIDLast, UINT nIDItem, UINT nFlags);
  UINT GetMenuItemCount() const;
  UINT GetMenuItemID(int nPos) const;
  UINT GetMenuState(UINT nID, UINT nFlags) const;
  int GetMenuString(UINT nIDItem, CString& rString, UINT nFlags) const;
  CMenu* GetSubMenu(int nPos) const;
  BOOL SetDefaultItem(UINT uItem, BOOL fByPos = FALSE);

private:
  CMenu(const CMenu&) = delete;
  CMenu& operator=(const CMenu&) = delete;
};

// ---------------------------------------------------------------------------
// CWnd: a window handle with a message map.
// ---------------------------------------------------------------------------

// CWnd::m_nFlags
#define WF_MODALLOOP 0x0004
#define WF_CONTINUEMODAL 0x0008
#define WF_TEMPORARY 0x0100

// RunModalLoop flags
#define MLF_NOIDLEMSG 0x0001
#define MLF_NOKICKIDLE 0x0002
#define MLF_SHOWONIDLE 0x0004

// The registered message by which CWnd::GetControlUnknown asks a control window
// for its IUnknown (the answer, an LRESULT, is the pointer or 0).
#define AFX_CONTROL_UNKNOWN_MESSAGE "QoMfcControlUnknown"

class AFX_API CWnd : public CCmdTarget {
  DECLARE_DYNCREATE(CWnd)
public:
  CWnd();
  virtual ~CWnd();

  HWND m_hWnd;
  operator HWND() const { return AfxIsNullThis(this) ? NULL : m_hWnd; }
  HWND GetSafeHwnd() const { return AfxIsNullThis(this) ? NULL : m_hWnd; }
  BOOL operator==(const CWnd& wnd) const { return wnd.m_hWnd == m_hWnd; }
  BOOL operator!=(const CWnd& wnd) const { return wnd.m_hWnd != m_hWnd; }

  // The handle map of this thread: the CWnd attached to hWnd, or a temporary
  // CWnd that lives until the next idle time.
  static CWnd* PASCAL FromHandle(HWND hWnd);
  static CWnd* PASCAL FromHandlePermanent(HWND hWnd);
  BOOL Attach(HWND hWndNew);
  HWND Detach();
  // Attaches and routes the window's messages through this object's map.
  BOOL SubclassWindow(HWND hWnd);
  BOOL SubclassDlgItem(UINT nID, CWnd* pParent);
  HWND UnsubclassWindow();

  // Creation
  virtual BOOL Create(LPCTSTR lpszClassName, LPCTSTR lpszWindowName, DWORD dwStyle, const RECT& rect,
                      CWnd* pParentWnd, UINT nID, void* pContext = NULL);
  virtual BOOL CreateEx(DWORD dwExStyle, LPCTSTR lpszClassName, LPCTSTR lpszWindowName, DWORD dwStyle, int x,
                        int y, int nWidth, int nHeight, HWND hWndParent, HMENU nIDorHMenu, LPVOID lpParam = NULL);
  virtual BOOL CreateEx(DWORD dwExStyle, LPCTSTR lpszClassName, LPCTSTR lpszWindowName, DWORD dwStyle,
                        const RECT& rect, CWnd* pParentWnd, UINT nID, LPVOID lpParam = NULL);
  virtual BOOL DestroyWindow();

  // Styles
  DWORD GetStyle() const;
  DWORD GetExStyle() const;
  BOOL ModifyStyle(DWORD dwRemove, DWORD dwAdd, UINT nFlags = 0);
  BOOL ModifyStyleEx(DWORD dwRemove, DWORD dwAdd, UINT nFlags = 0);

  // Text
  void SetWindowText(LPCTSTR lpszString);
  int GetWindowText(LPTSTR lpszStringBuf, int nMaxCount) const;
  void GetWindowText(CString& rString) const;
  int GetWindowTextLength() const;
  void SetFont(CFont* pFont, BOOL bRedraw = TRUE);
  void SetFont(HFONT hFont, BOOL bRedraw = TRUE);
  CFont* GetFont() const;

  // Dialog items
  int GetDlgCtrlID() const;
  int SetDlgCtrlID(int nID);
  CWnd* GetDlgItem(int nID) const;
  void SetDlgItemText(int nID, LPCTSTR lpszString);
  int GetDlgItemText(int nID, LPTSTR lpStr, int nMaxCount) const;
  int GetDlgItemText(int nID, CString& rString) const;
  void SetDlgItemInt(int nID, UINT nValue, BOOL bSigned = TRUE);
  UINT GetDlgItemInt(int nID, BOOL* lpTrans = NULL, BOOL bSigned = TRUE) const;
  void CheckDlgButton(int nIDButton, UINT nCheck);
  UINT IsDlgButtonChecked(int nIDButton) const;
  void CheckRadioButton(int nIDFirstButton, int nIDLastButton, int nIDCheckButton);
  int GetCheckedRadioButton(int nIDFirstButton, int nIDLastButton);
  LRESULT SendDlgItemMessage(int nID, UINT message, WPARAM wParam = 0, LPARAM lParam = 0);
  CWnd* GetNextDlgTabItem(CWnd* pWndCtl, BOOL bPrevious = FALSE) const;
  CWnd* GetNextDlgGroupItem(CWnd* pWndCtl, BOOL bPrevious = FALSE) const;

  // Messages
  LRESULT SendMessage(UINT message, WPARAM wParam = 0, LPARAM lParam = 0);
  BOOL PostMessage(UINT message, WPARAM wParam = 0, LPARAM lParam = 0);
  BOOL SendNotifyMessage(UINT message, WPARAM wParam, LPARAM lParam);
  static const MSG* PASCAL GetCurrentMessage();

  // Size, position and state
  BOOL ShowWindow(int nCmdShow);
  BOOL EnableWindow(BOOL bEnable = TRUE);
  BOOL IsWindowEnabled() const;
  BOOL IsWindowVisible() const;
  BOOL IsIconic() const;
  BOOL IsZoomed() const;
  void MoveWindow(int x, int y, int nWidth, int nHeight, BOOL bRepaint = TRUE);
  void MoveWindow(LPCRECT lpRect, BOOL bRepaint = TRUE);
  BOOL SetWindowPos(const CWnd* pWndInsertAfter, int x, int y, int cx, int cy, UINT nFlags);
  void GetClientRect(LPRECT lpRect) const;
  void GetWindowRect(LPRECT lpRect) const;
  void ClientToScreen(LPPOINT lpPoint) const;
  void ClientToScreen(LPRECT lpRect) const;
  void ScreenToClient(LPPOINT lpPoint) const;
  void ScreenToClient(LPRECT lpRect) const;
  void CenterWindow(CWnd* pAlternateOwner = NULL);
  BOOL SetForegroundWindow();
  void BringWindowToTop();
  BOOL IsWindow() const { return ::IsWindow(m_hWnd); }
  BOOL IsChild(const CWnd* pWnd) const;

  // Painting
  void Invalidate(BOOL bErase = TRUE);
  void InvalidateRect(LPCRECT lpRect, BOOL bErase = TRUE);
  void ValidateRect(LPCRECT lpRect);
  void UpdateWindow();
  BOOL RedrawWindow(LPCRECT lpRectUpdate = NULL, HRGN hrgnUpdate = NULL,
                    UINT flags = RDW_INVALIDATE | RDW_UPDATENOW | RDW_ERASE);
  void SetRedraw(BOOL bRedraw = TRUE);
  CDC* GetDC();
  int ReleaseDC(CDC* pDC);

  // Focus, capture, timers
  CWnd* SetFocus();
  static CWnd* PASCAL GetFocus();
  CWnd* SetCapture();
  static CWnd* PASCAL GetCapture();
  static BOOL PASCAL ReleaseCapture();
  UINT_PTR SetTimer(UINT_PTR nIDEvent, UINT nElapse, void(CALLBACK* lpfnTimer)(HWND, UINT, UINT_PTR, DWORD));
  BOOL KillTimer(UINT_PTR nIDEvent);
  static CWnd* PASCAL GetActiveWindow();
  CWnd* SetActiveWindow();

  // Relatives
  CWnd* GetParent() const;
  CWnd* SetParent(CWnd* pWndNewParent);
  CWnd* GetOwner() const;
  void SetOwner(CWnd* pOwnerWnd);
  CWnd* GetTopLevelParent() const;
  CWnd* GetWindow(UINT nCmd) const;
  CWnd* GetTopWindow() const;
  // The owned popup that was active last; the window itself when it has none.
  CWnd* GetLastActivePopup() const { return CWnd::FromHandle(::GetLastActivePopup(m_hWnd)); }
  CWnd* GetDescendantWindow(int nID, BOOL bOnlyPerm = FALSE) const;
  static CWnd* PASCAL GetDesktopWindow();

  // Menus
  CMenu* GetMenu() const;
  BOOL SetMenu(CMenu* pMenu);
  CMenu* GetSystemMenu(BOOL bRevert) const;

  // Scroll bars
  int SetScrollPos(int nBar, int nPos, BOOL bRedraw = TRUE);
  int GetScrollPos(int nBar) const;
  void SetScrollRange(int nBar, int nMinPos, int nMaxPos, BOOL bRedraw = TRUE);
  BOOL SetScrollInfo(int nBar, LPSCROLLINFO lpScrollInfo, BOOL bRedraw = TRUE);
  BOOL GetScrollInfo(int nBar, LPSCROLLINFO lpScrollInfo, UINT nMask = SIF_ALL);
  void ShowScrollBar(UINT nBar, BOOL bShow = TRUE);

  // A message box owned by this window, caption the application's name by default.
  int MessageBox(LPCTSTR lpszText, LPCTSTR lpszCaption = NULL, UINT nType = MB_OK);

  // Data exchange
  BOOL UpdateData(BOOL bSaveAndValidate = TRUE);
  // Modal loops on this window (CDialog::DoModal)
  int RunModalLoop(DWORD dwFlags = 0);
  virtual BOOL ContinueModal();
  virtual void EndModalLoop(int nResult);

  // Walks from pMsg->hwnd up to hWndStop, giving each CWnd's PreTranslateMessage a chance.
  static BOOL PASCAL WalkPreTranslateTree(HWND hWndStop, MSG* pMsg);
  // Sends the current message of the parent to the child that caused it.
  static BOOL PASCAL ReflectLastMsg(HWND hWndChild, LRESULT* pResult = NULL);

  // ActiveX control members. The control behind this window hands out its IUnknown
  // (not AddRef'd) when sent the registered message AFX_CONTROL_UNKNOWN_MESSAGE, as a
  // control site would; null when the window is no such control. InvokeHelper calls
  // a dispatch member with the arguments described by pbParamInfo (VTS_... string,
  // NULL for none) and stores the result converted to vtRet in pvRet (a BOOL for
  // VT_BOOL, a CString for VT_BSTR). A window that is no control raises
  // CNotSupportedException; a call the control refuses, CInvalidArgException.
  LPUNKNOWN GetControlUnknown();
  void AFX_CDECL InvokeHelper(DISPID dwDispID, WORD wFlags, VARTYPE vtRet, void* pvRet,
                              const BYTE* pbParamInfo, ...);
  void GetProperty(DISPID dwDispID, VARTYPE vtProp, void* pvProp) const;
  void AFX_CDECL SetProperty(DISPID dwDispID, VARTYPE vtProp, ...);

  // Virtual functions you might override
  virtual BOOL PreCreateWindow(CREATESTRUCT& cs);
  virtual void PreSubclassWindow();
  virtual BOOL PreTranslateMessage(MSG* pMsg);
  virtual BOOL OnCmdMsg(UINT nID, int nCode, void* pExtra, AFX_CMDHANDLERINFO* pHandlerInfo);
  virtual void DoDataExchange(CDataExchange* pDX);
  virtual LRESULT WindowProc(UINT message, WPARAM wParam, LPARAM lParam);
  virtual LRESULT DefWindowProc(UINT message, WPARAM wParam, LPARAM lParam);
  virtual BOOL OnWndMsg(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult);
  virtual BOOL OnCommand(WPARAM wParam, LPARAM lParam);
  virtual BOOL OnNotify(WPARAM wParam, LPARAM lParam, LRESULT* pResult);
  virtual BOOL OnChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult);
  virtual void PostNcDestroy();
  virtual WNDPROC* GetSuperWndProcAddr();

  // Handlers with their default behaviour (the window's own procedure)
  afx_msg int OnCreate(LPCREATESTRUCT lpCreateStruct);
  afx_msg void OnDestroy();
  afx_msg void OnNcDestroy();
  afx_msg void OnClose();
  afx_msg void OnPaint();
  afx_msg BOOL OnEraseBkgnd(CDC* pDC);
  afx_msg void OnSize(UINT nType, int cx, int cy);
  afx_msg void OnMove(int x, int y);
  afx_msg void OnTimer(UINT nIDEvent);
  afx_msg void OnShowWindow(BOOL bShow, UINT nStatus);
  afx_msg void OnSetFocus(CWnd* pOldWnd);
  afx_msg void OnKillFocus(CWnd* pNewWnd);
  afx_msg void OnLButtonDown(UINT nFlags, CPoint point);
  afx_msg void OnLButtonUp(UINT nFlags, CPoint point);
  afx_msg void OnLButtonDblClk(UINT nFlags, CPoint point);
  afx_msg void OnRButtonDown(UINT nFlags, CPoint point);
  afx_msg void OnRButtonUp(UINT nFlags, CPoint point);
  afx_msg void OnMButtonDown(UINT nFlags, CPoint point);
  afx_msg void OnMouseMove(UINT nFlags, CPoint point);
  afx_msg BOOL OnMouseWheel(UINT nFlags, short zDelta, CPoint pt);
  afx_msg void OnContextMenu(CWnd* pWnd, CPoint pos);
  afx_msg void OnKeyDown(UINT nChar, UINT nRepCnt, UINT nFlags);
  afx_msg void OnKeyUp(UINT nChar, UINT nRepCnt, UINT nFlags);
  afx_msg void OnChar(UINT nChar, UINT nRepCnt, UINT nFlags);
  afx_msg void OnSysKeyDown(UINT nChar, UINT nRepCnt, UINT nFlags);
  afx_msg UINT OnGetDlgCode();
  afx_msg BOOL OnSetCursor(CWnd* pWnd, UINT nHitTest, UINT message);
  afx_msg UINT OnNcHitTest(CPoint point);
  afx_msg void OnHScroll(UINT nSBCode, UINT nPos, CScrollBar* pScrollBar);
  afx_msg void OnVScroll(UINT nSBCode, UINT nPos, CScrollBar* pScrollBar);
  afx_msg void OnDrawItem(int nIDCtl, LPDRAWITEMSTRUCT lpDrawItemStruct);
  afx_msg void OnMeasureItem(int nIDCtl, LPMEASUREITEMSTRUCT lpMeasureItemStruct);
  afx_msg HBRUSH OnCtlColor(CDC* pDC, CWnd* pWnd, UINT nCtlColor);
  afx_msg void OnActivate(UINT nState, CWnd* pWndOther, BOOL bMinimized);
  afx_msg void OnActivateApp(BOOL bActive, DWORD dwThreadID);
  afx_msg void OnSysCommand(UINT nID, LPARAM lParam);
  afx_msg void OnGetMinMaxInfo(MINMAXINFO* lpMMI);
  afx_msg void OnWindowPosChanged(WINDOWPOS* lpwndpos);
  afx_msg void OnDropFiles(HDROP hDropInfo);
  afx_msg BOOL OnQueryEndSession();

  // Calls the window's own procedure with the current message.
  LRESULT Default();

  WNDPROC m_pfnSuper; // the procedure the window had before AfxWndProc
  UINT m_nFlags;
  int m_nModalResult;

protected:
  // Reflection of the parent's message to this control: the reflected entries
  // of the map (ON_NOTIFY_REFLECT, ON_CONTROL_REFLECT, ...).
  BOOL ReflectChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult);

  DECLARE_MESSAGE_MAP()

private:
  CWnd(const CWnd&) = delete;
  CWnd& operator=(const CWnd&) = delete;
};

// The window procedure of every CWnd.
AFX_API LRESULT CALLBACK AfxWndProc(HWND hWnd, UINT nMsg, WPARAM wParam, LPARAM lParam);
AFX_API LRESULT AFXAPI AfxCallWndProc(CWnd* pWnd, HWND hWnd, UINT nMsg, WPARAM wParam, LPARAM lParam);
// The next window created on this thread is attached to pWnd before its first message.
AFX_API void AFXAPI AfxHookWindowCreate(CWnd* pWnd);
// FALSE if the hooked window was not created (the hook is then cleared).
AFX_API BOOL AFXAPI AfxUnhookWindowCreate();

// ---------------------------------------------------------------------------
// CDialog: modal (DoModal, own modal loop) and modeless (Create) dialogs from
// templates found through the resource chain.
// ---------------------------------------------------------------------------

class AFX_API CDialog : public CWnd {
  DECLARE_DYNAMIC(CDialog)
public:
  CDialog();
  explicit CDialog(LPCTSTR lpszTemplateName, CWnd* pParentWnd = NULL);
  explicit CDialog(UINT nIDTemplate, CWnd* pParentWnd = NULL);
  virtual ~CDialog();

  // Modeless
  virtual BOOL Create(LPCTSTR lpszTemplateName, CWnd* pParentWnd = NULL);
  virtual BOOL Create(UINT nIDTemplate, CWnd* pParentWnd = NULL);
  virtual BOOL CreateIndirect(LPCDLGTEMPLATE lpDialogTemplate, CWnd* pParentWnd = NULL, void* lpDialogInit = NULL);
  virtual BOOL CreateIndirect(HGLOBAL hDialogTemplate, CWnd* pParentWnd = NULL);

  // Modal: the EndDialog result, IDCANCEL when closed, -1 when the dialog could not be made.
  BOOL InitModalIndirect(LPCDLGTEMPLATE lpDialogTemplate, CWnd* pParentWnd = NULL, void* lpDialogInit = NULL);
  virtual INT_PTR DoModal();
  void EndDialog(int nResult);

  void NextDlgCtrl() const;
  void PrevDlgCtrl() const;
  void GotoDlgCtrl(CWnd* pWndCtrl);
  void SetDefID(UINT nID);
  DWORD GetDefID() const;
  void MapDialogRect(LPRECT lpRect) const;

  // Virtual functions you might override
  virtual BOOL OnInitDialog();
  virtual void OnSetFont(CFont* pFont);
  virtual BOOL PreTranslateMessage(MSG* pMsg);
  virtual BOOL OnCmdMsg(UINT nID, int nCode, void* pExtra, AFX_CMDHANDLERINFO* pHandlerInfo);

  LPCTSTR m_lpszTemplateName;
  HGLOBAL m_hDialogTemplate;
  LPCDLGTEMPLATE m_lpDialogTemplate;
  void* m_lpDialogInit;
  CWnd* m_pParentWnd;
  HWND m_hWndTop;
  UINT m_nIDHelp;

protected:
  virtual void OnOK();
  virtual void OnCancel();

  // Hands IsDialogMessage the keyboard and mouse input of the dialog.
  BOOL PreTranslateInput(LPMSG lpMsg);
  BOOL CreateDlgIndirect(LPCDLGTEMPLATE lpDialogTemplate, CWnd* pParentWnd, HINSTANCE hInst);
  HWND PreModal();
  void PostModal();

  DECLARE_MESSAGE_MAP()

private:
  void CommonConstruct();
};

// ---------------------------------------------------------------------------
// CFrameWnd: the application's main window. The subset holds what is read of
// it from outside: its accelerator table. Frames live on the heap and delete
// themselves when their window is gone.
// ---------------------------------------------------------------------------

class AFX_API CFrameWnd : public CWnd {
  DECLARE_DYNCREATE(CFrameWnd)
public:
  CFrameWnd();
  virtual ~CFrameWnd();

  // The accelerators of the frame; NULL when it has none. Not destroyed with
  // the frame: a table loaded from resources is freed by the system.
  HACCEL m_hAccelTable;

protected:
  virtual void PostNcDestroy();
};

AFX_API INT_PTR CALLBACK AfxDlgProc(HWND hWnd, UINT message, WPARAM wParam, LPARAM lParam);

// ---------------------------------------------------------------------------
// Controls: one-line wrappers of the control messages.
// ---------------------------------------------------------------------------

class AFX_API CStatic : public CWnd {
  DECLARE_DYNAMIC(CStatic)
public:
  CStatic() {}
  virtual BOOL Create(LPCTSTR lpszText, DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID = 0xffff);
  HICON SetIcon(HICON hIcon);
  HICON GetIcon() const;
  HBITMAP SetBitmap(HBITMAP hBitmap);
  HBITMAP GetBitmap() const;
};

class AFX_API CButton : public CWnd {
  DECLARE_DYNAMIC(CButton)
public:
  CButton() {}
  virtual BOOL Create(LPCTSTR lpszCaption, DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID);
  int GetCheck() const;
  void SetCheck(int nCheck);
  UINT GetState() const;
  void SetState(BOOL bHighlight);
  UINT GetButtonStyle() const;
  void SetButtonStyle(UINT nStyle, BOOL bRedraw = TRUE);
  HICON SetIcon(HICON hIcon);
  HBITMAP SetBitmap(HBITMAP hBitmap);

  // Owner-drawn buttons (BS_OWNERDRAW) draw here; the parent reflects WM_DRAWITEM.
  virtual void DrawItem(LPDRAWITEMSTRUCT lpDrawItemStruct);

protected:
  virtual BOOL OnChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult);
};

class AFX_API CEdit : public CWnd {
  DECLARE_DYNAMIC(CEdit)
public:
  CEdit() {}
  virtual BOOL Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID);
  void SetSel(int nStartChar, int nEndChar, BOOL bNoScroll = FALSE);
  void SetSel(DWORD dwSelection, BOOL bNoScroll = FALSE);
  DWORD GetSel() const;
  void GetSel(int& nStartChar, int& nEndChar) const;
  void ReplaceSel(LPCTSTR lpszNewText, BOOL bCanUndo = FALSE);
  void LimitText(int nChars = 0);
  void SetLimitText(UINT nMax);
  UINT GetLimitText() const;
  BOOL SetReadOnly(BOOL bReadOnly = TRUE);
  int GetLineCount() const;
  int LineIndex(int nLine = -1) const;
  int LineLength(int nLine = -1) const;
  int GetLine(int nIndex, LPTSTR lpszBuffer) const;
  int GetLine(int nIndex, LPTSTR lpszBuffer, int nMaxLength) const;
  BOOL GetModify() const;
  void SetModify(BOOL bModified = TRUE);
  void Clear();
  void Copy();
  void Cut();
  void Paste();
  BOOL Undo();
};

class AFX_API CListBox : public CWnd {
  DECLARE_DYNAMIC(CListBox)
public:
  CListBox() {}
  virtual BOOL Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID);

  int AddString(LPCTSTR lpszItem);
  int InsertString(int nIndex, LPCTSTR lpszItem);
  int DeleteString(UINT nIndex);
  void ResetContent();
  int GetCount() const;
  int GetCurSel() const;
  int SetCurSel(int nSelect);
  int GetSel(int nIndex) const;
  int SetSel(int nIndex, BOOL bSelect = TRUE);
  int GetSelCount() const;
  int GetSelItems(int nMaxItems, LPINT rgIndex) const;
  int GetText(int nIndex, LPTSTR lpszBuffer) const;
  void GetText(int nIndex, CString& rString) const;
  int GetTextLen(int nIndex) const;
  int SetItemData(int nIndex, DWORD_PTR dwItemData);
  DWORD_PTR GetItemData(int nIndex) const;
  int SetItemDataPtr(int nIndex, void* pData);
  void* GetItemDataPtr(int nIndex) const;
  int FindString(int nStartAfter, LPCTSTR lpszItem) const;
  int FindStringExact(int nIndexStart, LPCTSTR lpszFind) const;
  int SelectString(int nStartAfter, LPCTSTR lpszItem);
  void SetHorizontalExtent(int cxExtent);
  int GetHorizontalExtent() const;
  int GetTopIndex() const;
  int SetTopIndex(int nIndex);
  int GetItemRect(int nIndex, LPRECT lpRect) const;
  int GetItemHeight(int nIndex) const;
  int SetItemHeight(int nIndex, UINT cyItemHeight);
  int GetCaretIndex() const;
  int SetCaretIndex(int nIndex, BOOL bScroll = TRUE);
  // The nearest item to pt (client coordinates); bOutside TRUE if pt is outside every item.
  UINT ItemFromPoint(CPoint pt, BOOL& bOutside) const;

  // Owner-drawn list boxes draw, measure, compare and free items here; the
  // parent reflects the messages.
  virtual void DrawItem(LPDRAWITEMSTRUCT lpDrawItemStruct);
  virtual void MeasureItem(LPMEASUREITEMSTRUCT lpMeasureItemStruct);
  virtual int CompareItem(LPCOMPAREITEMSTRUCT lpCompareItemStruct);
  virtual void DeleteItem(LPDELETEITEMSTRUCT lpDeleteItemStruct);

protected:
  virtual BOOL OnChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult);
};

// Sent to the parent (WM_COMMAND) when the user ticked or unticked an item of a check list box.
#define CLBN_CHKCHANGE 40

struct AFX_CHECK_DATA;
struct AFX_CHECKLIST_STATE;

// An owner-drawn list box (LBS_OWNERDRAWFIXED or LBS_OWNERDRAWVARIABLE, with
// LBS_HASSTRINGS) with a check box before every item. The check state (0, 1,
// or 2 for indeterminate) and an item's enabled state live beside the item;
// SetItemData/GetItemData keep the caller's own data untouched. A click in the
// box or the space bar toggles the check of an enabled item (auto styles) and
// tells the parent with CLBN_CHKCHANGE; a disabled item takes no clicks.
class AFX_API CCheckListBox : public CListBox {
  DECLARE_DYNAMIC(CCheckListBox)
public:
  CCheckListBox();
  virtual ~CCheckListBox();
  virtual BOOL Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID);

  // BS_CHECKBOX, BS_AUTOCHECKBOX (the default), BS_3STATE or BS_AUTO3STATE.
  void SetCheckStyle(UINT nStyle);
  UINT GetCheckStyle() const;
  void SetCheck(int nIndex, int nCheck);
  // 0 for an item that was never ticked and for an index outside the list.
  int GetCheck(int nIndex);
  void Enable(int nIndex, BOOL bEnabled = TRUE);
  BOOL IsEnabled(int nIndex);

  // Where the box of an item is drawn; rectCheckBox comes centred at the item's left.
  virtual CRect OnGetCheckPosition(CRect rectItem, CRect rectCheckBox);
  // Draws the item's text right of its box (lpDrawItemStruct->rcItem starts there).
  virtual void DrawItem(LPDRAWITEMSTRUCT lpDrawItemStruct);
  virtual void MeasureItem(LPMEASUREITEMSTRUCT lpMeasureItemStruct);

protected:
  virtual void PreSubclassWindow();
  virtual BOOL OnChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult);
  void PreDrawItem(LPDRAWITEMSTRUCT lpDrawItemStruct);
  void PreMeasureItem(LPMEASUREITEMSTRUCT lpMeasureItemStruct);
  int PreCompareItem(LPCOMPAREITEMSTRUCT lpCompareItemStruct);
  void PreDeleteItem(LPDELETEITEMSTRUCT lpDeleteItemStruct);
  // The item at point (-1 for none) and whether point lies in its box.
  int CheckFromPoint(CPoint point, BOOL& bInCheck);
  void InvalidateCheck(int nIndex);
  // Gives every selected item of a multiple-selection list the check nCheck.
  void SetSelectionCheck(int nCheck);
  int CalcMinimumItemHeight();

  afx_msg void OnLButtonDown(UINT nFlags, CPoint point);
  afx_msg void OnLButtonDblClk(UINT nFlags, CPoint point);
  afx_msg void OnKeyDown(UINT nChar, UINT nRepCnt, UINT nFlags);
  afx_msg int OnCreate(LPCREATESTRUCT lpCreateStruct);
  afx_msg void OnDestroy();
  afx_msg LRESULT OnSetFont(WPARAM wParam, LPARAM lParam);
  afx_msg LRESULT OnLBGetItemData(WPARAM wParam, LPARAM lParam);
  afx_msg LRESULT OnLBSetItemData(WPARAM wParam, LPARAM lParam);
  DECLARE_MESSAGE_MAP()

  UINT m_nStyle;
  AFX_CHECKLIST_STATE* m_pState;

private:
  // The item's check data, made on first need when bCreate; NULL for no such item.
  AFX_CHECK_DATA* CheckData(int nIndex, BOOL bCreate);
  // The check data that d points to, NULL when d is the user's own value.
  AFX_CHECK_DATA* Known(DWORD_PTR d) const;
  // The user's toggle of nIndex in the current check style; false when it is not toggled.
  bool Toggle(int nIndex);
  void NotifyCheckChange();
};

class AFX_API CComboBox : public CWnd {
  DECLARE_DYNAMIC(CComboBox)
public:
  CComboBox() {}
  virtual BOOL Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID);

  int AddString(LPCTSTR lpszString);
  int InsertString(int nIndex, LPCTSTR lpszString);
  int DeleteString(UINT nIndex);
  void ResetContent();
  int GetCount() const;
  int GetCurSel() const;
  int SetCurSel(int nSelect);
  int GetLBText(int nIndex, LPTSTR lpszText) const;
  void GetLBText(int nIndex, CString& rString) const;
  int GetLBTextLen(int nIndex) const;
  int SetItemData(int nIndex, DWORD_PTR dwItemData);
  DWORD_PTR GetItemData(int nIndex) const;
  int SetItemDataPtr(int nIndex, void* pData);
  void* GetItemDataPtr(int nIndex) const;
  int FindString(int nStartAfter, LPCTSTR lpszString) const;
  int FindStringExact(int nIndexStart, LPCTSTR lpszFind) const;
  int SelectString(int nStartAfter, LPCTSTR lpszString);
  BOOL SetEditSel(int nStartChar, int nEndChar);
  DWORD GetEditSel() const;
  BOOL LimitText(int nMaxChars);
  void ShowDropDown(BOOL bShowIt = TRUE);
  BOOL GetDroppedState() const;
  int SetDroppedWidth(UINT nWidth);
  void SetHorizontalExtent(UINT nExtent);
  int GetTopIndex() const;
  int SetTopIndex(int nIndex);
  int GetItemHeight(int nIndex) const;
  int SetItemHeight(int nIndex, UINT cyItemHeight);

  virtual void DrawItem(LPDRAWITEMSTRUCT lpDrawItemStruct);
  virtual void MeasureItem(LPMEASUREITEMSTRUCT lpMeasureItemStruct);
  virtual int CompareItem(LPCOMPAREITEMSTRUCT lpCompareItemStruct);
  virtual void DeleteItem(LPDELETEITEMSTRUCT lpDeleteItemStruct);

protected:
  virtual BOOL OnChildNotify(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* pResult);
};

class AFX_API CScrollBar : public CWnd {
  DECLARE_DYNAMIC(CScrollBar)
public:
  CScrollBar() {}
  virtual BOOL Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID);
  int GetScrollPos() const;
  int SetScrollPos(int nPos, BOOL bRedraw = TRUE);
  void GetScrollRange(LPINT lpMinPos, LPINT lpMaxPos) const;
  void SetScrollRange(int nMinPos, int nMaxPos, BOOL bRedraw = TRUE);
  BOOL SetScrollInfo(LPSCROLLINFO lpScrollInfo, BOOL bRedraw = TRUE);
  BOOL GetScrollInfo(LPSCROLLINFO lpScrollInfo, UINT nMask = SIF_ALL);
  void ShowScrollBar(BOOL bShow = TRUE);
  BOOL EnableScrollBar(UINT nArrowFlags = ESB_ENABLE_BOTH);
};

// ---------------------------------------------------------------------------
// Dialog data exchange
// ---------------------------------------------------------------------------

class AFX_API CDataExchange {
public:
  CDataExchange(CWnd* pDlgWnd, BOOL bSaveAndValidate);

  BOOL m_bSaveAndValidate; // TRUE: controls -> members
  CWnd* m_pDlgWnd;
  UINT m_idLastControl;
  BOOL m_bEditLastControl;

  // The control nIDC (must exist); remembered for Fail.
  HWND PrepareCtrl(int nIDC);
  HWND PrepareEditCtrl(int nIDC);
  // Puts the focus on the last prepared control and throws CUserException*.
  [[noreturn]] void Fail();
};

AFX_API void AFXAPI DDX_Text(CDataExchange* pDX, int nIDC, CString& value);
AFX_API void AFXAPI DDX_Text(CDataExchange* pDX, int nIDC, int& value);
AFX_API void AFXAPI DDX_Text(CDataExchange* pDX, int nIDC, UINT& value);
AFX_API void AFXAPI DDX_Text(CDataExchange* pDX, int nIDC, long& value);
AFX_API void AFXAPI DDX_Text(CDataExchange* pDX, int nIDC, DWORD& value);
AFX_API void AFXAPI DDX_Text(CDataExchange* pDX, int nIDC, double& value);
AFX_API void AFXAPI DDX_Check(CDataExchange* pDX, int nIDC, int& value);
AFX_API void AFXAPI DDX_Radio(CDataExchange* pDX, int nIDC, int& value);
AFX_API void AFXAPI DDX_Control(CDataExchange* pDX, int nIDC, CWnd& rControl);
AFX_API void AFXAPI DDX_CBIndex(CDataExchange* pDX, int nIDC, int& index);
AFX_API void AFXAPI DDX_CBString(CDataExchange* pDX, int nIDC, CString& value);
// Loading selects only an item equal to the value (case-insensitive), else sets the text.
AFX_API void AFXAPI DDX_CBStringExact(CDataExchange* pDX, int nIDC, CString& value);
AFX_API void AFXAPI DDX_LBIndex(CDataExchange* pDX, int nIDC, int& index);
AFX_API void AFXAPI DDX_LBString(CDataExchange* pDX, int nIDC, CString& value);
AFX_API void AFXAPI DDV_MaxChars(CDataExchange* pDX, CString const& value, int nChars);
AFX_API void AFXAPI DDV_MinMaxInt(CDataExchange* pDX, int value, int minVal, int maxVal);

// Sets the window text only when it differs (no flicker, no needless EN_CHANGE).
AFX_API void AFXAPI AfxSetWindowText(HWND hWndCtrl, LPCTSTR lpszNew);
