#include "CPrefixDialog.h"

#include "resource.h"

BEGIN_MESSAGE_MAP(CPrefixDialog, CDialog)
END_MESSAGE_MAP()

CPrefixDialog::CPrefixDialog(CWnd* pParent)
    : CDialog(IDD, pParent), m_bAlwaysSeparate(FALSE)
{
}

CPrefixDialog::~CPrefixDialog() {}

void CPrefixDialog::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Check(pDX, IDC_PREFIX_ALWAYS, m_bAlwaysSeparate);
    DDX_Text(pDX, IDC_PREFIX_SEPARATOR, m_strSeparator);
}
