#include "CColoredInputFilterListCtrl.h"

#include <exception>
#include <vector>

#include "CListRedrawOff.h"
#include "PreviewColumnWidths.h"
#include "CQoInputFilter.h"

namespace {
const int kNewColumnWidth = 170;
}

CColoredInputFilterListCtrl::CColoredInputFilterListCtrl(bool useHeader)
    : m_pFilter(NULL),
      m_bUseHeader(useHeader),
      m_clrText(RGB(0, 0, 0)),
      m_clrSelectedText(RGB(255, 255, 255)),
      m_bSpecialFirstRow(false),
      m_clrSpecialText(RGB(0, 0, 0)),
      m_clrSpecialSelectedText(RGB(255, 255, 255))
{
}

CColoredInputFilterListCtrl::~CColoredInputFilterListCtrl()
{
}

void CColoredInputFilterListCtrl::SetInputFilter(CQoInputFilter* pFilter)
{
    m_pFilter = pFilter;
}

void CColoredInputFilterListCtrl::UseHeader(bool useHeader)
{
    m_bUseHeader = useHeader;
}

void CColoredInputFilterListCtrl::SetSpecialFirstRow(bool on, DWORD clrText, DWORD clrSelectedText)
{
    m_bSpecialFirstRow = on;
    m_clrSpecialText = clrText;
    m_clrSpecialSelectedText = clrSelectedText;
    SetHeaderLines(on ? 1 : 0);
}

void CColoredInputFilterListCtrl::SetSpecialText(int column, const CString& text)
{
    if (column < 0 || column >= m_arrSpecialTexts.GetSize()) return;
    m_arrSpecialTexts[column] = text;
}

int CColoredInputFilterListCtrl::Update(int item)
{
    ASSERT(::IsWindow(m_hWnd));
    return (int)SendMessage(LVM_UPDATE, (WPARAM)item, 0);
}

// Columns that exist keep their place (and the user's widths until the widths
// are set below); only the surplus goes or the missing ones are appended.
void CColoredInputFilterListCtrl::SyncColumnCount(int n)
{
    CHeaderCtrl* pHeader = GetHeaderCtrl();
    int h = pHeader != NULL ? pHeader->GetItemCount() : 0;
    while (h > n) {
        if (!DeleteColumn(h - 1)) break;
        --h;
    }
    while (h < n) {
        if (InsertColumn(h, "", LVCFMT_LEFT, kNewColumnWidth) < 0) break;
        ++h;
    }
}

// min(rows, kMaxRows) without counting the whole file: NumRows() of a text filter
// reads the file to its end, which on ten million rows takes seconds. Standing on
// the last row shown settles the common case after reading at most kMaxRows rows;
// only a shorter filter is counted, and its count costs no more than that.
long CColoredInputFilterListCtrl::CountRowsUpToLimit()
{
    if (m_pFilter->AbsoluteRow(kMaxRows - 1)) return kMaxRows;
    long m = m_pFilter->NumRows();
    if (m < 0) return 0;
    return m >= kMaxRows ? kMaxRows : m;
}

void CColoredInputFilterListCtrl::Update()
{
    if (m_pFilter == NULL) return;
    ASSERT(::IsWindow(m_hWnd));
    CListRedrawOff redrawOff(*this);

    int n = m_pFilter->NumCols();
    if (n < 0) n = 0;
    if (n > kMaxColumns) n = kMaxColumns;
    SyncColumnCount(n);
    CHeaderCtrl* pHeader = GetHeaderCtrl();
    if (pHeader != NULL && pHeader->GetItemCount() < n) n = pHeader->GetItemCount();

    m_arrSpecialTexts.RemoveAll();
    m_arrSpecialTexts.SetSize(n);
    if (n == 0) return;

    const int extraItem = m_bSpecialFirstRow ? 1 : 0;
    CQoString value;
    for (int i = 0; i < n; ++i) {
        m_pFilter->ColName(i, value);
        LVCOLUMN column;
        memset(&column, 0, sizeof(column));
        column.mask = LVCF_TEXT;
        column.pszText = const_cast<char*>(value.GetString());
        SetColumn(i, &column);
    }

    std::vector<long long> sums(static_cast<size_t>(n), 0);
    const CPreviewTextMeter meter(*this);
    int sampled = 0;
    if (m_pFilter->FirstRow()) {
        do {
            for (int i = 0; i < n; ++i) {
                m_pFilter->Value(i, value);
                sums[static_cast<size_t>(i)] += meter.Width(value);
            }
            ++sampled;
        } while (sampled < kSampleRows && m_pFilter->NextRow());
    }
    SetItemCountEx(sampled + extraItem, LVSICF_NOINVALIDATEALL);

    const long rows = CountRowsUpToLimit();
    SetItemCountEx(static_cast<int>(rows) + extraItem, LVSICF_NOINVALIDATEALL);

    SetPreviewColumnWidths(*this, sums, sampled);
}

int CColoredInputFilterListCtrl::GetColoredItem(int row, int col, CString& text, DWORD& clrText,
                                                DWORD& clrSelectedText, bool& bold)
{
    if (m_pFilter == NULL) return 1;
    text.Empty();
    bold = false;
    if (m_bSpecialFirstRow) --row;
    if (row == -1) {
        clrText = m_clrSpecialText;
        clrSelectedText = m_clrSpecialSelectedText;
        if (col >= 0 && col < m_arrSpecialTexts.GetSize()) text = m_arrSpecialTexts[col];
        return 1;
    }
    clrText = m_clrText;
    clrSelectedText = m_clrSelectedText;
    // Called from painting: whatever the filter raises must end here, as an empty cell.
    try {
        if (m_pFilter->AbsoluteRow(row)) {
            CQoString value;
            m_pFilter->Value(col, value);
            text = value.GetString();
        }
    } catch (const std::exception&) {
        text.Empty();
    }
    return 1;
}
