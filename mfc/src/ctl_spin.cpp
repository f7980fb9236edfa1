// The up-down control: one common-control message per operation.
#include "afxpriv.h"
#include "afxcmn.h"

IMPLEMENT_DYNAMIC(CSpinButtonCtrl, CWnd)

static inline LRESULT SendCtrl(HWND hWnd, UINT message, WPARAM wParam, LPARAM lParam) {
  ASSERT(::IsWindow(hWnd));
  return ::SendMessageA(hWnd, message, wParam, lParam);
}
#define SEND(msg, w, l) SendCtrl(m_hWnd, (msg), (WPARAM)(w), (LPARAM)(l))

BOOL CSpinButtonCtrl::Create(DWORD dwStyle, const RECT& rect, CWnd* pParentWnd, UINT nID) {
  return CWnd::Create(UPDOWN_CLASSA, NULL, dwStyle, rect, pParentWnd, nID);
}

BOOL CSpinButtonCtrl::SetAccel(int nAccel, UDACCEL* pAccel) {
  ASSERT(nAccel >= 0 && (nAccel == 0 || pAccel != NULL));
  return (BOOL)SEND(UDM_SETACCEL, nAccel, pAccel);
}
UINT CSpinButtonCtrl::GetAccel(int nAccel, UDACCEL* pAccel) const {
  return (UINT)SEND(UDM_GETACCEL, nAccel, pAccel);
}

int CSpinButtonCtrl::SetBase(int nBase) { return (int)SEND(UDM_SETBASE, nBase, 0); }
UINT CSpinButtonCtrl::GetBase() const { return (UINT)LOWORD(SEND(UDM_GETBASE, 0, 0)); }

CWnd* CSpinButtonCtrl::SetBuddy(CWnd* pWndBuddy) {
  return CWnd::FromHandle((HWND)SEND(UDM_SETBUDDY, pWndBuddy != NULL ? pWndBuddy->m_hWnd : NULL, 0));
}
CWnd* CSpinButtonCtrl::GetBuddy() const { return CWnd::FromHandle((HWND)SEND(UDM_GETBUDDY, 0, 0)); }

int CSpinButtonCtrl::SetPos(int nPos) {
  // The 16-bit message carries the position in the low word of lParam.
  return (int)(short)LOWORD(SEND(UDM_SETPOS, 0, MAKELPARAM((WORD)nPos, 0)));
}
int CSpinButtonCtrl::GetPos() const { return (int)SEND(UDM_GETPOS, 0, 0); }

int CSpinButtonCtrl::SetPos32(int nPos) { return (int)SEND(UDM_SETPOS32, 0, nPos); }
int CSpinButtonCtrl::GetPos32(LPBOOL lpbError) const { return (int)SEND(UDM_GETPOS32, 0, lpbError); }

void CSpinButtonCtrl::SetRange(short nLower, short nUpper) {
  SEND(UDM_SETRANGE, 0, MAKELPARAM((WORD)nUpper, (WORD)nLower));
}
DWORD CSpinButtonCtrl::GetRange() const { return (DWORD)SEND(UDM_GETRANGE, 0, 0); }
void CSpinButtonCtrl::GetRange(int& lower, int& upper) const {
  DWORD dw = GetRange();
  lower = (int)(short)HIWORD(dw);
  upper = (int)(short)LOWORD(dw);
}
void CSpinButtonCtrl::SetRange32(int nLower, int nUpper) { SEND(UDM_SETRANGE32, nLower, nUpper); }
void CSpinButtonCtrl::GetRange32(int& lower, int& upper) const { SEND(UDM_GETRANGE32, &lower, &upper); }
