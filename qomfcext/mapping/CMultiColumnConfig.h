// CMultiColumnConfig - the page on which the user ties the columns of a file or
// of an output to functions, each column holding one function or a combination
// of functions, and sees the resulting data in a preview.
//
// The page works over the base library's CMultiColumnHandler in one of two
// modes, fixed at construction:
//
// * read mode: the outer columns are those of an input file. A column holding a
//   combination is split into one inner column per part; the preview shows the
//   split data, and the application reads it through GetInnerInputFilter().
// * write mode: the user makes, names, orders (by dragging the preview's column
//   headers) and deletes the outer columns of an output. Each is composed of its
//   function's value, or of the parts of its combination with their separators.
//   The inner columns are the plain functions of the manager, in the manager's
//   order: the application's output source given to SetOutputSource must have one
//   column per such function, in that order. GetOutputSource() is the composed
//   source that an output filter writes.
//
// The preview's first row names, above each column, the function(s) it holds.
// Every change is told to the listeners (CModifiedNotifier); their answers are
// not used. The inner input filter and the composed output source belong to the
// page and live as long as it does.
//
//     CMultiColumnConfig page(functions, sorter, true, ID_SPLIT, NULL);   // read mode
//     page.SetOuterColumnFunctions(stored);      // the start assignment, by column
//     page.Create(pHostWnd);
//     page.SetInputFilter(&inputFilter);          // after Create: fills the name list
//     ...
//     long f = page.GetOuterFunction(0);          // -1 for a column that does not exist
//     CQoInputFilter* split = page.GetInnerInputFilter();
//
//     CMultiColumnConfig out(functions, sorter, false, ID_COMPOSE, NULL); // write mode
//     out.SetOutputSource(&appSource);            // before or after Create
//     out.Create(pHostWnd);
//     outputFilter.Write(out.GetOutputSource());
//
// Outer column names are unique without regard to case; renaming a column also
// gives its function the new name, and a name that another column or another
// function already carries is refused with a message.
#pragma once

#include <afxwin.h>

#include <CMultiColumnHandler.h>

#include <vector>

#include "CColoredInputFilterListCtrl.h"
#include "CColoredListCtrlListener.h"
#include "CFunctionManager.h"
#include "CModelessDialog.h"
#include "CModifiedNotifier.h"
#include "QoMfcExtApi.h"

class CQoInputFilter;
class CQoOutputSource;
class CQoString;

