#include "CQoPasswortDlg.h"

#include "CQoLog.h"
#include "QoBatchMessageBox.h"
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

CString CQoPasswortDlg::RefusedText(const char* file)
{
    CString text;
    text.Format("Die Datenbank '%s' ist durch ein Passwort gesch\xFCtzt; das Passwort fehlt oder ist falsch.",
                file ? file : "");
    return text;
}

bool CQoPasswortDlg::Ask(const char* file, CString& password)
{
    if (QoBatchMessageBoxGetMode()) {
        // Nobody is there to type it: the run goes on as after a cancel.
        _theLog << "ERR: " << (const char*)RefusedText(file) << " (Stapelbetrieb: keine Abfrage)" << CQoLog::endl;
        return false;
    }
    CString format;
    format.LoadString(IDS_PASSWORD_PROMPT);
    CQoPasswortDlg dlg;
    dlg.m_strPrompt.Format(format, file ? file : "");
    if (dlg.DoModal() != IDOK)
        return false;
    password = dlg.m_strPassword;
    return true;
}
