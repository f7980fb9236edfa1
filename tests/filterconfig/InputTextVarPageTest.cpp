// The delimited text page and the input previews on real windows.
#include <gtest/gtest.h>

#include <memory>
#include <fstream>
#include <string>
#include <vector>

#include "CColoredInputFilterListCtrl.h"
#include "CInputFilterConfig.h"
#include "CInputFilterConfigTextVar.h"
#include "CInputFilterListCtrl.h"
#include "CModifiedListener.h"
#include "CQoException.h"
#include "CQoFile.h"
#include "CQoInputFilterTextVar.h"
#include "MfcTestHost.h"
#include "resource.h"

namespace {

using qotest::ColumnTitle;
using qotest::WriteTempFile;

CString Cell(CColoredInputFilterListCtrl& list, int item, int col)
{
    CString text;
    DWORD clr = 0, clrSel = 0;
    bool bold = false;
    list.GetColoredItem(item, col, text, clr, clrSel, bold);
    return text;
}

// `rows` lines of `cols` fields "r<row>c<col>", joined by ';'.
std::string Rows(int rows, int cols)
{
    std::string s;
    for (int r = 0; r < rows; ++r) {
        for (int c = 0; c < cols; ++c) s += (c ? ";r" : "r") + std::to_string(r) + "c" + std::to_string(c);
        s += "\r\n";
    }
    return s;
}

class PreviewTest : public qotest::HostFrameTest {
protected:
    PreviewTest() : HostFrameTest("Vorschau", 720, 520) {}
    void SetUp() override
    {
        HostFrameTest::SetUp();
        ASSERT_TRUE(m_list.Create(WS_CHILD | WS_VISIBLE | WS_BORDER | LVS_REPORT | LVS_OWNERDRAWFIXED | LVS_OWNERDATA,
                                  CRect(5, 5, 605, 405), m_pFrame, 100));
        m_list.Init();
        m_list.SetInputFilter(&m_filter);
    }
    void Load(const std::string& content)
    {
        m_filter.Init(WriteTempFile("qo_preview.csv", content).c_str());
        m_list.Update();
    }
    CColoredInputFilterListCtrl m_list;
    CQoInputFilterTextVar m_filter;
};

TEST_F(PreviewTest, ShowsAtMostAThousandRowsAndTheCaptionRowInItsColoursOnTheButtonFace)
{
    const COLORREF kCaption = RGB(200, 0, 0);
    struct Case {
        int rows;
        bool caption;
        int items;
    } cases[] = {{5000, false, 1000}, {25, true, 26}};
    for (const Case& c : cases) {
        SCOPED_TRACE(std::to_string(c.rows) + (c.caption ? " with caption" : ""));
        m_list.SetSpecialFirstRow(c.caption, kCaption, RGB(255, 255, 0));
        Load(Rows(c.rows, 3));
        EXPECT_EQ(c.items, m_list.GetItemCount());
        const int first = c.caption ? 1 : 0;
        EXPECT_EQ("r0c2", Cell(m_list, first, 2));
        EXPECT_EQ(CString(("r" + std::to_string(c.items - first - 1) + "c1").c_str()), Cell(m_list, c.items - 1, 1));
        if (c.rows < 1000) {
            EXPECT_EQ("", Cell(m_list, c.items, 1)) << "a row the filter does not have is empty";
        }
    }

    m_list.SetSpecialText(0, "Kopf");
    m_list.SetSpecialText(3, "zu weit");  // beyond the columns: ignored
    m_list.SetSpecialText(-1, "davor");
    EXPECT_EQ((std::vector<CString>{"Kopf", ""}), (std::vector<CString>{Cell(m_list, 0, 0), Cell(m_list, 0, 2)}));
    const qotest::Image img = qotest::Screen(m_list.m_hWnd);
    CRect caption;
    m_list.GetItemRect(0, &caption, LVIR_BOUNDS);
    caption.right = m_list.GetColumnWidth(0) - 10;
    EXPECT_EQ(::GetSysColor(COLOR_BTNFACE), img.Pixel(caption.right, caption.top + 1));
    EXPECT_GT(qotest::CountPixels(img, caption, kCaption), 0);

    // The plain list copies rows up to its limit.
    CInputFilterListCtrl plain;
    ASSERT_TRUE(plain.Create(WS_CHILD | WS_VISIBLE | LVS_REPORT, CRect(5, 5, 605, 205), m_pFrame, 101));
    plain.SetInputFilter(&m_filter);
    plain.SetMaxRows(10);
    plain.Update();
    EXPECT_EQ(10, plain.GetItemCount());
    plain.DestroyWindow();
}

TEST_F(PreviewTest, AnUpdateKeepsTheColumnOrderTheUserDraggedAndFollowsTheFile)
{
    Load(Rows(5, 3));
    int order[3] = {2, 0, 1};
    m_list.SetColumnOrderArray(3, order);
    m_filter.SetFirstRowHasNames(true);
    Load("A;B;C;D\r\n" + Rows(5, 4));
    std::vector<int> now(4);
    m_list.GetColumnOrderArray(now.data(), 4);
    EXPECT_EQ((std::vector<int>{2, 0, 1, 3}), now);
    EXPECT_EQ("D", ColumnTitle(m_list, 3));

    Load("Name;Ort\r\n");  // names only
    EXPECT_EQ(0, m_list.GetItemCount());
    EXPECT_EQ(2, m_list.GetHeaderCtrl()->GetItemCount());
    EXPECT_EQ("Ort", ColumnTitle(m_list, 1));
}

TEST(InputFilterConfigTest, PicksThePageByTheFiltersType)
{
    CQoInputFilterTextVar textVar;
    std::unique_ptr<CInputFilterConfig> page(CInputFilterConfig::GetAppropriateConfig(&textVar, 12));
    EXPECT_TRUE(page && page->IsKindOf(RUNTIME_CLASS(CInputFilterConfigTextVar)));
    EXPECT_EQ(nullptr, CInputFilterConfig::GetAppropriateConfig(nullptr, 12));
    struct CTypedFilter : CQoInputFilter {
        explicit CTypedFilter(int type) { m_fileType = type; }
    };
    for (int type : {0, 8, -1}) {
        CTypedFilter other(type);
        EXPECT_EQ(nullptr, CInputFilterConfig::GetAppropriateConfig(&other, 12)) << type;
    }
}

const int kPageId = 77;

class TextVarPageTest : public qotest::HostFrameTest, public CModifiedListener {
protected:
    TextVarPageTest() : HostFrameTest("Eingabe", 720, 520) {}
    void SetUp() override
    {
        HostFrameTest::SetUp();
        // The second record's town, enclosed in ', runs over two lines.
        m_strFile = WriteTempFile("qo_page.csv", "Name\tOrt\tPLZ\r\nMeier\t'K\xF6ln\r\nDeutz'\t50667\r\n"
                                                 "Huber\tM\xFCnchen\t80331\r\nSchulz\tHamburg\t20095\r\n");
    }
    void TearDown() override
    {
        Close();
        HostFrameTest::TearDown();
    }
    int ModifiedListenerSetModified(int, int nNotifierId) override
    {
        m_notified.push_back(nNotifierId);
        return 1;
    }
    void Open()
    {
        m_pPage = new CInputFilterConfigTextVar(&m_filter, kPageId);
        m_pPage->AddModifiedListener(this);
        ASSERT_TRUE(m_pPage->Create(m_pFrame));
        qotest::ShowChild(*m_pPage);
    }
    void Close()
    {
        if (m_pPage != nullptr) m_pPage->DestroyWindow();
        delete m_pPage;
        m_pPage = nullptr;
    }
    qotest::Dialog Page() { return qotest::Dialog(m_pPage->m_hWnd); }
    CString PageCell(int item, int col) { return Cell(m_pPage->m_preview, item, col); }
    void Press(int id)
    {
        Page().Press(id);
        qotest::PumpApp(100);
    }
    std::string State()
    {
        return std::string{m_filter.Delimiter(), '/', m_filter.Encloser(), '/'} + std::to_string(m_filter.Skip()) +
               "/" + std::to_string(m_filter.GetFirstRowHasNames()) + "/" + std::to_string(m_filter.CharSet());
    }

