#include "CInputFilterListCtrl.h"

#include <climits>
#include <vector>

#include "CListRedrawOff.h"
#include "PreviewColumnWidths.h"
#include "CQoInputFilter.h"
#include "CColoredInputFilterListCtrl.h"

namespace {
const int kNewColumnWidth = 170;
}

BEGIN_MESSAGE_MAP(CInputFilterListCtrl, CListCtrl)
END_MESSAGE_MAP()

CInputFilterListCtrl::CInputFilterListCtrl(int useHeader)
    : m_nUseHeader(useHeader), m_lMaxRows(0), m_pFilter(NULL)
{
}

CInputFilterListCtrl::~CInputFilterListCtrl()
{
}

void CInputFilterListCtrl::SetInputFilter(CQoInputFilter* pFilter)
{
    m_pFilter = pFilter;
}

void CInputFilterListCtrl::SetMaxRows(long maxRows)
{
    m_lMaxRows = maxRows;
}

void CInputFilterListCtrl::UseHeader(int useHeader)
{
    m_nUseHeader = useHeader;
}

void CInputFilterListCtrl::Update()
{
    if (m_pFilter == NULL) return;
    ASSERT(::IsWindow(m_hWnd));
    CListRedrawOff redrawOff(*this);

    DeleteAllItems();
    while (DeleteColumn(0)) {
    }

    int n = m_pFilter->NumCols();
    if (n < 0) n = 0;
    if (n > CColoredInputFilterListCtrl::kMaxColumns) n = CColoredInputFilterListCtrl::kMaxColumns;
    CQoString value;
    for (int i = 0; i < n; ++i) {
        if (m_nUseHeader != 0)
            m_pFilter->ColName(i, value);
        else
            value.Empty();
        if (InsertColumn(i, value, LVCFMT_LEFT, kNewColumnWidth) < 0) {
            n = i;
            break;
        }
    }

    std::vector<long long> sums(static_cast<size_t>(n), 0);
    const CPreviewTextMeter meter(*this);
    int rows = 0;
    if (n > 0 && m_pFilter->FirstRow()) {
        for (;;) {
            for (int i = 0; i < n; ++i) {
                m_pFilter->Value(i, value);
                sums[static_cast<size_t>(i)] += meter.Width(value);
                if (i == 0)
                    InsertItem(rows, value);
                else
                    SetItemText(rows, i, value);
            }
            ++rows;
            if (m_lMaxRows != 0 && rows >= m_lMaxRows) break;
            if (rows == INT_MAX) break;  // the list counts its items in an int
            if (!m_pFilter->NextRow()) break;
        }
    }
    if (n == 0) return;

    SetPreviewColumnWidths(*this, sums, rows);
}
