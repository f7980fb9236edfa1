// COutputFilterConfigDbase - the page of the dBase output
// (CQoOutputFilterDbase): per output column its field type (text or numeric)
// and the length of a text field.
//
// The page keeps the column settings in its own array, by column name: a
// column keeps type and length across RefreshDisplay as long as the source
// still has a column of exactly that name; a new column is a text field of 255
// characters. On apply ("Übernehmen", Enter, DefaultAction) the page hands the
// filter one field description per source column: a text field ('C') of the
// page's length, or a numeric field ('N') of 8 digits. The page keeps its
// settings after the apply, so the list goes on showing what was written.
//
//     page.SetSourceAndFilter(&source, &filter);  page.Create(pHost);
//     page.UpdateOutputFilter(0);                 // the filter's field descriptions
//     page.RefreshDisplay();                      // the source's columns into the list
//
// A dBase text field holds 1 to 255 characters: a text length outside that
// range is refused with a message and nothing of it reaches the filter.
#pragma once

#include <afxtempl.h>

#include "COutputFilterConfigColumns.h"
#include "QoMfcExtApi.h"

class CQoOutputFilterDbase;

// The page's column list: name, type and length (text fields only); one list
// serves every page of columns.
typedef COutputFilterConfigColumnsClrListCtrl COutputFilterConfigDbaseClrListCtrl;

class QOMFCEXT_API COutputFilterConfigDbase : public COutputFilterConfigColumns
{
    DECLARE_DYNAMIC(COutputFilterConfigDbase)

public:
    // The length and type a new column gets, the longest text field and the
    // width of a numeric field.
    enum { defaultLen = 255, defaultType = 2, maxTextLen = 255, numericLen = 8 };

    // One output column as the page holds it. Types: 1 numeric, 2 text.
    struct SCol {
        CString strName;
        int nLength = 0;
        int nType = 2;
        int nDataLength = -1;  // the source's GetDataLength, recorded only
    };

    COutputFilterConfigDbase(int nNotifierId, CWnd* pParent);
    virtual ~COutputFilterConfigDbase();

    // COutputFilterConfig
    virtual void UpdateOutputFilter(int nSave);

    virtual int GetColumnCount() const { return static_cast<int>(m_arrColumns.GetSize()); }
    // False and `col` untouched for an index outside the columns.
    bool GetColumn(int index, SCol& col) const { return ColumnAt(m_arrColumns, index, col); }
    virtual bool CellText(int row, int col, CString& text) const;

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual BOOL OnInitDialog();
    virtual bool FilterFits() const;
    virtual void ShowColumn(int row);
    virtual bool TakeSelectedColumn();
    virtual bool LoadColumnsFromSource();
    DECLARE_MESSAGE_MAP()

    CArray<SCol, SCol&> m_arrColumns;

private:
    CQoOutputFilterDbase* Filter() const;
    bool WriteToFilter();
};
