#include "CModelessDialog.h"

IMPLEMENT_DYNAMIC(CModelessDialog, CDialog)

BEGIN_MESSAGE_MAP(CModelessDialog, CDialog)
END_MESSAGE_MAP()

CModelessDialog::CModelessDialog(UINT nIDTemplate, CWnd* pParent)
    : CDialog(nIDTemplate, pParent)
{
}

CModelessDialog::~CModelessDialog() {}

void CModelessDialog::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
}

BOOL CModelessDialog::PreTranslateMessage(MSG* pMsg)
{
    // IsDialogMessage would take every key of the page for itself, so the
    // frame's shortcuts would die whenever the user works in a page. Only a
    // real frame has an accelerator table; a main window of another kind
    // (a dialog-based application) simply has none to offer.
    CWinApp* pApp = AfxGetApp();
    CFrameWnd* pFrame = pApp != NULL ? DYNAMIC_DOWNCAST(CFrameWnd, pApp->m_pMainWnd) : NULL;
    if (pFrame != NULL && pFrame->m_hAccelTable != NULL && ::IsWindow(pFrame->m_hWnd) &&
        ::TranslateAcceleratorA(pFrame->m_hWnd, pFrame->m_hAccelTable, pMsg))
        return TRUE;
    return CDialog::PreTranslateMessage(pMsg);
}

// CDialog ends the dialog here, which for a modeless one means hiding it: the
// page would vanish from the application's window at a press of Enter or
// Escape, with nothing left to bring it back.
void CModelessDialog::OnOK() {}

void CModelessDialog::OnCancel() {}
