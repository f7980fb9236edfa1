// Repairing defective records: a delimited file read through the real text
// filter with the repair dialog installed, the dialogs answered as a user
// would (typing, clicking the spin arrows, arrow keys, buttons).
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "CQoException.h"
#include "CQoInputFilterTextVar.h"
#include "CQoInterActive.h"
#include "CRepairRecordDlg.h"
#include "MfcTestHost.h"
#include "resource.h"

namespace {

using qotest::Dialog;
using qotest::DialogScript;

const char kHead[] = "Name;Ort;PLZ\r\nMeier;Bonn;53111\r\n";
const char kTail[] = "Schulz;Essen;45127\r\nWolf;Ulm;89073\r\n";

// One step of the spin control with a real click on its upper or lower arrow.
void ClickSpin(Dialog& d, bool up)
{
    HWND spin = d.Item(IDC_REPAIR_SPIN);
    RECT rc;
    GetClientRect(spin, &rc);
    // Press and release queued together: a busy machine must not hold the
    // button long enough for the control's own repeat to step once more.
    qotest::MoveMouse(spin, rc.right / 2, up ? 2 : rc.bottom - 3);
    qotest::InjectButton(qotest::MouseButton::Left, true);
    qotest::InjectButton(qotest::MouseButton::Left, false);
    qotest::PumpFor(40);
}

// Presses a button whose refusal opens a message box; returns when the box is gone.
void PressRefused(Dialog& d, int id)
{
    d.Press(id);
    qotest::PumpFor(600);
}

struct Outcome {
    std::vector<std::string> rows;
    std::string stop;   // the message that ended reading, if any
};

class RepairTest : public ::testing::Test {
protected:
    void SetUp() override { CQoInterActive::SetRepairRecord(CRepairRecordDlgDoIt); }
    void TearDown() override
    {
        CQoInterActive::SetRepairRecord(nullptr);
        CQoInterActive::SetCorrectRepair(nullptr);
        DeleteFileA(m_path.c_str());
    }

    // Reads every row of `content` with the dialogs answered by `scripts`.
    Outcome Read(const std::string& content, std::vector<DialogScript> scripts)
    {
        m_path = qotest::WriteTempFile("qo_repair_" + std::to_string(GetCurrentProcessId()) + ".csv", content);
        Outcome out;
        qotest::DialogDriver driver;
        for (auto& s : scripts) driver.Expect(std::move(s));
        try {
            CQoInputFilterTextVar filter;
            filter.SetFirstRowHasNames(true);
            filter.Init(m_path.c_str());
            for (bool ok = filter.FirstRow(); ok; ok = filter.NextRow()) {
                std::string row;
                for (int c = 0; c < filter.NumCols(); ++c) {
                    CQoString value;
                    filter.Value(c, value);
                    row += (c ? "|" : "") + std::string(value.GetString());
                }
                out.rows.push_back(row);
            }
        } catch (CQoException const& e) {
            out.stop = e.Message();
        }
        EXPECT_TRUE(driver.Done());
        EXPECT_EQ(0, driver.Unanswered());
        return out;
    }

    std::string m_path;
};

const std::vector<std::string> kAllRows = {"Meier|Bonn|53111", "Huber|K\xF6ln|50667", "Schulz|Essen|45127",
                                           "Wolf|Ulm|89073"};

}  // namespace

TEST_F(RepairTest, EachAnswerOfTheUserReachesTheFilter)
{
    const std::string file = std::string(kHead) + "Huber;K\xF6ln;50667;X\r\n" + kTail;
    DialogScript takeOver = [](Dialog& d) {  // still defective: the correction is asked for
        EXPECT_EQ("Daten korrigieren...", d.Title());
        EXPECT_EQ("Huber;K\xF6ln;50667;X\r\n", d.Text(IDC_REPAIR_CORRECTION));
        d.SetText(IDC_REPAIR_CORRECTION, "Huber;K\xF6ln;50667;X;Y");
        d.Press(IDOK);
    };
    auto press = [](int id) { return [id](Dialog& d) { d.Press(id); }; };
    DialogScript correct = [](Dialog& d) {
        EXPECT_EQ("Eingabe korrigieren", d.Title());
        EXPECT_EQ("Huber;K\xF6ln;50667;X;Y", d.Text(IDC_REPAIR_CORRECTION));
        d.SetText(IDC_REPAIR_CORRECTION, "Huber;K\xF6ln;50667");
        qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("correct-repair-4044.png").c_str());
        d.Press(IDOK);
    };
    const std::vector<std::string> withoutHuber = {"Meier|Bonn|53111", "Schulz|Essen|45127", "Wolf|Ulm|89073"};
    struct Case {
        const char* what;
        std::vector<DialogScript> scripts;
        std::vector<std::string> rows;
        bool stopped;
    } cases[] = {
        {"skipped", {press(IDC_REPAIR_IGNORE)}, withoutHuber, false},
        {"stopped", {press(IDCANCEL)}, {"Meier|Bonn|53111"}, true},
        {"corrected twice", {takeOver, correct}, kAllRows, false},
    };
    for (Case& c : cases) {
        SCOPED_TRACE(c.what);
        Outcome out = Read(file, std::move(c.scripts));
        EXPECT_EQ(c.rows, out.rows);
        EXPECT_EQ(c.stopped, !out.stop.empty()) << out.stop;
    }
}

