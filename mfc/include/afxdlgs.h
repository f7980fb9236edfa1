// MFC's header for the common dialogs. The subset holds the file dialog for
// opening and for saving, over the system's GetOpenFileName/GetSaveFileName:
//
//     CFileDialog dlg(TRUE, NULL, "kunden.txt", OFN_FILEMUSTEXIST,
//                     "Textdateien (*.txt)|*.txt|Alle Dateien (*.*)|*.*||", this);
//     if (dlg.DoModal() == IDOK) Open(dlg.GetPathName());
//
// m_ofn may be changed between construction and DoModal (initial folder,
// title, flags). One file is chosen at a time: the subset offers no walk over
// the names of a multiple selection.
#pragma once

#include "afxwin.h"

#include <commdlg.h>

#include <vector>

// The base of the common dialogs: a dialog whose window the system makes.
class AFX_API CCommonDialog : public CDialog {
  DECLARE_DYNAMIC(CCommonDialog)
public:
  explicit CCommonDialog(CWnd* pParentWnd);
};

class AFX_API CFileDialog : public CCommonDialog {
  DECLARE_DYNAMIC(CFileDialog)
public:
  // bOpenFileDialog: TRUE for "open", FALSE for "save as". lpszDefExt: the
  // extension (without the dot) added to a name typed without one.
  // lpszFileName: the initial name (cut to MAX_PATH - 1 characters).
  // lpszFilter: pairs of text and pattern separated by '|', ending in "||".
  // dwSize: the size of OPENFILENAME to hand the system; 0 for the current one.
  explicit CFileDialog(BOOL bOpenFileDialog, LPCTSTR lpszDefExt = NULL, LPCTSTR lpszFileName = NULL,
                       DWORD dwFlags = OFN_HIDEREADONLY | OFN_OVERWRITEPROMPT, LPCTSTR lpszFilter = NULL,
                       CWnd* pParentWnd = NULL, DWORD dwSize = 0);
  virtual ~CFileDialog();

  OPENFILENAMEA m_ofn;

  // IDOK when the user chose a file; IDCANCEL when the user cancelled or the
  // system could not show the dialog (CommDlgExtendedError tells which).
  virtual INT_PTR DoModal();

  // The chosen file: full path, name with extension, extension without the
  // dot, name without extension.
  CString GetPathName() const;
  CString GetFileName() const;
  CString GetFileExt() const;
  CString GetFileTitle() const;

protected:
  BOOL m_bOpenFileDialog;
  CString m_strDefExt;
  std::vector<char> m_filter;  // the filter with '|' turned into NUL, two NULs at the end
  char m_szFileName[MAX_PATH];
  char m_szFileTitle[MAX_PATH];
};
