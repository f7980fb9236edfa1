#include "CQoInputDialog.h"

#include "resource.h"

BEGIN_MESSAGE_MAP(CQoInputDialog, CDialog)
END_MESSAGE_MAP()

CQoInputDialog::CQoInputDialog(CWnd* pParent)
    : CDialog(IDD, pParent)
{
}

CQoInputDialog::~CQoInputDialog() {}

INT_PTR CQoInputDialog::DoModal()
{
    return CDialog::DoModal();
}

void CQoInputDialog::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_INPUT_VALUE, m_strValue);
    DDX_Text(pDX, IDC_INPUT_PROMPT, m_strPrompt);
}

BOOL CQoInputDialog::OnInitDialog()
{
    CDialog::OnInitDialog();
    if (!m_strTitle.IsEmpty())
        SetWindowText(m_strTitle);
    // The focus goes to the value, with the proposal selected for overtyping.
    return TRUE;
}
