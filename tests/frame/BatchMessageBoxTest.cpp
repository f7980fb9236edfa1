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

TEST_F(BatchMessageBox, LogLineHasPrefixTextAndThePresetAnswer)
{
    struct Case
    {
        int number;
        UINT answer;
        const char* text;  // null: the text of textId
        UINT textId;
        const char* logged;
    };
    const Case cases[] = {
        // The prefix follows the number range.
        {999, IDOK, "t", 0, " t, Autoreturn: ok"}, {1000, IDOK, "t", 0, "H:1000 t, Autoreturn: ok"},
        {2000, IDCANCEL, "t", 0, "E:2000 t, Autoreturn: cancel"}, {2999, IDOK, "t", 0, "E:2999 t, Autoreturn: ok"},
        {3000, IDOK, "t", 0, " t, Autoreturn: ok"},
        // An answer that is no button's.
        {1, 42, "x", 0, " x, Autoreturn: unknown"},
        // Line breaks are flattened.
        {1001, IDOK, "a\r\nb\nc\rd", 0, "H:1001 a b cd, Autoreturn: ok"},
        // The test program has no string table of its own: the text comes from
        // the library through the resource chain, in batch mode too.
        {2500, IDOK, nullptr, IDS_LOG_DELETE, "E:2500 L\xF6sche Verzeichnis/Datei , Autoreturn: ok"},
        {2501, IDOK, nullptr, 59999, "E:2501 , Autoreturn: ok"},
    };
    std::vector<std::string> expected;
    for (const Case& c : cases) {
        int answer = c.text ? QoBatchMessageBox(c.number, c.answer, c.text, MB_OK, 0)
                            : QoBatchMessageBox(c.number, c.answer, c.textId, MB_OK, 0);
        EXPECT_EQ((int)c.answer, answer) << c.logged;
        expected.push_back(c.logged);
    }
    EXPECT_EQ(expected, Entries());
}

TEST_F(InteractiveMessageBox, ShowsTheUnalteredTextAndLogsTheAnswer)
{
    qotest::DialogDriver driver;
    std::string seenWhileOpen = "-";
    const std::string log = m_log;
    driver.Expect([&](qotest::Dialog& d) {
        seenWhileOpen = ReadFile(log);  // nothing is written before the answer is known
        EXPECT_EQ("a\r\nb", d.MessageText());
        EXPECT_EQ((std::vector<int>{IDYES, IDNO}), d.ButtonIds());
        d.Press(IDYES);
    });
    EXPECT_EQ(IDYES, QoBatchMessageBox(2001, IDNO, "a\r\nb", MB_YESNO, 0));
    EXPECT_TRUE(driver.Done());
    EXPECT_EQ(0, driver.Unanswered());
    EXPECT_EQ("", seenWhileOpen);
    EXPECT_EQ(std::vector<std::string>{"E:2001 a b, Return: yes"}, Entries());
}