class QOMFCEXT_API CMultiColumnConfig : public CModelessDialog,
                                       public CModifiedNotifier,
                                       public CColoredListCtrlListener
{
public:
    // One outer column as the page shows it.
    class COuterColumn
    {
    public:
        COuterColumn(int id, const CString& name, long function) : m_nId(id), m_strName(name), m_lFunction(function)
        {
        }

        int m_nId;            // read mode: the file's column index; write mode: the handler's id
        CString m_strName;
        long m_lFunction;     // CFunctionManager::unusedFunction: none
    };

    // Command ids: the popup menu's functions from kFirstFunctionCmd on, then its
    // rename, function editing and name items; the page's own commands after them.
    enum {
        kFirstFunctionCmd = 1025,
        kMenuFunctions = 100,          // only this many functions can be chosen from the menu
        kRenameCmd = 1125,
        kEditFunctionsCmd = 1126,
        kColumnNameCmd = 1127,
        kFirstPrivateCmd = 1128,
        kOrderChangedCmd = 1129,
        kLastPrivateCmd = 1130
    };

    CMultiColumnConfig(CFunctionManager& manager, CFunctionManager::CSorter& sorter, bool bReadMode,
                       int nNotifierId, CWnd* pParent);
    ~CMultiColumnConfig() override;
    CMultiColumnConfig(const CMultiColumnConfig&) = delete;
    CMultiColumnConfig& operator=(const CMultiColumnConfig&) = delete;

    BOOL Create(CWnd* pParent);

    // Virtual functions you might override
    // Enables or disables the controls; a disabled page opens no menu.
    virtual void Enable(bool bEnable);

    // --- the sources --------------------------------------------------------
    // Read mode: the file whose columns are the outer columns (not owned). Call
    // after Create so that the name list is filled.
    void SetInputFilter(CQoInputFilter* pFilter);
    // Write mode: the application's source with one column per plain function
    // (not owned). Before or after Create.
    void SetOutputSource(CQoOutputSource* pSource);

    CMultiColumnHandler& GetHandler() { return m_handler; }
    // The preview's filter: the split file (read mode) or the composed output
    // read as an input (write mode). Owned by the page.
    CQoInputFilter* GetInnerInputFilter() const { return m_pInnerInputFilter; }
    // Write mode: the composed output source. Owned by the page.
    CQoOutputSource* GetOutputSource() const { return m_pMultiColumnOutputSource; }
    bool GetFieldNamesEditable() const { return m_bFieldNamesEditable; }

    // --- outer columns ----------------------------------------------------------
    int GetNumOuterColumns() const { return static_cast<int>(m_outerColumns.size()); }
    void GetOuterColumnName(int nIndex, CQoString& name) const;
    // The column's function id, or -1 for an index out of range.
    long GetOuterFunction(int nIndex) const;
    long GetInnerFunction(int nIndex) const;
    // Stores the function without redrawing anything.
    void SetOuterColumnFunction(int nIndex, long lFunction);
    // The start assignment by column index, used by the next SetInputFilter.
    void SetOuterColumnFunctions(const std::vector<long>& functions);
    // Read mode: names the input filter's column.
    void SetOuterColumnName(int nIndex, const CQoString& name);
    // Functions with an id at or above the limit are not offered and count as none.
    void SetDontShowLimit(long lLimit);

    // Write mode only.
    void AddOuterColumn(const CString& strName);
    void RemoveOuterColumn(int nIndex);
    void AddInnerColumn(long lFunction, const CString& strName, int nSourceColumn);
    void ClearInnerFunctions();
    // Replaces the outer columns by one per function of the manager, named
    // "Feld 1", "Feld 2", ...; unless bQuiet the user confirms first.
    void DoSelectAll(bool bQuiet);

    // --- filling and showing -------------------------------------------------------
    void InitFunctionList();
    void DisplayReadList();
    void DisplayWriteList();
    void RefreshList();
    void RebuildNameList();
    void GetInnerColumnsFromManager();
    void UpdateListSelections() { OnSelchangeComboNames(); }
    void UpdateListFunctions() { OnSelchangeComboFunctions(); }

    // From CColoredListCtrlListener: the user dragged the preview's columns.
    void ColoredListCtrlOrderChanged() override;

protected:
    void DoDataExchange(CDataExchange* pDX) override;
    BOOL OnInitDialog() override;

    afx_msg void OnChangeName();
    afx_msg void OnColumnclickList(NMHDR* pNMHDR, LRESULT* pResult);
    afx_msg void OnSelchangeComboNames();
    afx_msg void OnChangeFunctions();
    afx_msg void OnSelchangeComboFunctions();
    afx_msg void OnContextMenu(CWnd* pWnd, CPoint point);
    afx_msg void OnDeleteName();
    afx_msg void OnNewName();
    afx_msg void OnSelectAll();
    afx_msg void OnFuncToNames();
    afx_msg void OnPopupCmd(UINT nID);
    afx_msg void OnPrivateCmd(UINT nID);
    DECLARE_MESSAGE_MAP()

    CComboBox m_cbFunctions;
    CComboBox m_cbNames;
    CColoredInputFilterListCtrl m_list;
    CFunctionManager& m_functionManager;
    CQoInputFilter* m_pInputFilter;
    CQoInputFilter* m_pInnerInputFilter;
    bool m_bFieldNamesEditable;
    bool m_bReadMode;
    CMultiColumnHandler m_handler;
    std::vector<COuterColumn> m_outerColumns;
    bool m_bEnabled;
    CQoOutputSource* m_pOutputSource;
    CQoOutputSource* m_pMultiColumnOutputSource;
    std::vector<long> m_outerColumnFunctions;
    long m_lDontShowLimit;
    CFunctionManager::CSorter& m_sorter;

private:
    bool IsOuter(int nIndex) const { return nIndex >= 0 && nIndex < GetNumOuterColumns(); }
    // The function as the lists show it: none for one at or above the limit.
    long ShownFunction(long lFunction) const;
    // The functions below the limit in the sorter's order.
    std::vector<CFunctionManager::CFunction> SortedFunctions();
    // Selects the function list's item of that function; false if it has none.
    bool SelectFunctionItem(long lFunction);
    // Renames the column in the handler and the page, and tells the listeners.
    void ChangeNameTo(int nIndex, const CString& strName);
    // Whether a column other than `nIndex` is called `strName` (any case).
    bool OuterNameTaken(int nIndex, const CString& strName) const;
    void RenameSelected();
    // Composed sources that a later SetOutputSource replaced: the application
    // may still hold them, so they are released with the page.
    std::vector<CQoOutputSource*> m_replacedSources;
    // The function ids of the open popup menu, by position.
    std::vector<long> m_menuFunctions;
};
