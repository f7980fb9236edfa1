// COutputFilterConfigTextVar - the page of the delimited text output
// (CQoOutputFilterTextVar): delimiter, encloser, escape character, character
// set, "always enclose" and "names in the first line", with a preview of the
// header and the first 50 rows exactly as the filter would write them.
//
// Every preview writes the page's settings into the filter first: when the
// page opens, on "Vorschau aktualisieren", on Enter, DefaultAction and
// RefreshDisplay. A tab as delimiter is shown and typed as "[TAB]"; an empty
// box means "none" (character 0). The first preview with "DOS Ascii" tells
// the user once per page object that the preview shows Windows characters.
//
//     page.SetSourceAndFilter(&source, &filter);  page.Create(pHost);
//     ...                                          // after the source changed:
//     page.RefreshDisplay();
//
// Settings from which no readable file can be written (no delimiter, the
// delimiter equal to the encloser, ...) are shown in the preview in place of
// the rows, and so is an error of the filter or the source while previewing;
// the page raises nothing.
#pragma once

#include "COutputFilterConfig.h"
#include "QoMfcExtApi.h"

class CQoOutputFilterTextVar;

class QOMFCEXT_API COutputFilterConfigTextVar : public COutputFilterConfig
{
    DECLARE_DYNAMIC(COutputFilterConfigTextVar)

public:
    // The rows shown in the preview at most.
    enum { previewRows = 50 };

    COutputFilterConfigTextVar(int nNotifierId, CWnd* pParent);
    virtual ~COutputFilterConfigTextVar();

    // COutputFilterConfig
    virtual void Enable(bool bOn);
    virtual void DefaultAction();
    virtual void RefreshDisplay();
    virtual void UpdateOutputFilter(int nSave);
    virtual int Create(CWnd* pParent);
    using COutputFilterConfig::Create;

    // The text of the last preview.
    const CString& GetPreview() const { return m_strPreview; }

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual BOOL OnInitDialog();
    virtual void OnOK();

    afx_msg void OnApply();
    DECLARE_MESSAGE_MAP()

    CString m_strPreview;
    int m_nCharSet;
    CString m_strDelimiter;
    CString m_strEncloser;
    CString m_strEscape;
    BOOL m_bAlwaysEnclose;
    BOOL m_bNamesFirstLine;
    bool m_bCharSetHintShown;

private:
    CQoOutputFilterTextVar* Filter() const;
    void BuildPreview(CQoOutputFilterTextVar* pFilter);
};
