// The dialog driver on real message boxes and on a real dialog made from an in-memory template.
#include "DialogDriver.h"

#include <gtest/gtest-spi.h>
#include <gtest/gtest.h>

#include <cstring>
#include <stdexcept>

namespace {

using qotest::Dialog;
using qotest::DialogDriver;

// ---------------------------------------------------------------------------------------------
// An in-memory dialog template (DLGTEMPLATE + DLGITEMTEMPLATEs), 8 pt MS Shell Dlg.

class TemplateBuilder {
public:
    TemplateBuilder(const char* title, short cx, short cy)
    {
        DLGTEMPLATE t = {};
        t.style = DS_SETFONT | DS_MODALFRAME | WS_POPUP | WS_CAPTION | WS_SYSMENU;
        t.cx = cx;
        t.cy = cy;
        Raw(&t, sizeof t);
        Word(0);  // no menu
        Word(0);  // the dialog class
        String(title);
        Word(8);
        String("MS Shell Dlg");
    }

    // atom: 0x80 button, 0x81 edit, 0x82 static, 0x83 list box, 0x85 combo box
    TemplateBuilder& Add(WORD atom, int id, const char* text, DWORD style, short x, short y, short cx, short cy)
    {
        Align();
        DLGITEMTEMPLATE item = {};
        item.style = style | WS_CHILD | WS_VISIBLE;
        item.x = x;
        item.y = y;
        item.cx = cx;
        item.cy = cy;
        item.id = static_cast<WORD>(id);
        Raw(&item, sizeof item);
        Word(0xFFFF);
        Word(atom);
        String(text);
        Word(0);  // no creation data
        ++reinterpret_cast<DLGTEMPLATE*>(m_data.data())->cdit;
        return *this;
    }

    const DLGTEMPLATE* Get()
    {
        m_aligned.assign((m_data.size() + 3) / 4, 0);
        std::memcpy(m_aligned.data(), m_data.data(), m_data.size());
        return reinterpret_cast<const DLGTEMPLATE*>(m_aligned.data());
    }

private:
    void Raw(const void* p, size_t n)
    {
        auto b = static_cast<const char*>(p);
        m_data.insert(m_data.end(), b, b + n);
    }
    void Word(WORD w) { Raw(&w, sizeof w); }
    void String(const char* s)
    {
        wchar_t buf[256];
        int n = MultiByteToWideChar(1252, 0, s, -1, buf, 256);
        Raw(buf, n * sizeof(wchar_t));
    }
    void Align()
    {
        while (m_data.size() % 4) m_data.push_back(0);
    }

