#include "COutputFilterConfigDbase.h"

#include <afxcmn.h>

#include <CDbaseField.h>
#include <CQoArray.h>
#include <CQoException.h>
#include <CQoOutputFilterDbase.h>
#include <CQoOutputSource.h>
#include <QoLimits.h>

#include <vector>

#include "resource.h"

namespace {

// The type combo: index 0 text (type 2), index 1 numeric (type 1).
int TypeIndex(int type) { return type == 2 ? 0 : 1; }
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

COutputFilterConfigDbaseClrListCtrl::COutputFilterConfigDbaseClrListCtrl(COutputFilterConfigDbase* pPage)
    : m_pPage(pPage)
{
}

COutputFilterConfigDbaseClrListCtrl::~COutputFilterConfigDbaseClrListCtrl() {}

int COutputFilterConfigDbaseClrListCtrl::GetColoredItem(int row, int col, CString& text, DWORD& clrTextOut,
                                                        DWORD& clrSelectedTextOut, bool& bold)
{
    if (m_pPage == NULL)
        return 1;
    bold = false;
    clrTextOut = clrText;
    clrSelectedTextOut = clrSelectedText;
    text.Empty();
    COutputFilterConfigDbase::SCol column;
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
    }
    return 1;
}

void COutputFilterConfigDbaseClrListCtrl::ItemChanged()
{
    if (m_pPage != NULL)
        m_pPage->ListItemChanged();
}

// ---------------------------------------------------------------------------
// The page

IMPLEMENT_DYNAMIC(COutputFilterConfigDbase, COutputFilterConfig)

BEGIN_MESSAGE_MAP(COutputFilterConfigDbase, COutputFilterConfig)
    ON_BN_CLICKED(IDC_OUTDBF_APPLY, OnApply)
    ON_NOTIFY(LVN_ITEMCHANGED, IDC_OUTDBF_LIST, OnItemchangedList)
    ON_CBN_SELCHANGE(IDC_OUTDBF_TYPE, OnSelchangeType)
END_MESSAGE_MAP()

COutputFilterConfigDbase::COutputFilterConfigDbase(int nNotifierId, CWnd* pParent)
    : COutputFilterConfig(nNotifierId, IDD_OUTPUT_DBASE, pParent), m_nFieldLen(0), m_nFieldType(-1),
      m_nSelIndex(-1), m_list(this)
{
}

COutputFilterConfigDbase::~COutputFilterConfigDbase() {}

int COutputFilterConfigDbase::Create(CWnd* pParent)
{
    return CDialog::Create(IDD_OUTPUT_DBASE, pParent);
}

void COutputFilterConfigDbase::DoDataExchange(CDataExchange* pDX)
{
    COutputFilterConfig::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_OUTDBF_FIELDLEN, m_nFieldLen);
    DDX_CBIndex(pDX, IDC_OUTDBF_TYPE, m_nFieldType);
}

BOOL COutputFilterConfigDbase::OnInitDialog()
{
    CDialog::OnInitDialog();
    m_list.SubclassDlgItem(IDC_OUTDBF_LIST, this);
    m_list.Init();

    CRect rc;
    m_list.GetClientRect(&rc);
    const int w = rc.Width() - 16;  // room for a vertical scroll bar
    CString caption;
    caption.LoadString(IDS_COL_FIELD);
    m_list.InsertColumn(0, caption, LVCFMT_LEFT, w * 60 / 100);
    caption.LoadString(IDS_COL_TYPE);
    m_list.InsertColumn(1, caption, LVCFMT_LEFT, w * 20 / 100);
    caption.LoadString(IDS_COL_LENGTH);
    m_list.InsertColumn(2, caption, LVCFMT_RIGHT, w * 20 / 100);
    // Columns set before the window existed (a host may refresh first).
    m_list.SetItemCountEx(GetColumnCount(), 0);

    CComboBox* pType = static_cast<CComboBox*>(GetDlgItem(IDC_OUTDBF_TYPE));
    pType->ResetContent();
    pType->AddString(TypeText(2));
    pType->AddString(TypeText(1));
    pType->SetCurSel(0);
    pType->EnableWindow(FALSE);
    GetDlgItem(IDC_OUTDBF_FIELDLEN)->EnableWindow(FALSE);
    return TRUE;
}