TEST_F(RepairTest, SpinMovesARecordThatRunsOverTwoLinesIntoTheCorrection)
{
    // An encloser left open swallows the rest of the file; the presumed next
    // record starts one line too early.
    const std::string file = std::string(kHead) + "Huber;\"K\xF6\r\nln;50667\r\n" + kTail;
    Outcome out = Read(file, {[](Dialog& d) {
        EXPECT_EQ("Huber;\"K\xF6\r\n", d.Text(IDC_REPAIR_CORRECTION));
        // Two steps too far, and back.
        for (int i = 0; i < 12; ++i) ClickSpin(d, true);
        EXPECT_EQ("Huber;\"K\xF6\r\nln;50667\r\nSc", d.Text(IDC_REPAIR_CORRECTION));
        ClickSpin(d, false);
        ClickSpin(d, false);
        EXPECT_EQ("Huber;\"K\xF6\r\nln;50667\r\n", d.Text(IDC_REPAIR_CORRECTION));
        EXPECT_EQ(kTail, d.Text(IDC_REPAIR_DATA));
        qotest::CaptureWindow(d.Hwnd(), qotest::CapturePath("repair-4043.png").c_str());
        d.SetText(IDC_REPAIR_CORRECTION, "Huber;K\xF6ln;50667");
        d.Press(IDOK);
    }});
    EXPECT_EQ(kAllRows, out.rows);
    EXPECT_EQ("", out.stop);
}

TEST_F(RepairTest, RefusalsAndSplitsOnTheRecordAlone)
{
    const std::string big(40000, 'a');
    struct {
        const char* what;
        std::string data;
        int pos;
        DialogScript script;
        std::vector<UINT> messages;  // the refusals, in order
        int result, posAfter;
        std::string dataAfter;
    } cases[] = {
        {"split at the start: both ways out refused until moved", "abc;def\r\nghi;jkl\r\n", 0,
         [](Dialog& d) {
             EXPECT_EQ("", d.Text(IDC_REPAIR_CORRECTION));
             EXPECT_EQ("abc;def\r\nghi;jkl\r\n", d.Text(IDC_REPAIR_DATA));
             ClickSpin(d, false);  // below 0: stays there
             EXPECT_EQ("", d.Text(IDC_REPAIR_CORRECTION));
             PressRefused(d, IDOK);
             PressRefused(d, IDC_REPAIR_IGNORE);
             d.Cancel();
         },
         {IDS_REPAIR_SET_SPLIT, IDS_REPAIR_SET_SPLIT}, 0, 0, "abc;def\r\nghi;jkl\r\n"},
        {"unchanged record refused, but may be skipped", "abc;def;xyz", 11,
         [](Dialog& d) {
             EXPECT_EQ("", d.Text(IDC_REPAIR_DATA));
             ClickSpin(d, true);  // beyond the end: stays there
             PressRefused(d, IDOK);
             d.SetText(IDC_REPAIR_CORRECTION, "abc;def;xyz  \r\n");  // trailing blanks and breaks only
             PressRefused(d, IDOK);
             d.Press(IDC_REPAIR_IGNORE);
         },
         {IDS_REPAIR_UNCHANGED, IDS_REPAIR_UNCHANGED}, 2, 11, "abc;def;xyz  \r\n"},
        {"split beyond sixteen bits", big, 39990,
         [](Dialog& d) {
             ClickSpin(d, false);
             EXPECT_EQ(39989u, d.Text(IDC_REPAIR_CORRECTION).size());
             EXPECT_EQ(11u, d.Text(IDC_REPAIR_DATA).size());
             d.Press(IDC_REPAIR_IGNORE);
         },
         {}, 2, 39989, big.substr(0, 39989)},
    };
    for (auto& c : cases) {
        SCOPED_TRACE(c.what);
        CQoString data(c.data.c_str());
        int pos = c.pos;
        std::vector<DialogScript> scripts = {c.script};
        for (UINT id : c.messages)
            scripts.push_back([id](Dialog& box) {
                CString text;
                text.LoadString(id);
                EXPECT_EQ(std::string(text), box.MessageText());
                box.Press(IDOK);
            });
        qotest::Answering(scripts, [&] { EXPECT_EQ(c.result, CRepairRecordDlgDoIt("kunden.csv", data, pos)); });
        EXPECT_EQ(c.posAfter, pos);
        EXPECT_EQ(c.dataAfter, data.GetString());
    }
}
