#include "PreviewColumnWidths.h"

#include <CQoString.h>

namespace {
const int kUnsampledWidth = 50;   // a column's text width when no row was read
const int kColumnPadding = 30;
const int kListPadding = 16;      // room for the border and the scroll bar
const long long kMaxWidth = 0x7fff;   // a header item's width is a 16-bit value
}

void SetPreviewColumnWidths(CListCtrl& list, const std::vector<long long>& sums, int rows)
{
    const int n = static_cast<int>(sums.size());
    if (n == 0)
        return;
    std::vector<int> widths(sums.size());
    long long total = kListPadding;
    for (int i = 0; i < n; ++i) {
        long long w = rows > 0 ? sums[static_cast<size_t>(i)] / rows : kUnsampledWidth;
        w += kColumnPadding;
        if (w > kMaxWidth)
            w = kMaxWidth;
        widths[static_cast<size_t>(i)] = static_cast<int>(w);
        total += w;
    }
    CRect rcWindow;
    list.GetWindowRect(&rcWindow);
    const long long extra = total < rcWindow.Width() ? (rcWindow.Width() - total) / n : 0;
    for (int i = 0; i < n; ++i)
        list.SetColumnWidth(i, widths[static_cast<size_t>(i)] + static_cast<int>(extra));
}

CPreviewTextMeter::CPreviewTextMeter(CListCtrl& list) : m_list(list), m_bKnown(false)
{
    HDC hdc = ::GetDC(list.m_hWnd);
    if (hdc == NULL)
        return;
    HFONT hFont = reinterpret_cast<HFONT>(::SendMessageA(list.m_hWnd, WM_GETFONT, 0, 0));
    HGDIOBJ hOld = hFont != NULL ? ::SelectObject(hdc, hFont) : NULL;
    m_bKnown = ::GetCharWidth32A(hdc, 0, 255, m_widths) != FALSE;
    if (hOld != NULL)
        ::SelectObject(hdc, hOld);
    ::ReleaseDC(list.m_hWnd, hdc);
}

int CPreviewTextMeter::Width(const CQoString& text) const
{
    if (!m_bKnown)
        return m_list.GetStringWidth(text);
    long long width = 0;
    const unsigned char* p = reinterpret_cast<const unsigned char*>(text.GetString());
    for (int i = 0; i < text.GetLength(); ++i)
        width += m_widths[p[i]];
    return width > 0x7fffffff ? 0x7fffffff : static_cast<int>(width);
}
