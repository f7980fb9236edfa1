#include "CMainDlg.h"

#include <afxdlgs.h>

#include <CDirectoryChooser.h>
#include <CInputFilterConfig.h>
#include <COutputFilterConfigDao.h>
#include <COutputFilterConfigDbase.h>
#include <COutputFilterConfigTextFix.h>
#include <COutputFilterConfigTextVar.h>
#include <CQoConfigFile.h>
#include <CQoException.h>
#include <CQoLog.h>

#include "CColumnsDlg.h"
#include "COdbcInputPage.h"
#include "QoConvertApp.h"
#include "../conversion/QoConvertRun.h"

#include <commctrl.h>

BEGIN_MESSAGE_MAP(CMainDlg, CDialog)
    ON_BN_CLICKED(IDC_CONVERT, OnConvert)
    ON_BN_CLICKED(IDC_PROJECT_BROWSE, OnBrowseProject)
    ON_BN_CLICKED(IDC_INPUT_BROWSE, OnBrowseInput)
    ON_BN_CLICKED(IDC_OUTPUT_BROWSE, OnBrowseOutput)
    ON_EN_KILLFOCUS(IDC_INPUT_FILE, OnInputPlaceChanged)
    ON_EN_KILLFOCUS(IDC_INPUT_TABLE, OnInputPlaceChanged)
    ON_EN_KILLFOCUS(IDC_OUTPUT_FILE, OnOutputFileChanged)
    ON_CBN_SELCHANGE(IDC_INPUT_KIND, OnInputKindChanged)
    ON_CBN_SELCHANGE(IDC_OUTPUT_FORMAT, OnFormatChanged)
    ON_BN_CLICKED(IDC_COLUMNS, OnColumns)
    ON_WM_DESTROY()
    ON_BN_CLICKED(IDC_ABORT, OnAbort)
    ON_MESSAGE(WM_QOCONVERT_START, OnRunStart)
    ON_MESSAGE(WM_QOCONVERT_PROGRESS, OnRunProgress)
END_MESSAGE_MAP()

namespace {
// The kinds as the combos list them, in the order of CConversion's numbers.
const char* const kInputKinds[] = {"Text mit Trennzeichen", "Text mit fester Satzl\xE4nge",
                                   "Text mit festen Spalten", "dBase-Datei",
                                   "Datenbankdatei (Access, Excel)", "ODBC-Datenquelle"};
const char* const kOutputKinds[] = {"Text mit Trennzeichen", "Text mit fester L\xE4nge", "dBase-Datei",
                                    "Datenbankdatei (Access)", "ODBC-Datenquelle"};

bool IsStatement(const CString& text)
{
    CString start = text.Left(7);
    start.MakeUpper();
    return start == "SELECT ";
}
}

CMainDlg::CMainDlg(CWnd* pParent)
    : CDialog(IDD, pParent), m_hCancel(NULL), m_llInputSize(-1), m_bCloseWhenDone(false),
      m_inputKind(0), m_outputKind(0), m_bRebuilding(false)
{
    // The output page previews the first rows; it need not read the whole input.
    m_records.SetRowLimit(1000);
}

CMainDlg::~CMainDlg() = default;

BOOL CMainDlg::OnInitDialog()
{
    CComboBox* kinds = (CComboBox*)GetDlgItem(IDC_INPUT_KIND);
    for (const char* kind : kInputKinds)
        kinds->AddString(kind);
    kinds = (CComboBox*)GetDlgItem(IDC_OUTPUT_FORMAT);
    for (const char* kind : kOutputKinds)
        kinds->AddString(kind);
    CDialog::OnInitDialog();
    GetDlgItem(IDC_PROGRESS)->SendMessage(PBM_SETRANGE32, 0, 10000);
    LoadProject();
    EnableForRun(false);
    return TRUE;
}

void CMainDlg::LoadProject()
{
    CString problem;
    if (GetFileAttributesA(theApp.m_projectFile) == INVALID_FILE_ATTRIBUTES) {
        problem = "Neues Projekt: es wird mit \"Konvertieren\" gespeichert.";
    } else {
        CQoConfigFile config;
        if (!config.Open(theApp.m_projectFile)) {
            problem = "Die Projektdatei kann nicht gelesen werden.";
        } else {
            try {
                m_job.ReadConfig(config);
            } catch (const CQoException& e) {
                problem = e.Message();   // the user picks a valid set below
            }
        }
    }
    ShowJob();
    MakeInputPage();
    MakeOutputPage();
    if (!problem.IsEmpty())
        Status(problem);
}

