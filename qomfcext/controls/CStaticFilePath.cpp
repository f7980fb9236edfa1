#include "CStaticFilePath.h"

#include <vector>

BEGIN_MESSAGE_MAP(CStaticFilespec, CWnd)
    ON_MESSAGE(WM_SETTEXT, OnSetText)
    ON_WM_ERASEBKGND()
    ON_WM_PAINT()
END_MESSAGE_MAP()

CStaticFilespec::CStaticFilespec()
    : m_nPathMode(0), m_dwFormat(DT_NOPREFIX | DT_VCENTER)
{
}

CStaticFilespec::CStaticFilespec(DWORD format, int pathMode)
    : m_nPathMode(pathMode), m_dwFormat(format)
{
}

CStaticFilespec::~CStaticFilespec() {}

UINT CStaticFilespec::DrawFlags() const
{
    return m_dwFormat | (m_nPathMode > 0 ? DT_PATH_ELLIPSIS : DT_END_ELLIPSIS);
}

LRESULT CStaticFilespec::OnSetText(WPARAM, LPARAM)
{
    // The window keeps the whole text; only the drawing shortens it. The
    // result of the default handling is kept, so that SetWindowText reports
    // the truth.
    LRESULT result = Default();
    Invalidate(TRUE);
    return result;
}

BOOL CStaticFilespec::OnEraseBkgnd(CDC* pDC)
{
    CRect rect;
    GetClientRect(&rect);
    pDC->FillSolidRect(&rect, ::GetSysColor(COLOR_BTNFACE));
    return TRUE;
}

void CStaticFilespec::OnPaint()
{
    CPaintDC dc(this);

    CFont* pOldFont = NULL;
    CWnd* pParent = GetParent();
    CFont* pFont = pParent != NULL ? pParent->GetFont() : NULL;
    if (pFont != NULL)
        pOldFont = dc.SelectObject(pFont);

    CRect rect;
    GetClientRect(&rect);
    CString text;
    GetWindowText(text);
    // DrawTextEx wants a writable buffer although it changes nothing here.
    std::vector<char> buffer((const char*)text, (const char*)text + text.GetLength() + 1);
    int oldMode = dc.SetBkMode(TRANSPARENT);
    COLORREF oldColor = dc.SetTextColor(::GetSysColor(COLOR_BTNTEXT));
    ::DrawTextExA(dc.m_hDC, buffer.data(), text.GetLength(), &rect, DrawFlags(), NULL);
    dc.SetTextColor(oldColor);
    dc.SetBkMode(oldMode);

    if (pOldFont != NULL)
        dc.SelectObject(pOldFont);
}
