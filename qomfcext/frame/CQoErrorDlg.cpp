#include "CQoErrorDlg.h"

#include <CQoString.h>

#include "CQoLog.h"
#include "resource.h"

std::map<int, CString> CQoErrorDlg::m_mapMessages;

BEGIN_MESSAGE_MAP(CQoErrorDlg, CDialog)
END_MESSAGE_MAP()

CQoErrorDlg::CQoErrorDlg(CWnd* pParent)
    : CDialog(IDD, pParent)
{
}

CQoErrorDlg::~CQoErrorDlg() {}

void CQoErrorDlg::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_ERROR_INFO, m_strInfo);
    DDX_Text(pDX, IDC_ERROR_MESSAGE, m_strMessage);
}

void CQoErrorDlg::AddMessage(int code, const CString& text)
{
    m_mapMessages[code] = text;
}

void CQoErrorDlg::ClearMessage(int code)
{
    m_mapMessages[code].Empty();
}

void CQoErrorDlg::ClearAllMessages()
{
    m_mapMessages.clear();
}

void CQoErrorDlg::ShowError(int code, const char* info)
{
    CString registered;
    std::map<int, CString>::const_iterator it = m_mapMessages.find(code);
    if (it != m_mapMessages.end())
        registered = it->second;

    CString format;
    format.LoadString(IDS_ERROR_OCCURRED);
    CString message;
    message.Format(format, code, (const char*)registered);

    // The multi-line edit needs carriage return and line feed to break a line.
    // Breaks that already are pairs stay pairs.
    CQoString shown(info ? info : "");
    shown.Replace("\r\n", "\n");
    shown.Replace("\n", "\r\n");

    CQoErrorDlg dlg;
    dlg.m_strMessage = message;
    dlg.m_strInfo = (const char*)shown;
    dlg.DoModal();

    // One log line each.
    CQoString loggedInfo(shown);
    loggedInfo.Replace("\r\n", ";");
    CQoString loggedMessage((const char*)message);
    loggedMessage.Replace("\r\n", ";");
    loggedMessage.Replace("\n", ";");
    _theLog << "ERR: " << (const char*)loggedMessage << CQoLog::endl;
    _theLog << "ERR: " << (const char*)loggedInfo << CQoLog::endl;
}

void CQoErrorDlg::ShowError(int code, UINT infoId)
{
    CString info;
    info.LoadString(infoId);
    ShowError(code, (const char*)info);
}
