// The error dialog as the user sees it (read from the real window) and the two
// log lines it leaves.
#include <afxwin.h>

#include <CQoErrorDlg.h>
#include <DialogDriver.h>
#include <QoBatchMessageBox.h>
#include <Capture.h>
#include <resource.h>

#include "FrameTestUtil.h"

using namespace frametest;

namespace {

const char kBuiltIn[] = "Dies ist ein Testeintrag f\xFCr einen Fehler der qomfcext DLL";

class ErrorDlg : public LogFixture
{
protected:
    void TearDown() override
    {
        // Put the library's own registration back for the next test.
        CQoErrorDlg::ClearAllMessages();
        CQoErrorDlg::AddMessage(20001, kBuiltIn);
        QoBatchMessageBoxSetMode(false);
        LogFixture::TearDown();
    }

    // Shows the error and returns what the window showed; captures it when `png` is given.
    struct Seen
    {
        std::string title, message, info;
        bool okVisible = false;
    };
    Seen Show(int code, const char* info, const char* png = nullptr)
    {
        Seen seen;
        qotest::DialogDriver driver;
        driver.Expect([&](qotest::Dialog& d) {
            seen.title = d.Title();
            seen.message = d.Text(IDC_ERROR_MESSAGE);
            seen.info = d.Text(IDC_ERROR_INFO);
            seen.okVisible = d.IsVisible(IDOK);
            if (png) {
                EXPECT_TRUE(qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath(png).c_str()));
            }
            d.Press(IDOK);
        });
        CQoErrorDlg::ShowError(code, info);
        EXPECT_TRUE(driver.Done());
        EXPECT_EQ(0, driver.Unanswered());
        return seen;
    }
};

}  // namespace

TEST_F(ErrorDlg, ShowsNumberRegisteredTextAndInformation)
{
    // Line breaks of either kind show as CR LF and are logged as semicolons.
    CQoErrorDlg::AddMessage(20001, "Zeile eins\r\nZeile zwei");
    Seen seen = Show(20001, "Datei: C:\\daten\\kunden.txt\nZeile 17", "error-dialog-4037.png");
    EXPECT_EQ("Fehler", seen.title);
    EXPECT_EQ("Es ist der Fehler 20001 aufgetreten.\nZeile eins\r\nZeile zwei", seen.message);
    EXPECT_EQ("Datei: C:\\daten\\kunden.txt\r\nZeile 17", seen.info);
    EXPECT_TRUE(seen.okVisible);

    std::vector<std::string> expected = {
        "ERR: Es ist der Fehler 20001 aufgetreten.;Zeile eins;Zeile zwei",
        "ERR: Datei: C:\\daten\\kunden.txt;Zeile 17"};
    EXPECT_EQ(expected, Entries());
}

TEST_F(ErrorDlg, RegistrationsReplaceClearAndVanish)
{
    CQoErrorDlg::AddMessage(2107, "Die Eingabedatei fehlt.");
    CQoErrorDlg::AddMessage(2107, "Die Eingabedatei ist leer.");  // replaces
    EXPECT_EQ("Es ist der Fehler 2107 aufgetreten.\nDie Eingabedatei ist leer.", Show(2107, "x").message);

    // Without a registered text the message ends after the line break.
    CQoErrorDlg::ClearMessage(2107);
    Seen seen = Show(2107, "");
    EXPECT_EQ("Es ist der Fehler 2107 aufgetreten.\n", seen.message);
    EXPECT_EQ("", seen.info);
    std::vector<std::string> entries = Entries();
    ASSERT_EQ(4u, entries.size());
    EXPECT_EQ("ERR: Es ist der Fehler 2107 aufgetreten.;", entries[2]);
    EXPECT_EQ("ERR: ", entries[3]);

    CQoErrorDlg::ClearAllMessages();
    EXPECT_EQ("Es ist der Fehler 20001 aufgetreten.\n", Show(20001, "x").message);
}

TEST_F(ErrorDlg, StringIdFormAndBatchModeStillShow)
{
    QoBatchMessageBoxSetMode(true);
    std::string info;
    qotest::DialogDriver driver;
    driver.Expect([&](qotest::Dialog& d) {
        info = d.Text(IDC_ERROR_INFO);
        d.Press(IDOK);
    });
    CQoErrorDlg::ShowError(20001, (UINT)IDS_COL_OFFSET);
    EXPECT_EQ(1, driver.Seen());
    EXPECT_EQ("Offset", info);
    EXPECT_EQ("ERR: Offset", Entries().at(1));
}
