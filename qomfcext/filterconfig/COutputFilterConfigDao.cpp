#include "COutputFilterConfigDao.h"

#include <afxcmn.h>

#include <CQoException.h>
#include <CQoOutputFilterDB.h>
#include <CQoOutputSource.h>
#include <QoLimits.h>

#include <vector>

#include "resource.h"

namespace {

// The type combo: index 0 text (type 2), index 1 numeric (type 1); -1 for a
// type the database output does not know.
int TypeIndex(int type) { return type == 2 ? 0 : type == 1 ? 1 : -1; }
int TypeOfIndex(int index) { return index == 0 ? 2 : 1; }

CString TypeText(int type)
{
    CString text;
    if (type == 1)
        text.LoadString(IDS_TYPE_NUMERIC);
    else if (type == 2)
        text.LoadString(IDS_TYPE_TEXT);
    return text;
}

}  // namespace

// ---------------------------------------------------------------------------
// The column list

COutputFilterConfigDaoClrListCtrl::COutputFilterConfigDaoClrListCtrl(COutputFilterConfigDao* pPage) : m_pPage(pPage) {}

COutputFilterConfigDaoClrListCtrl::~COutputFilterConfigDaoClrListCtrl() {}

int COutputFilterConfigDaoClrListCtrl::GetColoredItem(int row, int col, CString& text, DWORD& clrTextOut,
                                                      DWORD& clrSelectedTextOut, bool& bold)
{
    if (m_pPage == NULL)
        return 1;
    bold = false;
    clrTextOut = clrText;
    clrSelectedTextOut = clrSelectedText;
    text.Empty();
    COutputFilterConfigDao::SCol column;
    if (!m_pPage->GetColumn(row, column))
        return 1;
    switch (col) {
    case 0:
        text = column.strName;
        break;
    case 1:
        text = TypeText(column.nType);
        break;
    case 2:
        if (column.nType == 2)
            text.Format("%d", column.nLength);
        break;
    case 3:
        text = column.bIndexed ? "ja" : "nein";
        break;
    }
    return 1;
}

void COutputFilterConfigDaoClrListCtrl::ItemChanged()
{
    if (m_pPage != NULL)
        m_pPage->ListItemChanged();
}

// ---------------------------------------------------------------------------
// The page

IMPLEMENT_DYNAMIC(COutputFilterConfigDao, COutputFilterConfig)

BEGIN_MESSAGE_MAP(COutputFilterConfigDao, COutputFilterConfig)
    ON_NOTIFY(LVN_ITEMCHANGED, IDC_OUTDAO_LIST, OnItemchangedList)
    ON_CBN_SELCHANGE(IDC_OUTDAO_TYPE, OnSelchangeType)
    ON_BN_CLICKED(IDC_OUTDAO_APPLY, OnApply)
END_MESSAGE_MAP()

COutputFilterConfigDao::COutputFilterConfigDao(int nNotifierId, CWnd* pParent)
    : COutputFilterConfig(nNotifierId, IDD_OUTPUT_DAO, pParent), m_nFieldLen(0), m_nFieldType(-1), m_bIndexed(FALSE),
      m_nSelIndex(-1), m_list(this)
{
}

COutputFilterConfigDao::~COutputFilterConfigDao() {}

int COutputFilterConfigDao::Create(CWnd* pParent)
{
    return CDialog::Create(IDD_OUTPUT_DAO, pParent);
}

void COutputFilterConfigDao::DoDataExchange(CDataExchange* pDX)
{
    COutputFilterConfig::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_OUTDAO_TABLE, m_strTableName);
    DDX_Text(pDX, IDC_OUTDAO_FIELDLEN, m_nFieldLen);
    DDX_CBIndex(pDX, IDC_OUTDAO_TYPE, m_nFieldType);
    DDX_Check(pDX, IDC_OUTDAO_INDEXED, m_bIndexed);
}

