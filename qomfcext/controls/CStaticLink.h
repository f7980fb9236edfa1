// CStaticLink - a static text that works as a hyperlink: drawn underlined in
// blue, purple once it has been opened, with a hand cursor; a click opens the
// link (a web address, a file, a program) with the shell.
//
// Subclass a left, centred or right aligned static text with it. Without a
// link of its own the window text is the link:
//
//     m_wndHome.SubclassDlgItem(IDC_HOME, this);         // text "https://..."
//     CStaticLink* p = new CStaticLink("C:\\daten\\liesmich.txt", TRUE);
//     p->SubclassDlgItem(IDC_README, this);              // deletes itself with the window
#pragma once

#include <afxwin.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CStaticLink : public CStatic
{
    DECLARE_DYNAMIC(CStaticLink)

public:
    // link: what a click opens (NULL or empty: the window text at the time of
    // the click). deleteOnDestroy: the object deletes itself when its window
    // is gone; such an object must be made with new.
    CStaticLink(const char* link = NULL, int deleteOnDestroy = 0);
    virtual ~CStaticLink();

    static COLORREF g_colorUnvisited;   // blue
    static COLORREF g_colorVisited;     // purple
    static HCURSOR g_hCursorLink;       // the hand, loaded on first need

    CString m_link;
    COLORREF m_color;   // the colour the text is drawn in now

protected:
    virtual void PostNcDestroy();

    afx_msg UINT OnNcHitTest(CPoint point);
    afx_msg HBRUSH CtlColor(CDC* pDC, UINT nCtlColor);
    afx_msg void OnLButtonDown(UINT nFlags, CPoint point);
    afx_msg BOOL OnSetCursor(CWnd* pWnd, UINT nHitTest, UINT message);

    DECLARE_MESSAGE_MAP()

    CFont m_font;              // the control's font, underlined; made on first use
    int m_bDeleteOnDestroy;
};
