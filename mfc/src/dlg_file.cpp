// CFileDialog: the system's dialogs for opening and saving a file.
#include "afxpriv.h"
#include "win_private.h"
#include "afxdlgs.h"

#include <cstring>

IMPLEMENT_DYNAMIC(CCommonDialog, CDialog)
IMPLEMENT_DYNAMIC(CFileDialog, CCommonDialog)

CCommonDialog::CCommonDialog(CWnd* pParentWnd) { m_pParentWnd = pParentWnd; }

CFileDialog::CFileDialog(BOOL bOpenFileDialog, LPCTSTR lpszDefExt, LPCTSTR lpszFileName, DWORD dwFlags,
                         LPCTSTR lpszFilter, CWnd* pParentWnd, DWORD dwSize)
    : CCommonDialog(pParentWnd), m_bOpenFileDialog(bOpenFileDialog) {
  memset(&m_ofn, 0, sizeof m_ofn);
  memset(m_szFileName, 0, sizeof m_szFileName);
  memset(m_szFileTitle, 0, sizeof m_szFileTitle);

  // The system knows the current size and the one of Windows NT 4.
  m_ofn.lStructSize = dwSize == OPENFILENAME_SIZE_VERSION_400A ? OPENFILENAME_SIZE_VERSION_400A : sizeof m_ofn;
  m_ofn.lpstrFile = m_szFileName;
  m_ofn.nMaxFile = MAX_PATH;
  m_ofn.lpstrFileTitle = m_szFileTitle;
  m_ofn.nMaxFileTitle = MAX_PATH;
  m_ofn.Flags = dwFlags | OFN_EXPLORER;
  m_ofn.hInstance = AfxGetResourceHandle();

  if (lpszDefExt != NULL) {
    m_strDefExt = lpszDefExt;
    m_ofn.lpstrDefExt = m_strDefExt;
  }
  if (lpszFileName != NULL) lstrcpynA(m_szFileName, lpszFileName, MAX_PATH);

  if (lpszFilter != NULL) {
    size_t n = strlen(lpszFilter);
    m_filter.assign(lpszFilter, lpszFilter + n);
    for (char& c : m_filter)
      if (c == '|') c = '\0';
    // A filter written without the closing "||" still ends the list.
    m_filter.push_back('\0');
    m_filter.push_back('\0');
    m_ofn.lpstrFilter = m_filter.data();
  }
}

CFileDialog::~CFileDialog() {}

INT_PTR CFileDialog::DoModal() {
  // The members may have been copied or moved since construction.
  m_ofn.lpstrFile = m_szFileName;
  m_ofn.nMaxFile = MAX_PATH;
  m_ofn.lpstrFileTitle = m_szFileTitle;
  m_ofn.nMaxFileTitle = MAX_PATH;
  m_szFileName[MAX_PATH - 1] = '\0';

  HWND hWndFocus = ::GetFocus();
  m_ofn.hwndOwner = PreModal();
  const qownd::CommonDialogs& comdlg = qownd::ComDlg();
  auto show = m_bOpenFileDialog ? comdlg.GetOpenFileName : comdlg.GetSaveFileName;
  BOOL bResult = show != nullptr && show(&m_ofn);
  PostModal();
  if (hWndFocus != NULL && ::IsWindow(hWndFocus)) ::SetFocus(hWndFocus);
  return bResult ? IDOK : IDCANCEL;
}

CString CFileDialog::GetPathName() const { return CString(m_ofn.lpstrFile != NULL ? m_ofn.lpstrFile : ""); }

CString CFileDialog::GetFileName() const {
  CString path = GetPathName();
  int i = path.GetLength();
  while (i > 0 && path[i - 1] != '\\' && path[i - 1] != '/' && path[i - 1] != ':') --i;
  return path.Mid(i);
}

CString CFileDialog::GetFileExt() const {
  CString name = GetFileName();
  int dot = name.ReverseFind('.');
  return dot < 0 ? CString() : name.Mid(dot + 1);
}

CString CFileDialog::GetFileTitle() const {
  CString name = GetFileName();
  int dot = name.ReverseFind('.');
  return dot < 0 ? name : name.Left(dot);
}
