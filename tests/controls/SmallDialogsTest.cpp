// The small dialogs and statics on real windows: what the user sees in them,
// what they hand back, and the log lines of the hint.
#include <gtest/gtest.h>

#include <afxwin.h>

#include <cstdio>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "CQoFileOpenDlg.h"
#include "CQoHint.h"
#include "CQoInfoView.h"
#include "CQoInputDialog.h"
#include "CQoLog.h"
#include "CStaticFilespec.h"
#include "CStaticLink.h"
#include "Capture.h"
#include "DialogDriver.h"
#include "Input.h"
#include "resource.h"

namespace {

// Runs the scripts, one per dialog in order, on the dialogs that `open` shows
// and checks that each was answered.
template <class Open>
void Drive(std::vector<qotest::DialogScript> scripts, Open open)
{
    qotest::DialogDriver driver;
    for (auto& s : scripts) driver.Expect(std::move(s));
    open();
    EXPECT_TRUE(driver.Done());
    EXPECT_EQ(0, driver.Unanswered());
}

std::string TempPath(const char* name)
{
    char dir[MAX_PATH];
    GetTempPathA(MAX_PATH, dir);
    return std::string(dir) + name;
}

// A program that exists on every system and ends at once, whatever it is given.
std::string HarmlessProgram()
{
    char dir[MAX_PATH];
    GetSystemDirectoryA(dir, MAX_PATH);
    return std::string(dir) + "\\hostname.exe";
}

// _theLog writes into a fresh file; Entries() are its lines without the time.
class LoggedTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        m_log = TempPath("qo_smalldialogs.log");
        DeleteFileA(m_log.c_str());
        _theLog.Open(m_log.c_str());
        CQoHint::Reset();
    }
    void TearDown() override
    {
        _theLog.Close();
        DeleteFileA(m_log.c_str());
        CQoHint::Reset();
    }
    std::vector<std::string> Entries() const
    {
        std::vector<std::string> out;
        std::ifstream in(m_log, std::ios::binary);
        std::string line;
        while (std::getline(in, line)) {
            if (!line.empty() && line.back() == '\r') line.pop_back();
            size_t sep = line.find(" > ");
            out.push_back(sep == std::string::npos ? line : line.substr(sep + 3));
        }
        return out;
    }
    std::string m_log;
};

}  // namespace

TEST(InfoView, EveryKindOfLineEndIsOneBreak)
{
    CQoInfoView view;
    view.Append("Eingabedatei: C:\\daten\\kunden.txt\nS\xE4tze: 1204");
    view.Append("\r\nFehlerhafte S\xE4tze: 3\r\n");
    view.Append("Satz 17: Feld 4 zu lang\nSatz 90: Feld 2 fehlt\n");

    std::string text, title;
    int lines = 0;
    bool cancelVisible = true;
    Drive({[&](qotest::Dialog& d) {
              title = d.Title();
              text = d.Text(IDC_INFO_TEXT);
              lines = (int)d.Send(IDC_INFO_TEXT, EM_GETLINECOUNT);
              cancelVisible = d.IsVisible(IDCANCEL);
              qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("info-4008.png").c_str());
              d.Press(IDOK);
          }},
          [&] { EXPECT_EQ(IDOK, view.DoModal()); });

    EXPECT_EQ("Information", title);
    EXPECT_EQ("Eingabedatei: C:\\daten\\kunden.txt\r\nS\xE4tze: 1204\r\nFehlerhafte S\xE4tze: 3\r\n"
              "Satz 17: Feld 4 zu lang\r\nSatz 90: Feld 2 fehlt\r\n",
              text);
    EXPECT_EQ(6, lines);  // five lines and the empty one after the last break
    EXPECT_FALSE(cancelVisible);
}

// ---------------------------------------------------------------------------
// Hint

using HintTest = LoggedTest;

