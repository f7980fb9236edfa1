// The small dialogs and statics on real windows.
#include <gtest/gtest.h>

#include <fstream>
#include <string>
#include <vector>

#include "CQoFileOpenDlg.h"
#include "CQoHint.h"
#include "CQoInfoView.h"
#include "CQoInputDialog.h"
#include "CQoLog.h"
#include "CStaticFilePath.h"
#include "CStaticLink.h"
#include "MfcTestHost.h"
#include "resource.h"

using qotest::Answering;

namespace {

// A program that exists on every system and ends at once, whatever it is given.
std::string HarmlessProgram()
{
    char dir[MAX_PATH];
    GetSystemDirectoryA(dir, MAX_PATH);
    return std::string(dir) + "\\hostname.exe";
}

}  // namespace

TEST(InfoView, EveryKindOfLineEndIsOneBreak)
{
    CQoInfoView view;
    view.Append("Eingabedatei: C:\\daten\\kunden.txt\nS\xE4tze: 1204");
    view.Append("\r\nFehlerhafte S\xE4tze: 3\r\n");
    view.Append("Satz 17: Feld 4 zu lang\nSatz 90: Feld 2 fehlt\n");
    Answering({[&](qotest::Dialog& d) {
                  EXPECT_EQ("Information", d.Title());
                  EXPECT_EQ("Eingabedatei: C:\\daten\\kunden.txt\r\nS\xE4tze: 1204\r\nFehlerhafte S\xE4tze: 3\r\n"
                            "Satz 17: Feld 4 zu lang\r\nSatz 90: Feld 2 fehlt\r\n",
                            d.Text(IDC_INFO_TEXT));
                  qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("info-4008.png").c_str());
                  d.Press(IDOK);
              }},
              [&] { EXPECT_EQ(IDOK, view.DoModal()); });
}

// _theLog writes into a fresh file; Entries() are its lines without the time.
class HintTest : public ::testing::Test {
protected:
    void SetUp() override
    {
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
        for (std::string line; std::getline(in, line);) {
            if (!line.empty() && line.back() == '\r') line.pop_back();
            const size_t sep = line.find(" > ");
            out.push_back(sep == std::string::npos ? line : line.substr(sep + 3));
        }
        return out;
    }
    const std::string m_log = qotest::TempPath("qo_smalldialogs.log");
};

TEST_F(HintTest, SwitchedOffHintIsOnlyLoggedUntilReset)
{
    const unsigned id = IDS_PREVIEW_DOS_HINT;  // a text with line breaks
    CString text;
    text.LoadString(id);
    std::string shown, logged;
    for (char c : std::string((const char*)text)) {
        shown += c == '\n' ? std::string("\r\n") : std::string(1, c);
        logged += c == '\n' ? ';' : c;
    }
    ASSERT_NE(shown.size(), logged.size());

    Answering({[&](qotest::Dialog& d) {
                  EXPECT_EQ("Hinweis", d.Title());
                  EXPECT_EQ(shown, d.Text(IDC_HINT_TEXT));
                  d.Check(IDC_HINT_DONT_SHOW);
                  qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("hint-4034.png").c_str());
                  d.Press(IDOK);
              }},
              [&] { CQoHint::ShowHint(id, true); });
    Answering({}, [&] { CQoHint::ShowHint(id, true); });  // switched off: no window

    std::vector<unsigned> stored;
    for (CQoHint::Iterator it = CQoHint::Begin(); it != CQoHint::End(); CQoHint::IteratorInc(it))
        stored.push_back(*it);
    EXPECT_EQ(std::vector<unsigned>{id}, stored);

    CQoHint::Reset();
    Answering({[](qotest::Dialog& d) { d.Press(IDOK); }}, [&] { CQoHint::ShowHint(id, true); });
    const std::string line = "CQoHint (" + logged + "), ";
    EXPECT_EQ((std::vector<std::string>{line + "angezeigt.", line + "nicht angezeigt.", line + "angezeigt."}),
              Entries());
}

