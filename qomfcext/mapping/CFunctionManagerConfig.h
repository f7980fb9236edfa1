// CFunctionManagerConfig - the modal dialog "Definitionen bearbeiten..."
// (template 4039) that shows the functions of a CFunctionManager in three
// lists - predefined (with the file functions), user-defined, combinations -
// and lets the user create, rename and delete user-defined functions and
// create, edit and delete combinations.
//
// Everything happens on the dialog's own copy of the manager; the caller
// takes the copy back only after OK, so Cancel drops every change:
//
//     CFunctionManagerConfig dlg(manager, bUserEditing, this);
//     if (dlg.DoModal() == IDOK) manager = dlg.GetFunctionManager();
//
// Names are refused when empty or when a function of that name exists in any
// letter case; a user-defined function that a combination uses can neither be
// renamed nor deleted, since the combination's name and parts refer to it.
#pragma once

#include <afxwin.h>

#include "CFunctionManager.h"

class CFunctionManagerConfig : public CDialog
{
public:
    enum { IDD = 4039 };

    // `userdefinedEditing` off: no new user-defined functions ("Neu" stays
    // disabled); renaming and deleting remain possible.
    CFunctionManagerConfig(const CFunctionManager& manager, bool userdefinedEditing, CWnd* pParent = nullptr);
    virtual ~CFunctionManagerConfig();

    // The working copy with the user's changes; take it after IDOK.
    CFunctionManager GetFunctionManager() const { return m_functionManager; }

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual BOOL OnInitDialog();

    afx_msg void OnUserSelChange();
    afx_msg void OnCombiSelChange();
    afx_msg void OnUserNew();
    afx_msg void OnUserEdit();
    afx_msg void OnUserDelete();
    afx_msg void OnCombiNew();
    afx_msg void OnCombiEdit();
    afx_msg void OnCombiDelete();

    DECLARE_MESSAGE_MAP()

private:
    void FillLists();
    // Shows the input dialog with `name` proposed; true with the new name
    // (blanks at both ends removed) when the user confirmed a name that is
    // not empty and that no function has. Refusals are told to the user.
    bool AskForNewName(CString& name);
    // The id of the selected item of `list`; false without a selection.
    static bool SelectedId(const CListBox& list, long& id, int& index);
    void EnableControl(int nID, bool enable);

    CListBox m_listUserdefined;     // 4137
    CListBox m_listPredefined;      // 4136, with the file functions
    CListBox m_listCombinations;    // 4138
    CFunctionManager m_functionManager;
    bool m_bUserdefinedEditing;
};
