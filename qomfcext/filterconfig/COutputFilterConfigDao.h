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

#include "CColoredListCtrl.h"
#include "COutputFilterConfig.h"
#include "QoMfcExtApi.h"

class COutputFilterConfigDao;
class CQoOutputFilterDB;

// The column list of the page: name, type, length (text fields only) and
// whether the column is indexed. It keeps no rows and asks the page for each
// cell; a row the page does not have is painted empty.
class COutputFilterConfigDaoClrListCtrl : public CColoredListCtrl
{
public:
    enum : DWORD { clrText = 0x000000, clrSelectedText = 0xFFFFFF };

    explicit COutputFilterConfigDaoClrListCtrl(COutputFilterConfigDao* pPage);
    ~COutputFilterConfigDaoClrListCtrl() override;

    int GetColoredItem(int row, int col, CString& text, DWORD& clrTextOut, DWORD& clrSelectedTextOut,
                       bool& bold) override;
    void ItemChanged() override;

private:
    COutputFilterConfigDao* m_pPage;  // not owned; null: every cell answers 1 and nothing else
};

class QOMFCEXT_API COutputFilterConfigDao : public COutputFilterConfig
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
    virtual void Enable(bool bOn);
    virtual void DefaultAction();
    virtual void RefreshDisplay();
    virtual void UpdateOutputFilter(int nSave);
    virtual int Create(CWnd* pParent);
    using COutputFilterConfig::Create;

    // The list calls it whenever an item's state changed.
    void ListItemChanged();

    int GetColumnCount() const { return static_cast<int>(m_arrColumns.GetSize()); }
    // False and `col` untouched for an index outside the columns.
    bool GetColumn(int index, SCol& col) const;
    const CString& GetTableName() const { return m_strTableName; }

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual BOOL OnInitDialog();
    virtual void OnOK();

    // The columns anew from the source, keeping the settings of columns whose
    // names stay; false (after telling the user) when the source fails.
    bool LoadColumnsFromSource();

    afx_msg void OnItemchangedList(NMHDR* pNMHDR, LRESULT* pResult);
    afx_msg void OnSelchangeType();
    afx_msg void OnApply();
    DECLARE_MESSAGE_MAP()

    CString m_strTableName;
    int m_nFieldLen;
    int m_nFieldType;  // combo index: 0 text, 1 numeric
    BOOL m_bIndexed;
    int m_nSelIndex;
    COutputFilterConfigDaoClrListCtrl m_list;
    CArray<SCol, SCol&> m_arrColumns;

private:
    CQoOutputFilterDB* Filter() const;
    // Takes the fields at the right into the selected column; false (after
    // telling the user) when they are refused.
    bool TakeSelectedColumn();
    // The page into the filter; false (after telling the user) when a setting
    // is refused, and then the filter is untouched.
    bool WriteToFilter();
};
