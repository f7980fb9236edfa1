#include "CColumnConfig.h"

#include <CQoInputFilter.h>
#include <CQoString.h>
#include <QoLimits.h>

#include "resource.h"

namespace {
// Caption row: green text, red when its row is selected.
const DWORD kCaptionText = 0x007F00;
const DWORD kCaptionSelectedText = 0x0000FF;

const UINT kPageControls[] = {IDC_COLUMN_LBL_FIELD, IDC_COLUMN_LBL_VALUE, IDC_COLUMN_INSTRUCTION,
                              IDC_COLUMN_FIELDS,    IDC_COLUMN_VALUES,    IDC_COLUMN_PREVIEW};
}  // namespace

// ---------------------------------------------------------------------------
// CColumnConfig::CEntry
// ---------------------------------------------------------------------------

CColumnConfig::CEntry::CEntry() : m_nId(0), m_bEnabled(TRUE), m_bInitiallyEnabled(TRUE) {}

CColumnConfig::CEntry::CEntry(const char* lpszName, int nId, int bEnabled)
    : m_strName(lpszName != NULL ? lpszName : ""), m_nId(nId), m_bEnabled(bEnabled), m_bInitiallyEnabled(bEnabled)
{
}

CColumnConfig::CEntry::~CEntry() {}

// ---------------------------------------------------------------------------
// CColumnConfig
// ---------------------------------------------------------------------------

BEGIN_MESSAGE_MAP(CColumnConfig, CModelessDialog)
    ON_CBN_SELCHANGE(IDC_COLUMN_FIELDS, OnSelchangeFieldList)
    ON_NOTIFY(LVN_COLUMNCLICK, IDC_COLUMN_PREVIEW, OnColumnclickList)
    ON_CBN_SELCHANGE(IDC_COLUMN_VALUES, OnSelchangeValueList)
    ON_WM_CONTEXTMENU()
    ON_COMMAND_RANGE(CColumnConfig::kFirstValueCmd, CColumnConfig::kFieldNameCmd, OnPopupCmd)
END_MESSAGE_MAP()

CColumnConfig::CColumnConfig(int nNotifierId, CWnd* pParent)
    : CModelessDialog(IDD_COLUMN_CONFIG, pParent),
      CModifiedNotifier(nNotifierId),
      m_nCurrentField(-1),
      m_nNumFields(0),
      m_pInputFilter(NULL),
      m_bEnabled(TRUE),
      m_nDefaultValue(0),
      m_bFieldNameEnabled(false)
{
    m_list.SetDontShowSelected(true);
    m_list.SetSpecialFirstRow(true, kCaptionText, kCaptionSelectedText);
}

CColumnConfig::~CColumnConfig() {}

BOOL CColumnConfig::Create(CWnd* pParent)
{
    return CDialog::Create(IDD_COLUMN_CONFIG, pParent);
}

void CColumnConfig::DoDataExchange(CDataExchange* pDX)
{
    CModelessDialog::DoDataExchange(pDX);
    DDX_Control(pDX, IDC_COLUMN_VALUES, m_cbValues);
    DDX_Control(pDX, IDC_COLUMN_FIELDS, m_cbFields);
    DDX_Control(pDX, IDC_COLUMN_PREVIEW, m_list);
}

BOOL CColumnConfig::OnInitDialog()
{
    CModelessDialog::OnInitDialog();
    m_list.Init();
    return TRUE;
}

// Enter and Escape leave the page as it is.
void CColumnConfig::OnOK() {}

void CColumnConfig::OnCancel() {}

// --- values ------------------------------------------------------------------

void CColumnConfig::AddValue(int nId, const char* lpszName, int bEnabled, int bMakeDefault)
{
    CEntry entry(lpszName, nId, bEnabled);
    const int nIndex = static_cast<int>(m_arrValues.Add(entry));
    if (bMakeDefault) m_nDefaultValue = nIndex;
}

void CColumnConfig::AddValue(const char* lpszName, int bEnabled, int bMakeDefault)
{
    AddValue(NumValues(), lpszName, bEnabled, bMakeDefault);
}

