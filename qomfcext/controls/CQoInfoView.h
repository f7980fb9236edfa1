// CQoInfoView - a modal box that shows a text the caller has collected
// (template 4008 "Information").
//
// The caller appends pieces of text, with whatever line ends they carry, and
// shows the box; the read-only edit shows each line on a line of its own:
//
//     CQoInfoView view(this);
//     view.Append("Zeile 1\nZeile 2\n");
//     view.DoModal();
#pragma once

#include <afxwin.h>

#include "QoMfcExtApi.h"

class QOMFCEXT_API CQoInfoView : public CDialog
{
public:
    enum { IDD = 4008 };

    explicit CQoInfoView(CWnd* pParent = nullptr);
    virtual ~CQoInfoView();

    // Appends the text with its line ends made CR LF (a multi-line edit
    // breaks a line only there); bare LF and CR LF both count as one break.
    void Append(const CString& text);
    // Empties the text.
    void Clear();

    CString m_strText;   // edit 4011

protected:
    virtual void DoDataExchange(CDataExchange* pDX);

    DECLARE_MESSAGE_MAP()
};
