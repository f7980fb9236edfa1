#include "CQoHint.h"

#include "CQoLog.h"
#include "resource.h"

std::set<unsigned int> CQoHint::m_setDontShow;

BEGIN_MESSAGE_MAP(CQoHint, CDialog)
END_MESSAGE_MAP()

CQoHint::CQoHint()
    : CDialog(IDD, NULL), m_bDontShow(FALSE), m_bMaySuppress(true)
{
}

CQoHint::CQoHint(bool maySuppress, CWnd* pParent)
    : CDialog(IDD, pParent), m_bDontShow(FALSE), m_bMaySuppress(maySuppress)
{
}

CQoHint::~CQoHint() {}

void CQoHint::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Check(pDX, IDC_HINT_DONT_SHOW, m_bDontShow);
    DDX_Text(pDX, IDC_HINT_TEXT, m_strText);
}

BOOL CQoHint::OnInitDialog()
{
    CDialog::OnInitDialog();
    CWnd* pCheck = GetDlgItem(IDC_HINT_DONT_SHOW);
    if (pCheck != NULL)
        pCheck->EnableWindow(m_bMaySuppress ? TRUE : FALSE);
    return TRUE;
}

void CQoHint::SetText(const CString& text)
{
    // The edit breaks a line only at CR LF; the string table has bare LF.
    m_strText = text;
    m_strText.Replace("\r\n", "\n");
    m_strText.Replace("\n", "\r\n");
}

void CQoHint::Log(UINT resultId) const
{
    // One log entry is one line.
    CString logged(m_strText);
    logged.Replace("\r\n", ";");
    CString result;
    result.LoadString(resultId);
    _theLog << "CQoHint (" << (const char*)logged << "), " << (const char*)result << CQoLog::endl;
}

void CQoHint::DoShow(unsigned int id)
{
    CString text;
    text.LoadString(id);
    SetText(text);
    bool hidden = m_setDontShow.count(id) != 0;
    Log(hidden ? IDS_HINT_NOT_SHOWN : IDS_HINT_SHOWN);
    if (hidden)
        return;

    m_bDontShow = FALSE;
    if (DoModal() == IDOK && m_bDontShow && m_bMaySuppress)
        m_setDontShow.insert(id);
}

void CQoHint::DoShow(const char* text)
{
    SetText(text != NULL ? text : "");
    Log(IDS_HINT_SHOWN);
    m_bDontShow = FALSE;
    DoModal();
}

void CQoHint::ShowHint(unsigned int id, bool maySuppress)
{
    CQoHint hint(maySuppress, NULL);
    hint.DoShow(id);
}

void CQoHint::ShowHint(const char* text)
{
    CQoHint hint(false, NULL);
    hint.DoShow(text);
}

void CQoHint::Hide(unsigned int id)
{
    m_setDontShow.insert(id);
}

void CQoHint::Reset()
{
    m_setDontShow.clear();
}

CQoHint::Iterator CQoHint::Begin()
{
    return m_setDontShow.begin();
}

CQoHint::Iterator CQoHint::End()
{
    return m_setDontShow.end();
}

void CQoHint::IteratorInc(Iterator& it)
{
    ++it;
}