BOOL COutputFilterConfigDao::OnInitDialog()
{
    CDialog::OnInitDialog();
    m_list.SubclassDlgItem(IDC_OUTDAO_LIST, this);
    m_list.Init();

    CRect rc;
    m_list.GetClientRect(&rc);
    const int w = rc.Width() - 16;  // room for a vertical scroll bar
    m_list.InsertColumn(0, "Feld", LVCFMT_LEFT, w * 45 / 100);
    m_list.InsertColumn(1, "Typ", LVCFMT_LEFT, w * 20 / 100);
    m_list.InsertColumn(2, "L\xE4nge", LVCFMT_RIGHT, w * 20 / 100);
    m_list.InsertColumn(3, "indiziert", LVCFMT_LEFT, w * 15 / 100);
    // Columns set before the window existed (a host may refresh first).
    m_list.SetItemCountEx(GetColumnCount(), 0);

    CComboBox* pType = static_cast<CComboBox*>(GetDlgItem(IDC_OUTDAO_TYPE));
    pType->ResetContent();
    pType->AddString(TypeText(2));
    pType->AddString(TypeText(1));
    pType->SetCurSel(0);
    pType->EnableWindow(FALSE);

    // A filter loaded before the window existed keeps its table name.
    if (m_strTableName.IsEmpty())
        m_strTableName = "Tabelle";
    SetDlgItemText(IDC_OUTDAO_TABLE, m_strTableName);
    CWnd* pTable = GetDlgItem(IDC_OUTDAO_TABLE);
    pTable->SetFocus();
    pTable->SendMessage(EM_SETSEL, 0, -1);

    GetDlgItem(IDC_OUTDAO_FIELDLEN)->EnableWindow(FALSE);
    GetDlgItem(IDC_OUTDAO_INDEXED)->EnableWindow(FALSE);
    return FALSE;  // the focus is set
}

CQoOutputFilterDB* COutputFilterConfigDao::Filter() const
{
    return dynamic_cast<CQoOutputFilterDB*>(m_pOutputFilter);
}

bool COutputFilterConfigDao::GetColumn(int index, SCol& col) const
{
    if (index < 0 || index >= GetColumnCount())
        return false;
    col = m_arrColumns[index];
    return true;
}

void COutputFilterConfigDao::Enable(bool bOn)
{
    if (!::IsWindow(m_hWnd))
        return;
    static const int ids[] = {IDC_OUTDAO_LBL_TABLE, IDC_OUTDAO_INSTRUCTION, IDC_OUTDAO_INSTRUCTION2,
                              IDC_OUTDAO_LBL_TYPE,  IDC_OUTDAO_LBL_FIELDLEN, IDC_OUTDAO_TABLE,
                              IDC_OUTDAO_TYPE,      IDC_OUTDAO_FIELDLEN,     IDC_OUTDAO_INDEXED,
                              IDC_OUTDAO_APPLY,     IDC_OUTDAO_LIST};
    for (int id : ids)
        if (CWnd* pCtrl = GetDlgItem(id))
            pCtrl->EnableWindow(bOn);
    // The fields at the right follow the selection.
    if (bOn)
        ListItemChanged();
}

void COutputFilterConfigDao::DefaultAction()
{
    OnApply();
}

void COutputFilterConfigDao::OnOK()
{
    DefaultAction();
}

void COutputFilterConfigDao::ListItemChanged()
{
    OnItemchangedList(NULL, NULL);
}

void COutputFilterConfigDao::OnItemchangedList(NMHDR* pNMHDR, LRESULT* pResult)
{
    (void)pNMHDR;
    if (::IsWindow(m_hWnd) && ::IsWindow(m_list.m_hWnd)) {
        const int row = ListView_GetNextItem(m_list.m_hWnd, -1, LVNI_SELECTED);
        CComboBox* pType = static_cast<CComboBox*>(GetDlgItem(IDC_OUTDAO_TYPE));
        if (row < 0 || row >= GetColumnCount()) {
            // Nothing selected: an apply now leaves every column as it is.
            m_nSelIndex = -1;
            pType->EnableWindow(FALSE);
            GetDlgItem(IDC_OUTDAO_FIELDLEN)->EnableWindow(FALSE);
            GetDlgItem(IDC_OUTDAO_INDEXED)->EnableWindow(FALSE);
        } else {
            const SCol& col = m_arrColumns[row];
            m_nFieldType = TypeIndex(col.nType);
            m_nFieldLen = col.nLength;
            m_bIndexed = col.bIndexed ? TRUE : FALSE;
            m_nSelIndex = row;
            // Only the column's fields: the table name may hold a change not yet applied.
            pType->SetCurSel(m_nFieldType);
            SetDlgItemInt(IDC_OUTDAO_FIELDLEN, static_cast<UINT>(m_nFieldLen), TRUE);
            CheckDlgButton(IDC_OUTDAO_INDEXED, m_bIndexed);
            pType->EnableWindow(TRUE);
            GetDlgItem(IDC_OUTDAO_FIELDLEN)->EnableWindow(m_nFieldType == 0);
            GetDlgItem(IDC_OUTDAO_INDEXED)->EnableWindow(TRUE);
        }
    }
    if (pResult != NULL)
        *pResult = 0;
}

