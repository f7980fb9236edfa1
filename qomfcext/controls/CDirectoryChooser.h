// CDirectoryChooser - the modal dialog "Verzeichnis wählen" (template 4006), in
// which the user picks a folder from the tree of drives and folders.
//
// The tree opens along the start directory; after DoModal the chosen folder
// (with a trailing backslash) is in GetDirectory whichever way the dialog was
// closed, so the caller decides by DoModal's answer:
//
//     CDirectoryChooser dlg("Wohin sollen die Dateien geschrieben werden?", this, "C:\\Export");
//     if (dlg.DoModal() == IDOK) m_strTarget = dlg.GetDirectory();
#pragma once

#include <afxwin.h>

#include "CDirectoryTreeCtrl.h"
#include "QoMfcExtApi.h"

class QOMFCEXT_API CDirectoryChooser : public CDialog
{
    DECLARE_DYNAMIC(CDirectoryChooser)

public:
    enum { IDD = 4006 };

    CDirectoryChooser(const char* lpszText = NULL, CWnd* pParent = NULL, const char* lpszStartDir = NULL);
    virtual ~CDirectoryChooser();

    CString GetDirectory() const { return m_strDirectory; }

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual BOOL OnInitDialog();
    afx_msg void OnDestroy();
    DECLARE_MESSAGE_MAP()

    CDirectoryTreeCtrl m_tree;  // 4000
    CString m_strText;          // 4001
    CString m_strDirectory;     // the start directory, then the chosen one
};
