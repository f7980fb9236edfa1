// CInputFilterConfigTextFix - the page of the fixed-column text filters, template
// 4009: records of one length without line breaks (CQoInputFilterTextFix,
// records mode) or lines cut into columns of fixed width (CQoInputFilterTextVF,
// lines mode).
//
// The raw records (or lines) of the file are shown in the text-format control,
// the columns as vertical lines on it: a click sets a column boundary, a double
// click deletes one, a drag moves one. "Übernehmen", ticking the first-record box
// and the host's DefaultAction() hand the boundaries, the record length and the
// character set to the filter, show the file anew and tell the listeners.
// The first column always starts at the start of the record; the boundaries up to
// the record length (the longest line shown, in lines mode) count.
//
// A file that cannot be opened any more gives a message, and the filter and the
// view stay as they were.
//
//     CInputFilterConfigTextFix page(&filter, ID_INPUT, false);  // records mode
//     page.Create(pHostWnd);
//     page.ShowWindow(SW_SHOW);
#pragma once

#include "CInputFilterConfig.h"
#include "CQoTextFormat.h"
#include "QoMfcExtApi.h"

class QOMFCEXT_API CInputFilterConfigTextFix : public CInputFilterConfig
{
    DECLARE_DYNAMIC(CInputFilterConfigTextFix)

public:
    enum { IDD = 4009 };

    CInputFilterConfigTextFix(CQoInputFilter* pFilter, int nNotifierId, bool bLinesMode);
    ~CInputFilterConfigTextFix() override;

    void Enable(int bEnable) override;
    void DefaultAction() override;
    int Create(CWnd* pParent) override;
    void UpdateInputFilter(int bSave) override;

    // Exchanged with the controls, in this order
    int m_nRecordLen;            // 4013 with spin 4090
    CQoTextFormat m_textView;    // 4012
    int m_nCharSet;              // 4020, index of the character-set choice
    BOOL m_bFirstRecordHasNames; // 4129

protected:
    bool m_bLinesMode;
    int m_nLongestLine;          // lines mode: the longest line shown

    void DoDataExchange(CDataExchange* pDX) override;
    BOOL OnInitDialog() override;
    void OnOK() override;
    void OnCancel() override;
    // Reads the file into the text view; false (with a message, the view as it
    // was) when the file cannot be opened.
    bool FillControl();

    afx_msg void OnApply();
    afx_msg void OnDeltaPosSpin(NMHDR* pNMHDR, LRESULT* pResult);
    DECLARE_MESSAGE_MAP()

private:
    bool HasFilterForMode() const;
    bool SaveSettings();
    void MarksFromFilter();
    bool CanOpen(const CString& strFile);
    void ShowError(const char* text);
};
