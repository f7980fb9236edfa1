#include "CQoFileOpenDlg.h"

#include <afxdlgs.h>
#include <shellapi.h>

#include "resource.h"

BEGIN_MESSAGE_MAP(CQoFileOpenDlg, CDialog)
    ON_BN_CLICKED(IDC_OPEN_DEFAULT, OnRadio)
    ON_BN_CLICKED(IDC_OPEN_NOTEPAD, OnRadio)
    ON_BN_CLICKED(IDC_OPEN_OTHER, OnRadio)
    ON_BN_CLICKED(IDC_OPEN_BROWSE, OnChange)
END_MESSAGE_MAP()

CQoFileOpenDlg::CQoFileOpenDlg(CWnd* pParent)
    : CDialog(IDD, pParent), m_wndFile(DT_NOPREFIX | DT_VCENTER, 0), m_nRadio(choiceDefault)
{
}

CQoFileOpenDlg::~CQoFileOpenDlg() {}

void CQoFileOpenDlg::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Control(pDX, IDC_OPEN_FILE, m_wndFile);
    DDX_Text(pDX, IDC_OPEN_PROGRAM, m_strProgram);
    DDX_Radio(pDX, IDC_OPEN_DEFAULT, m_nRadio);
}

BOOL CQoFileOpenDlg::OnInitDialog()
{
    CDialog::OnInitDialog();
    m_wndFile.SetPath(1);
    m_wndFile.SetWindowText(m_strFile);
    UpdateData(FALSE);
    OnRadio();
    return TRUE;
}

void CQoFileOpenDlg::OnRadio()
{
    UpdateData(TRUE);
    BOOL other = m_nRadio == choiceOther;
    GetDlgItem(IDC_OPEN_PROGRAM)->EnableWindow(other);
    GetDlgItem(IDC_OPEN_BROWSE)->EnableWindow(other);
}

void CQoFileOpenDlg::OnChange()
{
    UpdateData(TRUE);
    CString filter;
    filter.LoadString(IDS_EXE_FILTER);
    CFileDialog dlg(TRUE, NULL, m_strProgram,
                    OFN_FILEMUSTEXIST | OFN_PATHMUSTEXIST | OFN_NOCHANGEDIR | OFN_HIDEREADONLY, filter, this);
    if (dlg.DoModal() == IDOK) {
        m_strProgram = dlg.GetPathName();
        UpdateData(FALSE);
    }
}

void CQoFileOpenDlg::OnOK()
{
    if (!UpdateData(TRUE))
        return;

    CString program;
    CString parameters;
    // The file is one argument to the program, blanks in its path or not.
    CString quoted = "\"" + m_strFile + "\"";
    switch (m_nRadio) {
    case choiceDefault:
        program = m_strFile;  // the system opens it with the program of its type
        break;
    case choiceEditor:
        program = "notepad.exe";
        parameters = quoted;
        break;
    default:
        program = m_strProgram;
        parameters = quoted;
        break;
    }

    if (!program.IsEmpty()) {
        HINSTANCE hResult = ::ShellExecuteA(m_hWnd, "open", program,
                                            parameters.IsEmpty() ? NULL : (const char*)parameters, NULL,
                                            SW_SHOWNORMAL);
        if ((INT_PTR)hResult <= 32) {
            CString format;
            format.LoadString(IDS_FILE_OPEN_FAILED);
            CString message;
            message.Format(format, (const char*)m_strFile);
            AfxMessageBox(message);
            return;
        }
    }
    CDialog::OnOK();
}
