// CFrameWnd: the main window's accelerator table and its self-deletion.
#include "afxwin.h"

IMPLEMENT_DYNCREATE(CFrameWnd, CWnd)

CFrameWnd::CFrameWnd() : m_hAccelTable(NULL) {}

CFrameWnd::~CFrameWnd() {}

// A frame is made with new and nobody else holds on to it once its window is
// destroyed (the user closed it), so it goes with its window.
void CFrameWnd::PostNcDestroy() { delete this; }
