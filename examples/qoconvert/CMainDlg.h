// CMainDlg - the sample program's main window: the project's files, character
// sets and file databases, and the button that converts. A project's ODBC
// settings are kept and used, though not shown.
#pragma once

#include <afxwin.h>

#include "CConversion.h"
#include "resource.h"

class CMainDlg : public CDialog
{
public:
    enum { IDD = IDD_MAIN };

    CMainDlg(CWnd* pParent = NULL);

protected:
    virtual BOOL OnInitDialog();
    virtual void DoDataExchange(CDataExchange* pDX);
    afx_msg void OnConvert();

    DECLARE_MESSAGE_MAP()

private:
    void FillCharsets(int id);

    CString m_project;
    CString m_inputFile;
    int m_inputCharset;
    CString m_outputFile;
    int m_outputCharset;
    // A file database (Access-type, .mdb, .xlsx) and its table, until the
    // database pages come.
    CString m_inputDatabase;
    CString m_inputTable;
    CString m_outputDatabase;
    CString m_outputTable;
};