void CMainDlg::ShowJob()
{
    m_project = (const char*)theApp.m_projectFolder;
    m_inputKind = m_job.InputKind();
    m_inputFile = (const char*)m_job.InputLocation();
    m_inputTable = (const char*)(m_job.m_inputSql.IsEmpty() ? m_job.m_inputTable : m_job.m_inputSql);
    m_outputKind = m_job.OutputKind();
    m_outputFile = (const char*)m_job.OutputLocation();
    UpdateData(FALSE);
    ShowKinds();
}

void CMainDlg::ShowKinds()
{
    const bool odbcIn = m_inputKind == CConversion::inputOdbc;
    SetDlgItemText(IDC_INPUT_FILE_LABEL, odbcIn ? "Verbindung:"
                                         : m_inputKind == CConversion::inputDatabase ? "Datenbank:" : "Datei:");
    GetDlgItem(IDC_INPUT_TABLE_LABEL)->ShowWindow(odbcIn ? SW_SHOW : SW_HIDE);
    GetDlgItem(IDC_INPUT_TABLE)->ShowWindow(odbcIn ? SW_SHOW : SW_HIDE);
    GetDlgItem(IDC_INPUT_BROWSE)->EnableWindow(!odbcIn);
    const bool odbcOut = m_outputKind == CConversion::outputOdbc;
    SetDlgItemText(IDC_OUTPUT_FILE_LABEL, odbcOut ? "Verbindung:"
                                          : m_outputKind == CConversion::outputDatabase ? "Datenbank:" : "Datei:");
    GetDlgItem(IDC_OUTPUT_BROWSE)->EnableWindow(!odbcOut);
}

void CMainDlg::DoDataExchange(CDataExchange* pDX)
{
    CDialog::DoDataExchange(pDX);
    DDX_Text(pDX, IDC_PROJECT, m_project);
    DDX_CBIndex(pDX, IDC_INPUT_KIND, m_inputKind);
    DDX_Text(pDX, IDC_INPUT_FILE, m_inputFile);
    DDX_Text(pDX, IDC_INPUT_TABLE, m_inputTable);
    DDX_CBIndex(pDX, IDC_OUTPUT_FORMAT, m_outputKind);
    DDX_Text(pDX, IDC_OUTPUT_FILE, m_outputFile);
}

