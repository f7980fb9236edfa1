// The fixed-length text page on real windows over files the tests write.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "CInputFilterConfig.h"
#include "CInputFilterConfigTextFix.h"
#include "CModifiedListener.h"
#include "CQoFile.h"
#include "CQoInputFilterTextFix.h"
#include "CQoInputFilterTextVF.h"
#include "MfcTestHost.h"
#include "resource.h"

namespace {

const COLORREF kMark = RGB(0, 0, 255);
const int kPageId = 31;

// Three records of 20 bytes and a last one of 5, without line breaks.
const char kRecords[] = "Meier     Hans 50667Huber     Anna 80331Schulz    Paul 20095Rest!";

// The filter lets go of its file, so that the test can take it away.
struct CClosableTextFix : CQoInputFilterTextFix {
    using CQoInputFilterTextFix::CloseFile;
};

template <class Filter>
std::vector<int> Widths(Filter& f)
{
    std::vector<int> w;
    for (int i = 0; i < f.NumCols(); ++i) w.push_back(f.ColLen(i));
    return w;
}

class TextFixPageTest : public qotest::HostFrameTest, public CModifiedListener {
protected:
    TextFixPageTest() : HostFrameTest("Eingabe", 720, 520) {}
    void SetUp() override
    {
        HostFrameTest::SetUp();
        m_strFile = qotest::WriteTempFile("qo_textfix.dat", kRecords);
        m_filter.Init(m_strFile.c_str());
        m_filter.RecordLen(20);
        m_filter.SetNumCols(2);
        m_filter.ColLen(0, 10);
        m_filter.ColLen(1, 10);
    }
    void TearDown() override
    {
        if (m_pPage != NULL) m_pPage->DestroyWindow();
        delete m_pPage;
        HostFrameTest::TearDown();
        ::DeleteFileA(m_strFile.c_str());
    }
    void Open(CQoInputFilter* pFilter)
    {
        m_pPage = dynamic_cast<CInputFilterConfigTextFix*>(CInputFilterConfig::GetAppropriateConfig(pFilter, kPageId));
        ASSERT_TRUE(m_pPage != NULL);
        m_pPage->AddModifiedListener(this);
        ASSERT_TRUE(m_pPage->Create(m_pFrame));
        qotest::ShowChild(*m_pPage, 5, 5);
        m_hView = m_pPage->m_textView.m_hWnd;
        qotest::PumpApp(100);
    }
    // The x coordinates of the mark lines, read from the ruler row of a capture.
    std::vector<int> MarkLines()
    {
        const qotest::Image img = qotest::Screen(m_hView);
        std::vector<int> xs;
        for (int x = 0; x < img.width; ++x)
            if (img.Pixel(x, 1) == kMark) xs.push_back(x);
        return xs;
    }
    // Learns the character width from the marks at 0 and 20 that loading set.
    void Measure()
    {
        const std::vector<int> xs = MarkLines();
        ASSERT_EQ(3u, xs.size());
        m_x0 = xs[0];
        m_cx = (xs[2] - xs[0]) / 20;
        ASSERT_EQ(xs[0] + 10 * m_cx, xs[1]);
    }
    int X(int pos) const { return m_x0 + pos * m_cx; }
    int Y() const { return 40; }
    void Apply() { qotest::ClickMiddle(m_pPage->GetDlgItem(IDC_TEXTFIX_APPLY)->m_hWnd); }
    int ModifiedListenerSetModified(int, int nNotifierId) override
    {
        m_calls.push_back(nNotifierId);
        return 1;
    }

