// COutputFilterConfigTextFix - the page of the fixed-length text output
// (CQoOutputFilterTextFix): a list of the source's columns with their offsets
// and lengths, the record length, the line break after each record and the
// character set.
//
// The page keeps the column lengths in its own array, by column name: a column
// keeps its length across RefreshDisplay as long as the source still has a
// column of exactly that name; a new column gets defaultLen. The lengths reach
// the filter only on apply ("Übernehmen", Enter, DefaultAction), which also
// writes the column names, the line-break switch and the character set.
//
//     page.SetSourceAndFilter(&source, &filter);  page.Create(pHost);
//     page.UpdateOutputFilter(0);                 // lengths and switches from the filter
//     page.RefreshDisplay();                      // the source's columns into the list
//
// The user selects a row, types its length and applies. A length must be a
// whole number from 1 to what is left of the record limit of the base library
// (qolimits::maxRecordLength less the other columns); anything else is refused
// with the framework's range message and never reaches the filter. A filter
// that refuses the settings (too many columns, a record too long) is reported
// with its own message.
#pragma once

#include <afxtempl.h>

#include "COutputFilterConfigColumns.h"
#include "QoMfcExtApi.h"

class CQoOutputFilterTextFix;

// The page's column list (one list serves every page of columns).
typedef COutputFilterConfigColumnsClrListCtrl COutputFilterConfigTextFixClrListCtrl;

class QOMFCEXT_API COutputFilterConfigTextFix : public COutputFilterConfigColumns
{
    DECLARE_DYNAMIC(COutputFilterConfigTextFix)

public:
    // The length of a column the page has no length for.
    static constexpr int defaultLen = 30;

    // One column of the record as the page holds it.
    struct SCol {
        CString strName;
        int nLength = 0;
        int nOffset = 0;       // zero-based start in the record
        int nDataLength = -1;  // the source's GetDataLength, recorded only
    };

    COutputFilterConfigTextFix(int nNotifierId, CWnd* pParent);
    virtual ~COutputFilterConfigTextFix();

    // COutputFilterConfig
    virtual void RefreshDisplay();
    virtual void UpdateOutputFilter(int nSave);

    // What the page holds (for the list and for the host).
    virtual int GetColumnCount() const { return static_cast<int>(m_arrColumns.GetSize()); }
    // False and `col` untouched for an index outside the columns.
    bool GetColumn(int index, SCol& col) const { return ColumnAt(m_arrColumns, index, col); }
    int GetRecordLength() const { return m_nRecLen; }
    virtual bool CellText(int row, int col, CString& text) const;

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual BOOL OnInitDialog();
    virtual bool FilterFits() const;
    virtual void ShowColumn(int row);
    // The typed length into the selected column, if it fits into the record.
    virtual bool TakeSelectedColumn();
    virtual bool LoadColumnsFromSource();

    // Offsets from the lengths, and the record length (their sum).
    void CalcOffsets();

    afx_msg void OnKillfocusReclen();
    DECLARE_MESSAGE_MAP()

    CString m_strSelField;
    int m_nRecLen;
    BOOL m_bCrLf;
    int m_nCharSet;
    CArray<SCol, SCol&> m_arrColumns;

private:
    CQoOutputFilterTextFix* Filter() const;
    // The page's columns into the filter; false (after telling the user) when
    // the filter refuses them.
    bool WriteToFilter();
};
