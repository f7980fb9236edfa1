#include "COutputFilterConfigTextFix.h"

#include <afxcmn.h>
#include <afxres.h>

#include <CQoException.h>
#include <CQoFile.h>
#include <CQoOutputFilterTextFix.h>
#include <CQoOutputSource.h>
#include <QoLimits.h>

#include <climits>
#include <vector>

#include "resource.h"

namespace {

// A length as the filter writes it: nothing for zero or less.
long long Width(int length) { return length > 0 ? length : 0; }

int CharSetIndex(int charSet) { return charSet == CQoFile::ascii ? 1 : 0; }

int CharSetOfIndex(int index) { return index == 1 ? CQoFile::ascii : CQoFile::ansi; }

}  // namespace

IMPLEMENT_DYNAMIC(COutputFilterConfigTextFix, COutputFilterConfig)

BEGIN_MESSAGE_MAP(COutputFilterConfigTextFix, COutputFilterConfig)
    ON_NOTIFY(LVN_ITEMCHANGED, IDC_OUTFIX_LIST, OnItemchangedList)
    ON_BN_CLICKED(IDC_OUTFIX_APPLY, OnApply)
    ON_EN_KILLFOCUS(IDC_OUTFIX_RECLEN, OnKillfocusReclen)
END_MESSAGE_MAP()

COutputFilterConfigTextFix::COutputFilterConfigTextFix(int nNotifierId, CWnd* pParent)
    : COutputFilterConfig(nNotifierId, IDD_OUTPUT_TEXTFIX, pParent), m_nFieldLen(0), m_nRecLen(0), m_bCrLf(TRUE),
      m_nCharSet(0), m_nSelIndex(-1), m_list(this)
{
}

COutputFilterConfigTextFix::~COutputFilterConfigTextFix() {}

int COutputFilterConfigTextFix::Create(CWnd* pParent)
{
    return CDialog::Create(IDD_OUTPUT_TEXTFIX, pParent);
}

void COutputFilterConfigTextFix::DoDataExchange(CDataExchange* pDX)
{
    COutputFilterConfig::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_OUTFIX_FIELDLEN, m_nFieldLen);
    DDX_Text(pDX, IDC_OUTFIX_RECLEN, m_nRecLen);
    DDX_Check(pDX, IDC_OUTFIX_CRLF, m_bCrLf);
    DDX_CBIndex(pDX, IDC_OUTFIX_CHARSET, m_nCharSet);
}

BOOL COutputFilterConfigTextFix::OnInitDialog()
{
    CDialog::OnInitDialog();
    m_list.SubclassDlgItem(IDC_OUTFIX_LIST, this);
    m_list.Init();

    CRect rc;
    m_list.GetClientRect(&rc);
    const int w = rc.Width() - 16;  // room for a vertical scroll bar
    CString caption;
    caption.LoadString(IDS_COL_FIELD);
    m_list.InsertColumn(0, caption, LVCFMT_LEFT, w * 50 / 100);
    caption.LoadString(IDS_COL_OFFSET);
    m_list.InsertColumn(1, caption, LVCFMT_RIGHT, w * 20 / 100);
    caption.LoadString(IDS_COL_LENGTH);
    m_list.InsertColumn(2, caption, LVCFMT_RIGHT, w * 30 / 100);
    // Columns set before the window existed (a host may refresh first).
    m_list.SetItemCountEx(GetColumnCount(), 0);

    CComboBox* pCharSet = static_cast<CComboBox*>(GetDlgItem(IDC_OUTFIX_CHARSET));
    pCharSet->ResetContent();
    pCharSet->AddString("Windows Ansi");
    pCharSet->AddString("DOS Ascii");
    pCharSet->SetCurSel(m_nCharSet == 1 ? 1 : 0);

    GetDlgItem(IDC_OUTFIX_FIELDLEN)->EnableWindow(FALSE);
    return TRUE;
}

CQoOutputFilterTextFix* COutputFilterConfigTextFix::Filter() const
{
    return dynamic_cast<CQoOutputFilterTextFix*>(m_pOutputFilter);
}

bool COutputFilterConfigTextFix::GetColumn(int index, SCol& col) const
{
    if (index < 0 || index >= GetColumnCount())
        return false;
    col = m_arrColumns[index];
    return true;
}

void COutputFilterConfigTextFix::CalcOffsets()
{
    // Lengths of zero or less take no room in the record, as the filter writes
    // them. The page's lengths are bounded, the sum is taken in 64 bits all the same.
    long long sum = 0;
    for (int i = 0; i < GetColumnCount(); ++i) {
        m_arrColumns[i].nOffset = static_cast<int>(sum < INT_MAX ? sum : INT_MAX);
        sum += Width(m_arrColumns[i].nLength);
    }
    m_nRecLen = static_cast<int>(sum < INT_MAX ? sum : INT_MAX);
}

