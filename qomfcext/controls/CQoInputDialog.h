// CQoInputDialog - a modal prompt for one line of text (template 4029).
//
// The caller sets the caption, the prompt and the value it proposes, shows
// the box and, after OK, reads what the user typed:
//
//     CQoInputDialog dlg(this);
//     dlg.m_strTitle = "Eingabe";
//     dlg.m_strPrompt = "Bezeichnung eingeben";
//     dlg.m_strValue = "Neue_Spalte";
//     if (dlg.DoModal() == IDOK) Use(dlg.m_strValue);
#pragma once

#include <afxwin.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CQoInputDialog : public CDialog
{
public:
    enum { IDD = 4029 };

    explicit CQoInputDialog(CWnd* pParent = nullptr);
    virtual ~CQoInputDialog();

    CString m_strTitle;    // the caption; empty keeps the template's
    CString m_strValue;    // edit 4077
    CString m_strPrompt;   // static 4078

    virtual INT_PTR DoModal();

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual BOOL OnInitDialog();

    DECLARE_MESSAGE_MAP()
};