void CColumnConfig::RemoveValue(int nId)
{
    const bool bWindow = ::IsWindow(m_hWnd) != FALSE;
    // The value that moves into a removed place is not looked at again.
    for (int i = 0; i < NumValues(); ++i) {
        if (m_arrValues[i].m_nId != nId || i == m_nDefaultValue) continue;
        if (bWindow) m_cbValues.DeleteString(i);
        m_arrValues.RemoveAt(i);
        // The default index names a value, not a place: it moves with its value.
        if (i < m_nDefaultValue) --m_nDefaultValue;
        for (INT_PTR f = 0; f < m_arrFieldValues.GetSize(); ++f) {
            if (m_arrFieldValues[f] == i)
                m_arrFieldValues[f] = m_nDefaultValue;
            else if (m_arrFieldValues[f] > i)
                --m_arrFieldValues[f];
        }
    }
    SetupHeaders(FALSE);
}

int CColumnConfig::Enabled(int nIndex) const
{
    return IsValueIndex(nIndex) ? m_arrValues[nIndex].m_bEnabled : FALSE;
}

void CColumnConfig::Enabled(int nIndex, int bEnabled)
{
    if (IsValueIndex(nIndex)) m_arrValues[nIndex].m_bEnabled = bEnabled;
}

void CColumnConfig::PopupNameClicked(int) {}

// --- fields ------------------------------------------------------------------

int CColumnConfig::ValueIndexOf(int nField) const
{
    return IsField(nField) ? m_arrFieldValues[nField] : m_nDefaultValue;
}

int CColumnConfig::Value(int nField) const
{
    const int nIndex = ValueIndexOf(nField);
    return IsValueIndex(nIndex) ? m_arrValues[nIndex].m_nId : 0;
}

void CColumnConfig::Value(int nField, int nId)
{
    if (!IsField(nField)) return;
    m_arrFieldValues[nField] = m_nDefaultValue;
    for (int i = 0; i < NumValues(); ++i)
        if (m_arrValues[i].m_nId == nId) m_arrFieldValues[nField] = i;  // the last one wins
}

void CColumnConfig::GetName(int nField, CString& strName) const
{
    const int nIndex = ValueIndexOf(nField);
    if (IsValueIndex(nIndex)) strName = m_arrValues[nIndex].m_strName;
}

CString CColumnConfig::GetFieldName(int nField) const
{
    CString strName;
    if (m_pInputFilter != NULL) {
        CQoString name;
        m_pInputFilter->ColName(nField, name);
        strName = name.GetString();
    } else {
        CString strFormat;
        strFormat.LoadString(IDS_FIELD_N);
        strName.Format(strFormat, nField);
    }
    return strName;
}

int CColumnConfig::GetFilterIndex(int nId) const
{
    if (m_pInputFilter == NULL) return -1;
    int nIndex = -1;
    for (int i = 0; i < NumValues() && nIndex < 0; ++i)
        if (m_arrValues[i].m_nId == nId) nIndex = i;
    if (nIndex < 0) return -1;
    for (INT_PTR f = 0; f < m_arrFieldValues.GetSize(); ++f)
        if (m_arrFieldValues[f] == nIndex) return static_cast<int>(f);
    return -1;
}

void CColumnConfig::Init(CQoInputFilter* pFilter)
{
    m_pInputFilter = pFilter;
    m_list.SetInputFilter(pFilter);
    // A filter's column count comes from its file: more fields than any
    // layout may have are not offered.
    int nFields = pFilter != NULL ? pFilter->NumCols() : 0;
    if (nFields < 0) nFields = 0;
    if (nFields > qolimits::maxColumns) nFields = qolimits::maxColumns;
    m_nNumFields = nFields;
    // Fields that existed before keep their value; new ones start at index 0.
    m_arrFieldValues.SetSize(nFields);
    if (m_nCurrentField >= nFields) m_nCurrentField = -1;

    if (!::IsWindow(m_hWnd)) return;
    m_list.Update();
    m_cbFields.ResetContent();
    m_cbValues.ResetContent();
    for (int f = 0; f < nFields; ++f) m_cbFields.AddString(GetFieldName(f));
    m_cbFields.SetCurSel(0);
    m_cbValues.Init();
    for (int i = 0; i < NumValues(); ++i) m_arrValues[i].m_bEnabled = m_arrValues[i].m_bInitiallyEnabled;
    SetupHeaders(FALSE);
    OnSelchangeFieldList();
}

void CColumnConfig::Enable(BOOL bEnable)
{
    if (::IsWindow(m_hWnd)) {
        for (UINT nId : kPageControls) {
            CWnd* pControl = GetDlgItem(nId);
            if (pControl != NULL) pControl->EnableWindow(bEnable);
        }
    }
    m_bEnabled = bEnable;
}

