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

#include "CColoredListCtrl.h"
#include "COutputFilterConfig.h"
#include "QoMfcExtApi.h"

class COutputFilterConfigDbase;
class CQoOutputFilterDbase;

// The column list of the page: name, type and length (text fields only). It
// keeps no rows and asks the page for each cell; a row the page does not have
// is painted empty.
class COutputFilterConfigDbaseClrListCtrl : public CColoredListCtrl
{
public:
    enum : DWORD { clrText = 0x000000, clrSelectedText = 0xFFFFFF };

    explicit COutputFilterConfigDbaseClrListCtrl(COutputFilterConfigDbase* pPage);
    ~COutputFilterConfigDbaseClrListCtrl() override;

    int GetColoredItem(int row, int col, CString& text, DWORD& clrTextOut, DWORD& clrSelectedTextOut,
                       bool& bold) override;
    void ItemChanged() override;

private:
    COutputFilterConfigDbase* m_pPage;  // not owned; null: every cell answers 1 and nothing else
};

class QOMFCEXT_API COutputFilterConfigDbase : public COutputFilterConfig
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

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual BOOL OnInitDialog();
    virtual void OnOK();

    afx_msg void OnApply();
    afx_msg void OnItemchangedList(NMHDR* pNMHDR, LRESULT* pResult);
    afx_msg void OnSelchangeType();
    DECLARE_MESSAGE_MAP()

    int m_nFieldLen;
    int m_nFieldType;  // combo index: 0 text, 1 numeric
    int m_nSelIndex;
    COutputFilterConfigDbaseClrListCtrl m_list;
    CArray<SCol, SCol&> m_arrColumns;

private:
    CQoOutputFilterDbase* Filter() const;
    bool TakeSelectedColumn();
    bool WriteToFilter();
};