void COutputFilterConfigDao::OnSelchangeType()
{
    m_nFieldType = static_cast<CComboBox*>(GetDlgItem(IDC_OUTDAO_TYPE))->GetCurSel();
    GetDlgItem(IDC_OUTDAO_FIELDLEN)->EnableWindow(m_nFieldType == 0);
}

bool COutputFilterConfigDao::TakeSelectedColumn()
{
    CString prompt;
    int focus = 0;
    if (m_nFieldType != 0 && m_nFieldType != 1) {
        prompt.Format("Bitte w\xE4hlen Sie einen Feldtyp f\xFCr das Feld '%s'.",
                      static_cast<const char*>(m_arrColumns[m_nSelIndex].strName));
        focus = IDC_OUTDAO_TYPE;
    } else if (m_nFieldType == 0 && (m_nFieldLen < 1 || m_nFieldLen > maxTextLen)) {
        prompt.Format("Die L\xE4nge des Textfeldes '%s' muss zwischen 1 und %d liegen.",
                      static_cast<const char*>(m_arrColumns[m_nSelIndex].strName), static_cast<int>(maxTextLen));
        focus = IDC_OUTDAO_FIELDLEN;
    }
    if (focus != 0) {
        AfxMessageBox(prompt, MB_ICONEXCLAMATION);
        CWnd* pCtrl = GetDlgItem(focus);
        GotoDlgCtrl(pCtrl);
        if (focus == IDC_OUTDAO_FIELDLEN)
            pCtrl->SendMessage(EM_SETSEL, 0, -1);
        return false;
    }
    SCol& col = m_arrColumns[m_nSelIndex];
    col.nType = TypeOfIndex(m_nFieldType);
    // A numeric field has no length of its own: the one it had stays for a
    // later change back to text.
    if (col.nType == 2)
        col.nLength = m_nFieldLen;
    col.bIndexed = m_bIndexed != 0;
    m_list.RedrawWindow(NULL, NULL, RDW_INVALIDATE | RDW_ERASE | RDW_UPDATENOW);
    return true;
}

void COutputFilterConfigDao::OnApply()
{
    if (::IsWindow(m_hWnd)) {
        // A refused entry has been told once; nothing of it is applied.
        if (!UpdateData(TRUE))
            return;
        if (m_nSelIndex >= 0 && m_nSelIndex < GetColumnCount() && !TakeSelectedColumn())
            return;
    }
    UpdateOutputFilter(1);
}

bool COutputFilterConfigDao::LoadColumnsFromSource()
{
    CArray<SCol, SCol&> columns;
    try {
        const int n =
            qolimits::Checked("Spalten", m_pOutputSource->GetNumColumns(), 0, qolimits::maxColumns);
        for (int i = 0; i < n; ++i) {
            SCol col;
            CQoString name;
            m_pOutputSource->GetColumnName(i, name);
            col.strName = name.GetString();
            col.nDataLength = m_pOutputSource->GetDataLength(i);
            col.nLength = defaultLen;
            col.nType = defaultType;
            for (int k = 0; k < GetColumnCount(); ++k)
                if (m_arrColumns[k].strName == col.strName) {
                    col.nLength = m_arrColumns[k].nLength;
                    col.nType = m_arrColumns[k].nType;
                    col.bIndexed = m_arrColumns[k].bIndexed;
                    break;
                }
            columns.Add(col);
        }
    } catch (CQoException const& e) {
        AfxMessageBox(e.Message(), MB_ICONEXCLAMATION);
        return false;
    }
    m_arrColumns.Copy(columns);
    return true;
}