void CMainDlg::OnDestroy()
{
    if (m_hCancel != NULL) {
        // Only after the run ended (OnCancel waits for it); the handle goes.
        CloseHandle(m_hCancel);
        m_hCancel = NULL;
    }
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

void CMainDlg::TakeInputChoice()
{
    CQoString location((const char*)m_inputFile);
    if (m_inputKind == CConversion::inputDatabase && strcmp(m_job.m_inputDatabase, location) != 0) {
        // Another database has other tables.
        m_job.m_inputTable.Empty();
        m_job.m_inputSql.Empty();
    }
    m_job.SetInput(m_inputKind, location);
    if (m_inputKind == CConversion::inputOdbc) {
        m_job.m_inputTable.Empty();
        m_job.m_inputSql.Empty();
        (IsStatement(m_inputTable) ? m_job.m_inputSql : m_job.m_inputTable) = (const char*)m_inputTable;
    }
}

void CMainDlg::TakeOutputChoice()
{
    m_job.SetOutput(m_outputKind, CQoString((const char*)m_outputFile));
}

void CMainDlg::MakeInputPage()
{
    m_bRebuilding = true;
    if (m_inputPage && ::IsWindow(m_inputPage->m_hWnd))
        m_inputPage->DestroyWindow();
    m_inputPage.reset();
    Status("");
    m_input.reset(m_job.NewInputFilter());
    try {
        if (!m_inputFile.IsEmpty())
            m_job.OpenInputFilter(*m_input, theApp.m_projectFolder);
    } catch (const CQoException& e) {
        Status(e.Message());
    }
    if (m_inputKind == CConversion::inputOdbc)
        m_inputPage.reset(new COdbcInputPage(m_input.get(), idInputPage));
    else
        m_inputPage.reset(CInputFilterConfig::GetAppropriateConfig(m_input.get(), idInputPage));
    if (m_inputPage) {
        m_inputPage->Create(this);
        m_inputPage->AddModifiedListener(this);
        // The file database's page lists the tables when it opens and selects
        // the filter's table only when asked; the other pages have read their
        // filter already.
        if (m_inputKind == CConversion::inputDatabase)
            m_inputPage->UpdateInputFilter(0);
    }
    m_bRebuilding = false;
    FollowInput();
    Arrange();
}

void CMainDlg::FollowInput()
{
    // What the page set goes into the project's settings, and a filter of
    // the same kind reads them for the output side: the output sees what a
    // conversion of the project would read.
    m_job.TakeInputSettings(*m_input);
    std::unique_ptr<CQoInputFilter> rows(m_job.NewInputFilter());
    try {
        if (!m_inputFile.IsEmpty())
            m_job.OpenInputFilter(*rows, theApp.m_projectFolder, true);
    } catch (const CQoException&) {
        // the input page and the status line say why it cannot be read
    }
    m_records.SetInputFilter(rows.get());
    m_outputRows = std::move(rows);
    // The output columns follow the input's.
    m_job.Columns().Build(m_records);
    if (m_outputPage && ::IsWindow(m_outputPage->m_hWnd))
        m_outputPage->RefreshDisplay();
}

void CMainDlg::MakeOutputPage()
{
    if (m_outputPage && ::IsWindow(m_outputPage->m_hWnd))
        m_outputPage->DestroyWindow();
    m_outputPage.reset();
    m_output.reset(m_job.NewOutputFilter());
    m_job.FitOutputColumns(*m_output, m_job.Columns().View());
    switch (m_outputKind) {
    case CConversion::formatFixed:
        m_outputPage.reset(new COutputFilterConfigTextFix(idOutputPage, this));
        break;
    case CConversion::formatDbase:
        m_outputPage.reset(new COutputFilterConfigDbase(idOutputPage, this));
        break;
    case CConversion::outputDatabase:
    case CConversion::outputOdbc:
        // Both are tables: name, field types, lengths and indexes.
        m_outputPage.reset(new COutputFilterConfigDao(idOutputPage, this));
        break;
    default:
        m_outputPage.reset(new COutputFilterConfigTextVar(idOutputPage, this));
        break;
    }
    m_outputPage->SetSourceAndFilter(&m_job.Columns().View(), m_output.get());
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
    // From the right: Beenden, Abbrechen, Konvertieren, the progress bar.
    CRect status = ChildRect(this, GetDlgItem(IDC_STATUS));
    CRect convert = ChildRect(this, GetDlgItem(IDC_CONVERT));
    CRect quit = ChildRect(this, GetDlgItem(IDCANCEL));
    CRect abort = ChildRect(this, GetDlgItem(IDC_ABORT));
    CRect bar = ChildRect(this, GetDlgItem(IDC_PROGRESS));
    const UINT place = SWP_NOSIZE | SWP_NOZORDER | SWP_NOACTIVATE;
    int x = right - quit.Width();
    GetDlgItem(IDCANCEL)->SetWindowPos(NULL, x, top, 0, 0, place);
    x -= unit.right + abort.Width();
    GetDlgItem(IDC_ABORT)->SetWindowPos(NULL, x, top, 0, 0, place);
    x -= unit.right + convert.Width();
    GetDlgItem(IDC_CONVERT)->SetWindowPos(NULL, x, top, 0, 0, place);
    x -= 2 * unit.right + bar.Width();
    GetDlgItem(IDC_PROGRESS)->SetWindowPos(NULL, x, top + (convert.Height() - bar.Height()) / 2, 0, 0, place);
    GetDlgItem(IDC_STATUS)->SetWindowPos(NULL, status.left, top + (convert.Height() - status.Height()) / 2,
                                         x - unit.right - status.left, status.Height(),
                                         SWP_NOZORDER | SWP_NOACTIVATE);

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
    if (nNotifierId == idInputPage && !m_bRebuilding)
        FollowInput();
    return 1;
}

bool CMainDlg::Browse(CString& file, bool open, int kind, bool output)
{
    const char* filter;
    if ((!output && kind == CConversion::inputDbase) || (output && kind == CConversion::formatDbase))
        filter = "dBase-Dateien (*.dbf)|*.dbf|Alle Dateien (*.*)|*.*||";
    else if (!output && kind == CConversion::inputDatabase)
        filter = "Datenbanken (*.mdb;*.accdb;*.xlsx)|*.mdb;*.accdb;*.xlsx|Alle Dateien (*.*)|*.*||";
    else if (output && kind == CConversion::outputDatabase)
        filter = "Datenbanken (*.mdb;*.accdb)|*.mdb;*.accdb|Alle Dateien (*.*)|*.*||";
    else
        filter = "Textdateien (*.txt;*.csv)|*.txt;*.csv|Alle Dateien (*.*)|*.*||";
    // A table goes into an existing database file: no question of overwriting it.
    DWORD flags = OFN_HIDEREADONLY;
    if (open)
        flags |= OFN_FILEMUSTEXIST;
    else if (kind != CConversion::outputDatabase)
        flags |= OFN_OVERWRITEPROMPT;
    CFileDialog dialog(open, NULL, file, flags, filter, this);
    if (dialog.DoModal() != IDOK)
        return false;
    file = dialog.GetPathName();
    return true;
}

void CMainDlg::OnBrowseProject()
{
    CDirectoryChooser chooser("In welchem Ordner liegt das Projekt (qoconvert.ini)?", this,
                              CString((const char*)theApp.m_projectFolder) + "\\");
    if (chooser.DoModal() != IDOK)
        return;
    // A folder without a project starts with what is shown, its files
    // named in full, as the previous project found them.
    UpdateData(TRUE);
    TakeInputChoice();
    TakeOutputChoice();
    m_job.PlaceInFolder(theApp.m_projectFolder);
    theApp.SetProjectFolder(CQoString((const char*)chooser.GetDirectory()));
    LoadProject();
}

void CMainDlg::OnBrowseInput()
{
    UpdateData(TRUE);
    if (!Browse(m_inputFile, true, m_inputKind, false))
        return;
    UpdateData(FALSE);
    TakeInputChoice();
    MakeInputPage();
}

void CMainDlg::OnBrowseOutput()
{
    UpdateData(TRUE);
    if (!Browse(m_outputFile, false, m_outputKind, true))
        return;
    UpdateData(FALSE);
    TakeOutputChoice();
}

void CMainDlg::ApplyInputPage()
{
    if (m_inputPage && ::IsWindow(m_inputPage->m_hWnd)) {
        m_bRebuilding = true;
        m_inputPage->DefaultAction();
        m_bRebuilding = false;
    }
    m_job.TakeInputSettings(*m_input);
}

void CMainDlg::OnInputPlaceChanged()
{
    CString file = m_inputFile, table = m_inputTable;
    UpdateData(TRUE);
    if (m_inputFile == file && m_inputTable == table)
        return;
    // The settings made on the page so far stay for the new file.
    ApplyInputPage();
    TakeInputChoice();
    MakeInputPage();
}

void CMainDlg::OnInputKindChanged()
{
    UpdateData(TRUE);
    m_inputTable.Empty();
    UpdateData(FALSE);
    ShowKinds();
    TakeInputChoice();
    MakeInputPage();
}

void CMainDlg::OnOutputFileChanged()
{
    UpdateData(TRUE);
    TakeOutputChoice();
}

void CMainDlg::OnFormatChanged()
{
    UpdateData(TRUE);
    ShowKinds();
    TakeOutputChoice();
    MakeOutputPage();
}

void CMainDlg::OnColumns()
{
    CColumnsDlg dialog(m_job.Columns(), m_records, this);
    if (dialog.DoModal() != IDOK)
        return;
    // The output filter takes the new columns as the page shows them.
    m_outputPage->RefreshDisplay();
    m_outputPage->UpdateOutputFilter(1);
}

void CMainDlg::OnConvert()
{
    if (!UpdateData(TRUE))
        return;
    // What the pages show is what is converted.
    TakeInputChoice();
    TakeOutputChoice();
    ApplyInputPage();
    m_outputPage->UpdateOutputFilter(1);
    m_job.TakeOutputSettings(*m_output);
    if (m_job.OutputIsDatabase() && m_job.m_outputTable.IsEmpty()) {
        Status("Der Name der Ausgabetabelle fehlt (Tabellenname auf der Ausgabeseite).");
        return;
    }
    if (m_job.InputIsDatabase() && m_job.m_inputTable.IsEmpty() && m_job.m_inputSql.IsEmpty()) {
        Status("Es ist keine Eingabetabelle gew\xE4hlt.");
        return;
    }

    // The project keeps what the user chose. A project file that cannot be
    // read is not written over: its other settings would be lost.
    CQoConfigFile config;
    if (GetFileAttributesA(theApp.m_projectFile) != INVALID_FILE_ATTRIBUTES && !config.Open(theApp.m_projectFile)) {
        Status("Die Projektdatei kann nicht gelesen werden.");
        return;
    }
    m_job.WriteConfig(config);
    if (!config.Write(theApp.m_projectFile)) {
        // Nothing is converted with settings that were not kept.
        DWORD attributes = GetFileAttributesA(theApp.m_projectFile);
        CString text;
        text.Format(attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_READONLY)
                        ? "Die Projektdatei '%s' ist schreibgesch\xFCtzt; nicht gespeichert, nicht konvertiert."
                        : "Die Projektdatei '%s' kann nicht gespeichert werden; nicht konvertiert.",
                    (const char*)theApp.m_projectFile);
        Status(text);
        return;
    }

    // The module converts on a thread of its own; this window stays live,
    // shows its progress and may set the event that stops it.
    static LONG runs = 0;
    CString name;
    name.Format("qoconvert-abbrechen-%lu-%ld", GetCurrentProcessId(), InterlockedIncrement(&runs));
    m_hCancel = CreateEventA(NULL, TRUE, FALSE, name);
    if (m_hCancel == NULL) {
        Status("Die Konvertierung kann nicht gestartet werden.");
        return;
    }
    m_llInputSize = -1;
    GetDlgItem(IDC_PROGRESS)->SendMessage(PBM_SETPOS, 0, 0);
    EnableForRun(true);
    Status("Konvertierung l\xE4uft...");
    if (!theApp.StartConversion(m_hWnd, name)) {
        CloseHandle(m_hCancel);
        m_hCancel = NULL;
        EnableForRun(false);
        Status("Die Konvertierung kann nicht gestartet werden.");
    }
}

