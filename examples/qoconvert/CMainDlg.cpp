#include "CMainDlg.h"

#include <CQoConfigFile.h>
#include <CQoException.h>

#include "QoConvertApp.h"

BEGIN_MESSAGE_MAP(CMainDlg, CDialog)
    ON_BN_CLICKED(IDC_CONVERT, OnConvert)
END_MESSAGE_MAP()

CMainDlg::CMainDlg(CWnd* pParent)
    : CDialog(IDD, pParent), m_inputCharset(0), m_outputCharset(0)
{
}

void CMainDlg::FillCharsets(int id)
{
    CComboBox* combo = (CComboBox*)GetDlgItem(id);
    combo->ResetContent();
    combo->AddString("Windows Ansi");
    combo->AddString("DOS Ascii");
    combo->AddString("Ansi/Ascii");
}

BOOL CMainDlg::OnInitDialog()
{
    FillCharsets(IDC_INPUT_CHARSET);
    FillCharsets(IDC_OUTPUT_CHARSET);

    CQoConfigFile config;
    CConversion job;
    CString problem;
    if (!config.Open(theApp.m_projectFile)) {
        problem = "Die Projektdatei kann nicht gelesen werden.";
    } else {
        try {
            job.ReadConfig(config);
        } catch (const CQoException& e) {
            problem = e.Message();   // the user picks a valid set below
        }
    }
    m_project = (const char*)theApp.m_projectFolder;
    m_inputFile = (const char*)job.m_inputFile;
    m_inputCharset = job.m_inputCharset;
    m_outputFile = (const char*)job.m_outputFile;
    m_outputCharset = job.m_outputCharset;
    m_inputDatabase = (const char*)job.m_inputDatabase;
    m_inputTable = (const char*)job.m_inputTable;
    m_outputDatabase = (const char*)job.m_outputDatabase;
    m_outputTable = (const char*)job.m_outputTable;

    CDialog::OnInitDialog();
    SetDlgItemText(IDC_STATUS, problem);
    return TRUE;
}

void CMainDlg::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_PROJECT, m_project);
    DDX_Text(pDX, IDC_INPUT_FILE, m_inputFile);
    DDX_CBIndex(pDX, IDC_INPUT_CHARSET, m_inputCharset);
    DDX_Text(pDX, IDC_OUTPUT_FILE, m_outputFile);
    DDX_CBIndex(pDX, IDC_OUTPUT_CHARSET, m_outputCharset);
    DDX_Text(pDX, IDC_INPUT_DATABASE, m_inputDatabase);
    DDX_Text(pDX, IDC_INPUT_TABLE, m_inputTable);
    DDX_Text(pDX, IDC_OUTPUT_DATABASE, m_outputDatabase);
    DDX_Text(pDX, IDC_OUTPUT_TABLE, m_outputTable);
}

void CMainDlg::OnConvert()
{
    if (!UpdateData(TRUE))
        return;

    // The project keeps what the user chose. A project file that cannot be
    // read is not written over: its other settings would be lost.
    CQoConfigFile config;
    if (!config.Open(theApp.m_projectFile)) {
        SetDlgItemText(IDC_STATUS, "Die Projektdatei kann nicht gelesen werden.");
        return;
    }
    CConversion job;
    job.m_inputFile = (const char*)m_inputFile;
    job.m_inputCharset = m_inputCharset;
    job.m_outputFile = (const char*)m_outputFile;
    job.m_outputCharset = m_outputCharset;
    job.m_inputDatabase = (const char*)m_inputDatabase;
    job.m_inputTable = (const char*)m_inputTable;
    job.m_outputDatabase = (const char*)m_outputDatabase;
    job.m_outputTable = (const char*)m_outputTable;
    job.WriteConfig(config);
    if (!config.Write(theApp.m_projectFile)) {
        SetDlgItemText(IDC_STATUS, "Projektdatei nicht gespeichert.");
        return;
    }

    CString status = theApp.Convert() ? "Konvertiert." : "Fehlgeschlagen.";
    SetDlgItemText(IDC_STATUS, status);
}