void COutputFilterConfigTextFix::Enable(bool bOn)
{
    if (!::IsWindow(m_hWnd))
        return;
    static const int ids[] = {IDC_OUTFIX_INSTRUCTION, IDC_OUTFIX_LBL_CHARSET, IDC_OUTFIX_LBL_RECLEN,
                              IDC_OUTFIX_LBL_FIELDLEN, IDC_OUTFIX_CHARSET,    IDC_OUTFIX_RECLEN,
                              IDC_OUTFIX_FIELDLEN,     IDC_OUTFIX_APPLY,      IDC_OUTFIX_CRLF,
                              IDC_OUTFIX_LIST};
    for (int id : ids)
        if (CWnd* pCtrl = GetDlgItem(id))
            pCtrl->EnableWindow(bOn);
    // The field length is editable only while a row is selected.
    if (bOn)
        ListItemChanged();
}

void COutputFilterConfigTextFix::DefaultAction()
{
    OnApply();
}

void COutputFilterConfigTextFix::OnOK()
{
    DefaultAction();
}

void COutputFilterConfigTextFix::ListItemChanged()
{
    OnItemchangedList(NULL, NULL);
}

void COutputFilterConfigTextFix::OnItemchangedList(NMHDR* pNMHDR, LRESULT* pResult)
{
    (void)pNMHDR;
    if (::IsWindow(m_hWnd) && ::IsWindow(m_list.m_hWnd)) {
        const int row = ListView_GetNextItem(m_list.m_hWnd, -1, LVNI_SELECTED);
        CWnd* pFieldLen = GetDlgItem(IDC_OUTFIX_FIELDLEN);
        if (row < 0 || row >= GetColumnCount()) {
            // Nothing selected: an apply now leaves every length as it is.
            m_nSelIndex = -1;
            pFieldLen->EnableWindow(FALSE);
        } else {
            m_strSelField = m_arrColumns[row].strName;
            m_nFieldLen = m_arrColumns[row].nLength;
            m_nSelIndex = row;
            pFieldLen->EnableWindow(TRUE);
            // Only the length: the other controls may hold changes not yet applied.
            SetDlgItemInt(IDC_OUTFIX_FIELDLEN, static_cast<UINT>(m_nFieldLen), TRUE);
        }
    }
    if (pResult != NULL)
        *pResult = 0;
}

bool COutputFilterConfigTextFix::TakeFieldLength()
{
    // The filter refuses a record longer than the base library's limit, so a
    // column may have what the others leave of it, and at least 1.
    long long others = 0;
    for (int i = 0; i < GetColumnCount(); ++i)
        if (i != m_nSelIndex)
            others += Width(m_arrColumns[i].nLength);
    const long long room = qolimits::maxRecordLength - others;
    if (room < 1)
        return true;  // the record is too long already: the filter says so when it is written
    if (m_nFieldLen < 1 || m_nFieldLen > room) {
        CString high;
        high.Format("%lld", room);
        CString prompt;
        AfxFormatString2(prompt, AFX_IDP_PARSE_INT_RANGE, "1", high);
        AfxMessageBox(prompt, MB_ICONEXCLAMATION, AFX_IDP_PARSE_INT_RANGE);
        CWnd* pFieldLen = GetDlgItem(IDC_OUTFIX_FIELDLEN);
        GotoDlgCtrl(pFieldLen);
        pFieldLen->SendMessage(EM_SETSEL, 0, -1);
        return false;
    }
    m_arrColumns[m_nSelIndex].nLength = m_nFieldLen;
    CalcOffsets();
    m_list.RedrawWindow(NULL, NULL, RDW_INVALIDATE | RDW_ERASE | RDW_UPDATENOW);
    UpdateData(FALSE);
    return true;
}

void COutputFilterConfigTextFix::OnApply()
{
    if (::IsWindow(m_hWnd)) {
        // A refused entry has been told once; nothing of it is applied.
        if (!UpdateData(TRUE))
            return;
        if (m_nSelIndex >= 0 && m_nSelIndex < GetColumnCount() && !TakeFieldLength())
            return;
    }
    UpdateOutputFilter(1);
}

void COutputFilterConfigTextFix::OnKillfocusReclen()
{
    // The record length is never typed: it is always the sum of the lengths.
    CalcOffsets();
    SetDlgItemInt(IDC_OUTFIX_RECLEN, static_cast<UINT>(m_nRecLen), TRUE);
}

