#include "CQoInfoView.h"

#include "resource.h"

BEGIN_MESSAGE_MAP(CQoInfoView, CDialog)
END_MESSAGE_MAP()

CQoInfoView::CQoInfoView(CWnd* pParent)
    : CDialog(IDD, pParent)
{
}

CQoInfoView::~CQoInfoView() {}

void CQoInfoView::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_INFO_TEXT, m_strText);
}

void CQoInfoView::Append(const CString& text)
{
    // First pairs to LF, so that they do not become CR CR LF below.
    CString normal(text);
    normal.Replace("\r\n", "\n");
    normal.Replace("\n", "\r\n");
    m_strText += normal;
}

void CQoInfoView::Clear()
{
    m_strText.Empty();
}