void CColumnConfig::SetupHeaders(int bSelectFirst)
{
    if (!::IsWindow(m_list.m_hWnd)) return;
    for (int f = 0; f < m_nNumFields; ++f) {
        CString strText;
        if (NumValues() > 0) GetName(f, strText);
        m_list.SetSpecialText(f, strText);
    }
    m_list.SendMessage(LVM_REDRAWITEMS, 0, 0);
    m_list.UpdateWindow();
    if (bSelectFirst) {
        m_cbFields.SetCurSel(0);
        OnSelchangeFieldList();
    }
}

// --- the user's choices --------------------------------------------------------

void CColumnConfig::ComputeValueFlags()
{
    if (NumValues() == 0) return;
    for (int i = 0; i < NumValues(); ++i) m_arrValues[i].m_bEnabled = TRUE;
    // A value other than the default belongs to one field at most.
    for (INT_PTR f = 0; f < m_arrFieldValues.GetSize(); ++f) {
        if (f == m_nCurrentField) continue;
        const int nIndex = m_arrFieldValues[f];
        if (IsValueIndex(nIndex)) m_arrValues[nIndex].m_bEnabled = FALSE;
    }
    if (IsValueIndex(m_nDefaultValue)) m_arrValues[m_nDefaultValue].m_bEnabled = TRUE;
    AdjustValueFlags();
    m_cbValues.ResetContent();
    for (int i = 0; i < NumValues(); ++i) m_cbValues.AddString(m_arrValues[i].m_strName, m_arrValues[i].m_bEnabled);
}

void CColumnConfig::ShowValueOf(int nField)
{
    if (IsField(nField)) m_cbValues.SetCurSel(m_arrFieldValues[nField]);
}

void CColumnConfig::OnSelchangeFieldList()
{
    const int nField = m_cbFields.GetCurSel();
    if (!IsField(nField)) return;
    m_nCurrentField = nField;
    ComputeValueFlags();
    ShowValueOf(nField);
}

void CColumnConfig::OnSelchangeValueList()
{
    const int nField = m_cbFields.GetCurSel();
    const int nValue = m_cbValues.GetCurSel();
    if (nValue < 0 || !IsValueIndex(nValue) || !m_cbValues.IsEnabled(nValue)) {
        // Nothing was taken: the list must not go on showing a value the field does not hold.
        ShowValueOf(nField);
        return;
    }
    if (!IsField(nField)) return;
    const int nOld = m_arrFieldValues[nField];
    m_arrFieldValues[nField] = nValue;
    SetupHeaders(FALSE);
    if (!NotifyListeners()) {
        m_arrFieldValues[nField] = nOld;
        SetupHeaders(FALSE);
        ShowValueOf(nField);
    }
}

void CColumnConfig::OnColumnclickList(NMHDR* pNMHDR, LRESULT* pResult)
{
    const NMLISTVIEW* pNMLV = reinterpret_cast<const NMLISTVIEW*>(pNMHDR);
    m_cbFields.SetCurSel(pNMLV->iSubItem);
    OnSelchangeFieldList();
    *pResult = 0;
}

void CColumnConfig::OnContextMenu(CWnd*, CPoint point)
{
    if (!m_bEnabled || !::IsWindow(m_list.m_hWnd)) return;
    const int nField = m_list.ColumnAtScreenPoint(point);
    if (nField < 0) return;

    m_cbFields.SetCurSel(nField);
    OnSelchangeFieldList();

    CMenu menu;
    if (!menu.CreatePopupMenu()) return;
    menu.AppendMenu(MF_STRING | (m_bFieldNameEnabled ? 0 : MF_DISABLED), kFieldNameCmd, GetFieldName(nField));
    menu.SetDefaultItem(kFieldNameCmd);
    menu.AppendMenu(MF_SEPARATOR);
    // The command ids past the values' range belong to the field name: the
    // values beyond it are left to the value list.
    for (int i = 0; i < NumValues() && i < kMenuValues; ++i)
        menu.AppendMenu(MF_STRING | (m_arrValues[i].m_bEnabled ? 0 : MF_GRAYED), kFirstValueCmd + i,
                        m_arrValues[i].m_strName);
    menu.TrackPopupMenu(TPM_RIGHTBUTTON, point.x, point.y, this);
}

void CColumnConfig::OnPopupCmd(UINT nID)
{
    if (nID == kFieldNameCmd) {
        PopupNameClicked(m_cbFields.GetCurSel());
        return;
    }
    const int nIndex = static_cast<int>(nID) - kFirstValueCmd;
    if (!IsValueIndex(nIndex)) return;
    m_cbValues.SetCurSel(nIndex);
    OnSelchangeValueList();
}