TEST_F(HintTest, CheckBoxOnlyWhereTheHintMaySwitchOff)
{
    // Hidden by the host (as when it restores the stored ids), then a hint that may
    // not be switched off.
    CQoHint::Hide(IDS_ODBC_MUST_EXIST);
    std::vector<bool> enabled;
    auto look = [&](qotest::Dialog& d) {
        enabled.push_back(d.IsEnabled(IDC_HINT_DONT_SHOW));
        d.Press(IDOK);
    };
    Answering({look}, [&] {
        CQoHint::ShowHint(IDS_ODBC_MUST_EXIST, true);
        CQoHint::ShowHint(IDS_UNKNOWN_COLUMN_TYPE, false);
    });
    EXPECT_EQ((std::vector<bool>{false}), enabled);
    EXPECT_EQ((std::vector<std::string>{"CQoHint (ODBC Datenbanken m\xFCssen schon angelegt sein!), nicht angezeigt.",
                                        "CQoHint (Unbekannter Spaltentyp!), angezeigt."}),
              Entries());
}

TEST(InputDialog, ShowsTitlePromptAndValueAndReturnsWhatWasTyped)
{
    CQoInputDialog dlg;
    dlg.m_strTitle = "Eingabe";
    dlg.m_strPrompt = "Bezeichnung eingeben";
    dlg.m_strValue = "Neue_Spalte";
    Answering({[&](qotest::Dialog& d) {
                  EXPECT_EQ("Eingabe", d.Title());
                  EXPECT_EQ("Bezeichnung eingeben", d.Text(IDC_INPUT_PROMPT));
                  EXPECT_EQ("Neue_Spalte", d.Text(IDC_INPUT_VALUE));
                  d.Type(IDC_INPUT_VALUE, "Stra\xDF" "e");  // the proposal is selected: typing replaces it
                  qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("input-4029.png").c_str());
                  d.Press(IDOK);
              }},
              [&] { EXPECT_EQ(IDOK, dlg.DoModal()); });
    EXPECT_EQ(CString("Stra\xDF" "e"), dlg.m_strValue);
}

TEST(FileOpenDlg, ProgramFieldsOnlyForAnotherProgramAndOkStartsItOrReportsThatItCannot)
{
    const std::string file =
        "C:\\Daten\\Ausgabe\\2024\\Quartal 3\\Kunden mit langen Namen\\Filiale Nord\\kunden_gesamt.txt";
    const std::string program = HarmlessProgram();
    CQoFileOpenDlg dlg;
    dlg.SetFile(file.c_str());
    dlg.SetRadio(3);  // no such choice: the system's default program

    std::vector<bool> enabled;  // the program's browse button, after each choice
    auto record = [&](qotest::Dialog& d) { enabled.push_back(d.IsEnabled(IDC_OPEN_BROWSE)); };
    Answering({[&](qotest::Dialog& d) {
                   EXPECT_EQ("Datei \xF6" "ffnen mit ...", d.Title());
                   EXPECT_EQ(file, d.Text(IDC_OPEN_FILE));
                   EXPECT_TRUE(d.IsChecked(IDC_OPEN_DEFAULT));
                   record(d);
                   d.Check(IDC_OPEN_NOTEPAD);
                   record(d);
                   d.Check(IDC_OPEN_OTHER);
                   record(d);
                   d.Press(IDC_OPEN_BROWSE);
                   qotest::WaitFor([&] { return !d.Text(IDC_OPEN_PROGRAM).empty(); }, 5000);
                   EXPECT_STRCASEEQ(program.c_str(), d.Text(IDC_OPEN_PROGRAM).c_str());
                   qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("open-with-189.png").c_str());
                   d.Press(IDCANCEL);
               },
               [&](qotest::Dialog& d) {  // the program chooser
                   d.SetText(d.Exists(0x47c) ? 0x47c : 0x480, program);
                   d.Press(IDOK);
               }},
              [&] { EXPECT_EQ(IDCANCEL, dlg.DoModal()); });
    EXPECT_EQ((std::vector<bool>{false, false, true}), enabled);

    // OK with a program that cannot start: the message, and the dialog stays open.
    const std::string missing = qotest::TempPath("qo_oeffnen_mit.txt");
    CQoFileOpenDlg broken;
    broken.SetFile(missing.c_str());
    broken.SetRadio(2);
    broken.SetProgram("C:\\gibt es nicht\\programm.exe");
    std::string message;
    Answering({[&](qotest::Dialog& d) {
                   d.Press(IDOK);
                   qotest::WaitFor([&] { return !message.empty(); }, 5000);  // answered meanwhile
                   EXPECT_TRUE(IsWindowVisible(d.Hwnd()));
                   d.Press(IDCANCEL);
               },
               [&](qotest::Dialog& box) {
                   message = box.MessageText();
                   box.Press(IDOK);
               }},
              [&] { EXPECT_EQ(IDCANCEL, broken.DoModal()); });
    EXPECT_EQ("Die Datei '" + missing + "' konnte nicht ge\xF6" "ffnet werden.", message);

    // A program that starts: the dialog closes with OK.
    CQoFileOpenDlg working;
    working.SetFile("C:\\daten mit blank\\kunden.txt");
    working.SetRadio(2);
    working.SetProgram(program.c_str());
    Answering({[](qotest::Dialog& d) { d.Press(IDOK); }}, [&] { EXPECT_EQ(IDOK, working.DoModal()); });
}

