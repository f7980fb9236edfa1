#include "CStaticLink.h"

#include <shellapi.h>

IMPLEMENT_DYNAMIC(CStaticLink, CStatic)

COLORREF CStaticLink::g_colorUnvisited = RGB(0, 0, 255);
COLORREF CStaticLink::g_colorVisited = RGB(128, 0, 128);
HCURSOR CStaticLink::g_hCursorLink = NULL;

namespace {

// The hand of the old help program; the system's hand where that program or
// its cursor is missing. Looked for once per process.
HCURSOR LoadLinkCursor()
{
    HCURSOR hCursor = NULL;
    HMODULE hModule = ::LoadLibraryExA("winhlp32.exe", NULL, LOAD_LIBRARY_AS_DATAFILE);
    if (hModule != NULL) {
        HCURSOR hHelp = ::LoadCursorA(hModule, MAKEINTRESOURCEA(106));
        if (hHelp != NULL)
            hCursor = (HCURSOR)::CopyImage(hHelp, IMAGE_CURSOR, 0, 0, 0);
        ::FreeLibrary(hModule);
    }
    if (hCursor == NULL)
        hCursor = ::LoadCursorA(NULL, MAKEINTRESOURCEA(32649));  // IDC_HAND
    return hCursor;
}

}  // namespace

BEGIN_MESSAGE_MAP(CStaticLink, CStatic)
    ON_WM_NCHITTEST()
    ON_WM_CTLCOLOR_REFLECT()
    ON_WM_LBUTTONDOWN()
    ON_WM_SETCURSOR()
END_MESSAGE_MAP()

CStaticLink::CStaticLink(const char* link, int deleteOnDestroy)
    : m_link(link != NULL ? link : ""), m_color(g_colorUnvisited), m_bDeleteOnDestroy(deleteOnDestroy)
{
}

CStaticLink::~CStaticLink() {}

UINT CStaticLink::OnNcHitTest(CPoint)
{
    // A plain static is transparent to the mouse; the link must see clicks.
    return HTCLIENT;
}

HBRUSH CStaticLink::CtlColor(CDC* pDC, UINT)
{
    // Only text statics (left, centred, right) are drawn as a link.
    if ((GetStyle() & SS_TYPEMASK) > SS_RIGHT)
        return NULL;

    if (m_font.m_hObject == NULL) {
        LOGFONT lf;
        CFont* pFont = GetFont();
        HGDIOBJ hFont = pFont != NULL ? pFont->m_hObject : ::GetStockObject(SYSTEM_FONT);
        if (::GetObjectA(hFont, sizeof lf, &lf) == sizeof lf) {
            lf.lfUnderline = TRUE;
            m_font.CreateFontIndirect(&lf);
        }
    }
    if (m_font.m_hObject != NULL)
        pDC->SelectObject(&m_font);
    pDC->SetTextColor(m_color);
    pDC->SetBkMode(TRANSPARENT);
    return (HBRUSH)::GetStockObject(HOLLOW_BRUSH);
}

void CStaticLink::OnLButtonDown(UINT, CPoint)
{
    if (m_link.IsEmpty())
        GetWindowText(m_link);
    if (m_link.IsEmpty())
        return;

    HINSTANCE hResult = ::ShellExecuteA(NULL, "open", m_link, NULL, NULL, SW_SHOWNORMAL);
    if ((INT_PTR)hResult > 32) {
        m_color = g_colorVisited;
        // The background is hollow: let the parent paint under the text again.
        CWnd* pParent = GetParent();
        if (pParent != NULL) {
            CRect rect;
            GetWindowRect(&rect);
            pParent->ScreenToClient(&rect);
            pParent->InvalidateRect(&rect, TRUE);
        }
        Invalidate(TRUE);
    } else {
        ::MessageBeep(0);
    }
}

BOOL CStaticLink::OnSetCursor(CWnd*, UINT, UINT)
{
    static bool s_bTried = false;
    if (g_hCursorLink == NULL && !s_bTried) {
        s_bTried = true;
        g_hCursorLink = LoadLinkCursor();
    }
    if (g_hCursorLink == NULL)
        return FALSE;
    ::SetCursor(g_hCursorLink);
    return TRUE;
}

void CStaticLink::PostNcDestroy()
{
    if (m_bDeleteOnDestroy)
        delete this;
}
