// CCombiColumnConfig - the modal dialog "Kombifelddefinition..." (template
// 4040) in which the user composes a combination function from other
// functions, each further part preceded by a separator.
//
// It works on its own copy of the function manager. Creating a combination
// adds it to that copy, which the caller takes back; editing one hands the
// parts and the name back and leaves storing them to the caller:
//
//     CCombiColumnConfig dlg(manager, false, this);        // a new combination
//     if (dlg.DoModal() == IDOK) manager = dlg.GetFunctionManager();
//
//     CCombiColumnConfig edit(manager, true, this);        // an existing one
//     edit.SetCombination(combi.GetCombination(), combi.GetId());
//     if (edit.DoModal() == IDOK) { combi.SetCombination(edit.GetCombination());
//                                   combi.SetName(edit.GetCombinationName()); ... }
//
// OK refuses a combination of fewer than two parts and one whose functions
// and separators equal those of another combination of the manager.
#pragma once

#include <afxcmn.h>
#include <afxwin.h>

#include <vector>

#include "CFunctionManager.h"

class CCombiColumnConfig : public CDialog
{
public:
    enum { IDD = 4040 };

    CCombiColumnConfig(const CFunctionManager& manager, bool editMode, CWnd* pParent = nullptr);
    virtual ~CCombiColumnConfig();

    // The combination to edit, before DoModal. `editedId` names the function
    // that holds it, so that it is not taken for another combination with the
    // same parts; without it every combination of the manager is compared.
    void SetCombination(const std::vector<CFunctionManager::CCombiPart>& parts);
    void SetCombination(const std::vector<CFunctionManager::CCombiPart>& parts, long editedId);

    // After IDOK: the parts, the name built from them, and the manager (which
    // holds the new combination when one was created here).
    std::vector<CFunctionManager::CCombiPart> GetCombination() const { return m_parts; }
    CString GetCombinationName() const { return m_strCombinationName; }
    CFunctionManager GetFunctionManager() const { return m_functionManager; }

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual BOOL OnInitDialog();
    virtual void OnOK();

    afx_msg void OnFunctionSelChange();
    afx_msg void OnAdd();
    afx_msg void OnDelete();
    afx_msg void OnPartChanged(NMHDR* pNMHDR, LRESULT* pResult);

    DECLARE_MESSAGE_MAP()

private:
    void Refresh();
    void UpdateButtons();
    // Whether another combination of the manager has these functions with
    // these separators (the always-separate flags do not count).
    bool IsDefinedElsewhere() const;
    // Takes a combination id that no function holds; false when the range
    // has none left.
    bool TakeFreeCombiId(long& id);

    CListCtrl m_listParts;                  // 4146
    CListBox m_listFunctions;               // 4142
    CString m_strCombinationName;           // shown in 4150
    CFunctionManager m_functionManager;     // the dialog's own copy
    std::vector<CFunctionManager::CCombiPart> m_parts;
    bool m_bEditMode;
    bool m_bHasEditedId;
    long m_lEditedId;
    // The part each row of the part list shows: parts whose function the
    // manager does not know have no row.
    std::vector<size_t> m_rowParts;
};
