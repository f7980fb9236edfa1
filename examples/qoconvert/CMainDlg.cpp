#include "CMainDlg.h"

#include <afxdlgs.h>

#include <CInputFilterConfigTextVar.h>
#include <COutputFilterConfigTextFix.h>
#include <COutputFilterConfigTextVar.h>
#include <CQoConfigFile.h>
#include <CQoException.h>

#include "QoConvertApp.h"

BEGIN_MESSAGE_MAP(CMainDlg, CDialog)
    ON_BN_CLICKED(IDC_CONVERT, OnConvert)
    ON_BN_CLICKED(IDC_INPUT_BROWSE, OnBrowseInput)
    ON_BN_CLICKED(IDC_OUTPUT_BROWSE, OnBrowseOutput)
    ON_EN_KILLFOCUS(IDC_INPUT_FILE, OnInputFileChanged)
    ON_CBN_SELCHANGE(IDC_OUTPUT_FORMAT, OnFormatChanged)
    ON_WM_DESTROY()
END_MESSAGE_MAP()

CMainDlg::CMainDlg(CWnd* pParent)
    : CDialog(IDD, pParent), m_outputFormat(CConversion::formatDelimited), m_records(&m_outputRows)
{
}

CMainDlg::~CMainDlg() = default;

BOOL CMainDlg::OnInitDialog()
{
    CQoConfigFile config;
    CString problem;
    if (!config.Open(theApp.m_projectFile)) {
        problem = "Die Projektdatei kann nicht gelesen werden.";
    } else {
        try {
            m_job.ReadConfig(config);
        } catch (const CQoException& e) {
            problem = e.Message();   // the user picks a valid set below
        }
    }
    m_project = (const char*)theApp.m_projectFolder;
    m_inputFile = (const char*)m_job.m_inputFile;
    m_outputFile = (const char*)m_job.m_outputFile;
    m_outputFormat = m_job.m_outputFormat;
    m_inputDatabase = (const char*)m_job.m_inputDatabase;
    m_inputTable = (const char*)m_job.m_inputTable;
    m_outputDatabase = (const char*)m_job.m_outputDatabase;
    m_outputTable = (const char*)m_job.m_outputTable;

    CComboBox* format = (CComboBox*)GetDlgItem(IDC_OUTPUT_FORMAT);
    format->AddString("Trennzeichen");
    format->AddString("Feste L\xE4nge");
    CDialog::OnInitDialog();

    // The input page works on the project's filter settings.
    m_job.ConfigureInput(m_input);
    OpenInput();
    m_inputPage.reset(new CInputFilterConfigTextVar(&m_input, idInputPage));
    m_inputPage->Create(this);
    m_inputPage->AddModifiedListener(this);
    MakeOutputPage();
    if (!problem.IsEmpty())
        Status(problem);
    return TRUE;
}

void CMainDlg::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_PROJECT, m_project);
    DDX_Text(pDX, IDC_INPUT_FILE, m_inputFile);
    DDX_Text(pDX, IDC_OUTPUT_FILE, m_outputFile);
    DDX_CBIndex(pDX, IDC_OUTPUT_FORMAT, m_outputFormat);
    DDX_Text(pDX, IDC_INPUT_DATABASE, m_inputDatabase);
    DDX_Text(pDX, IDC_INPUT_TABLE, m_inputTable);
    DDX_Text(pDX, IDC_OUTPUT_DATABASE, m_outputDatabase);
    DDX_Text(pDX, IDC_OUTPUT_TABLE, m_outputTable);
}

void CMainDlg::OnDestroy()
{
    // The pages are children of this window: they go before it does.
    if (m_outputPage && ::IsWindow(m_outputPage->m_hWnd))
        m_outputPage->DestroyWindow();
    if (m_inputPage && ::IsWindow(m_inputPage->m_hWnd))
        m_inputPage->DestroyWindow();
    CDialog::OnDestroy();
}

void CMainDlg::OnOK()
{
    // Enter outside the pages converts nothing by accident.
}

void CMainDlg::Status(const CString& text)
{
    SetDlgItemText(IDC_STATUS, text);
}

void CMainDlg::OpenInput()
{
    Status("");
    try {
        if (!m_inputFile.IsEmpty())
            m_input.Init(theApp.InProject(CQoString((const char*)m_inputFile)));
    } catch (const CQoException& e) {
        Status(e.Message());
    }
    FollowInput();
}

