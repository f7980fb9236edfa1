// COutputFilterConfigColumns - the common ground of the output pages on which
// the user sets up the output columns one by one (fixed-length text, file
// database, dBase): a coloured list with one row per column of the source, the
// fields at the right for the selected column, and "Übernehmen", which takes
// those fields into the column and writes all columns to the filter.
//
// A page keeps its columns in its own array of its own column structure and
// answers a few questions about them; everything else is done here:
//
//     GetColumnCount        how many columns the page holds
//     CellText              the text of one cell of the list, and whether it is computed (grey)
//     ShowColumn            the selected column into the fields (-1: none selected)
//     TakeSelectedColumn    the fields into the selected column, or refused with a message
//     LoadColumnsFromSource the columns anew from the source (LoadColumns does it by name)
//     FilterFits            whether the filter is of the page's kind
//
// The page describes its controls once, in an SLayout of static storage that
// the constructor takes; its message map routes the list's LVN_ITEMCHANGED to
// OnItemchangedList, its button to OnApply and (pages with field types) its
// type combo's CBN_SELCHANGE to OnSelchangeType.
#pragma once

#include <afxtempl.h>

#include <string>
#include <unordered_map>
#include <vector>

#include "CColoredListCtrl.h"
#include "COutputFilterConfig.h"
#include "QoMfcExtApi.h"

class COutputFilterConfigColumns;

// The column list of such a page. It keeps no rows and asks its page for each
// cell; a row the page does not (or no longer) have is painted as empty cells,
// so a list whose item count runs ahead of the page's columns never fails a
// paint. Every change of an item's state is passed to the page.
class COutputFilterConfigColumnsClrListCtrl : public CColoredListCtrl
{
public:
    // Text colours of the cells; computed cells are grey in either state.
    enum : DWORD { clrText = 0x000000, clrSelectedText = 0xFFFFFF, clrComputed = 0x7F7F7F };

    explicit COutputFilterConfigColumnsClrListCtrl(COutputFilterConfigColumns* pPage);
    ~COutputFilterConfigColumnsClrListCtrl() override;

    int GetColoredItem(int row, int col, CString& text, DWORD& clrTextOut, DWORD& clrSelectedTextOut,
                       bool& bold) override;
    void ItemChanged() override;

private:
    COutputFilterConfigColumns* m_pPage;  // not owned; null: every cell answers 1 and nothing else
};

class QOMFCEXT_API COutputFilterConfigColumns : public COutputFilterConfig
{
    DECLARE_DYNAMIC(COutputFilterConfigColumns)

public:
    // A column of the list: its caption (a text, or a string-table entry by
    // MAKEINTRESOURCE), its alignment and its share of the list's width in percent.
    struct SListColumn {
        const char* pszCaption;
        int nFormat;
        int nPercent;
    };
    // The page's template and controls.
    struct SLayout {
        UINT nTemplate;
        int nList;
        int nFieldLen;  // the length of the selected column
        int nType;      // the type combo of the selected column; 0 on a page without types
        std::vector<SListColumn> listColumns;
        std::vector<int> controls;  // every control that Enable switches
    };

    COutputFilterConfigColumns(int nNotifierId, const SLayout& layout, CWnd* pParent);
    virtual ~COutputFilterConfigColumns();

    // COutputFilterConfig
    virtual void Enable(bool bOn);
    virtual void DefaultAction();
    virtual void RefreshDisplay();
    virtual int Create(CWnd* pParent);
    using COutputFilterConfig::Create;

    // The list calls it whenever an item's state changed.
    void ListItemChanged();

    // Virtual functions a page overrides
    virtual int GetColumnCount() const = 0;
    // The text of cell `col` of column `row` (0 <= row < GetColumnCount());
    // true for a computed cell, which is grey.
    virtual bool CellText(int row, int col, CString& text) const = 0;

protected:
    virtual BOOL OnInitDialog();

    // Virtual functions a page overrides
    // The filter is of the page's kind.
    virtual bool FilterFits() const = 0;
    // Shows column `row` in the fields at the right and enables them; -1:
    // nothing is selected, the fields are disabled.
    virtual void ShowColumn(int row) = 0;
    // Takes the fields at the right into the selected column; false (after
    // telling the user) when they are refused.
    virtual bool TakeSelectedColumn() = 0;
    // The columns anew from the source, keeping the settings of columns whose
    // names stay; false (after telling the user) when the source fails.
    virtual bool LoadColumnsFromSource() = 0;

