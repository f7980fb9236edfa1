// The small dialogs and statics on real windows: what the user sees in them,
// what they hand back, and the log lines of the hint.
#include <gtest/gtest.h>

#include <afxwin.h>

#include <string>
#include <vector>

#include "CQoInfoView.h"
#include "Capture.h"
#include "DialogDriver.h"
#include "resource.h"

namespace {

// Runs one script on the dialog that `open` shows and checks that it was answered.
template <class Open>
void Drive(qotest::DialogScript script, Open open)
{
    qotest::DialogDriver driver;
    driver.Expect(std::move(script));
    open();
    EXPECT_TRUE(driver.Done());
    EXPECT_EQ(0, driver.Unanswered());
}

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
    Drive(
        [&](qotest::Dialog& d) {
            title = d.Title();
            text = d.Text(IDC_INFO_TEXT);
            lines = (int)d.Send(IDC_INFO_TEXT, EM_GETLINECOUNT);
            cancelVisible = d.IsVisible(IDCANCEL);
            qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("info-4008.png").c_str());
            d.Press(IDOK);
        },
        [&] { EXPECT_EQ(IDOK, view.DoModal()); });

    EXPECT_EQ("Information", title);
    EXPECT_EQ("Eingabedatei: C:\\daten\\kunden.txt\r\nS\xE4tze: 1204\r\nFehlerhafte S\xE4tze: 3\r\n"
              "Satz 17: Feld 4 zu lang\r\nSatz 90: Feld 2 fehlt\r\n",
              text);
    EXPECT_EQ(6, lines);  // five lines and the empty one after the last break
    EXPECT_FALSE(cancelVisible);

    view.Clear();
    view.Append("neu");
    Drive(
        [&](qotest::Dialog& d) {
            text = d.Text(IDC_INFO_TEXT);
            d.Press(IDOK);
        },
        [&] { view.DoModal(); });
    EXPECT_EQ("neu", text);
}
