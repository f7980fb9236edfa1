// The dialog driver on real message boxes and on a real dialog from the program's resources.
#include "DialogDriver.h"

#include <gtest/gtest-spi.h>
#include <gtest/gtest.h>

namespace {

using qotest::Dialog;
using qotest::DialogDriver;

// The dialog SELFTEST of selftest.rc.
enum { kEdit = 100, kCheck = 101, kCombo = 102, kList = 103, kMore = 104, kLocked = 105 };

// What the dialog procedure saw.
struct Record {
    bool initDone = false;
    int enChange = 0, cbnSelChange = 0, lbnSelChange = 0, checkClicks = 0;
    int innerResult = 0;
    std::string text;
    bool checked = false;
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
    return DialogBoxParamA(GetModuleHandleA(nullptr), "SELFTEST", nullptr, TestDlgProc, reinterpret_cast<LPARAM>(&rec));
}

TEST(DialogDriver, AnswersMessageBoxesInOrderAndReadsThem)
{
    DialogDriver driver;
    driver.Expect([](Dialog& d) {
        EXPECT_EQ("Frage", d.Title());
        EXPECT_EQ("Zeile eins\nZeile zwei", d.MessageText());
        EXPECT_EQ((std::vector<int>{IDYES, IDNO}), d.ButtonIds());
        EXPECT_EQ(qotest::IconKind::Question, d.Icon());
        d.Press(IDNO);
    });
    driver.Expect([](Dialog& d) {
        EXPECT_EQ(qotest::IconKind::Error, d.Icon());
        d.Press(IDOK);
    });
    EXPECT_EQ(IDNO, MessageBoxA(nullptr, "Zeile eins\nZeile zwei", "Frage", MB_YESNO | MB_ICONQUESTION));
    EXPECT_FALSE(driver.Done());
    EXPECT_EQ(IDOK, MessageBoxA(nullptr, "Fehler beim Lesen.", "Hinweis", MB_OKCANCEL | MB_ICONERROR));
    EXPECT_TRUE(driver.Done());
    EXPECT_EQ(2, driver.Seen());
    EXPECT_EQ(0, driver.Unanswered());
}

TEST(DialogDriver, FillsADialogAsAUserWould)
{
    Record rec;
    DialogDriver driver;
    driver.Expect([&](Dialog& d) {
        EXPECT_EQ("Eingabe pr\xfc" "fen", d.Title());
        EXPECT_EQ("alt", d.Text(kEdit));
        EXPECT_EQ((std::vector<std::string>{"Feld 1", "Feld 2", "Feld 3"}), d.ListItems(kList));

        EXPECT_TRUE(d.SetText(kEdit, "Kunden.txt"));
        EXPECT_TRUE(d.Type(kEdit, "!"));  // the caret stands after the replaced text
        EXPECT_EQ(2, rec.enChange);
        EXPECT_TRUE(d.Check(kCheck));
        EXPECT_TRUE(d.Check(kCheck, true));  // already checked: no click
        EXPECT_EQ(1, rec.checkClicks);
        EXPECT_TRUE(d.Select(kCombo, 2));
        EXPECT_TRUE(d.SelectText(kList, "Feld 2"));
        EXPECT_EQ(2, d.Selection(kCombo));
        EXPECT_EQ(1, d.Selection(kList));
        EXPECT_EQ(1, rec.cbnSelChange);
        EXPECT_EQ(1, rec.lbnSelChange);
        d.Press(IDOK);
    });
    EXPECT_EQ(IDOK, RunTestDialog(rec));
    EXPECT_TRUE(driver.Done());
    EXPECT_EQ("Kunden.txt!", rec.text);
    EXPECT_TRUE(rec.checked);
}

TEST(DialogDriver, MisuseOfAControlFailsTheTest)
{
    Record rec;
    DialogDriver driver;
    driver.Expect([&](Dialog& d) {
        EXPECT_NONFATAL_FAILURE(d.Press(kLocked), "disabled");
        EXPECT_NONFATAL_FAILURE(d.Press(4711), "no control 4711");
        EXPECT_NONFATAL_FAILURE(d.Select(kCombo, 9), "no entry 9");
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
        qotest::PumpFor(800);  // longer than the timeout: the disabled outer dialog must survive
        d.Press(IDCANCEL);
    });
    EXPECT_EQ(IDOK, RunTestDialog(rec));
    EXPECT_TRUE(driver.Done());
    EXPECT_EQ(0, driver.Unanswered());
}

TEST(DialogDriver, ClosesWhatNoScriptAnswersAndReportsIt)
{
    DialogDriver driver;
    driver.SetReportFailures(false);
    driver.SetTimeout(300);
    // A script that leaves the dialog open, then a box without Cancel button or script.
    Record rec;
    driver.Expect([](Dialog&) {});
    EXPECT_EQ(IDCANCEL, RunTestDialog(rec));
    MessageBoxA(nullptr, "Niemand antwortet.", "Verwaist", MB_YESNO);
    EXPECT_EQ(2, driver.Unanswered());
    EXPECT_EQ(2, driver.Seen());
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
        },
        "1 dialog script(s) never ran");
}

}  // namespace