void COutputFilterConfigTextFix::RefreshDisplay()
{
    if (m_pOutputSource == NULL || Filter() == NULL)
        return;
    CArray<SCol, SCol&> columns;
    try {
        int n = m_pOutputSource->GetNumColumns();
        // More columns than any output may have are not taken into the page;
        // the filter names the limit when they are written.
        if (n > qolimits::maxColumns)
            n = qolimits::maxColumns;
        for (int i = 0; i < n; ++i) {
            SCol col;
            CQoString name;
            m_pOutputSource->GetColumnName(i, name);
            col.strName = name.GetString();
            col.nDataLength = m_pOutputSource->GetDataLength(i);
            col.nLength = defaultLen;
            for (int k = 0; k < GetColumnCount(); ++k)
                if (m_arrColumns[k].strName == col.strName) {
                    col.nLength = m_arrColumns[k].nLength;
                    break;
                }
            columns.Add(col);
        }
    } catch (CQoException const& e) {
        AfxMessageBox(e.Message(), MB_ICONEXCLAMATION);
        return;
    }
    m_arrColumns.Copy(columns);
    CalcOffsets();
    m_nSelIndex = -1;
    if (::IsWindow(m_list.m_hWnd)) {
        m_list.DeleteAllItems();
        m_list.SetItemCountEx(GetColumnCount(), 0);
        m_list.Invalidate();
    }
    if (::IsWindow(m_hWnd)) {
        ListItemChanged();
        SetDlgItemInt(IDC_OUTFIX_RECLEN, static_cast<UINT>(m_nRecLen), TRUE);
    }
}

void COutputFilterConfigTextFix::UpdateOutputFilter(int nSave)
{
    CQoOutputFilterTextFix* pFilter = Filter();
    if (pFilter == NULL || m_pOutputSource == NULL)
        return;
    if (nSave == 0) {
        const int n = pFilter->NumCols();
        m_arrColumns.SetSize(n);
        for (int i = 0; i < n; ++i) {
            CQoString name;
            pFilter->GetColumnName(i, name);
            m_arrColumns[i].strName = name.GetString();
            m_arrColumns[i].nLength = pFilter->GetLength(i);
            m_arrColumns[i].nOffset = 0;
            m_arrColumns[i].nDataLength = -1;
        }
        CalcOffsets();
        m_bCrLf = pFilter->GetCrLf() ? TRUE : FALSE;
        m_nCharSet = CharSetIndex(pFilter->FileCharSet());
        if (::IsWindow(m_hWnd)) {
            UpdateData(FALSE);
            m_list.Invalidate();
        }
        return;
    }
    if (::IsWindow(m_hWnd))
        UpdateData(TRUE);
    WriteToFilter();
}

bool COutputFilterConfigTextFix::WriteToFilter()
{
    CQoOutputFilterTextFix* pFilter = Filter();
    try {
        const int n = qolimits::Checked("Spalten", m_pOutputSource->GetNumColumns(), 0, qolimits::maxColumns);
        long long total = 0;
        for (int i = 0; i < n; ++i)
            total += Width(i < GetColumnCount() ? m_arrColumns[i].nLength : defaultLen);
        qolimits::Checked("Satzl\xE4nge", total, 0, qolimits::maxRecordLength);
        // The source is asked first: a source that fails leaves the filter untouched.
        std::vector<CQoString> names(static_cast<size_t>(n));
        for (int i = 0; i < n; ++i)
            m_pOutputSource->GetColumnName(i, names[static_cast<size_t>(i)]);

        // The filter checks the record limit at every length it is given, so
        // the lengths rise from zero: no step is longer than the whole record,
        // whatever the filter held before.
        for (int i = 0; i < pFilter->NumCols(); ++i)
            pFilter->SetLength(i, 0);
        pFilter->NumCols(n);
        for (int i = 0; i < n; ++i)
            pFilter->SetLength(i, 0);
        for (int i = 0; i < n; ++i) {
            pFilter->ColumnName(i, names[static_cast<size_t>(i)]);
            pFilter->SetLength(i, i < GetColumnCount() ? m_arrColumns[i].nLength : defaultLen);
        }
        pFilter->CrLf(m_bCrLf != 0);
        pFilter->FileCharSet(CharSetOfIndex(m_nCharSet));
    } catch (CQoException const& e) {
        AfxMessageBox(e.Message(), MB_ICONEXCLAMATION);
        return false;
    }
    return true;
}
