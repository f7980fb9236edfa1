// COdbcInputPage - the sample program's page for an ODBC input. The library
// has no page for it: an ODBC source is named by its connect string and a
// table or statement, which the window asks for; the page shows the records
// as the filter reads them, like the library's dBase page.
#pragma once

#include <CInputFilterConfig.h>
#include <CInputFilterListCtrl.h>

#include "resource.h"

class COdbcInputPage : public CInputFilterConfig
{
public:
    enum { IDD = IDD_ODBC_INPUT };

    COdbcInputPage(CQoInputFilter* pFilter, int nNotifierId);

    void Enable(int bEnable) override;
    int Create(CWnd* pParent) override;
    // 0: reads the preview again; the page sets nothing.
    void UpdateInputFilter(int bSave) override;

protected:
    void DoDataExchange(CDataExchange* pDX) override;
    BOOL OnInitDialog() override;
    void OnOK() override {}
    void OnCancel() override {}

private:
    void RefreshPreview();

    CInputFilterListCtrl m_preview;
};
