// CListRedrawOff - holds a list's painting off while it is filled or its columns
// are changed one by one, and turns it on again when it goes out of scope, also
// when the filter raises on the way.
//
// Under Wine every change of a column lays out and paints the whole list (several
// milliseconds apiece) and every inserted item invalidates it; with painting off
// the list is painted once, at the end.
#pragma once

#include <afxwin.h>

class CListRedrawOff
{
public:
    explicit CListRedrawOff(CWnd& wnd) : m_wnd(wnd) { m_wnd.SetRedraw(FALSE); }
    ~CListRedrawOff()
    {
        if (!::IsWindow(m_wnd.m_hWnd)) return;
        m_wnd.SetRedraw(TRUE);
        m_wnd.RedrawWindow(NULL, NULL, RDW_INVALIDATE | RDW_ERASE | RDW_FRAME | RDW_ALLCHILDREN);
    }
    CListRedrawOff(const CListRedrawOff&) = delete;
    CListRedrawOff& operator=(const CListRedrawOff&) = delete;

private:
    CWnd& m_wnd;
};
