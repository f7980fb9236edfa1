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

// The page's controls: the list of the columns, and what Enable switches.
const COutputFilterConfigColumns::SLayout layout = {
    IDD_OUTPUT_TEXTFIX,
    IDC_OUTFIX_LIST,
    IDC_OUTFIX_FIELDLEN,
    0,
    {{MAKEINTRESOURCE(IDS_COL_FIELD), LVCFMT_LEFT, 50},
     {MAKEINTRESOURCE(IDS_COL_OFFSET), LVCFMT_RIGHT, 20},
     {MAKEINTRESOURCE(IDS_COL_LENGTH), LVCFMT_RIGHT, 30}},
    {IDC_OUTFIX_INSTRUCTION, IDC_OUTFIX_LBL_CHARSET, IDC_OUTFIX_LBL_RECLEN, IDC_OUTFIX_LBL_FIELDLEN, IDC_OUTFIX_CHARSET,
     IDC_OUTFIX_RECLEN, IDC_OUTFIX_FIELDLEN, IDC_OUTFIX_APPLY, IDC_OUTFIX_CRLF, IDC_OUTFIX_LIST}};

}  // namespace

IMPLEMENT_DYNAMIC(COutputFilterConfigTextFix, COutputFilterConfigColumns)

BEGIN_MESSAGE_MAP(COutputFilterConfigTextFix, COutputFilterConfigColumns)
    ON_NOTIFY(LVN_ITEMCHANGED, IDC_OUTFIX_LIST, OnItemchangedList)
    ON_BN_CLICKED(IDC_OUTFIX_APPLY, OnApply)
    ON_EN_KILLFOCUS(IDC_OUTFIX_RECLEN, OnKillfocusReclen)
END_MESSAGE_MAP()

COutputFilterConfigTextFix::COutputFilterConfigTextFix(int nNotifierId, CWnd* pParent)
    : COutputFilterConfigColumns(nNotifierId, layout, pParent), m_nRecLen(0), m_bCrLf(TRUE), m_nCharSet(0)
{
}

COutputFilterConfigTextFix::~COutputFilterConfigTextFix() {}

void COutputFilterConfigTextFix::DoDataExchange(CDataExchange* pDX)
{
    COutputFilterConfigColumns::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_OUTFIX_FIELDLEN, m_nFieldLen);
    DDX_Text(pDX, IDC_OUTFIX_RECLEN, m_nRecLen);
    DDX_Check(pDX, IDC_OUTFIX_CRLF, m_bCrLf);
    DDX_CBIndex(pDX, IDC_OUTFIX_CHARSET, m_nCharSet);
}

BOOL COutputFilterConfigTextFix::OnInitDialog()
{
    COutputFilterConfigColumns::OnInitDialog();
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

bool COutputFilterConfigTextFix::FilterFits() const
{
    return Filter() != NULL;
}

bool COutputFilterConfigTextFix::CellText(int row, int col, CString& text) const
{
    const SCol& column = m_arrColumns[row];
    if (col == 0)
        text = column.strName;
    else if (col == 1 || col == 2)
        text.Format("%d", col == 1 ? column.nOffset : column.nLength);
    // The offsets follow from the lengths: nobody types them.
    return col == 1;
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

void COutputFilterConfigTextFix::ShowColumn(int row)
{
    CWnd* pFieldLen = GetDlgItem(IDC_OUTFIX_FIELDLEN);
    pFieldLen->EnableWindow(row >= 0);
    if (row < 0)
        return;
    m_strSelField = m_arrColumns[row].strName;
    m_nFieldLen = m_arrColumns[row].nLength;
    // Only the length: the other controls may hold changes not yet applied.
    SetDlgItemInt(IDC_OUTFIX_FIELDLEN, static_cast<UINT>(m_nFieldLen), TRUE);
}

bool COutputFilterConfigTextFix::TakeSelectedColumn()
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
        Refuse(prompt, IDC_OUTFIX_FIELDLEN, AFX_IDP_PARSE_INT_RANGE);
        return false;
    }
    m_arrColumns[m_nSelIndex].nLength = m_nFieldLen;
    CalcOffsets();
    UpdateData(FALSE);
    return true;
}

void COutputFilterConfigTextFix::OnKillfocusReclen()
{
    // The record length is never typed: it is always the sum of the lengths.
    CalcOffsets();
    SetDlgItemInt(IDC_OUTFIX_RECLEN, static_cast<UINT>(m_nRecLen), TRUE);
}

bool COutputFilterConfigTextFix::LoadColumnsFromSource()
{
    SCol fresh;
    fresh.nLength = defaultLen;
    // More columns than any output may have are not taken into the page; the
    // filter names the limit when they are written.
    if (!LoadColumns(m_arrColumns, fresh, true))
        return false;
    CalcOffsets();
    return true;
}

void COutputFilterConfigTextFix::RefreshDisplay()
{
    COutputFilterConfigColumns::RefreshDisplay();
    if (::IsWindow(m_hWnd))
        SetDlgItemInt(IDC_OUTFIX_RECLEN, static_cast<UINT>(m_nRecLen), TRUE);
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
