#include "CInputFilterConfigDbase.h"

#include <exception>

#include "CQoInputFilterDbase34.h"
#include "QoBatchMessageBox.h"
#include "QoPreviewCheck.h"
#include "resource.h"

namespace {
const int kEnabledControls[] = {IDC_DBASE_TEXT, IDC_DBASE_LBL_CHARSET, IDC_DBASE_CHARSET_HINT, IDC_DBASE_PREVIEW};
}

IMPLEMENT_DYNAMIC(CInputFilterConfigDbase, CInputFilterConfig)

CInputFilterConfigDbase::CInputFilterConfigDbase(CQoInputFilterDbase34* pFilter, int nNotifierId)
    : CInputFilterConfig(pFilter, nNotifierId, IDD, NULL), m_preview(1)
{
}

CInputFilterConfigDbase::~CInputFilterConfigDbase()
{
}

int CInputFilterConfigDbase::Create(CWnd* pParent)
{
    return CDialog::Create(IDD, pParent);
}

void CInputFilterConfigDbase::DoDataExchange(CDataExchange* pDX)
{
    CInputFilterConfig::DoDataExchange(pDX);
    DDX_Control(pDX, IDC_DBASE_CHARSET, m_charSet);
    DDX_Control(pDX, IDC_DBASE_PREVIEW, m_preview);
}

BOOL CInputFilterConfigDbase::OnInitDialog()
{
    CInputFilterConfig::OnInitDialog();
    // dBase data are always read as DOS text: the choice is shown, not offered.
    m_charSet.ResetContent();
    m_charSet.AddString("DOS Ascii");
    m_charSet.SetCurSel(0);
    m_charSet.EnableWindow(FALSE);

    m_preview.SetMaxRows(m_lMaxPreviewRows);
    m_preview.SetInputFilter(m_pInputFilter);
    RefreshPreview();
    return TRUE;
}

void CInputFilterConfigDbase::Enable(int bEnable)
{
    if (!::IsWindow(m_hWnd)) return;
    for (int id : kEnabledControls) {
        if (CWnd* pCtrl = GetDlgItem(id)) pCtrl->EnableWindow(bEnable);
    }
}

void CInputFilterConfigDbase::UpdateInputFilter(int bSave)
{
    if (bSave == 0 && ::IsWindow(m_hWnd)) RefreshPreview();
}

// A file that cannot be read (it vanished, or it ends before its records) is
// reported once, and the preview keeps what it showed rather than half a file.
void CInputFilterConfigDbase::RefreshPreview()
{
    if (m_pInputFilter == NULL) return;
    CString strError;
    if (!QoPreviewReadable(*m_pInputFilter, m_lMaxPreviewRows, strError)) {
        QoBatchMessageBox(0, IDOK, strError, MB_OK | MB_ICONEXCLAMATION);
        return;
    }
    try {
        m_preview.Update();
    } catch (const std::exception& e) {
        QoBatchMessageBox(0, IDOK, e.what(), MB_OK | MB_ICONEXCLAMATION);
    }
}

void CInputFilterConfigDbase::OnOK()
{
}

void CInputFilterConfigDbase::OnCancel()
{
}
