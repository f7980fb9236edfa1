#include "CCorrectRepairDlg.h"

#include "CQoString.h"
#include "resource.h"

BEGIN_MESSAGE_MAP(CCorrectRepairDlg, CDialog)
END_MESSAGE_MAP()

CCorrectRepairDlg::CCorrectRepairDlg(CWnd* pParent)
    : CDialog(IDD, pParent)
{
}

CCorrectRepairDlg::~CCorrectRepairDlg() {}

void CCorrectRepairDlg::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    if (!pDX->m_bSaveAndValidate) {
        // A record may be longer than an edit takes by typing.
        SendDlgItemMessage(IDC_REPAIR_CORRECTION, EM_LIMITTEXT, 0, 0);
    }
    DDX_Text(pDX, IDC_REPAIR_CORRECTION, m_strRecord);
}

int CCorrectRepairDlgDoIt(CQoString& record)
{
    CCorrectRepairDlg dlg(NULL);
    dlg.m_strRecord = CString(record.GetString(), record.GetLength());
    if (dlg.DoModal() != IDOK)
        return 0;
    record = CQoString(dlg.m_strRecord, dlg.m_strRecord.GetLength());
    return 1;
}
