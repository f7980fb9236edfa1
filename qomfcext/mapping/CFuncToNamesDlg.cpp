#include "CFuncToNamesDlg.h"

#include "resource.h"

BEGIN_MESSAGE_MAP(CFuncToNamesDlg, CDialog)
END_MESSAGE_MAP()

CFuncToNamesDlg::CFuncToNamesDlg(CWnd* pParent)
    : CDialog(IDD, pParent), m_nChoice(currentField)
{
}

CFuncToNamesDlg::~CFuncToNamesDlg() {}

void CFuncToNamesDlg::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Radio(pDX, IDC_FUNC_TO_NAMES_CURRENT, m_nChoice);
}