void CMainDlg::EnableForRun(bool running)
{
    const int controls[] = {IDC_PROJECT_BROWSE, IDC_INPUT_KIND, IDC_INPUT_FILE, IDC_INPUT_TABLE,
                            IDC_OUTPUT_FORMAT, IDC_OUTPUT_FILE, IDC_COLUMNS, IDC_CONVERT};
    for (int id : controls)
        GetDlgItem(id)->EnableWindow(!running);
    // Nothing to browse for an ODBC source.
    GetDlgItem(IDC_INPUT_BROWSE)->EnableWindow(!running && m_inputKind != CConversion::inputOdbc);
    GetDlgItem(IDC_OUTPUT_BROWSE)->EnableWindow(!running && m_outputKind != CConversion::outputOdbc);
    if (m_inputPage && ::IsWindow(m_inputPage->m_hWnd))
        m_inputPage->EnableWindow(!running);
    if (m_outputPage && ::IsWindow(m_outputPage->m_hWnd))
        m_outputPage->EnableWindow(!running);
    GetDlgItem(IDC_ABORT)->EnableWindow(running);
    GetDlgItem(IDC_PROGRESS)->ShowWindow(running ? SW_SHOW : SW_HIDE);
}

void CMainDlg::OnAbort()
{
    if (m_hCancel != NULL) {
        SetEvent(m_hCancel);
        Status("Wird abgebrochen...");
    }
}