    std::vector<char> m_data;
    std::vector<DWORD> m_aligned;
};

enum { kEdit = 100, kCheck = 101, kCombo = 102, kList = 103, kMore = 104, kLocked = 105 };

// What the dialog procedure saw.
struct Record {
    bool initDone = false;
    int enChange = 0, cbnSelChange = 0, lbnSelChange = 0, checkClicks = 0;
    int innerResult = 0;
    std::string text;
    bool checked = false;
    int combo = -1, list = -1;
};

INT_PTR CALLBACK TestDlgProc(HWND hDlg, UINT msg, WPARAM wp, LPARAM lp)
{
    auto* rec = reinterpret_cast<Record*>(GetWindowLongPtrA(hDlg, DWLP_USER));
    switch (msg) {
    case WM_INITDIALOG:
        rec = reinterpret_cast<Record*>(lp);
        SetWindowLongPtrA(hDlg, DWLP_USER, lp);
        SetDlgItemTextA(hDlg, kEdit, "alt");
        for (const char* s : {"Windows Ansi", "DOS Ascii", "Ansi/Ascii"})
            SendDlgItemMessageA(hDlg, kCombo, CB_ADDSTRING, 0, reinterpret_cast<LPARAM>(s));
        SendDlgItemMessageA(hDlg, kCombo, CB_SETCURSEL, 0, 0);
        for (const char* s : {"Feld 1", "Feld 2", "Feld 3"})
            SendDlgItemMessageA(hDlg, kList, LB_ADDSTRING, 0, reinterpret_cast<LPARAM>(s));
        EnableWindow(GetDlgItem(hDlg, kLocked), FALSE);
        rec->initDone = true;
        return TRUE;
    case WM_COMMAND: {
        if (!rec || !rec->initDone) return FALSE;
        int id = LOWORD(wp), code = HIWORD(wp);
        if (id == kEdit && code == EN_CHANGE) ++rec->enChange;
        if (id == kCombo && code == CBN_SELCHANGE) ++rec->cbnSelChange;
        if (id == kList && code == LBN_SELCHANGE) ++rec->lbnSelChange;
        if (id == kCheck && code == BN_CLICKED) ++rec->checkClicks;
        if (id == kMore && code == BN_CLICKED)
            rec->innerResult = MessageBoxA(hDlg, "Wirklich mehr?", "Nachfrage", MB_OKCANCEL | MB_ICONWARNING);
        if (id == IDOK) {
            char buf[256] = "";
            GetDlgItemTextA(hDlg, kEdit, buf, sizeof buf);
            rec->text = buf;
            rec->checked = IsDlgButtonChecked(hDlg, kCheck) == BST_CHECKED;
            rec->combo = static_cast<int>(SendDlgItemMessageA(hDlg, kCombo, CB_GETCURSEL, 0, 0));
            rec->list = static_cast<int>(SendDlgItemMessageA(hDlg, kList, LB_GETCURSEL, 0, 0));
            EndDialog(hDlg, IDOK);
        }
        if (id == IDCANCEL) EndDialog(hDlg, IDCANCEL);
        return TRUE;
    }
    default:
        return FALSE;
    }
}

INT_PTR RunTestDialog(Record& rec)
{
    TemplateBuilder t("Eingabe pr\xfc" "fen", 200, 150);
    t.Add(0x81, kEdit, "", ES_AUTOHSCROLL | WS_BORDER | WS_TABSTOP, 7, 7, 120, 14)
        .Add(0x80, kCheck, "&Kopfzeile", BS_AUTOCHECKBOX | WS_TABSTOP, 7, 26, 80, 10)
        .Add(0x85, kCombo, "", CBS_DROPDOWNLIST | WS_VSCROLL | WS_TABSTOP, 7, 40, 100, 60)
        .Add(0x83, kList, "", LBS_NOTIFY | WS_BORDER | WS_VSCROLL, 7, 58, 100, 40)
        .Add(0x80, kMore, "&Mehr...", BS_PUSHBUTTON | WS_TABSTOP, 140, 50, 50, 14)
        .Add(0x80, kLocked, "Gesperrt", BS_PUSHBUTTON, 140, 68, 50, 14)
        .Add(0x80, IDOK, "OK", BS_DEFPUSHBUTTON | WS_TABSTOP, 86, 128, 50, 14)
        .Add(0x80, IDCANCEL, "Abbrechen", BS_PUSHBUTTON | WS_TABSTOP, 140, 128, 50, 14);
    return DialogBoxIndirectParamA(GetModuleHandleA(nullptr), t.Get(), nullptr, TestDlgProc,
                                   reinterpret_cast<LPARAM>(&rec));
}

// ---------------------------------------------------------------------------------------------

TEST(DialogDriver, AnswersMessageBoxesInOrderAndReadsThem)
{
    DialogDriver driver;
    driver.Expect([](Dialog& d) {
        EXPECT_EQ("Frage", d.Title());
        EXPECT_EQ("Zeile eins\nZeile zwei", d.MessageText());
        EXPECT_EQ((std::vector<int>{IDYES, IDNO}), d.ButtonIds());
        EXPECT_EQ(qotest::IconKind::Question, d.Icon());
        EXPECT_FALSE(d.Exists(IDCANCEL));
        d.Press(IDNO);
    });
    driver.Expect([](Dialog& d) {
        EXPECT_EQ("Hinweis", d.Title());
        EXPECT_EQ((std::vector<int>{IDOK, IDCANCEL}), d.ButtonIds());
        EXPECT_EQ(qotest::IconKind::Error, d.Icon());
        d.Press(IDOK);
    });
    EXPECT_EQ(2, driver.Pending());
    EXPECT_EQ(IDNO, MessageBoxA(nullptr, "Zeile eins\nZeile zwei", "Frage", MB_YESNO | MB_ICONQUESTION));
    EXPECT_FALSE(driver.Done());
    EXPECT_EQ(IDOK, MessageBoxA(nullptr, "Fehler beim Lesen.", "Hinweis", MB_OKCANCEL | MB_ICONERROR));
    EXPECT_TRUE(driver.Done());
    EXPECT_EQ(2, driver.Seen());
    EXPECT_EQ((std::vector<std::string>{"Frage", "Hinweis"}), driver.Titles());
    EXPECT_EQ(0, driver.Unanswered());
}

TEST(DialogDriver, FillsADialogAsAUserWould)
{
    Record rec;
    DialogDriver driver;
    driver.Expect([&](Dialog& d) {
        EXPECT_EQ("Eingabe pr\xfc" "fen", d.Title());
        EXPECT_EQ("alt", d.Text(kEdit));
        EXPECT_EQ((std::vector<std::string>{"Windows Ansi", "DOS Ascii", "Ansi/Ascii"}), d.ComboItems(kCombo));
        EXPECT_EQ((std::vector<std::string>{"Feld 1", "Feld 2", "Feld 3"}), d.ListItems(kList));
        EXPECT_FALSE(d.IsEnabled(kLocked));
        EXPECT_TRUE(d.IsVisible(kLocked));
        EXPECT_FALSE(d.Exists(999));
        EXPECT_EQ("Edit", d.ClassName(kEdit));

        // Position and size come back in the template's dialog units.
        qotest::ControlRect r = d.RectDlu(kEdit);
        EXPECT_EQ(7, r.x);
        EXPECT_EQ(7, r.y);
        EXPECT_EQ(120, r.cx);
        EXPECT_EQ(14, r.cy);
        r = d.RectDlu(IDCANCEL);
        EXPECT_EQ(140, r.x);
        EXPECT_EQ(128, r.y);
        EXPECT_GT(d.RectPixels(kEdit).cx, 120);  // dialog units are not pixels

        EXPECT_TRUE(d.SetText(kEdit, "Kunden.txt"));
        EXPECT_EQ(1, rec.enChange);
        EXPECT_TRUE(d.Type(kEdit, "!"));  // the caret stands after the replaced text
        EXPECT_EQ("Kunden.txt!", d.Text(kEdit));
        EXPECT_EQ(2, rec.enChange);

        EXPECT_FALSE(d.IsChecked(kCheck));
        EXPECT_TRUE(d.Check(kCheck));
        EXPECT_TRUE(d.IsChecked(kCheck));
        EXPECT_TRUE(d.Check(kCheck, true));  // already checked: no click
        EXPECT_EQ(1, rec.checkClicks);

        EXPECT_TRUE(d.Select(kCombo, 2));
        EXPECT_EQ("Ansi/Ascii", d.Text(kCombo));
        EXPECT_TRUE(d.SelectText(kList, "Feld 2"));
        EXPECT_EQ(1, d.Selection(kList));
        EXPECT_EQ(1, rec.cbnSelChange);
        EXPECT_EQ(1, rec.lbnSelChange);

        d.Press(IDOK);
    });
    EXPECT_EQ(IDOK, RunTestDialog(rec));
    EXPECT_TRUE(driver.Done());
    EXPECT_EQ(0, driver.Unanswered());
    EXPECT_EQ("Kunden.txt!", rec.text);
    EXPECT_TRUE(rec.checked);
    EXPECT_EQ(2, rec.combo);
    EXPECT_EQ(1, rec.list);
}

TEST(DialogDriver, MisuseOfAControlFailsTheTest)
{
    Record rec;
    DialogDriver driver;
    driver.Expect([&](Dialog& d) {
        EXPECT_NONFATAL_FAILURE(d.Press(kLocked), "disabled");
        EXPECT_NONFATAL_FAILURE(d.Press(4711), "no control 4711");
        EXPECT_NONFATAL_FAILURE(d.Select(kCombo, 9), "no entry 9");
        EXPECT_NONFATAL_FAILURE(d.SetText(kCombo, "x"), "use Select");
        EXPECT_EQ(0, rec.cbnSelChange);
        d.Press(IDCANCEL);
    });
    EXPECT_EQ(IDCANCEL, RunTestDialog(rec));
    EXPECT_TRUE(driver.Done());
}

TEST(DialogDriver, NextScriptAnswersANestedBox)
{
    Record rec;
    DialogDriver driver;
    driver.SetTimeout(500);  // the outer dialog waits longer than this for the inner box
    driver.Expect([&](Dialog& d) {
        d.Press(kMore);
        // The inner box opens while this script pumps, and the next script answers it.
        EXPECT_TRUE(qotest::WaitFor([&] { return rec.innerResult != 0; }, 5000));
        EXPECT_EQ(IDCANCEL, rec.innerResult);
        d.Press(IDOK);
    });
    driver.Expect([&](Dialog& d) {
        EXPECT_EQ("Nachfrage", d.Title());
        EXPECT_EQ(qotest::IconKind::Warning, d.Icon());
        qotest::PumpFor(800);  // longer than the timeout: the disabled outer dialog must survive
        d.Press(IDCANCEL);
    });
    EXPECT_EQ(IDOK, RunTestDialog(rec));
    EXPECT_TRUE(driver.Done());
    EXPECT_EQ(0, driver.Unanswered());
    EXPECT_EQ((std::vector<std::string>{"Eingabe pr\xfc" "fen", "Nachfrage"}), driver.Titles());
}

TEST(DialogDriver, ClosesWhatNoScriptAnswersAndReportsIt)
{
    DialogDriver driver;
    driver.SetReportFailures(false);
    driver.SetTimeout(300);

    // A script that leaves the dialog open.
    Record rec;
    driver.Expect([](Dialog&) {});
    EXPECT_EQ(IDCANCEL, RunTestDialog(rec));
    EXPECT_EQ(1, driver.Unanswered());

    // A script that throws; the dialog is closed all the same.
    driver.Expect([](Dialog&) { throw std::runtime_error("kaputt"); });
    EXPECT_EQ(IDCANCEL, RunTestDialog(rec));
    EXPECT_EQ(2, driver.Unanswered());
    ASSERT_FALSE(driver.Errors().empty());
    bool mentioned = false;
    for (const std::string& e : driver.Errors()) mentioned |= e.find("kaputt") != std::string::npos;
    EXPECT_TRUE(mentioned);

    // No script at all, and a box without a Cancel button: it is closed too.
    DWORD start = GetTickCount();
    MessageBoxA(nullptr, "Niemand antwortet.", "Verwaist", MB_YESNO);
    EXPECT_LT(GetTickCount() - start, 5000u);
    EXPECT_EQ(3, driver.Unanswered());
    EXPECT_EQ((std::vector<std::string>{"Eingabe pr\xfc" "fen", "Eingabe pr\xfc" "fen", "Verwaist"}),
              driver.UnansweredTitles());
    EXPECT_TRUE(driver.Done());
    EXPECT_EQ(3, driver.Seen());
}

TEST(DialogDriver, ReportsAnUnansweredDialogAsAFailureByDefault)
{
    Record rec;
    EXPECT_NONFATAL_FAILURE(
        {
            DialogDriver driver;
            driver.SetTimeout(200);
            driver.Expect([](Dialog&) {});
            RunTestDialog(rec);
        },
        "still open after its script");
}

TEST(DialogDriver, ScriptsThatNeverRanAreReported)
{
    EXPECT_NONFATAL_FAILURE(
        {
            DialogDriver driver;
            driver.Expect([](Dialog& d) { d.Press(IDOK); });
            EXPECT_FALSE(driver.Done());
            EXPECT_EQ(1, driver.Pending());
            EXPECT_EQ(0, driver.Seen());
        },
        "1 dialog script(s) never ran");
}

TEST(Pumping, WaitForSeesAPostedMessageHandled)
{
    bool flag = false;
    UINT_PTR timer = SetTimer(nullptr, 0, 50, nullptr);
    DWORD start = GetTickCount();
    EXPECT_FALSE(qotest::WaitFor([&] { return flag; }, 200));
    EXPECT_GE(GetTickCount() - start, 190u);
    KillTimer(nullptr, timer);
    flag = true;
    EXPECT_TRUE(qotest::WaitFor([&] { return flag; }, 0));
}

}  // namespace
