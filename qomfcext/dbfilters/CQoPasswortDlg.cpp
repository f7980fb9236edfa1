#include "CQoPasswortDlg.h"

#include "resource.h"

BEGIN_MESSAGE_MAP(CQoPasswortDlg, CDialog)
END_MESSAGE_MAP()

CQoPasswortDlg::CQoPasswortDlg(CWnd* pParent)
    : CDialog(IDD, pParent)
{
}

CQoPasswortDlg::~CQoPasswortDlg()
{
}

void CQoPasswortDlg::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_PASSWORD_EDIT, m_strPassword);
    DDX_Text(pDX, IDC_PASSWORD_PROMPT, m_strPrompt);
}

bool CQoPasswortDlg::Ask(const char* file, CString& password)
{
    CString format;
    format.LoadString(IDS_PASSWORD_PROMPT);
    CQoPasswortDlg dlg;
    dlg.m_strPrompt.Format(format, file ? file : "");
    if (dlg.DoModal() != IDOK)
        return false;
    password = dlg.m_strPassword;
    return true;
}
