#include "COutputFilterConfigColumns.h"

#include <afxcmn.h>

#include <CQoException.h>
#include <CQoOutputSource.h>
#include <QoLimits.h>

#include "resource.h"

// ---------------------------------------------------------------------------
// The column list

COutputFilterConfigColumnsClrListCtrl::COutputFilterConfigColumnsClrListCtrl(COutputFilterConfigColumns* pPage)
    : m_pPage(pPage)
{
}

COutputFilterConfigColumnsClrListCtrl::~COutputFilterConfigColumnsClrListCtrl() {}

int COutputFilterConfigColumnsClrListCtrl::GetColoredItem(int row, int col, CString& text, DWORD& clrTextOut,
                                                          DWORD& clrSelectedTextOut, bool& bold)
{
    if (m_pPage == NULL)
        return 1;
    bold = false;
    clrTextOut = clrText;
    clrSelectedTextOut = clrSelectedText;
    text.Empty();
    // The item count is set by the page, but a host may load other columns
    // before it refreshes: a row beyond them stays empty instead of failing
    // inside a paint.
    if (row < 0 || row >= m_pPage->GetColumnCount())
        return 1;
    if (m_pPage->CellText(row, col, text)) {
        clrTextOut = clrComputed;
        clrSelectedTextOut = clrComputed;
    }
    return 1;
}

void COutputFilterConfigColumnsClrListCtrl::ItemChanged()
{
    if (m_pPage != NULL)
        m_pPage->ListItemChanged();
}

// ---------------------------------------------------------------------------
// The page

IMPLEMENT_DYNAMIC(COutputFilterConfigColumns, COutputFilterConfig)

BEGIN_MESSAGE_MAP(COutputFilterConfigColumns, COutputFilterConfig)
END_MESSAGE_MAP()

COutputFilterConfigColumns::COutputFilterConfigColumns(int nNotifierId, const SLayout& layout, CWnd* pParent)
    : COutputFilterConfig(nNotifierId, layout.nTemplate, pParent), m_nFieldLen(0), m_nFieldType(-1), m_nSelIndex(-1),
      m_list(this), m_layout(layout)
{
}

COutputFilterConfigColumns::~COutputFilterConfigColumns() {}

int COutputFilterConfigColumns::Create(CWnd* pParent)
{
    return CDialog::Create(m_layout.nTemplate, pParent);
}

BOOL COutputFilterConfigColumns::OnInitDialog()
{
    CDialog::OnInitDialog();
    m_list.SubclassDlgItem(m_layout.nList, this);
    m_list.Init();

    CRect rc;
    m_list.GetClientRect(&rc);
    const int w = rc.Width() - 16;  // room for a vertical scroll bar
    int i = 0;
    for (const SListColumn& column : m_layout.listColumns)
        m_list.InsertColumn(i++, CString(column.pszCaption), column.nFormat, w * column.nPercent / 100);
    // Columns set before the window existed (a host may refresh first).
    m_list.SetItemCountEx(GetColumnCount(), 0);
    return TRUE;
}

void COutputFilterConfigColumns::Enable(bool bOn)
{
    if (!::IsWindow(m_hWnd))
        return;
    for (int id : m_layout.controls)
        if (CWnd* pCtrl = GetDlgItem(id))
            pCtrl->EnableWindow(bOn);
    // The fields at the right follow the selection.
    if (bOn)
        ListItemChanged();
}

void COutputFilterConfigColumns::DefaultAction()
{
    OnApply();
}

void COutputFilterConfigColumns::ListItemChanged()
{
    OnItemchangedList(NULL, NULL);
}

void COutputFilterConfigColumns::OnItemchangedList(NMHDR* pNMHDR, LRESULT* pResult)
{
    (void)pNMHDR;
    if (::IsWindow(m_hWnd) && ::IsWindow(m_list.m_hWnd)) {
        const int row = ListView_GetNextItem(m_list.m_hWnd, -1, LVNI_SELECTED);
        // Nothing selected: an apply now leaves every column as it is.
        m_nSelIndex = row >= 0 && row < GetColumnCount() ? row : -1;
        ShowColumn(m_nSelIndex);
    }
    if (pResult != NULL)
        *pResult = 0;
}

void COutputFilterConfigColumns::OnApply()
{
    if (::IsWindow(m_hWnd)) {
        // A refused entry has been told once; nothing of it is applied.
        if (!UpdateData(TRUE))
            return;
        if (m_nSelIndex >= 0 && m_nSelIndex < GetColumnCount()) {
            if (!TakeSelectedColumn())
                return;
            m_list.RedrawWindow(NULL, NULL, RDW_INVALIDATE | RDW_ERASE | RDW_UPDATENOW);
        }
    }
    UpdateOutputFilter(1);
}