CQoOutputFilterDbase* COutputFilterConfigDbase::Filter() const
{
    return dynamic_cast<CQoOutputFilterDbase*>(m_pOutputFilter);
}

bool COutputFilterConfigDbase::GetColumn(int index, SCol& col) const
{
    if (index < 0 || index >= GetColumnCount())
        return false;
    col = m_arrColumns[index];
    return true;
}

void COutputFilterConfigDbase::Enable(bool bOn)
{
    if (!::IsWindow(m_hWnd))
        return;
    static const int ids[] = {IDC_OUTDBF_INSTRUCTION, IDC_OUTDBF_INSTRUCTION2, IDC_OUTDBF_LBL_TYPE,
                              IDC_OUTDBF_LBL_FIELDLEN, IDC_OUTDBF_TYPE,        IDC_OUTDBF_FIELDLEN,
                              IDC_OUTDBF_APPLY,        IDC_OUTDBF_LIST};
    for (int id : ids)
        if (CWnd* pCtrl = GetDlgItem(id))
            pCtrl->EnableWindow(bOn);
    // The fields at the right follow the selection.
    if (bOn)
        ListItemChanged();
}

void COutputFilterConfigDbase::DefaultAction()
{
    OnApply();
}

void COutputFilterConfigDbase::OnOK()
{
    DefaultAction();
}

void COutputFilterConfigDbase::ListItemChanged()
{
    OnItemchangedList(NULL, NULL);
}

void COutputFilterConfigDbase::OnItemchangedList(NMHDR* pNMHDR, LRESULT* pResult)
{
    (void)pNMHDR;
    if (::IsWindow(m_hWnd) && ::IsWindow(m_list.m_hWnd)) {
        const int row = ListView_GetNextItem(m_list.m_hWnd, -1, LVNI_SELECTED);
        CComboBox* pType = static_cast<CComboBox*>(GetDlgItem(IDC_OUTDBF_TYPE));
        if (row < 0 || row >= GetColumnCount()) {
            // Nothing selected: an apply now leaves every column as it is.
            m_nSelIndex = -1;
            pType->EnableWindow(FALSE);
            GetDlgItem(IDC_OUTDBF_FIELDLEN)->EnableWindow(FALSE);
        } else {
            m_nFieldType = TypeIndex(m_arrColumns[row].nType);
            m_nFieldLen = m_arrColumns[row].nLength;
            m_nSelIndex = row;
            UpdateData(FALSE);
            pType->EnableWindow(TRUE);
            GetDlgItem(IDC_OUTDBF_FIELDLEN)->EnableWindow(m_nFieldType == 0);
        }
    }
    if (pResult != NULL)
        *pResult = 0;
}

void COutputFilterConfigDbase::OnSelchangeType()
{
    m_nFieldType = static_cast<CComboBox*>(GetDlgItem(IDC_OUTDBF_TYPE))->GetCurSel();
    GetDlgItem(IDC_OUTDBF_FIELDLEN)->EnableWindow(m_nFieldType == 0);
}

bool COutputFilterConfigDbase::TakeSelectedColumn()
{
    SCol& col = m_arrColumns[m_nSelIndex];
    if (m_nFieldType == 0 && (m_nFieldLen < 1 || m_nFieldLen > maxTextLen)) {
        CString prompt;
        prompt.Format("Die L\xE4nge des Textfeldes '%s' muss zwischen 1 und %d liegen.",
                      static_cast<const char*>(col.strName), static_cast<int>(maxTextLen));
        AfxMessageBox(prompt, MB_ICONEXCLAMATION);
        CWnd* pLen = GetDlgItem(IDC_OUTDBF_FIELDLEN);
        GotoDlgCtrl(pLen);
        pLen->SendMessage(EM_SETSEL, 0, -1);
        return false;
    }
    col.nType = TypeOfIndex(m_nFieldType);
    // A numeric field is always numericLen wide: the text length stays for a
    // later change back to text.
    if (col.nType == 2)
        col.nLength = m_nFieldLen;
    m_list.RedrawWindow(NULL, NULL, RDW_INVALIDATE | RDW_ERASE | RDW_UPDATENOW);
    return true;
}