void CMainDlg::OnCancel()
{
    // Closing while the module runs would end it in the middle of a record:
    // it is stopped first, and the window closes when it is over.
    if (m_hCancel != NULL) {
        m_bCloseWhenDone = true;
        OnAbort();
        return;
    }
    CDialog::OnCancel();
}

LRESULT CMainDlg::OnRunStart(WPARAM, LPARAM lParam)
{
    m_llInputSize = (long long)lParam;
    return 0;
}

LRESULT CMainDlg::OnRunProgress(WPARAM wParam, LPARAM lParam)
{
    if (m_hCancel == NULL)
        return 0;   // a late message of a run that is over
    long long position = (long long)lParam;
    CString text;
    text.Format("Konvertierung l\xE4uft: %lu S\xE4tze", (unsigned long)wParam);
    if (m_llInputSize > 0 && position >= 0) {
        int permyriad = (int)(position >= m_llInputSize ? 10000 : position * 10000 / m_llInputSize);
        GetDlgItem(IDC_PROGRESS)->SendMessage(PBM_SETPOS, permyriad, 0);
        CString share;
        share.Format(" (%d %%)", permyriad / 100);
        text += share;
    }
    if (WaitForSingleObject(m_hCancel, 0) == WAIT_OBJECT_0)
        text = "Wird abgebrochen...";
    Status(text);
    return 0;
}

void CMainDlg::ConversionDone(int code)
{
    if (m_hCancel != NULL) {
        CloseHandle(m_hCancel);
        m_hCancel = NULL;
    }
    _theLog << "Ergebnis der Konvertierung: " << (long)code << " - " << (const char*)CQoConvertApp::ResultText(code)
            << CQoLog::endl;
    EnableForRun(false);
    Status(CQoConvertApp::ResultText(code));
    if (m_bCloseWhenDone)
        EndDialog(IDCANCEL);
}