void COutputFilterConfigColumns::RefreshDisplay()
{
    if (m_pOutputSource == NULL || !FilterFits())
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

bool COutputFilterConfigColumns::ReadSourceColumns(std::vector<SSourceColumn>& columns, bool bCutAtLimit)
{
    columns.clear();
    try {
        int n = m_pOutputSource->GetNumColumns();
        if (!bCutAtLimit)
            n = qolimits::Checked("Spalten", n, 0, qolimits::maxColumns);
        else if (n > qolimits::maxColumns)
            n = qolimits::maxColumns;
        for (int i = 0; i < n; ++i) {
            CQoString name;
            m_pOutputSource->GetColumnName(i, name);
            columns.push_back(SSourceColumn{name.GetString(), m_pOutputSource->GetDataLength(i)});
        }
    } catch (CQoException const& e) {
        AfxMessageBox(e.Message(), MB_ICONEXCLAMATION);
        return false;
    }
    return true;
}

void COutputFilterConfigColumns::Refuse(const CString& prompt, int nFocus, UINT nHelpId)
{
    AfxMessageBox(prompt, MB_ICONEXCLAMATION, nHelpId);
    CWnd* pCtrl = GetDlgItem(nFocus);
    GotoDlgCtrl(pCtrl);
    if (nFocus == m_layout.nFieldLen)
        pCtrl->SendMessage(EM_SETSEL, 0, -1);
}

// ---------------------------------------------------------------------------
// Field types

int COutputFilterConfigColumns::TypeIndex(int type)
{
    return type == 2 ? 0 : type == 1 ? 1 : -1;
}

int COutputFilterConfigColumns::TypeOfIndex(int index)
{
    return index == 0 ? 2 : 1;
}

CString COutputFilterConfigColumns::TypeText(int type)
{
    CString text;
    if (type == 1)
        text.LoadString(IDS_TYPE_NUMERIC);
    else if (type == 2)
        text.LoadString(IDS_TYPE_TEXT);
    return text;
}

void COutputFilterConfigColumns::TypedCellText(int col, const CString& name, int type, int length, CString& text)
{
    if (col == 0)
        text = name;
    else if (col == 1)
        text = TypeText(type);
    else if (col == 2 && type == 2)
        text.Format("%d", length);
}

CString COutputFilterConfigColumns::TextLengthProblem(const char* name, int length, int maxLength)
{
    CString problem;
    if (length < 1 || length > maxLength)
        problem.Format("Die L\xE4nge des Textfeldes '%s' muss zwischen 1 und %d liegen.", name, maxLength);
    return problem;
}

void COutputFilterConfigColumns::InitTypeCombo()
{
    CComboBox* pType = static_cast<CComboBox*>(GetDlgItem(m_layout.nType));
    pType->ResetContent();
    pType->AddString(TypeText(2));
    pType->AddString(TypeText(1));
    pType->SetCurSel(0);
    pType->EnableWindow(FALSE);
    GetDlgItem(m_layout.nFieldLen)->EnableWindow(FALSE);
}

void COutputFilterConfigColumns::ShowTypeAndLength(int row, int type, int length)
{
    CComboBox* pType = static_cast<CComboBox*>(GetDlgItem(m_layout.nType));
    CWnd* pFieldLen = GetDlgItem(m_layout.nFieldLen);
    if (row < 0) {
        pType->EnableWindow(FALSE);
        pFieldLen->EnableWindow(FALSE);
        return;
    }
    m_nFieldType = TypeIndex(type);
    m_nFieldLen = length;
    // Only the column's fields: the others may hold a change not yet applied.
    pType->SetCurSel(m_nFieldType);
    SetDlgItemInt(m_layout.nFieldLen, static_cast<UINT>(m_nFieldLen), TRUE);
    pType->EnableWindow(TRUE);
    pFieldLen->EnableWindow(m_nFieldType == 0);
}

void COutputFilterConfigColumns::OnSelchangeType()
{
    m_nFieldType = static_cast<CComboBox*>(GetDlgItem(m_layout.nType))->GetCurSel();
    GetDlgItem(m_layout.nFieldLen)->EnableWindow(m_nFieldType == 0);
}

bool COutputFilterConfigColumns::CheckTypeAndLength(const char* name, int maxLength)
{
    if (m_nFieldType != 0 && m_nFieldType != 1) {
        CString prompt;
        prompt.Format("Bitte w\xE4hlen Sie einen Feldtyp f\xFCr das Feld '%s'.", name);
        Refuse(prompt, m_layout.nType);
        return false;
    }
    const CString problem = m_nFieldType == 0 ? TextLengthProblem(name, m_nFieldLen, maxLength) : CString();
    if (!problem.IsEmpty()) {
        Refuse(problem, m_layout.nFieldLen);
        return false;
    }
    return true;
}