TEST_F(HintTest, SwitchedOffHintIsOnlyLoggedUntilReset)
{
    const unsigned id = IDS_PREVIEW_DOS_HINT;  // a text with line breaks
    CString text;
    text.LoadString(id);
    ASSERT_EQ(std::string::npos, std::string((const char*)text).find('\r'));
    std::string shown, logged;
    for (char c : std::string((const char*)text)) {
        shown += c == '\n' ? std::string("\r\n") : std::string(1, c);
        logged += c == '\n' ? ';' : c;
    }

    std::string title, edit;
    bool enabled = false, checked = true;
    Drive({[&](qotest::Dialog& d) {
              title = d.Title();
              edit = d.Text(IDC_HINT_TEXT);
              enabled = d.IsEnabled(IDC_HINT_DONT_SHOW);
              checked = d.IsChecked(IDC_HINT_DONT_SHOW);
              d.Check(IDC_HINT_DONT_SHOW);
              qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("hint-4034.png").c_str());
              d.Press(IDOK);
          }},
          [&] { CQoHint::ShowHint(id, true); });
    EXPECT_EQ("Hinweis", title);
    EXPECT_EQ(shown, edit);
    EXPECT_TRUE(enabled);
    EXPECT_FALSE(checked);

    // Switched off: no window, only the log line.
    qotest::DialogDriver none;
    CQoHint::ShowHint(id, true);
    EXPECT_EQ(0, none.Seen());

    std::vector<unsigned> stored;
    for (CQoHint::Iterator it = CQoHint::Begin(); it != CQoHint::End(); CQoHint::IteratorInc(it))
        stored.push_back(*it);
    EXPECT_EQ(std::vector<unsigned>{id}, stored);

    CQoHint::Reset();
    Drive({[&](qotest::Dialog& d) { d.Press(IDOK); }}, [&] { CQoHint::ShowHint(id, true); });

    std::vector<std::string> expected = {"CQoHint (" + logged + "), angezeigt.",
                                         "CQoHint (" + logged + "), nicht angezeigt.",
                                         "CQoHint (" + logged + "), angezeigt."};
    EXPECT_EQ(expected, Entries());
}

TEST_F(HintTest, CheckBoxOnlyWhereTheHintMaySwitchOff)
{
    // Hidden by the host (as when it restores the stored ids), then a hint
    // that may not be switched off, then one with a text of its own.
    CQoHint::Hide(IDS_ODBC_MUST_EXIST);
    std::vector<bool> enabled;
    std::string edit;
    auto tickAndOk = [&](qotest::Dialog& d) {
        enabled.push_back(d.IsEnabled(IDC_HINT_DONT_SHOW));
        edit = d.Text(IDC_HINT_TEXT);
        d.Press(IDOK);
    };
    Drive({tickAndOk, tickAndOk}, [&] {
        CQoHint::ShowHint(IDS_ODBC_MUST_EXIST, true);
        CQoHint::ShowHint(IDS_UNKNOWN_COLUMN_TYPE, false);
        CQoHint::ShowHint("Die Ausgabedatei\nwird \xFC" "berschrieben.");
    });
    EXPECT_EQ((std::vector<bool>{false, false}), enabled);
    EXPECT_EQ("Die Ausgabedatei\r\nwird \xFC" "berschrieben.", edit);
    EXPECT_EQ(1u, CQoHint::m_setDontShow.size());

    std::vector<std::string> expected = {
        "CQoHint (ODBC Datenbanken m\xFCssen schon angelegt sein!), nicht angezeigt.",
        "CQoHint (Unbekannter Spaltentyp!), angezeigt.",
        "CQoHint (Die Ausgabedatei;wird \xFC" "berschrieben.), angezeigt."};
    EXPECT_EQ(expected, Entries());
}

// ---------------------------------------------------------------------------
// Input dialog

TEST(InputDialog, ShowsTitlePromptAndValueAndReturnsWhatWasTyped)
{
    CQoInputDialog dlg;
    dlg.m_strTitle = "Eingabe";
    dlg.m_strPrompt = "Bezeichnung eingeben";
    dlg.m_strValue = "Neue_Spalte";

    std::string title, prompt, value;
    Drive({[&](qotest::Dialog& d) {
              title = d.Title();
              prompt = d.Text(IDC_INPUT_PROMPT);
              value = d.Text(IDC_INPUT_VALUE);
              // The proposal is selected: typing replaces it.
              d.Type(IDC_INPUT_VALUE, "Stra\xDF" "e");
              qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("input-4029.png").c_str());
              d.Press(IDOK);
          }},
          [&] { EXPECT_EQ(IDOK, dlg.DoModal()); });
    EXPECT_EQ("Eingabe", title);
    EXPECT_EQ("Bezeichnung eingeben", prompt);
    EXPECT_EQ("Neue_Spalte", value);
    EXPECT_EQ(CString("Stra\xDF" "e"), dlg.m_strValue);

    // Cancel keeps the value; without a title the caption stays the template's.
    CQoInputDialog plain;
    plain.m_strValue = "alt";
    Drive({[&](qotest::Dialog& d) {
              title = d.Title();
              d.SetText(IDC_INPUT_VALUE, "neu");
              d.Press(IDCANCEL);
          }},
          [&] { EXPECT_EQ(IDCANCEL, plain.DoModal()); });
    EXPECT_EQ("Dialog", title);
    EXPECT_EQ(CString("alt"), plain.m_strValue);
}

