#include "CInputFilterConfigDao.h"

#include <exception>

#include "CQoException.h"
#include "CQoInputFilterDao.h"
#include "QoBatchMessageBox.h"
#include "QoPreviewCheck.h"
#include "resource.h"

namespace {

const int kEnabledControls[] = {IDC_DAO_TABLES, IDC_DAO_PREVIEW, IDC_DAO_LBL_TABLES};
const UINT WM_QO_SHOW_PICK_ERROR = WM_APP + 0x51;
const UINT kIcons[] = {IDI_DAO_TABLE, IDI_DAO_QUERY, IDI_DAO_WORKBOOK};  // in image order

void AddIcon(CImageList& images, UINT nId)
{
    HINSTANCE hInst = AfxFindResourceHandle(MAKEINTRESOURCE(nId), RT_GROUP_ICON);
    HICON hIcon = static_cast<HICON>(::LoadImageA(hInst, MAKEINTRESOURCE(nId), IMAGE_ICON, 16, 16, 0));
    images.Add(hIcon);
    if (hIcon != NULL) ::DestroyIcon(hIcon);
}

void ShowError(const char* text, UINT icon)
{
    QoBatchMessageBox(0, IDOK, text, MB_OK | icon);
}

}  // namespace

IMPLEMENT_DYNAMIC(CInputFilterConfigDao, CInputFilterConfig)

BEGIN_MESSAGE_MAP(CInputFilterConfigDao, CInputFilterConfig)
    ON_NOTIFY(LVN_ITEMCHANGED, IDC_DAO_TABLES, OnItemchangedTables)
    ON_NOTIFY(LVN_ITEMCHANGING, IDC_DAO_TABLES, OnItemchangingTables)
    ON_MESSAGE(WM_QO_SHOW_PICK_ERROR, OnShowPickError)
END_MESSAGE_MAP()

CInputFilterConfigDao::CInputFilterConfigDao(CQoInputFilterDao* pFilter, int nNotifierId)
    : CInputFilterConfig(pFilter, nNotifierId, IDD, NULL),
      m_preview(1),
      m_nSelected(-1),
      m_pImageList(new CImageList),
      m_bFilling(false),
      m_bShowing(false)
{
    m_pImageList->Create(16, 16, ILC_COLOR4 | ILC_MASK, 2, 1);
    for (UINT nId : kIcons) AddIcon(*m_pImageList, nId);
    m_preview.SetInputFilter(pFilter);
}

CInputFilterConfigDao::~CInputFilterConfigDao()
{
    delete m_pImageList;  // the list only shares it (LVS_SHAREIMAGELISTS)
}

CQoInputFilterDao* CInputFilterConfigDao::DaoFilter() const
{
    return static_cast<CQoInputFilterDao*>(m_pInputFilter);
}

int CInputFilterConfigDao::Create(CWnd* pParent)
{
    return CDialog::Create(IDD, pParent);
}

void CInputFilterConfigDao::DoDataExchange(CDataExchange* pDX)
{
    CInputFilterConfig::DoDataExchange(pDX);
    DDX_Control(pDX, IDC_DAO_TABLES, m_tables);
    DDX_Control(pDX, IDC_DAO_PREVIEW, m_preview);
}

// The filter's current table is selected by the host's UpdateInputFilter(0).
BOOL CInputFilterConfigDao::OnInitDialog()
{
    CInputFilterConfig::OnInitDialog();
    m_preview.SetMaxRows(m_lMaxPreviewRows);
    m_tables.SetImageList(m_pImageList, LVSIL_SMALL);
    FillTableList();
    return TRUE;
}

void CInputFilterConfigDao::Enable(int bEnable)
{
    if (!::IsWindow(m_hWnd)) return;
    for (int id : kEnabledControls) {
        if (CWnd* pCtrl = GetDlgItem(id)) pCtrl->EnableWindow(bEnable);
    }
}

