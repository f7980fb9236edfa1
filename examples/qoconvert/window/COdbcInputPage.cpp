#include "COdbcInputPage.h"

#include <QoBatchMessageBox.h>

#include <exception>

COdbcInputPage::COdbcInputPage(CQoInputFilter* pFilter, int nNotifierId)
    : CInputFilterConfig(pFilter, nNotifierId, IDD, NULL), m_preview(1)
{
}

int COdbcInputPage::Create(CWnd* pParent)
{
    return CDialog::Create(IDD, pParent);
}

void COdbcInputPage::DoDataExchange(CDataExchange* pDX)
{
    CInputFilterConfig::DoDataExchange(pDX);
    DDX_Control(pDX, IDC_ODBC_PREVIEW, m_preview);
}

BOOL COdbcInputPage::OnInitDialog()
{
    CInputFilterConfig::OnInitDialog();
    m_preview.SetMaxRows(m_lMaxPreviewRows);
    m_preview.SetInputFilter(m_pInputFilter);
    RefreshPreview();
    return TRUE;
}

void COdbcInputPage::Enable(int bEnable)
{
    if (::IsWindow(m_hWnd))
        m_preview.EnableWindow(bEnable);
}

void COdbcInputPage::UpdateInputFilter(int bSave)
{
    if (bSave == 0 && ::IsWindow(m_hWnd))
        RefreshPreview();
}

void COdbcInputPage::RefreshPreview()
{
    // A source that cannot be read is named once; the list keeps what it showed.
    try {
        m_preview.Update();
    } catch (const std::exception& e) {
        QoBatchMessageBox(0, IDOK, e.what(), MB_OK | MB_ICONEXCLAMATION);
    }
}