    // One column of the source as LoadColumns reads it.
    struct SSourceColumn {
        CString strName;
        int nDataLength;
    };
    // The source's columns; false (after telling the user) when the source
    // fails. More columns than any output may have are refused, or with
    // `bCutAtLimit` cut off (the filter then names the limit when written).
    bool ReadSourceColumns(std::vector<SSourceColumn>& columns, bool bCutAtLimit);
    // The columns anew from the source: a column keeps its settings as long
    // as the source still has a column of exactly its name, a new one is a
    // copy of `fresh`; the order is the source's.
    template <class TCol>
    bool LoadColumns(CArray<TCol, TCol&>& columns, const TCol& fresh, bool bCutAtLimit);
    // False and `col` untouched for an index outside the columns.
    template <class TCol>
    static bool ColumnAt(const CArray<TCol, TCol&>& columns, int index, TCol& col);

    // Tells the user why an entry is refused and puts the focus on the control to correct.
    void Refuse(const CString& prompt, int nFocus, UINT nHelpId = 0);

    // Pages with field types (1 numeric, 2 text). The combo lists "Text" (index
    // 0, type 2) and "numerisch" (index 1, type 1); -1 for a type the output
    // does not know.
    static int TypeIndex(int type);
    static int TypeOfIndex(int index);
    static CString TypeText(int type);
    // Cells 0 to 2 of a column with a type: its name, its type and, for a text
    // field, its length.
    static void TypedCellText(int col, const CString& name, int type, int length, CString& text);
    // Empty when a text field of `length` characters fits, else why not.
    static CString TextLengthProblem(const char* name, int length, int maxLength);
    // Fills the type combo and disables it with the length edit (OnInitDialog).
    void InitTypeCombo();
    // The type and length of column `row` (-1: none) into the combo and the
    // length edit; the edit is enabled for a text field only.
    void ShowTypeAndLength(int row, int type, int length);
    // The type combo and the length edit checked before they are taken into
    // the selected column named `name`; false after telling the user.
    bool CheckTypeAndLength(const char* name, int maxLength);

    // For a column structure with a type and a length (nType, nLength):
    // a new column of the given type and length,
    template <class TCol>
    static TCol TypedColumn(int type, int length);
    // column `row` of `columns` (-1: none) into the type combo and the length edit,
    template <class TCol>
    void ShowTypedColumn(int row, const CArray<TCol, TCol&>& columns);
    // and the type combo and the length edit into `col`; false, after telling
    // the user, when they are refused. A numeric field has no length of its
    // own: the text length stays for a later change back to text.
    template <class TCol>
    bool TakeTypeAndLength(TCol& col, int maxLength);

    afx_msg void OnItemchangedList(NMHDR* pNMHDR, LRESULT* pResult);
    afx_msg void OnApply();
    afx_msg void OnSelchangeType();
    DECLARE_MESSAGE_MAP()

    // The fields of the selected column: its length, and on pages with types
    // its type as combo index.
    int m_nFieldLen;
    int m_nFieldType;
    int m_nSelIndex;
    COutputFilterConfigColumnsClrListCtrl m_list;

private:
    const SLayout& m_layout;
};

template <class TCol>
bool COutputFilterConfigColumns::LoadColumns(CArray<TCol, TCol&>& columns, const TCol& fresh, bool bCutAtLimit)
{
    std::vector<SSourceColumn> source;
    if (!ReadSourceColumns(source, bCutAtLimit))
        return false;
    // By name, the first column of a name (sources of thousands of columns).
    std::unordered_map<std::string, int> byName;
    for (int k = 0; k < columns.GetSize(); ++k)
        byName.emplace(std::string((const char*)columns[k].strName), k);
    CArray<TCol, TCol&> merged;
    for (const SSourceColumn& src : source) {
        auto known = byName.find(std::string((const char*)src.strName));
        TCol col = known != byName.end() ? columns[known->second] : fresh;
        col.strName = src.strName;
        col.nDataLength = src.nDataLength;
        merged.Add(col);
    }
    columns.Copy(merged);
    return true;
}

template <class TCol>
bool COutputFilterConfigColumns::ColumnAt(const CArray<TCol, TCol&>& columns, int index, TCol& col)
{
    if (index < 0 || index >= columns.GetSize())
        return false;
    col = columns[index];
    return true;
}

template <class TCol>
TCol COutputFilterConfigColumns::TypedColumn(int type, int length)
{
    TCol col;
    col.nType = type;
    col.nLength = length;
    return col;
}

template <class TCol>
void COutputFilterConfigColumns::ShowTypedColumn(int row, const CArray<TCol, TCol&>& columns)
{
    ShowTypeAndLength(row, row >= 0 ? columns[row].nType : 0, row >= 0 ? columns[row].nLength : 0);
}

template <class TCol>
bool COutputFilterConfigColumns::TakeTypeAndLength(TCol& col, int maxLength)
{
    if (!CheckTypeAndLength(col.strName, maxLength))
        return false;
    col.nType = TypeOfIndex(m_nFieldType);
    if (col.nType == 2)
        col.nLength = m_nFieldLen;
    return true;
}