// ---------------------------------------------------------------------------
// "Open with"

TEST(FileOpenDlg, RadioChoiceIsZeroToTwo)
{
    CQoFileOpenDlg dlg;
    const int given[] = {2, 3, 1, -1};
    const int stored[] = {2, 0, 1, 0};
    for (int i = 0; i < 4; ++i) {
        dlg.SetRadio(given[i]);
        EXPECT_EQ(stored[i], dlg.GetRadio()) << given[i];
    }
}

TEST(FileOpenDlg, ProgramFieldsOnlyForAnotherProgramAndBrowseFillsThem)
{
    const std::string file =
        "C:\\Daten\\Ausgabe\\2024\\Quartal 3\\Kunden mit langen Namen\\Filiale Nord\\kunden_gesamt.txt";
    const std::string program = HarmlessProgram();
    CQoFileOpenDlg dlg;
    dlg.SetFile(file.c_str());

    std::string fileShown, programAfterBrowse;
    std::vector<bool> editEnabled, browseEnabled;
    auto record = [&](qotest::Dialog& d) {
        editEnabled.push_back(d.IsEnabled(IDC_OPEN_PROGRAM));
        browseEnabled.push_back(d.IsEnabled(IDC_OPEN_BROWSE));
    };
    Drive({[&](qotest::Dialog& d) {
               EXPECT_EQ("Datei \xF6" "ffnen mit ...", d.Title());
               fileShown = d.Text(IDC_OPEN_FILE);
               EXPECT_TRUE(d.IsChecked(IDC_OPEN_DEFAULT));
               record(d);
               d.Check(IDC_OPEN_NOTEPAD);
               record(d);
               d.Check(IDC_OPEN_OTHER);
               record(d);
               d.Press(IDC_OPEN_BROWSE);
               qotest::WaitFor([&] { return !d.Text(IDC_OPEN_PROGRAM).empty(); }, 5000);
               programAfterBrowse = d.Text(IDC_OPEN_PROGRAM);
               qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("open-with-189.png").c_str());
               d.Press(IDCANCEL);
           },
           [&](qotest::Dialog& d) {  // the program chooser
               int nameId = d.Exists(0x47c) ? 0x47c : 0x480;
               d.SetText(nameId, program);
               d.Press(IDOK);
           }},
          [&] { EXPECT_EQ(IDCANCEL, dlg.DoModal()); });

    EXPECT_EQ(file, fileShown);
    EXPECT_EQ((std::vector<bool>{false, false, true}), editEnabled);
    EXPECT_EQ((std::vector<bool>{false, false, true}), browseEnabled);
    EXPECT_STRCASEEQ(program.c_str(), programAfterBrowse.c_str());
}

TEST(FileOpenDlg, ProgramThatCannotStartKeepsTheDialogOpen)
{
    const std::string file = TempPath("qo_oeffnen_mit.txt");
    CQoFileOpenDlg dlg;
    dlg.SetFile(file.c_str());
    dlg.SetRadio(2);
    dlg.SetProgram("C:\\gibt es nicht\\programm.exe");

    std::string message;
    bool openAfterMessage = false;
    Drive({[&](qotest::Dialog& d) {
               d.Press(IDOK);
               qotest::PumpFor(300);  // the message box appears and is answered meanwhile
               qotest::WaitFor([&] { return !message.empty(); }, 5000);
               openAfterMessage = IsWindowVisible(d.Hwnd()) != FALSE;
               d.Press(IDCANCEL);
           },
           [&](qotest::Dialog& box) {
               message = box.MessageText();
               box.Press(IDOK);
           }},
          [&] { EXPECT_EQ(IDCANCEL, dlg.DoModal()); });
    EXPECT_EQ("Die Datei '" + file + "' konnte nicht ge\xF6" "ffnet werden.", message);
    EXPECT_TRUE(openAfterMessage);
}

