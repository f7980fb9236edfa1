// COutputFilterConfigDao - the page of the file-database output
// (CQoOutputFilterDao): the target table's name and, per output column, its
// field type (text or numeric), the length of a text field and whether the
// column gets an index.
//
// The page keeps the column settings in its own array, by column name: a
// column keeps type, length and index across RefreshDisplay as long as the
// source still has a column of exactly that name; a new column is a text
// field of 255 characters without index. The settings reach the filter only on
// apply ("Übernehmen", Enter, DefaultAction).
//
//     page.SetSourceAndFilter(&source, &filter);  page.Create(pHost);
//     page.UpdateOutputFilter(0);                 // table and columns from the filter
//     page.RefreshDisplay();                      // the source's columns into the list
//
// The user selects a row, chooses the type, types the length, ticks "indiziert"
// and applies. A database text field holds 1 to 255 characters, so a text
// length outside that range is refused with a message, as are an empty table
// name and a column of a type the database cannot create; nothing of a refused
// apply reaches the filter.
#pragma once

#include <afxtempl.h>

#include "COutputFilterConfigColumns.h"
#include "QoMfcExtApi.h"

class CQoOutputFilterDB;

// The page's column list: name, type, length (text fields only) and whether
// the column is indexed (one list serves every page of columns).
typedef COutputFilterConfigColumnsClrListCtrl COutputFilterConfigDaoClrListCtrl;

class QOMFCEXT_API COutputFilterConfigDao : public COutputFilterConfigColumns
{
    DECLARE_DYNAMIC(COutputFilterConfigDao)

public:
    // The length and type a new column gets, and the longest text field.
    enum { defaultLen = 255, defaultType = 2, maxTextLen = 255 };

    // One output column as the page holds it. Types as in the filter:
    // 1 numeric, 2 text.
    struct SCol {
        CString strName;
        int nLength = 0;
        bool bIndexed = false;
        int nType = 2;
        int nDataLength = -1;  // the source's GetDataLength, recorded only
    };

    COutputFilterConfigDao(int nNotifierId, CWnd* pParent);
    virtual ~COutputFilterConfigDao();

    // COutputFilterConfig
    virtual void UpdateOutputFilter(int nSave);

    virtual int GetColumnCount() const { return static_cast<int>(m_arrColumns.GetSize()); }
    // False and `col` untouched for an index outside the columns.
    bool GetColumn(int index, SCol& col) const { return ColumnAt(m_arrColumns, index, col); }
    const CString& GetTableName() const { return m_strTableName; }
    virtual bool CellText(int row, int col, CString& text) const;

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual BOOL OnInitDialog();
    virtual bool FilterFits() const;
    virtual void ShowColumn(int row);
    virtual bool TakeSelectedColumn();
    virtual bool LoadColumnsFromSource();
    DECLARE_MESSAGE_MAP()

    CString m_strTableName;
    BOOL m_bIndexed;
    CArray<SCol, SCol&> m_arrColumns;

private:
    CQoOutputFilterDB* Filter() const;
    // The page into the filter; false (after telling the user) when a setting
    // is refused, and then the filter is untouched.
    bool WriteToFilter();
};