void COutputFilterConfigDbase::OnApply()
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

void COutputFilterConfigDbase::RefreshDisplay()
{
    if (m_pOutputSource == NULL || Filter() == NULL)
        return;
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
                    break;
                }
            columns.Add(col);
        }
    } catch (CQoException const& e) {
        AfxMessageBox(e.Message(), MB_ICONEXCLAMATION);
        return;
    }
    m_arrColumns.Copy(columns);
    m_nSelIndex = -1;
    if (::IsWindow(m_list.m_hWnd)) {
        m_list.DeleteAllItems();
        m_list.SetItemCountEx(GetColumnCount(), 0);
        m_list.Invalidate();
    }
    if (::IsWindow(m_hWnd))
        ListItemChanged();
}

void COutputFilterConfigDbase::UpdateOutputFilter(int nSave)
{
    CQoOutputFilterDbase* pFilter = Filter();
    if (pFilter == NULL || m_pOutputSource == NULL)
        return;
    if (nSave == 0) {
        const int n = pFilter->NumCols();
        m_arrColumns.SetSize(n);
        for (int i = 0; i < n; ++i) {
            SCol& col = m_arrColumns[i];
            CDbaseField field;
            if (pFilter->GetFieldDesc(i, field)) {
                col.strName = field.Name().GetString();
                col.nLength = field.Length();
                col.nType = field.Type() == 'N' ? 1 : 2;
            } else {
                // A column the filter has no description for is written as
                // text of the full length.
                CQoString name;
                pFilter->GetColumnName(i, name);
                col.strName = name.GetString();
                col.nLength = defaultLen;
                col.nType = defaultType;
            }
            col.nDataLength = -1;
        }
        if (::IsWindow(m_hWnd)) {
            ListItemChanged();
            m_list.Invalidate();
        }
        return;
    }
    if (::IsWindow(m_hWnd) && !UpdateData(TRUE))
        return;
    WriteToFilter();
}

bool COutputFilterConfigDbase::WriteToFilter()
{
    CQoOutputFilterDbase* pFilter = Filter();
    try {
        const int n =
            qolimits::Checked("Spalten", m_pOutputSource->GetNumColumns(), 0, qolimits::maxColumns);
        // Every description is made and checked first: a refusal leaves the
        // filter as it was.
        CQoArray<CDbaseField> fields;
        std::vector<CQoString> names(static_cast<size_t>(n));
        for (int i = 0; i < n; ++i) {
            CQoString& name = names[static_cast<size_t>(i)];
            m_pOutputSource->GetColumnName(i, name);
            const bool numeric = i < GetColumnCount() && m_arrColumns[i].nType == 1;
            const int length = numeric ? numericLen : i < GetColumnCount() ? m_arrColumns[i].nLength : defaultLen;
            if (!numeric && (length < 1 || length > maxTextLen)) {
                CString prompt;
                prompt.Format("Die L\xE4nge des Textfeldes '%s' muss zwischen 1 und %d liegen.", name.GetString(),
                              static_cast<int>(maxTextLen));
                AfxMessageBox(prompt, MB_ICONEXCLAMATION);
                return false;
            }
            fields.Add(CDbaseField(name.GetString(), numeric ? 'N' : 'C', length));
        }
        pFilter->NumCols(n);
        for (int i = 0; i < n; ++i)
            pFilter->ColumnName(i, names[static_cast<size_t>(i)]);
        // The filter keeps a copy; the page keeps its own settings.
        pFilter->SetFieldDescs(&fields);
    } catch (CQoException const& e) {
        AfxMessageBox(e.Message(), MB_ICONEXCLAMATION);
        return false;
    }
    return true;
}
