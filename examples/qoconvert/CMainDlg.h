// CMainDlg - the sample program's main window: the project's files and
// character sets and the button that converts.
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
};