namespace {

class StaticsTest : public qotest::HostFrameTest {
protected:
    StaticsTest() : HostFrameTest("Statics", 500, 200) {}
    void SetUp() override
    {
        HostFrameTest::SetUp();
        m_font.CreatePointFont(80, "MS Sans Serif");
        m_pFrame->SetFont(&m_font, FALSE);
    }
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

// What the screen shows now, without making the window paint.
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
    asPath.SetWindowText(path.c_str());
    atEnd.SetWindowText(path.c_str());
    middleShown.SetWindowText(Shortened(asPath, path, format | DT_PATH_ELLIPSIS).c_str());
    endShown.SetWindowText(Shortened(atEnd, path, format | DT_END_ELLIPSIS).c_str());
    qotest::BringToFront(m_pFrame->m_hWnd);

    // The window keeps the whole path; the screen shows the shortened text.
    EXPECT_EQ(path, qotest::WindowText(asPath));
    EXPECT_TRUE(Seen(asPath).rgb == Seen(middleShown).rgb);
    EXPECT_TRUE(Seen(atEnd).rgb == Seen(endShown).rgb);
}

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
    EXPECT_GT(qotest::CountPixels(Seen(broken), CStaticLink::g_colorUnvisited), 20);

    // The real mouse: a plain static would let the click through to the frame.
    qotest::Click(broken, 5, 8);
    qotest::PumpFor(200);
    EXPECT_EQ(0, qotest::CountPixels(Seen(broken), CStaticLink::g_colorVisited)) << "it could not be opened";

    qotest::Click(working, 5, 8);
    qotest::PumpFor(300);
    EXPECT_EQ(HarmlessProgram(), (const char*)working.m_link);
    EXPECT_GT(qotest::CountPixels(Seen(working), CStaticLink::g_colorVisited), 20);

    // One made to delete itself goes with its window.
    struct CCountedLink : CStaticLink {
        bool* m_pDeleted;
        explicit CCountedLink(bool* deleted) : CStaticLink("x", 1), m_pDeleted(deleted) {}
        ~CCountedLink() override { *m_pDeleted = true; }
    };
    bool deleted = false;
    CCountedLink* link = new CCountedLink(&deleted);
    ASSERT_TRUE(link->Create("x", WS_CHILD | WS_VISIBLE, CRect(0, 70, 50, 90), m_pFrame, 3));
    link->DestroyWindow();
    EXPECT_TRUE(deleted);
}