void COutputFilterConfigDao::RefreshDisplay()
{
    if (m_pOutputSource == NULL || Filter() == NULL)
        return;
    if (!LoadColumnsFromSource())
        return;
    m_nSelIndex = -1;
    if (::IsWindow(m_list.m_hWnd)) {
        m_list.DeleteAllItems();
        m_list.SetItemCountEx(GetColumnCount(), 0);
        m_list.Invalidate();
    }
    if (::IsWindow(m_hWnd))
        ListItemChanged();
}

void COutputFilterConfigDao::UpdateOutputFilter(int nSave)
{
    CQoOutputFilterDB* pFilter = Filter();
    if (pFilter == NULL || m_pOutputSource == NULL)
        return;
    if (nSave == 0) {
        m_strTableName = pFilter->GetTableName().GetString();
        if (m_strTableName.IsEmpty())
            m_strTableName = "Tabelle";
        const int n = pFilter->NumCols();
        m_arrColumns.SetSize(n);
        for (int i = 0; i < n; ++i) {
            CQoString name;
            pFilter->GetColumnName(i, name);
            SCol& col = m_arrColumns[i];
            col.strName = name.GetString();
            col.bIndexed = pFilter->GetIndexed(i);
            col.nLength = pFilter->GetLength(i);
            col.nType = pFilter->GetType(i);
            col.nDataLength = -1;
        }
        if (::IsWindow(m_hWnd)) {
            SetDlgItemText(IDC_OUTDAO_TABLE, m_strTableName);
            ListItemChanged();
            m_list.Invalidate();
        }
        return;
    }
    if (::IsWindow(m_hWnd) && !UpdateData(TRUE))
        return;
    if (GetColumnCount() < pFilter->NumCols() && !LoadColumnsFromSource())
        return;
    WriteToFilter();
}

bool COutputFilterConfigDao::WriteToFilter()
{
    CQoOutputFilterDB* pFilter = Filter();
    CString problem;
    CString table = m_strTableName;
    table.TrimLeft();
    table.TrimRight();
    if (table.IsEmpty())
        problem = "Bitte geben Sie den Namen der Tabelle an, in die geschrieben wird.";
    try {
        const int n =
            qolimits::Checked("Spalten", m_pOutputSource->GetNumColumns(), 0, qolimits::maxColumns);
        // The source and every column are checked first: a refusal leaves the
        // filter as it was.
        std::vector<CQoString> names(static_cast<size_t>(n));
        for (int i = 0; i < n; ++i)
            m_pOutputSource->GetColumnName(i, names[static_cast<size_t>(i)]);
        for (int i = 0; i < n && i < GetColumnCount() && problem.IsEmpty(); ++i) {
            const SCol& col = m_arrColumns[i];
            const char* name = names[static_cast<size_t>(i)].GetString();
            if (col.nType != 1 && col.nType != 2)
                problem.Format("Das Feld '%s' hat einen unbekannten Feldtyp (%d). Bitte w\xE4hlen Sie "
                               "'Text' oder 'numerisch'.",
                               name, col.nType);
            else if (col.nType == 2 && (col.nLength < 1 || col.nLength > maxTextLen))
                problem.Format("Die L\xE4nge des Textfeldes '%s' muss zwischen 1 und %d liegen.", name,
                               static_cast<int>(maxTextLen));
        }
        if (!problem.IsEmpty()) {
            AfxMessageBox(problem, MB_ICONEXCLAMATION);
            return false;
        }
        pFilter->NumCols(n);
        for (int i = 0; i < n; ++i) {
            pFilter->ColumnName(i, names[static_cast<size_t>(i)]);
            if (i < GetColumnCount()) {
                const SCol& col = m_arrColumns[i];
                pFilter->SetLength(i, col.nLength);
                pFilter->SetType(i, col.nType);
                pFilter->SetIndexed(i, col.bIndexed);
            } else {
                pFilter->SetLength(i, defaultLen);
                pFilter->SetType(i, defaultType);
                pFilter->SetIndexed(i, false);
            }
        }
        pFilter->SetTableName(static_cast<const char*>(m_strTableName));
    } catch (CQoException const& e) {
        AfxMessageBox(e.Message(), MB_ICONEXCLAMATION);
        return false;
    }
    return true;
}
