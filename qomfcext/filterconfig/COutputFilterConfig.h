// COutputFilterConfig - the base of the output filter pages: one page per kind
// of output filter, on which the user sets up how the converted rows are written.
//
// A page works on two objects that the host owns and hands it: the output
// filter (what is written and how) and the output source (the rows and columns
// to be written). The page never deletes them. There is no factory: the host
// constructs the page that fits its filter and drives it so:
//
//     COutputFilterConfigTextFix* page = new COutputFilterConfigTextFix(ID_OUTPUT_PAGE, pHost);
//     page->SetSourceAndFilter(&source, &filter);   // stores both, shows nothing yet
//     page->Create(pHost);                          // hidden child window
//     page->UpdateOutputFilter(0);                  // filter settings -> page
//     page->RefreshDisplay();                       // source columns -> page
//     page->ShowWindow(SW_SHOW);
//     ...                                           // after the source changed:
//     page->RefreshDisplay();
//     page->UpdateOutputFilter(1);                  // page -> filter (Enter does it too)
//
// Enter on any output page runs DefaultAction (the page's apply); Escape does
// nothing and the page stays open. Without a source or a filter every
// operation that needs them does nothing. A page refuses bad input with a
// message box and never lets an exception of the filter or the source leave
// it. The output pages announce nothing to their modification listeners.
#pragma once

#include <afxwin.h>

#include "CModelessDialog.h"
#include "CModifiedNotifier.h"
#include "QoMfcExtApi.h"

class CQoOutputFilter;
class CQoOutputSource;

class QOMFCEXT_API COutputFilterConfig : public CModelessDialog, public CModifiedNotifier
{
    DECLARE_DYNAMIC(COutputFilterConfig)

public:
    COutputFilterConfig(int nNotifierId, UINT nIDTemplate, CWnd* pParent);
    virtual ~COutputFilterConfig();

    // Virtual functions a page overrides
    // Enables or disables every control of the page (only while the window exists).
    virtual void Enable(bool bOn) = 0;
    // What Enter does; here nothing.
    virtual void DefaultAction();
    // Rebuilds the page's display from the source; here nothing.
    virtual void RefreshDisplay();
    // 0: the filter's settings into the page; nonzero: the page into the filter.
    virtual void UpdateOutputFilter(int nSave) = 0;
    // Stores both pointers (not owned); does not refresh.
    virtual void SetSourceAndFilter(CQoOutputSource* pSource, CQoOutputFilter* pFilter);
    // Creates the modeless window from the page's template; nonzero on success.
    virtual int Create(CWnd* pParent) = 0;
    using CDialog::Create;

    CQoOutputFilter* GetOutputFilter() const { return m_pOutputFilter; }
    CQoOutputSource* GetOutputSource() const { return m_pOutputSource; }

protected:
    // Enter applies: runs DefaultAction and leaves the page open.
    virtual void OnOK();

    CQoOutputFilter* m_pOutputFilter;
    CQoOutputSource* m_pOutputSource;

    DECLARE_MESSAGE_MAP()
};
