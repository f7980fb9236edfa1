// CModelessDialog - the base of the configuration pages that an application
// embeds in its own windows.
//
// A page is a child dialog (template styles WS_CHILD, DS_CONTROL, DS_SETFONT,
// not visible) that the application creates inside one of its windows and
// destroys itself; the page never runs modally. While the keyboard focus is
// in the page, the accelerators of the application's main frame keep working:
// such a key runs the frame's command and the page does not see it. Every
// other key reaches the page's controls as in any dialog (Tab moves on, Enter
// and Escape send IDOK and IDCANCEL to the page).
//
//     class CMyPage : public CModelessDialog { ... };
//     CMyPage* page = new CMyPage(IDD_MY_PAGE, pHostWnd);
//     page->Create(IDD_MY_PAGE, pHostWnd);
//     page->SetWindowPos(NULL, x, y, 0, 0, SWP_NOSIZE | SWP_NOZORDER);
//     page->ShowWindow(SW_SHOW);
//     ...
//     page->DestroyWindow(); delete page;
//
// A page does not close itself: Enter and Escape leave it open and on the
// screen. A page that applies its values on Enter overrides OnOK.
#pragma once

#include <afxwin.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CModelessDialog : public CDialog
{
    DECLARE_DYNAMIC(CModelessDialog)

public:
    CModelessDialog(UINT nIDTemplate, CWnd* pParent);
    virtual ~CModelessDialog();

    // The main frame's accelerators first, then ordinary dialog keyboard handling.
    virtual BOOL PreTranslateMessage(MSG* pMsg);

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    // Keep the page open (CDialog's would hide it): nothing happens here.
    virtual void OnOK();
    virtual void OnCancel();

    DECLARE_MESSAGE_MAP()
};