    std::string m_strFile;
    CClosableTextFix m_filter;
    CInputFilterConfigTextFix* m_pPage = NULL;
    HWND m_hView = NULL;
    int m_x0 = 0, m_cx = 1;
    std::vector<int> m_calls;
};

TEST_F(TextFixPageTest, ClickSetsDoubleClickDeletesDragMovesAMarkAndAVanishedFileIsNamed)
{
    Open(&m_filter);
    Measure();

    struct Step {
        const char* what;
        std::function<void()> act;
        std::vector<int> widths;
    } steps[] = {
        {"click at 5", [&] { qotest::Click(m_hView, X(5), Y()); }, {5, 5, 10}},
        {"double click at 10", [&] { qotest::DoubleClick(m_hView, X(10), Y()); }, {5, 15}},
        {"drag 5 to 7", [&] { qotest::Drag(m_hView, {X(5), Y()}, {X(7), Y()}); }, {7, 13}},
        // The first column starts at the start of the record, whatever the marks say.
        {"double click at 0", [&] { qotest::DoubleClick(m_hView, X(0), Y()); }, {7, 13}},
    };
    for (const Step& s : steps) {
        SCOPED_TRACE(s.what);
        s.act();
        qotest::PumpApp(150);
        Apply();
        EXPECT_EQ(s.widths, Widths(m_filter));
    }
    EXPECT_EQ(std::vector<int>({X(0), X(7), X(20)}), MarkLines());
    EXPECT_EQ(std::vector<int>(4, kPageId), m_calls);
    qotest::CaptureWindow(m_pPage->m_hWnd, qotest::CapturePath("input-textfix-4009.png").c_str());

    // The file vanished: named, the filter's columns kept, the user's new mark still shown.
    m_filter.CloseFile();
    ASSERT_TRUE(::DeleteFileA(m_strFile.c_str()));
    qotest::Click(m_hView, X(5), Y());
    qotest::PumpApp(150);
    EXPECT_EQ("Die Datei '" + m_strFile + "' konnte nicht ge\xF6" "ffnet werden.", qotest::MessageOf([&] { Apply(); }));
    EXPECT_EQ(std::vector<int>({7, 13}), Widths(m_filter));
    EXPECT_EQ(4u, m_calls.size());
    EXPECT_EQ(std::vector<int>({X(0), X(5), X(7), X(20)}), MarkLines());
}

TEST_F(TextFixPageTest, RecordLengthSpinAndCharacterSetReachTheFilter)
{
    Open(&m_filter);
    qotest::TypeOver(m_pPage->GetDlgItem(IDC_TEXTFIX_RECORD_LEN)->m_hWnd, "25");
    static_cast<CComboBox*>(m_pPage->GetDlgItem(IDC_TEXTFIX_CHARSET))->SetCurSel(1);
    Apply();
    EXPECT_EQ(25, m_filter.RecordLen());
    EXPECT_EQ(CQoFile::ascii, m_filter.CharSet());
    EXPECT_EQ(std::vector<int>({10, 10, 5}), Widths(m_filter));

    // One step up: the old end goes, the last column grows.
    CWnd* pSpin = m_pPage->GetDlgItem(IDC_TEXTFIX_SPIN);
    CRect rc;
    pSpin->GetClientRect(&rc);
    qotest::Click(pSpin->m_hWnd, rc.Width() / 2, 2);
    qotest::PumpApp(200);
    EXPECT_EQ(26, m_filter.RecordLen());
    EXPECT_EQ(std::vector<int>({10, 10, 6}), Widths(m_filter));
    EXPECT_EQ(2u, m_calls.size());

    // Too long for any record: refused with a message, nothing changed.
    qotest::TypeOver(m_pPage->GetDlgItem(IDC_TEXTFIX_RECORD_LEN)->m_hWnd, "99999999");
    EXPECT_EQ("Die Satzl\xE4nge darf h\xF6" "chstens 16777216 betragen.", qotest::MessageOf([&] { Apply(); }));
    EXPECT_EQ(26, m_filter.RecordLen());
}

TEST_F(TextFixPageTest, LinesModeCutsUpToTheLongestLineAndKeepsTheRecordLengthOff)
{
    const std::string file = qotest::WriteTempFile("qo_textvf.txt", "Name      Ort\r\nMeier     K\xF6ln\r\nHuber     Bonn\r\n");
    CQoInputFilterTextVF lines;
    lines.Init(file.c_str());
    lines.SetNumCols(2);
    lines.ColLen(0, 10);
    lines.ColLen(1, 10);
    lines.SetFirstRowHasNames(true);
    Open(&lines);
    Measure();
    m_pPage->Enable(TRUE);
    EXPECT_FALSE(m_pPage->GetDlgItem(IDC_TEXTFIX_RECORD_LEN)->IsWindowEnabled());
    // A mark beyond every line shown is ignored: the lines are 14 long at most.
    qotest::Click(m_hView, X(30), Y());
    qotest::PumpApp(150);
    Apply();
    EXPECT_EQ(std::vector<int>({10, 4}), Widths(lines));
    ::DeleteFileA(file.c_str());
}

TEST_F(TextFixPageTest, SavingWithoutTheWindowKeepsTheColumns)
{
    CInputFilterConfigTextFix page(&m_filter, kPageId, false);
    page.m_nRecordLen = 30;
    page.UpdateInputFilter(1);
    EXPECT_EQ(30, m_filter.RecordLen());
    EXPECT_EQ(std::vector<int>({10, 10}), Widths(m_filter));
}

}  // namespace