TEST(FileOpenDlg, OkStartsTheProgramOrClosesWhenThereIsNone)
{
    // Another program with none given: nothing to start, the dialog closes.
    CQoFileOpenDlg empty;
    empty.SetFile("C:\\daten\\kunden.txt");
    empty.SetRadio(2);
    Drive({[&](qotest::Dialog& d) { d.Press(IDOK); }}, [&] { EXPECT_EQ(IDOK, empty.DoModal()); });

    // A program that starts: the dialog closes with OK, no message.
    CQoFileOpenDlg started;
    started.SetFile("C:\\daten mit blank\\kunden.txt");
    started.SetRadio(2);
    started.SetProgram(HarmlessProgram().c_str());
    Drive({[&](qotest::Dialog& d) { d.Press(IDOK); }}, [&] { EXPECT_EQ(IDOK, started.DoModal()); });
}

// ---------------------------------------------------------------------------
// Statics on a frame

namespace {

class StaticsTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        m_pFrame = new CFrameWnd;
        ASSERT_TRUE(m_pFrame->CreateEx(0, AfxRegisterWndClass(0, ::LoadCursor(NULL, IDC_ARROW),
                                                              (HBRUSH)(COLOR_BTNFACE + 1)),
                                       "Statics", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 40, 40, 500, 200, NULL, NULL));
        m_font.CreatePointFont(80, "MS Sans Serif");
        m_pFrame->SetFont(&m_font, FALSE);
    }
    void TearDown() override
    {
        if (::IsWindow(m_pFrame->m_hWnd)) m_pFrame->DestroyWindow();  // deletes it
        qotest::PumpFor(50);
    }

    CFrameWnd* m_pFrame = nullptr;
    CFont m_font;
};

// What DrawTextEx makes of `text` in the control with the frame's font and `flags`.
std::string Shortened(HWND hwnd, const std::string& text, UINT flags)
{
    std::vector<char> buffer(text.begin(), text.end());
    buffer.resize(text.size() + 8, '\0');  // room for the ellipsis
    RECT rect;
    GetClientRect(hwnd, &rect);
    HDC hdc = GetDC(hwnd);
    HGDIOBJ old = SelectObject(hdc, (HGDIOBJ)SendMessageA(GetParent(hwnd), WM_GETFONT, 0, 0));
    DrawTextExA(hdc, buffer.data(), (int)text.size(), &rect, flags | DT_MODIFYSTRING | DT_CALCRECT, NULL);
    SelectObject(hdc, old);
    ReleaseDC(hwnd, hdc);
    return buffer.data();
}

qotest::Image Seen(HWND hwnd)
{
    qotest::Image img;
    EXPECT_TRUE(qotest::CaptureImage(hwnd, img, true));
    return img;
}

}  // namespace

TEST_F(StaticsTest, FilespecShortensInTheMiddleAsPathElseAtTheEnd)
{
    const std::string path = "C:\\Daten\\Kunden\\Ausgabe 2024\\Quartal 3\\Filiale Nord\\kunden_gesamt.txt";
    const UINT format = DT_NOPREFIX | DT_VCENTER | DT_SINGLELINE;
    // Each shortened control beside one of the other kind that shows the
    // shortened text as it is (it fits, so nothing is cut there).
    CStaticFilespec asPath(format, 1), atEnd(format, 0), middleShown(format, 0), endShown(format, 1);
    CStaticFilespec* all[] = {&asPath, &atEnd, &middleShown, &endShown};
    for (int i = 0; i < 4; ++i)
        ASSERT_TRUE(all[i]->Create("STATIC", "", WS_CHILD | WS_VISIBLE, CRect(10, 10 + 25 * i, 230, 30 + 25 * i),
                                   m_pFrame, i + 1));
    EXPECT_TRUE(asPath.IsPath());
    EXPECT_FALSE(atEnd.IsPath());
    EXPECT_EQ((UINT)(DT_NOPREFIX | DT_VCENTER), CStaticFilespec().GetFormat());

    std::string middle = Shortened(asPath, path, format | DT_PATH_ELLIPSIS);
    std::string end = Shortened(atEnd, path, format | DT_END_ELLIPSIS);
    EXPECT_EQ(0u, middle.find("C:\\")) << middle;
    EXPECT_NE(std::string::npos, middle.find("...\\kunden_gesamt.txt")) << middle;
    EXPECT_EQ(0u, end.find("C:\\Daten\\Kunden\\")) << end;
    EXPECT_EQ(end.size() - 3, end.rfind("...")) << end;

    asPath.SetWindowText(path.c_str());
    atEnd.SetWindowText(path.c_str());
    middleShown.SetWindowText(middle.c_str());
    endShown.SetWindowText(end.c_str());
    qotest::BringToFront(m_pFrame->m_hWnd);

    // The window keeps the whole path; the screen shows the shortened text.
    CString kept;
    asPath.GetWindowText(kept);
    EXPECT_EQ(path, (const char*)kept);
    EXPECT_TRUE(Seen(asPath).rgb == Seen(middleShown).rgb);
    EXPECT_TRUE(Seen(atEnd).rgb == Seen(endShown).rgb);
    EXPECT_FALSE(Seen(asPath).rgb == Seen(atEnd).rgb);

    // A new text is painted at once, the old one erased.
    EXPECT_TRUE(::SetWindowTextA(asPath, "D:\\kurz.txt"));
    EXPECT_TRUE(::SetWindowTextA(middleShown, "D:\\kurz.txt"));
    qotest::PumpFor(100);
    EXPECT_TRUE(Seen(asPath).rgb == Seen(middleShown).rgb);
}

