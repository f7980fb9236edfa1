// CInputFilterConfig - the page on which the user sets up how an input filter
// reads its source, with a preview of the records it delivers.
//
// There is one page per kind of filter; GetAppropriateConfig picks it by the
// filter's InputFilterType(). The host owns both the filter and the page, creates
// the page's window inside one of its own and drives every page alike:
//
//     CInputFilterConfig* page = CInputFilterConfig::GetAppropriateConfig(&filter, ID_INPUT);
//     if (page != NULL) {                 // null: no page for this kind of filter
//         page->AddModifiedListener(&doc); // told after each change the user applies
//         page->Create(pHostWnd);          // a hidden child; the host places and shows it
//         ...
//         page->DefaultAction();           // take the page's settings as if the user applied
//         page->UpdateInputFilter(0);      // show a filter that changed outside the page
//         page->DestroyWindow();
//         delete page;
//     }
//
// A page never closes itself: Enter applies where the page has something to apply,
// Escape does nothing. The filter must outlive the page.
#pragma once

#include "CModelessDialog.h"
#include "CModifiedNotifier.h"
#include "QoMfcExtApi.h"

class CQoInputFilter;

class QOMFCEXT_API CInputFilterConfig : public CModelessDialog, public CModifiedNotifier
{
    DECLARE_DYNAMIC(CInputFilterConfig)

public:
    CInputFilterConfig(CQoInputFilter* pFilter, int nNotifierId, UINT nIDTemplate, CWnd* pParent);
    ~CInputFilterConfig() override;

    // A new page for the filter (the caller owns it; its window is not created
    // yet), or null for a null filter or a kind of filter without a page.
    static CInputFilterConfig* GetAppropriateConfig(CQoInputFilter* pFilter, int nNotifierId);

    // Virtual functions every page overrides
    // Enables (nonzero) or disables every control of the page, while its window exists.
    virtual void Enable(int bEnable) = 0;
    // Takes the page's settings over as the page's own apply would. Default: nothing.
    virtual void DefaultAction();
    using CDialog::Create;
    // Creates the page's window from its own template as a child of the parent.
    virtual int Create(CWnd* pParent) = 0;
    // 0: the filter's settings into the controls and a fresh preview;
    // nonzero: the controls' settings into the filter.
    virtual void UpdateInputFilter(int bSave) = 0;

    CQoInputFilter* GetInputFilter() const { return m_pInputFilter; }

protected:
    long m_lMaxPreviewRows;          // rows the plain previews copy at most
    CQoInputFilter* m_pInputFilter;  // not owned
};