void CInputFilterConfigDao::FillTableList()
{
    if (m_pInputFilter == NULL || !::IsWindow(m_tables.m_hWnd)) return;
    CQoInputFilterDao* pFilter = DaoFilter();
    const CString strDatabase = (const char*)pFilter->GetDatabaseName();
    CDaoDatabase& db = pFilter->GetDatabase();
    if (!db.IsOpen()) {
        // A file that could not be opened (or whose password was not given):
        // said once, and the list keeps the tables it showed.
        if (!strDatabase.IsEmpty() && strDatabase != m_strReported) {
            m_strReported = strDatabase;
            CString strFormat, strMessage;
            strFormat.LoadString(IDS_DAO_NOT_OPEN);
            strMessage.Format(strFormat, (LPCSTR)strDatabase);
            ShowError(strMessage, MB_ICONEXCLAMATION);
        }
        return;
    }
    m_strReported.Empty();
    m_strListed = strDatabase;
    m_nSelected = -1;

    const bool bAccess = pFilter->InputFilterType() == CQoInputFilter::filterAccess;
    m_bFilling = true;
    m_tables.DeleteAllItems();
    try {
        const int nTables = db.GetTableDefCount();
        for (int i = 0; i < nTables; ++i) {
            CDaoTableDefInfo info;
            db.GetTableDefInfo(i, info, AFX_DAO_PRIMARY_INFO);
            if (info.m_lAttributes & dbSystemObject) continue;
            const int nItem = m_tables.InsertItem(0, info.m_strName, bAccess ? imageTable : imageWorkbook);
            m_tables.SetItemData(nItem, 0);
        }
        const int nQueries = db.GetQueryDefCount();
        for (int i = 0; i < nQueries; ++i) {
            CDaoQueryDefInfo info;
            db.GetQueryDefInfo(i, info, AFX_DAO_PRIMARY_INFO);
            if (info.m_nType != dbQSelect) continue;  // action queries change data, they are not read
            const int nItem = m_tables.InsertItem(0, info.m_strName, bAccess ? imageQuery : imageWorkbook);
            m_tables.SetItemData(nItem, 1);
        }
    } catch (CDaoException* e) {
        const CString strText = e->m_pErrorInfo != NULL ? e->m_pErrorInfo->m_strDescription : CString();
        e->Delete();
        ShowError(strText, 0);
    }
    m_bFilling = false;
}

void CInputFilterConfigDao::UpdateInputFilter(int bSave)
{
    if (bSave != 0 || m_pInputFilter == NULL || !::IsWindow(m_hWnd)) return;
    CQoInputFilterDao* pFilter = DaoFilter();
    // The host may have opened another database (or the same one again, now
    // that it could be opened).
    if (!pFilter->GetDatabase().IsOpen() || m_strListed != (const char*)pFilter->GetDatabaseName())
        FillTableList();

    const CString strName = (const char*)pFilter->GetTableName();
    if (strName.IsEmpty()) return;
    LVFINDINFO find = {};
    find.flags = LVFI_STRING;
    find.psz = strName;
    const int nItem = m_tables.FindItem(&find, -1);
    if (nItem < 0) return;
    m_bShowing = true;
    m_tables.SetItemState(nItem, LVIS_SELECTED, LVIS_SELECTED);
    m_bShowing = false;
    LRESULT result = 0;
    OnItemchangedTables(NULL, &result);
}

void CInputFilterConfigDao::ShowSelected(int nItem)
{
    m_nSelected = nItem;
    m_bShowing = true;
    if (nItem >= 0) {
        m_tables.SetItemState(nItem, LVIS_SELECTED | LVIS_FOCUSED, LVIS_SELECTED | LVIS_FOCUSED);
    } else {
        for (int i = m_tables.GetNextItem(-1, LVNI_SELECTED); i >= 0; i = m_tables.GetNextItem(i, LVNI_SELECTED))
            m_tables.SetItemState(i, 0, LVIS_SELECTED);
    }
    m_bShowing = false;
}