namespace {

class CCountedLink : public CStaticLink {
public:
    CCountedLink(const char* link, bool* deleted) : CStaticLink(link, 1), m_pDeleted(deleted) {}
    ~CCountedLink() override { *m_pDeleted = true; }
    bool* m_pDeleted;
};

int CountColour(const qotest::Image& img, COLORREF colour)
{
    int n = 0;
    for (int y = 0; y < img.height; ++y)
        for (int x = 0; x < img.width; ++x)
            if (img.Pixel(x, y) == colour) ++n;
    return n;
}

}  // namespace

TEST_F(StaticsTest, LinkOpensOnClickAndTurnsPurpleOnlyWhenOpened)
{
    CStaticLink broken("C:\\gibt es nicht\\liesmich.qox");
    CStaticLink working;  // the window text is the link
    ASSERT_TRUE(broken.Create("Liesmich", WS_CHILD | WS_VISIBLE | SS_LEFT, CRect(10, 10, 200, 30), m_pFrame, 1));
    ASSERT_TRUE(working.Create(HarmlessProgram().c_str(), WS_CHILD | WS_VISIBLE | SS_LEFT,
                               CRect(10, 40, 400, 60), m_pFrame, 2));
    broken.SetFont(&m_font);
    working.SetFont(&m_font);
    qotest::BringToFront(m_pFrame->m_hWnd);

    qotest::Image img;
    ASSERT_TRUE(qotest::CaptureImage(broken, img, true));
    EXPECT_GT(CountColour(img, CStaticLink::g_colorUnvisited), 20);

    // The real mouse: a plain static would let the click through to the frame.
    qotest::Click(broken, 5, 8);
    qotest::PumpFor(200);
    EXPECT_EQ(CStaticLink::g_colorUnvisited, broken.m_color);
    ASSERT_TRUE(qotest::CaptureImage(broken, img, true));
    EXPECT_EQ(0, CountColour(img, CStaticLink::g_colorVisited));

    qotest::Click(working, 5, 8);
    qotest::PumpFor(300);
    EXPECT_EQ(CStaticLink::g_colorVisited, working.m_color);
    EXPECT_EQ(HarmlessProgram(), (const char*)working.m_link);
    ASSERT_TRUE(qotest::CaptureImage(working, img, true));
    EXPECT_GT(CountColour(img, CStaticLink::g_colorVisited), 20);
    EXPECT_EQ(0, CountColour(img, CStaticLink::g_colorUnvisited));

    // Over the link the cursor is the hand.
    EXPECT_TRUE(working.SendMessage(WM_SETCURSOR, (WPARAM)working.m_hWnd, MAKELPARAM(HTCLIENT, WM_MOUSEMOVE)));
    EXPECT_NE(nullptr, CStaticLink::g_hCursorLink);
    EXPECT_EQ(CStaticLink::g_hCursorLink, ::GetCursor());
}

TEST_F(StaticsTest, LinkMadeToDeleteItselfGoesWithItsWindow)
{
    bool deleted = false;
    CCountedLink* link = new CCountedLink("x", &deleted);
    ASSERT_TRUE(link->Create("x", WS_CHILD | WS_VISIBLE, CRect(0, 0, 50, 20), m_pFrame, 3));
    link->DestroyWindow();
    EXPECT_TRUE(deleted);
}
