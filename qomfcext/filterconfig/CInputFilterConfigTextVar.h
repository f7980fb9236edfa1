// CInputFilterConfigTextVar - the page of the delimited text filter
// (CQoInputFilterTextVar), template 4007.
//
// The user picks or types the delimiter ("[TAB]" for the tab), the encloser and
// the escape character, the lines to skip at the start, the character set and
// whether the first line holds the field names. "Übernehmen", Enter, ticking the
// first-line box and the host's DefaultAction() all apply: the settings go to the
// filter, the filter re-opens its file, the preview below shows the records as
// they are now read, and the listeners are told once with the page's id.
//
// Nothing reaches the filter before an apply, and nothing reaches it from an apply
// that is refused: a skip that is not a whole number, an empty delimiter, a file
// that cannot be opened or is not text, or settings under which the filter cannot
// read the file each give a message and leave the filter and the page's fields as
// they are. Only a change of delimiter, encloser or escape drops the filter's
// known row count, since only they move the record boundaries.
//
//     CInputFilterConfigTextVar page(&filter, ID_INPUT);
//     page.Create(pHostWnd);
//     page.ShowWindow(SW_SHOW);
#pragma once

#include "CColoredInputFilterListCtrl.h"
#include "CInputFilterConfig.h"
#include "QoMfcExtApi.h"

class CQoInputFilterTextVar;

class QOMFCEXT_API CInputFilterConfigTextVar : public CInputFilterConfig
{
    DECLARE_DYNAMIC(CInputFilterConfigTextVar)

public:
    enum { IDD = 4007 };

    CInputFilterConfigTextVar(CQoInputFilterTextVar* pFilter, int nNotifierId);
    ~CInputFilterConfigTextVar() override;

    void Enable(int bEnable) override;
    void DefaultAction() override;
    int Create(CWnd* pParent) override;
    void UpdateInputFilter(int bSave) override;

    // Exchanged with the controls, in this order
    CColoredInputFilterListCtrl m_preview;  // 4009
    int m_nSkip;                            // 4018
    CString m_strDelimiter;                 // 4015, "[TAB]" for the tab
    CString m_strEncloser;                  // 4016
    CString m_strEscape;                    // 4017
    int m_nCharSet;                         // 4019, index of the character-set choice
    BOOL m_bFirstRowHasNames;               // 4128

protected:
    void DoDataExchange(CDataExchange* pDX) override;
    BOOL OnInitDialog() override;
    // Enter applies; Escape leaves everything as it is.
    void OnOK() override;
    void OnCancel() override;

    afx_msg void OnApply();
    afx_msg void OnInfo();
    DECLARE_MESSAGE_MAP()

private:
    CQoInputFilterTextVar* TextFilter() const;
    // Writes the controls' settings into the filter and re-opens it; false when
    // the settings were refused (a message was shown, the filter is untouched).
    bool SaveSettings();
    bool CheckSettings(char cDelimiter);
    bool CheckFile(const CString& strFile);
    bool TryOpen(char cDelimiter, char cEncloser, char cEscape);
    // Rebuilds the preview; a filter error is shown, not passed on.
    void RefreshPreview();
    void ShowError(const char* text);
};
