// CInputFilterConfigDbase - the page of the dBase filter (CQoInputFilterDbase34,
// dBase III and IV), template 4011.
//
// A dBase file describes itself: there is nothing to set. The page explains so,
// shows the character set dBase data are read in (always DOS, the choice is
// disabled) and previews the first 1000 records, so that the user sees whether
// the file is what it should be.
//
// The page never changes its filter. UpdateInputFilter(0) reads the preview anew
// (the host calls it after it opened another file); a file that can no longer be
// read is reported with a message and the preview keeps what it showed.
//
//     CInputFilterConfigDbase page(&dbf, ID_INPUT);
//     page.Create(pHostWnd);
//     page.ShowWindow(SW_SHOW);
#pragma once

#include "CInputFilterConfig.h"
#include "CInputFilterListCtrl.h"
#include "QoMfcExtApi.h"

class CQoInputFilterDbase34;

class QOMFCEXT_API CInputFilterConfigDbase : public CInputFilterConfig
{
    DECLARE_DYNAMIC(CInputFilterConfigDbase)

public:
    enum { IDD = 4011 };

    CInputFilterConfigDbase(CQoInputFilterDbase34* pFilter, int nNotifierId);
    ~CInputFilterConfigDbase() override;

    void Enable(int bEnable) override;
    int Create(CWnd* pParent) override;
    // 0: the preview read anew; nonzero: nothing (the page has no settings).
    void UpdateInputFilter(int bSave) override;

    CComboBox m_charSet;             // 4161, "DOS Ascii" only, disabled
    CInputFilterListCtrl m_preview;  // 4021

protected:
    void DoDataExchange(CDataExchange* pDX) override;
    BOOL OnInitDialog() override;
    // Enter and Escape leave the page as it is.
    void OnOK() override;
    void OnCancel() override;

private:
    void RefreshPreview();
};