// The host may keep the current table: a refused selection change leaves the
// list as it is. Only changes of the selection are asked for, not the focus
// moving, nor the page's own moves.
void CInputFilterConfigDao::OnItemchangingTables(NMHDR* pNMHDR, LRESULT* pResult)
{
    *pResult = 0;
    if (m_bFilling || m_bShowing) return;
    const NMLISTVIEW* pChange = reinterpret_cast<const NMLISTVIEW*>(pNMHDR);
    if (!(pChange->uChanged & LVIF_STATE) || !((pChange->uOldState ^ pChange->uNewState) & LVIS_SELECTED)) return;
    if (NotifyListeners() == 0) *pResult = 1;
}

void CInputFilterConfigDao::OnItemchangedTables(NMHDR* /*pNMHDR*/, LRESULT* pResult)
{
    *pResult = 0;
    if (m_bFilling) return;
    const int nItem = m_tables.GetNextItem(-1, LVNI_SELECTED);
    if (nItem < 0 || nItem == m_nSelected) return;  // the same pick told again
    m_nSelected = nItem;
    if (m_pInputFilter == NULL) return;

    CQoInputFilterDao* pFilter = DaoFilter();
    if (!pFilter->GetDatabase().IsOpen()) {
        // The filter would ignore the pick and read nothing; it is not taken.
        CString strFormat, strMessage;
        strFormat.LoadString(IDS_DAO_NOT_OPEN);
        strMessage.Format(strFormat, (const char*)pFilter->GetDatabaseName());
        RefusePick(strMessage);
        return;
    }
    const CString strName = m_tables.GetItemText(nItem, 0);
    const bool bQuery = m_tables.GetItemData(nItem) != 0;
    const CQoString strOldName = pFilter->GetTableName();
    const CQoInputFilterDB::tabletype oldType = pFilter->GetTableType();
    try {
        pFilter->InitTable(strName, bQuery ? CQoInputFilterDB::tableQuery : CQoInputFilterDB::tableTable, true);
    } catch (const CQoException& e) {
        // The filter goes back to the table it read, and the list shows it again.
        const CString strMessage = e.Message();
        if (!strOldName.IsEmpty() && oldType != CQoInputFilterDB::tableNone) {
            try {
                pFilter->InitTable(strOldName, oldType, true);
            } catch (const CQoException&) {
            }
        }
        RefusePick(strMessage);
        RefreshPreview();
        return;
    }
    RefreshPreview();
    NotifyListeners();  // the table is taken; a refusal here changes nothing
}

void CInputFilterConfigDao::RefusePick(const CString& strMessage)
{
    // The item of the table the filter reads (the indexes may have moved).
    int nItem = -1;
    const CString strTable = (const char*)DaoFilter()->GetTableName();
    if (!strTable.IsEmpty()) {
        LVFINDINFO find = {};
        find.flags = LVFI_STRING;
        find.psz = strTable;
        nItem = m_tables.FindItem(&find, -1);
    }
    ShowSelected(nItem);
    // A message box inside the list's click would let the list go on with the
    // click behind it and pick the refused item once more.
    m_strPickError = strMessage;
    if (!PostMessage(WM_QO_SHOW_PICK_ERROR)) OnShowPickError(0, 0);
}

LRESULT CInputFilterConfigDao::OnShowPickError(WPARAM, LPARAM)
{
    const CString strMessage = m_strPickError;
    m_strPickError.Empty();
    if (!strMessage.IsEmpty()) ShowError(strMessage, MB_ICONERROR);
    return 0;
}

void CInputFilterConfigDao::RefreshPreview()
{
    if (!::IsWindow(m_preview.m_hWnd)) return;
    CString strError;
    if (!QoPreviewReadable(*m_pInputFilter, m_lMaxPreviewRows, strError)) {
        ShowError(strError, MB_ICONEXCLAMATION);
        return;
    }
    try {
        m_preview.Update();
    } catch (const std::exception& e) {
        ShowError(e.what(), MB_ICONEXCLAMATION);
    }
}

void CInputFilterConfigDao::OnOK()
{
}

void CInputFilterConfigDao::OnCancel()
{
}