    CQoInputFilterTextVar m_filter;
    std::vector<int> m_notified;  // the notifier ids the page told
    CInputFilterConfigTextVar* m_pPage = nullptr;
    std::string m_strFile;
};

TEST_F(TextVarPageTest, ShowsTheFiltersSettingsAndRecords)
{
    m_filter.Delimiter('\t');
    m_filter.Encloser(0);
    m_filter.Escape('\\');
    m_filter.Skip(1);
    m_filter.CharSet(CQoFile::ansimix);
    m_filter.SetFirstRowHasNames(true);
    m_filter.Init(WriteTempFile("qo_adressen.txt", "Adressen, Stand Mai\r\nName\tOrt\tPLZ\tStra\xDF" "e\r\n"
                                                   "Meier\tK\xF6ln\t50667\tHohe Stra\xDF" "e 12\r\n"
                                                   "Huber\tM\xFCnchen\t80331\tMarienplatz 1\r\n")
                      .c_str());
    Open();
    qotest::Dialog page = Page();
    EXPECT_EQ((std::vector<std::string>{"[TAB]", "", "\\", "1"}),
              (std::vector<std::string>{page.Text(IDC_TEXTVAR_DELIMITER), page.Text(IDC_TEXTVAR_ENCLOSER),
                                        page.Text(IDC_TEXTVAR_ESCAPE), page.Text(IDC_TEXTVAR_SKIP)}));
    EXPECT_EQ("Ansi/Ascii", page.Text(IDC_TEXTVAR_CHARSET));
    EXPECT_TRUE(page.IsChecked(IDC_TEXTVAR_FIRST_NAMES));
    EXPECT_EQ(2, m_pPage->m_preview.GetItemCount());
    EXPECT_EQ("80331", PageCell(1, 2));
    qotest::CaptureWindow(m_pPage->m_hWnd, qotest::CapturePath("input-textvar-4007.png").c_str());
}

TEST_F(TextVarPageTest, AppliesWhatTheUserSetAndTellsTheListenersOnce)
{
    m_filter.Init(m_strFile.c_str());  // ';' and '"': five records of one field
    Open();
    qotest::Dialog page = Page();
    ASSERT_EQ(5, m_pPage->m_preview.GetItemCount());

    // Tab and ' move the record boundaries: the row count is read anew.
    page.SelectText(IDC_TEXTVAR_DELIMITER, "[TAB]");
    page.SetText(IDC_TEXTVAR_ENCLOSER, "'");
    Press(IDC_TEXTVAR_APPLY);
    EXPECT_EQ('\t', m_filter.Delimiter());
    EXPECT_EQ('\'', m_filter.Encloser());
    EXPECT_EQ(4, m_pPage->m_preview.GetItemCount());
    EXPECT_EQ("K\xF6ln\r\nDeutz", PageCell(1, 1));
    EXPECT_EQ(std::vector<int>{kPageId}, m_notified);

    // Ticking the first-line box applies the pending edits with it; the names
    // are read under the new settings.
    page.SelectText(IDC_TEXTVAR_DELIMITER, "[TAB]");
    page.SetText(IDC_TEXTVAR_SKIP, "-3");  // becomes 0, and is shown so
    page.Select(IDC_TEXTVAR_CHARSET, 2);
    page.Check(IDC_TEXTVAR_FIRST_NAMES, true);
    qotest::PumpApp(100);
    EXPECT_TRUE(m_filter.GetFirstRowHasNames());
    EXPECT_EQ(0, m_filter.Skip());
    EXPECT_EQ("0", page.Text(IDC_TEXTVAR_SKIP));
    EXPECT_EQ(CQoFile::ansimix, m_filter.CharSet());
    EXPECT_EQ(3, m_pPage->m_preview.GetItemCount());
    EXPECT_EQ("Meier", PageCell(0, 0));
    EXPECT_EQ("Ort", ColumnTitle(m_pPage->m_preview, 1));
    EXPECT_EQ(2u, m_notified.size());
}

TEST_F(TextVarPageTest, ASkipThatIsNoNumberStopsTheExchangeThereAndTheApplyGoesOn)
{
    m_filter.Init(m_strFile.c_str());  // ';' and '"': five records of one field
    Open();
    qotest::Dialog page = Page();
    // The file gains a record: the apply re-opens the filter on it.
    std::ofstream(m_strFile, std::ios::binary | std::ios::app) << "Neu\tBonn\t53111\r\n";
    page.SelectText(IDC_TEXTVAR_DELIMITER, "[TAB]");  // exchanged after the skip: stays ';'
    page.SetText(IDC_TEXTVAR_SKIP, "abc");
    EXPECT_EQ("Geben Sie eine ganze Zahl ein.", qotest::MessageOf([&] { Press(IDC_TEXTVAR_APPLY); }));
    EXPECT_EQ(';', m_filter.Delimiter());
    EXPECT_EQ(0, m_filter.Skip());
    EXPECT_EQ(6, m_pPage->m_preview.GetItemCount());
    EXPECT_EQ(std::vector<int>{kPageId}, m_notified);
}

TEST_F(TextVarPageTest, RefusesBadSettingsWithAMessageAndLeavesTheFilterAsItWas)
{
    const std::string binary = WriteTempFile("qo_bild.png", std::string("\x89PNG\r\n\x1a\n\0\0\0\rIHDR\0\0\0\x10", 20));
    const std::string open = WriteTempFile("qo_offen.csv", "a;b\r\nc;'d\r\n");
    const std::string gone = qotest::TempPath("qo_weg.csv");
    struct Case {
        const char* what;
        std::string file;  // "" : the page's file
        int control;
        const char* typed;
        std::string message;  // the start of the message shown
    } cases[] = {
        {"empty delimiter", "", IDC_TEXTVAR_DELIMITER, "", "Bitte geben Sie ein Trennzeichen an"},
        {"file vanished", gone, IDC_TEXTVAR_SKIP, "1", "Die Datei '" + gone + "' konnte nicht ge\xF6" "ffnet werden."},
        {"not text", binary, IDC_TEXTVAR_SKIP, "1", "Die Datei '" + binary + "' ist keine Textdatei."},
        {"filter cannot read it", open, IDC_TEXTVAR_ENCLOSER, "'", ""},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        m_filter.Encloser(0);
        try {
            m_filter.Init((c.file.empty() ? m_strFile : c.file).c_str());
        } catch (const CQoException&) {
            // the vanished file: the filter names it but cannot read it
        }
        Open();
        const std::string before = State();
        Page().SetText(c.control, c.typed);
        const std::string shown = qotest::MessageOf([&] { Press(IDC_TEXTVAR_APPLY); });
        EXPECT_TRUE(!shown.empty() && shown.find(c.message) == 0) << shown;
        EXPECT_EQ(before, State()) << "the settings are the filter's as before";
        EXPECT_TRUE(m_notified.empty());
        EXPECT_EQ(c.typed, Page().Text(c.control)) << "the page keeps what the user typed";
        Close();
    }
    EXPECT_EQ(2, m_filter.NumRows()) << "after the refused encloser the filter reads its file as before";
}

}  // namespace
