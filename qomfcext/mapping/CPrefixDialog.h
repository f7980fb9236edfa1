// CPrefixDialog - asks for the separator written before a further part of a
// combination field, and whether it is written when that part is empty.
//
//     CPrefixDialog dlg(this);
//     if (dlg.DoModal() != IDOK) return;          // nothing is added
//     part = CCombiPart(id, dlg.m_strSeparator, dlg.m_bAlwaysSeparate != FALSE);
//
// The fields may be preset before DoModal; OK stores what the controls show.
// The separator is taken as typed, blanks included: a blank is a separator.
#pragma once

#include <afxwin.h>

class CPrefixDialog : public CDialog
{
public:
    enum { IDD = 4041 };

    explicit CPrefixDialog(CWnd* pParent = nullptr);
    virtual ~CPrefixDialog();

    BOOL m_bAlwaysSeparate;   // check box 4148 "Trenner auch bei leerem Feld"
    CString m_strSeparator;   // edit 4147

protected:
    virtual void DoDataExchange(CDataExchange* pDX);

    DECLARE_MESSAGE_MAP()
};