void CMainDlg::FollowInput()
{
    m_outputRows.CopyFrom(m_input);
    try {
        if (*m_input.FileName() != '\0')
            m_outputRows.Init(CQoString(m_input.FileName()));
    } catch (const CQoException&) {
        // the input page shows why the file cannot be read
    }
    m_records.SetInputFilter(&m_outputRows);
    if (m_outputPage && ::IsWindow(m_outputPage->m_hWnd))
        m_outputPage->RefreshDisplay();
}

void CMainDlg::MakeOutputPage()
{
    if (m_outputPage && ::IsWindow(m_outputPage->m_hWnd))
        m_outputPage->DestroyWindow();
    m_outputPage.reset();
    m_job.m_outputFormat = m_outputFormat;
    m_output.reset(m_job.NewTextOutput());
    if (m_outputFormat == CConversion::formatFixed)
        m_outputPage.reset(new COutputFilterConfigTextFix(idOutputPage, this));
    else
        m_outputPage.reset(new COutputFilterConfigTextVar(idOutputPage, this));
    m_outputPage->SetSourceAndFilter(&m_records, m_output.get());
    m_outputPage->Create(this);
    m_outputPage->UpdateOutputFilter(0);
    m_outputPage->RefreshDisplay();
    Arrange();
}

namespace {
CRect ChildRect(CWnd* parent, CWnd* child)
{
    CRect rect;
    child->GetWindowRect(&rect);
    parent->ScreenToClient(&rect);
    return rect;
}
}

void CMainDlg::Arrange()
{
    // Each group is as wide as its page needs; the output side moves to the
    // right of the input group, and everything below the groups moves under
    // the taller page.
    CRect unit(0, 0, 4, 8);
    MapDialogRect(&unit);
    const int margin = unit.right * 2;
    CWnd* inputGroup = GetDlgItem(IDC_INPUT_GROUP);
    CWnd* outputGroup = GetDlgItem(IDC_OUTPUT_GROUP);
    CRect in = ChildRect(this, inputGroup);
    CRect out = ChildRect(this, outputGroup);
    CRect inMarker = ChildRect(this, GetDlgItem(IDC_INPUT_PAGE));
    CRect outMarker = ChildRect(this, GetDlgItem(IDC_OUTPUT_PAGE));
    CRect inPage, outPage;
    if (m_inputPage && ::IsWindow(m_inputPage->m_hWnd))
        m_inputPage->GetWindowRect(&inPage);
    if (m_outputPage && ::IsWindow(m_outputPage->m_hWnd))
        m_outputPage->GetWindowRect(&outPage);

    int inWidth = std::max(in.Width(), int(inMarker.left - in.left + inPage.Width() + margin));
    int shift = in.left + inWidth + unit.right * 2 - out.left;
    // The output side: every control that starts within its group.
    for (CWnd* child = GetWindow(GW_CHILD); child != NULL; child = child->GetWindow(GW_HWNDNEXT)) {
        if (child == m_inputPage.get() || child == m_outputPage.get())
            continue;
        CRect rect = ChildRect(this, child);
        if (rect.left >= out.left && rect.top >= out.top && rect.top < out.bottom)
            child->SetWindowPos(NULL, rect.left + shift, rect.top, 0, 0, SWP_NOSIZE | SWP_NOZORDER | SWP_NOACTIVATE);
    }
    out.OffsetRect(shift, 0);
    outMarker.OffsetRect(shift, 0);
    int outWidth = std::max(out.Width(), int(outMarker.left - out.left + outPage.Width() + margin));
    int groupBottom = std::max(inMarker.top + inPage.Height(), outMarker.top + outPage.Height()) + margin;
    inputGroup->SetWindowPos(NULL, 0, 0, inWidth, groupBottom - in.top, SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE);
    outputGroup->SetWindowPos(NULL, 0, 0, outWidth, groupBottom - out.top, SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE);
    if (m_inputPage && ::IsWindow(m_inputPage->m_hWnd)) {
        m_inputPage->SetWindowPos(NULL, inMarker.left, inMarker.top, 0, 0, SWP_NOSIZE | SWP_NOZORDER | SWP_NOACTIVATE);
        m_inputPage->ShowWindow(SW_SHOW);
    }
    if (m_outputPage && ::IsWindow(m_outputPage->m_hWnd)) {
        m_outputPage->SetWindowPos(NULL, outMarker.left, outMarker.top, 0, 0, SWP_NOSIZE | SWP_NOZORDER | SWP_NOACTIVATE);
        m_outputPage->ShowWindow(SW_SHOW);
    }

    // The status line at the left, the buttons at the right, under the groups.
    const int right = out.left + outWidth;
    const int top = groupBottom + unit.bottom;
    CRect status = ChildRect(this, GetDlgItem(IDC_STATUS));
    CRect convert = ChildRect(this, GetDlgItem(IDC_CONVERT));
    CRect quit = ChildRect(this, GetDlgItem(IDCANCEL));
    GetDlgItem(IDCANCEL)->SetWindowPos(NULL, right - quit.Width(), top, 0, 0, SWP_NOSIZE | SWP_NOZORDER | SWP_NOACTIVATE);
    GetDlgItem(IDC_CONVERT)->SetWindowPos(NULL, right - quit.Width() - unit.right - convert.Width(), top, 0, 0,
                                          SWP_NOSIZE | SWP_NOZORDER | SWP_NOACTIVATE);
    GetDlgItem(IDC_STATUS)->SetWindowPos(NULL, status.left, top + (convert.Height() - status.Height()) / 2,
                                         right - 2 * unit.right - quit.Width() - convert.Width() - status.left,
                                         status.Height(), SWP_NOZORDER | SWP_NOACTIVATE);

    CRect window, client;
    GetWindowRect(&window);
    GetClientRect(&client);
    SetWindowPos(NULL, 0, 0, right + in.left + (window.Width() - client.Width()),
                 top + convert.Height() + unit.bottom + (window.Height() - client.Height()),
                 SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE);
    CenterWindow();
}

