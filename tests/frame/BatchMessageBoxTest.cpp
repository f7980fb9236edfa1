// Message boxes: the log line of every box, shown or skipped, and the answer.
#include <afxwin.h>

#include <DialogDriver.h>
#include <QoBatchMessageBox.h>
#include <resource.h>

#include "FrameTestUtil.h"

using namespace frametest;

namespace {

class BatchMessageBox : public LogFixture
{
protected:
    void SetUp() override
    {
        LogFixture::SetUp();
        QoBatchMessageBoxSetMode(true);
    }
    void TearDown() override
    {
        QoBatchMessageBoxSetMode(false);
        LogFixture::TearDown();
    }
};

using InteractiveMessageBox = LogFixture;

}  // namespace

TEST_F(BatchMessageBox, ShowsNothingAndReturnsThePreset)
{
    qotest::DialogDriver driver;
    EXPECT_EQ(IDNO, QoBatchMessageBox(2001, IDNO, "Weiter?", MB_YESNO, 0));
    qotest::PumpFor(200);
    EXPECT_EQ(0, driver.Seen());
    EXPECT_EQ(std::vector<std::string>{"E:2001 Weiter?, Autoreturn: no"}, Entries());
}

TEST_F(BatchMessageBox, PrefixDependsOnTheNumberRange)
{
    const int numbers[] = {999, 1000, 1999, 2000, 2999, 3000, -1500, 0};
    for (int n : numbers)
        QoBatchMessageBox(n, IDOK, "t", MB_OK, 0);
    std::vector<std::string> expected = {
        " t, Autoreturn: ok",      "H:1000 t, Autoreturn: ok", "H:1999 t, Autoreturn: ok",
        "E:2000 t, Autoreturn: ok", "E:2999 t, Autoreturn: ok", " t, Autoreturn: ok",
        " t, Autoreturn: ok",      " t, Autoreturn: ok"};
    EXPECT_EQ(expected, Entries());
}

TEST_F(BatchMessageBox, EveryAnswerHasItsName)
{
    const UINT answers[] = {IDOK, IDCANCEL, IDABORT, IDRETRY, IDIGNORE, IDYES, IDNO, 0, 42};
    for (UINT a : answers)
        EXPECT_EQ((int)a, QoBatchMessageBox(1, a, "x", MB_OK, 0));
    std::vector<std::string> expected = {
        " x, Autoreturn: ok",     " x, Autoreturn: cancel", " x, Autoreturn: abort",
        " x, Autoreturn: retry",  " x, Autoreturn: ignore", " x, Autoreturn: yes",
        " x, Autoreturn: no",     " x, Autoreturn: unknown", " x, Autoreturn: unknown"};
    EXPECT_EQ(expected, Entries());
}

TEST_F(BatchMessageBox, LineBreaksAreFlattenedInTheLog)
{
    QoBatchMessageBox(1001, IDOK, "a\r\nb\nc\rd", MB_OK, 0);
    EXPECT_EQ(std::vector<std::string>{"H:1001 a b cd, Autoreturn: ok"}, Entries());
}

TEST_F(BatchMessageBox, StringIdFormLoadsTheLibraryText)
{
    // The test program has no string table of its own: the text comes from the
    // library through the resource chain, in batch mode too.
    QoBatchMessageBox(2500, IDOK, (UINT)IDS_LOG_DELETE, MB_OK, 0);
    QoBatchMessageBox(2501, IDOK, (UINT)59999, MB_OK, 0);
    std::vector<std::string> expected = {
        "E:2500 L\xF6sche Verzeichnis/Datei , Autoreturn: ok",
        "E:2501 , Autoreturn: ok"};
    EXPECT_EQ(expected, Entries());
}

TEST_F(InteractiveMessageBox, ShowsTheUnalteredTextAndLogsTheAnswer)
{
    qotest::DialogDriver driver;
    driver.Expect([](qotest::Dialog& d) {
        EXPECT_EQ("a\r\nb", d.MessageText());
        std::vector<int> buttons = d.ButtonIds();
        EXPECT_EQ((std::vector<int>{IDYES, IDNO}), buttons);
        d.Press(IDYES);
    });
    EXPECT_EQ(IDYES, QoBatchMessageBox(2001, IDNO, "a\r\nb", MB_YESNO, 0));
    EXPECT_TRUE(driver.Done());
    EXPECT_EQ(0, driver.Unanswered());
    EXPECT_EQ(std::vector<std::string>{"E:2001 a b, Return: yes"}, Entries());
}

TEST_F(InteractiveMessageBox, PendingPiecesWaitWhileTheBoxIsOpen)
{
    qotest::DialogDriver driver;
    std::string seenWhileOpen;
    std::string log = m_log;
    driver.Expect([&](qotest::Dialog& d) {
        // Nothing is written before the answer is known.
        seenWhileOpen = ReadFile(log);
        d.Press(IDCANCEL);
    });
    EXPECT_EQ(IDCANCEL, QoBatchMessageBox(1500, IDOK, "Abbrechen?", MB_OKCANCEL, 0));
    EXPECT_EQ("", seenWhileOpen);
    EXPECT_EQ(std::vector<std::string>{"H:1500 Abbrechen?, Return: cancel"}, Entries());
}

TEST_F(InteractiveMessageBox, StringIdFormShowsTheLibraryText)
{
    qotest::DialogDriver driver;
    driver.Expect([](qotest::Dialog& d) {
        EXPECT_EQ("ODBC Datenbanken m\xFCssen schon angelegt sein!", d.MessageText());
        d.Press(IDOK);
    });
    EXPECT_EQ(IDOK, QoBatchMessageBox(3000, IDCANCEL, (UINT)IDS_ODBC_MUST_EXIST, MB_OK, 0));
    EXPECT_TRUE(driver.Done());
    EXPECT_EQ(std::vector<std::string>{" ODBC Datenbanken m\xFCssen schon angelegt sein!, Return: ok"},
              Entries());
}
