// QoWidenListBox - the width bookkeeping that the library's list boxes share:
// before a text is added, it is measured in the list's own font; a text wider
// than every earlier one sets the horizontal scroll range to its width plus
// 20 pixels, so that the end of the longest entry can be scrolled into view.
#pragma once

#include <afxwin.h>

// nWidest is the widest text measured so far for this list (0 at the start).
inline void QoWidenListBox(CListBox& list, int& nWidest, const char* lpszItem)
{
    ASSERT(::IsWindow(list.m_hWnd));
    if (lpszItem == nullptr)
        return;
    CWindowDC dc(&list);
    CFont* pFont = list.GetFont();
    CFont* pOld = pFont != nullptr ? dc.SelectObject(pFont) : nullptr;
    CRect rc(0, 0, 0, 0);
    // Items are drawn without prefix processing: an '&' takes its room too.
    dc.DrawText(lpszItem, -1, &rc, DT_CALCRECT | DT_SINGLELINE | DT_NOPREFIX);
    if (pOld != nullptr)
        dc.SelectObject(pOld);
    if (rc.Width() > nWidest) {
        nWidest = rc.Width();
        list.SetHorizontalExtent(nWidest + 20);
    }
}
