#include "dialog_script.h"

#include "afxwin.h"

static CDialogScript* s_pCurrent = NULL;
static const DWORD kTimeoutMs = 20000;

CDialogScript::CDialogScript() : m_dwStart(::GetTickCount()) {
  s_pCurrent = this;
  m_nTimer = ::SetTimer(NULL, 0, 40, &CDialogScript::OnTimer);
}

CDialogScript::~CDialogScript() {
  ::KillTimer(NULL, m_nTimer);
  s_pCurrent = NULL;
}

CDialogScript& CDialogScript::Then(Step step) {
  m_steps.push_back(std::move(step));
  return *this;
}

CDialogScript& CDialogScript::AnswerBox(int nButton) {
  return Then([this, nButton](HWND hBox) {
    char szCaption[256] = "";
    ::GetWindowTextA(hBox, szCaption, sizeof(szCaption));
    m_boxes.push_back({ItemText(hBox, 0xFFFF), szCaption});
    ::PostMessageA(hBox, WM_COMMAND, nButton, 0);
  });
}

std::string CDialogScript::ItemText(HWND hDlg, int nID) {
  char sz[1024] = "";
  ::GetDlgItemTextA(hDlg, nID, sz, sizeof(sz));
  return sz;
}

void CDialogScript::Click(HWND hDlg, int nID) {
  ::PostMessageA(hDlg, WM_COMMAND, MAKEWPARAM(nID, BN_CLICKED), (LPARAM)::GetDlgItem(hDlg, nID));
}

HWND CDialogScript::FindDialog() {
  struct Search {
    HWND hFound;
  } search = {NULL};
  ::EnumThreadWindows(
      ::GetCurrentThreadId(),
      [](HWND hWnd, LPARAM lParam) -> BOOL {
        char szClass[16];
        if (::GetClassNameA(hWnd, szClass, sizeof(szClass)) && strcmp(szClass, "#32770") == 0 &&
            ::IsWindowVisible(hWnd) && ::IsWindowEnabled(hWnd)) {
          ((Search*)lParam)->hFound = hWnd;
          return FALSE;
        }
        return TRUE;
      },
      (LPARAM)&search);
  return search.hFound;
}

void CALLBACK CDialogScript::OnTimer(HWND, UINT, UINT_PTR, DWORD) {
  CDialogScript* self = s_pCurrent;
  if (self == NULL || self->m_bBusy) return;
  HWND hDlg = FindDialog();
  if (::GetTickCount() - self->m_dwStart > kTimeoutMs) {
    // A test went wrong: close whatever is open so that the run goes on.
    if (hDlg != NULL) ::PostMessageA(hDlg, WM_COMMAND, IDCANCEL, 0);
    return;
  }
  if (self->m_steps.empty() || hDlg == NULL || hDlg == self->m_hLast) {
    if (hDlg == NULL) self->m_hLast = NULL;
    return;
  }
  self->m_hLast = hDlg;
  Step step = std::move(self->m_steps.front());
  self->m_steps.erase(self->m_steps.begin());
  self->m_bBusy = true;
  step(hDlg);
  self->m_bBusy = false;
}

void PumpFor(DWORD nMilliseconds) {
  DWORD dwStart = ::GetTickCount();
  MSG msg;
  while (::GetTickCount() - dwStart < nMilliseconds) {
    while (::PeekMessageA(&msg, NULL, 0, 0, PM_REMOVE)) {
      if (!AfxPreTranslateMessage(&msg)) {
        ::TranslateMessage(&msg);
        ::DispatchMessageA(&msg);
      }
    }
    ::MsgWaitForMultipleObjects(0, NULL, FALSE, 10, QS_ALLINPUT);
  }
}
