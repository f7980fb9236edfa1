// CCorrectRepairDlg - one line in which the user corrects a taken-over record
// that still does not fit the file's format (template 4044, "Eingabe
// korrigieren"). Used by the library only: CRepairRecordDlgDoIt installs
// CCorrectRepairDlgDoIt in the base library, which calls it until the record
// fits or the user gives up.
#pragma once

#include <afxwin.h>

class CQoString;

class CCorrectRepairDlg : public CDialog
{
public:
    enum { IDD = 4044 };

    explicit CCorrectRepairDlg(CWnd* pParent = NULL);
    virtual ~CCorrectRepairDlg();

    CString m_strRecord;   // edit 4120

protected:
    virtual void DoDataExchange(CDataExchange* pDX);

    DECLARE_MESSAGE_MAP()
};

// The correction hook: shows the dialog for `record` without a parent. OK
// answers 1 with the edited record in `record`; cancelling answers 0 and leaves
// `record` unchanged.
int CCorrectRepairDlgDoIt(CQoString& record);
