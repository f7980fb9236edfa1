// CQoPasswortDlg - the modal prompt for the password of a database file
// (internal to the library; template 4013).
//
// The file-database filters show it when the engine refuses a database for a
// wrong or missing password: the prompt names the file, the user types the
// password (hidden) and confirms, or cancels. An unattended run (batch mode)
// never waits for it: it is not shown and counts as cancelled.
#pragma once

#include <afxwin.h>

class CQoPasswortDlg : public CDialog
{
public:
    enum { IDD = 4013 };

    explicit CQoPasswortDlg(CWnd* pParent = NULL);
    virtual ~CQoPasswortDlg();

    CString m_strPassword;   // what the user typed
    CString m_strPrompt;     // the text above the field

    // The prompt for `file` (string 10), shown modally without a parent;
    // true and the typed password on OK. In batch mode nothing is shown: one
    // log line names the database and the answer is a cancel.
    static bool Ask(const char* file, CString& password);
    // What a filter reports when the password is missing or wrong and the
    // prompt was cancelled or not shown.
    static CString RefusedText(const char* file);

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    DECLARE_MESSAGE_MAP()
};