int CMainDlg::ModifiedListenerSetModified(int /*bModified*/, int nNotifierId)
{
    if (nNotifierId == idInputPage)
        FollowInput();
    return 1;
}

bool CMainDlg::Browse(CString& file, bool open)
{
    const char filter[] = "Textdateien (*.txt;*.csv)|*.txt;*.csv|Alle Dateien (*.*)|*.*||";
    CFileDialog dialog(open, NULL, file, OFN_HIDEREADONLY | (open ? OFN_FILEMUSTEXIST : OFN_OVERWRITEPROMPT),
                       filter, this);
    if (dialog.DoModal() != IDOK)
        return false;
    file = dialog.GetPathName();
    return true;
}

void CMainDlg::OnBrowseInput()
{
    UpdateData(TRUE);
    if (!Browse(m_inputFile, true))
        return;
    UpdateData(FALSE);
    OpenInput();
    m_inputPage->UpdateInputFilter(0);
}

void CMainDlg::OnBrowseOutput()
{
    UpdateData(TRUE);
    if (Browse(m_outputFile, false))
        UpdateData(FALSE);
}

void CMainDlg::OnInputFileChanged()
{
    CString before = m_inputFile;
    UpdateData(TRUE);
    if (m_inputFile == before)
        return;
    OpenInput();
    m_inputPage->UpdateInputFilter(0);
}

void CMainDlg::OnFormatChanged()
{
    UpdateData(TRUE);
    MakeOutputPage();
}

void CMainDlg::OnConvert()
{
    if (!UpdateData(TRUE))
        return;
    // What the pages show is what is converted.
    m_inputPage->DefaultAction();
    m_outputPage->UpdateOutputFilter(1);

    // The project keeps what the user chose. A project file that cannot be
    // read is not written over: its other settings would be lost.
    CQoConfigFile config;
    if (!config.Open(theApp.m_projectFile)) {
        Status("Die Projektdatei kann nicht gelesen werden.");
        return;
    }
    m_job.m_inputFile = (const char*)m_inputFile;
    m_job.m_outputFile = (const char*)m_outputFile;
    m_job.m_outputFormat = m_outputFormat;
    m_job.m_inputDatabase = (const char*)m_inputDatabase;
    m_job.m_inputTable = (const char*)m_inputTable;
    m_job.m_outputDatabase = (const char*)m_outputDatabase;
    m_job.m_outputTable = (const char*)m_outputTable;
    m_job.TakeFilterSettings(m_input, *m_output);
    m_job.WriteConfig(config);
    if (!config.Write(theApp.m_projectFile)) {
        Status("Projektdatei nicht gespeichert.");
        return;
    }
    Status(theApp.Convert() ? "Konvertiert." : "Fehlgeschlagen.");
}
