// CFuncToNamesDlg - the modal question "Feldbezeichnungen..." (template 4042):
// is the text of the assigned function to become the field name of the
// current field only, or of every field? The caller does the renaming.
//
//     CFuncToNamesDlg dlg(this);
//     if (dlg.DoModal() == IDOK)
//         dlg.m_nChoice == CFuncToNamesDlg::allFields ? RenameAll() : RenameCurrent();
#pragma once

#include <afxwin.h>

class CFuncToNamesDlg : public CDialog
{
public:
    enum { IDD = 4042 };
    enum { currentField = 0, allFields = 1 };

    explicit CFuncToNamesDlg(CWnd* pParent = nullptr);
    virtual ~CFuncToNamesDlg();

    int GetChoice() const { return m_nChoice; }

    // The radio group from 4158: 0 only the current field, 1 all fields (4046).
    int m_nChoice;

protected:
    virtual void DoDataExchange(CDataExchange* pDX);

    DECLARE_MESSAGE_MAP()
};
