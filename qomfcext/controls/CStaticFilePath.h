// CStaticFilespec - a static text for a file name that does not fit: it draws
// its window text shortened with an ellipsis, either in the middle of a path
// ("C:\daten\...\kunden.txt", path mode) or at the end.
//
// Subclass a static control of a dialog with it (DDX_Control) or create it as
// a child window; the text is the window text, the drawing uses the parent's
// font on the button face.
//
//     CStaticFilespec m_wndFile;             // DDX_Control(pDX, 4112, m_wndFile)
//     m_wndFile.SetPath(1);
//     m_wndFile.SetWindowText("C:\\daten\\2024\\kunden\\kunden.txt");
#pragma once

#include <afxwin.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CStaticFilespec : public CWnd
{
public:
    // DT_NOPREFIX | DT_VCENTER, cut at the end.
    CStaticFilespec();
    // format: DrawText flags; pathMode > 0 shortens as a path.
    CStaticFilespec(DWORD format, int pathMode);
    virtual ~CStaticFilespec();

    BOOL IsPath() const { return m_nPathMode > 0; }
    void SetPath(int pathMode) { m_nPathMode = pathMode; }
    DWORD GetFormat() const { return m_dwFormat; }
    void SetFormat(DWORD format) { m_dwFormat = format; }

    // The flags with which the text is drawn: the format and the ellipsis.
    UINT DrawFlags() const;

protected:
    afx_msg LRESULT OnSetText(WPARAM wParam, LPARAM lParam);
    afx_msg BOOL OnEraseBkgnd(CDC* pDC);
    afx_msg void OnPaint();

    DECLARE_MESSAGE_MAP()

private:
    int m_nPathMode;
    DWORD m_dwFormat;
};
