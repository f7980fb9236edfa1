// CQoFileOpenDlg - "Datei öffnen mit ..." (template 189): the user chooses
// the program with which a file is opened - the one registered for its type,
// the Windows editor, or a program of his own - and OK starts it.
//
//     CQoFileOpenDlg dlg(this);
//     dlg.SetFile("C:\\daten\\kunden.txt");
//     dlg.SetRadio(1);                       // the editor is proposed
//     dlg.DoModal();
//
// A program that cannot be started is reported (string 14) and the dialog
// stays open for another choice; "anderes Programm" without a program closes
// it without starting anything.
#pragma once

#include <afxwin.h>

#include "CStaticFilePath.h"
#include "QoMfcExtApi.h"

class QOMFCEXT_API CQoFileOpenDlg : public CDialog
{
public:
    enum { IDD = 189 };
    enum { choiceDefault = 0, choiceEditor = 1, choiceOther = 2 };

    explicit CQoFileOpenDlg(CWnd* pParent = nullptr);
    virtual ~CQoFileOpenDlg();

    CString GetFile() const { return m_strFile; }
    void SetFile(const CString& file) { m_strFile = file; }
    CString GetProgram() const { return m_strProgram; }
    void SetProgram(const CString& program) { m_strProgram = program; }
    int GetRadio() const { return m_nRadio; }
    // 0, 1 or 2; any other value chooses 0.
    void SetRadio(int choice) { m_nRadio = choice >= 0 && choice <= 2 ? choice : 0; }

protected:
    virtual void DoDataExchange(CDataExchange* pDX);
    virtual BOOL OnInitDialog();
    virtual void OnOK();

    afx_msg void OnRadio();
    afx_msg void OnChange();

    DECLARE_MESSAGE_MAP()

    CStaticFilespec m_wndFile;   // static 4112, shortened as a path
    CString m_strProgram;        // edit 1145
    int m_nRadio;                // radio group from 4113
    CString m_strFile;           // the file to open
};
