// The delimited text page and the input previews on real windows, over real
// files that the tests write: the page driven as a user drives it (typing,
// picking from the combos, ticking, pressing, real Enter and Escape), its
// messages answered as a user answers them, and the previews checked by their
// item counts, cell texts, column widths and the pixels of a capture.
#include <gtest/gtest.h>

#include <afxcmn.h>

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
#include "Capture.h"
#include "DialogDriver.h"
#include "Input.h"
#include "resource.h"

namespace {

// The delimited filter, telling the test how often it was opened and whether its
// row count was still known when it was (SetNumRows(0) drops it).
class CProbeFilter : public CQoInputFilterTextVar {
public:
    int m_nInits = 0;
    bool m_bCountKnownAtInit = false;
    void Init(CQoString const& name) override
    {
        ++m_nInits;
        m_bCountKnownAtInit = m_bNumRowsKnown;
        CQoInputFilterTextVar::Init(name);
    }
};

// A filter that only reports a type.
class CTypedFilter : public CQoInputFilter {
public:
    explicit CTypedFilter(int type) { m_fileType = type; }
};

class CRecordingListener : public CModifiedListener {
public:
    std::vector<int> m_ids;
    int ModifiedListenerSetModified(int bModified, int nNotifierId) override
    {
        EXPECT_EQ(1, bModified);
        m_ids.push_back(nNotifierId);
        return 1;
    }
};

CString ColumnTitle(const CListCtrl& list, int col)
{
    char buf[64] = "";
    LVCOLUMN column = {};
    column.mask = LVCF_TEXT;
    column.pszText = buf;
    column.cchTextMax = sizeof(buf);
    list.GetColumn(col, &column);
    return buf;
}

std::string TempFolder()
{
    char path[MAX_PATH];
    GetTempPathA(MAX_PATH, path);
    std::string folder = std::string(path) + "qo_textvar_page";
    CreateDirectoryA(folder.c_str(), NULL);
    return folder;
}

std::string WriteFile(const std::string& name, const std::string& content)
{
    const std::string path = TempFolder() + "\\" + name;
    std::ofstream out(path, std::ios::binary);
    out << content;
    return path;
}

// `rows` lines of `cols` fields "r<row>c<col>", joined by `delim`.
std::string Rows(int rows, int cols, char delim = ';')
{
    std::string s;
    for (int r = 0; r < rows; ++r) {
        for (int c = 0; c < cols; ++c) {
            if (c) s += delim;
            s += "r" + std::to_string(r) + "c" + std::to_string(c);
        }
        s += "\r\n";
    }
    return s;
}

// The application's loop in small: PreTranslateMessage first, so that the page
// sees Enter and Escape as it does in a host.
void PumpApp(DWORD ms)
{
    const DWORD start = GetTickCount();
    for (;;) {
        MSG msg;
        while (PeekMessageA(&msg, NULL, 0, 0, PM_REMOVE)) {
            if (!AfxPreTranslateMessage(&msg)) {
                TranslateMessage(&msg);
                DispatchMessageA(&msg);
            }
        }
        const DWORD elapsed = GetTickCount() - start;
        if (elapsed >= ms) return;
        MsgWaitForMultipleObjects(0, NULL, FALSE, ms - elapsed, QS_ALLINPUT);
    }
}

class FrameTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        m_pFrame = new CFrameWnd;
        ASSERT_TRUE(m_pFrame->CreateEx(0, AfxRegisterWndClass(0, ::LoadCursor(NULL, IDC_ARROW),
                                                              (HBRUSH)(COLOR_BTNFACE + 1)),
                                       "Eingabe", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 20, 20, 720, 520, NULL,
                                       NULL));
    }
    void TearDown() override
    {
        if (::IsWindow(m_pFrame->m_hWnd)) m_pFrame->DestroyWindow();  // deletes it
        qotest::PumpFor(30);
    }
    // Answers the boxes a test expects; one it does not expect is closed and fails it.
    qotest::DialogDriver m_driver;
    CFrameWnd* m_pFrame = nullptr;
};

// ---------------------------------------------------------------------------
// The previews

class PreviewTest : public FrameTest {
protected:
    void SetUp() override
    {
        FrameTest::SetUp();
        ASSERT_TRUE(m_list.Create(WS_CHILD | WS_VISIBLE | WS_BORDER | LVS_REPORT | LVS_OWNERDRAWFIXED |
                                      LVS_OWNERDATA,
                                  CRect(5, 5, 605, 405), m_pFrame, 100));
        m_list.Init();
        m_list.SetInputFilter(&m_filter);
    }
    void TearDown() override
    {
        m_list.DestroyWindow();
        FrameTest::TearDown();
    }
    CString Cell(int item, int col)
    {
        CString text;
        DWORD clr = 0, clrSel = 0;
        bool bold = true;
        m_list.GetColoredItem(item, col, text, clr, clrSel, bold);
        EXPECT_FALSE(bold);
        return text;
    }
    int HeaderCount() { return m_list.GetHeaderCtrl()->GetItemCount(); }
    CString Title(int col) { return ColumnTitle(m_list, col); }

    CColoredInputFilterListCtrl m_list;
    CQoInputFilterTextVar m_filter;
};

TEST_F(PreviewTest, ShowsAtMostAThousandRowsWithOrWithoutTheCaptionRow)
{
    struct Case {
        int rows;
        bool caption;
        int items;
    } cases[] = {{25, false, 25}, {25, true, 26}, {5000, false, 1000}, {5000, true, 1001}};
    for (const Case& c : cases) {
        SCOPED_TRACE(std::to_string(c.rows) + (c.caption ? " with caption" : ""));
        m_filter.Init(WriteFile("rows.csv", Rows(c.rows, 3)).c_str());
        m_list.SetSpecialFirstRow(c.caption, RGB(200, 0, 0), RGB(255, 255, 0));
        m_list.Update();
        EXPECT_EQ(c.items, m_list.GetItemCount());
        const int first = c.caption ? 1 : 0;
        EXPECT_EQ("r0c0", Cell(first, 0));
        EXPECT_EQ("r0c2", Cell(first, 2));
        EXPECT_EQ(CString(("r" + std::to_string(c.items - first - 1) + "c1").c_str()), Cell(c.items - 1, 1));
        if (c.rows < 1000) EXPECT_EQ("", Cell(c.items, 1)) << "a row the filter does not have is empty";
    }

    // The plain list copies rows up to its limit.
    CInputFilterListCtrl plain;
    ASSERT_TRUE(plain.Create(WS_CHILD | WS_VISIBLE | LVS_REPORT, CRect(5, 5, 605, 205), m_pFrame, 101));
    plain.SetInputFilter(&m_filter);
    plain.SetMaxRows(1000);
    plain.Update();
    EXPECT_EQ(1000, plain.GetItemCount());
    EXPECT_EQ("r999c2", plain.GetItemText(999, 2));
    m_filter.Init(WriteFile("rows.csv", Rows(25, 3)).c_str());
    plain.SetMaxRows(0);
    plain.Update();
    EXPECT_EQ(25, plain.GetItemCount());
    EXPECT_EQ(3, plain.GetHeaderCtrl()->GetItemCount());
    plain.DestroyWindow();
}

TEST_F(PreviewTest, WithoutRowsEveryColumnGetsEightyAndAnEqualShare)
{
    m_filter.SetFirstRowHasNames(true);
    m_filter.Init(WriteFile("names.csv", "Name;Ort;PLZ\r\n").c_str());
    m_list.Update();
    EXPECT_EQ(0, m_list.GetItemCount());
    ASSERT_EQ(3, HeaderCount());
    CRect rc;
    m_list.GetWindowRect(&rc);
    const int share = (rc.Width() - (3 * 80 + 16)) / 3;
    for (int col = 0; col < 3; ++col) EXPECT_EQ(80 + share, m_list.GetColumnWidth(col)) << col;
    EXPECT_EQ("Ort", Title(1));
}

TEST_F(PreviewTest, ASecondUpdateKeepsTheColumnsItHasAndFollowsTheFilter)
{
    m_filter.Init(WriteFile("cols.csv", Rows(5, 3)).c_str());
    m_list.Update();
    int order[3] = {2, 0, 1};  // the user dragged the columns
    m_list.SetColumnOrderArray(3, order);

    m_filter.SetFirstRowHasNames(true);
    m_filter.Init(WriteFile("cols.csv", "A;B;C;D\r\n" + Rows(5, 4)).c_str());
    m_list.Update();
    ASSERT_EQ(4, HeaderCount());
    int now[4] = {};
    m_list.GetColumnOrderArray(now, 4);
    EXPECT_EQ(2, now[0]);
    EXPECT_EQ(0, now[1]);
    EXPECT_EQ(1, now[2]);
    EXPECT_EQ(3, now[3]);
    EXPECT_EQ("A", Title(0));
    EXPECT_EQ("D", Title(3));

    m_filter.Init(WriteFile("cols.csv", "A;B\r\n" + Rows(5, 2)).c_str());
    m_list.Update();
    EXPECT_EQ(2, HeaderCount());
    EXPECT_EQ("B", Title(1));
}

TEST_F(PreviewTest, TheCaptionRowShowsItsTextsInItsColoursOnTheButtonFace)
{
    const COLORREF kCaption = RGB(200, 0, 0);
    m_filter.Init(WriteFile("caption.csv", Rows(10, 3)).c_str());
    m_list.SetSpecialFirstRow(true, kCaption, RGB(255, 255, 0));
    m_list.Update();
    m_list.SetSpecialText(0, "Kopf");
    m_list.SetSpecialText(3, "zu weit");  // one beyond the columns: ignored
    m_list.SetSpecialText(-1, "davor");
    EXPECT_EQ("Kopf", Cell(0, 0));
    EXPECT_EQ("", Cell(0, 2));
    EXPECT_EQ("r0c0", Cell(1, 0));

    qotest::BringToFront(m_pFrame->m_hWnd);
    m_list.Invalidate();
    m_list.UpdateWindow();
    qotest::Image img;
    ASSERT_TRUE(qotest::CaptureImage(m_list.m_hWnd, img, true));
    CRect caption, data;
    m_list.GetItemRect(0, &caption, LVIR_BOUNDS);
    m_list.GetItemRect(1, &data, LVIR_BOUNDS);
    const int cellRight = m_list.GetColumnWidth(0) - 10;
    EXPECT_EQ(::GetSysColor(COLOR_BTNFACE), img.Pixel(cellRight, caption.top + 1));
    EXPECT_EQ(m_list.GetBkColor(), img.Pixel(cellRight, data.top + 1));
    bool red = false, black = false;
    for (int x = 0; x < cellRight; ++x)
        for (int y = caption.top; y < data.bottom; ++y) {
            red |= y < caption.bottom && img.Pixel(x, y) == kCaption;
            black |= y >= data.top && img.Pixel(x, y) == RGB(0, 0, 0);
        }
    EXPECT_TRUE(red) << "caption text in its colour";
    EXPECT_TRUE(black) << "data text in black";
}

TEST(InputFilterConfigTest, PicksThePageByTheFiltersType)
{
    CQoInputFilterTextVar textVar;
    CInputFilterConfig* page = CInputFilterConfig::GetAppropriateConfig(&textVar, 12);
    ASSERT_NE(nullptr, page);
    EXPECT_TRUE(page->IsKindOf(RUNTIME_CLASS(CInputFilterConfigTextVar)));
    EXPECT_EQ(&textVar, page->GetInputFilter());
    delete page;

    EXPECT_EQ(nullptr, CInputFilterConfig::GetAppropriateConfig(nullptr, 12));
    // Types whose pages do not exist here, unknown types, and a filter that
    // claims to be delimited text without being one.
    for (int type : {0, 1, 2, 3, 4, 5, 6, 7, 8, -1}) {
        CTypedFilter other(type);
        EXPECT_EQ(nullptr, CInputFilterConfig::GetAppropriateConfig(&other, 12)) << type;
    }
}

// ---------------------------------------------------------------------------
// The delimited text page

const int kPageId = 77;

class TextVarPageTest : public FrameTest {
protected:
    void SetUp() override
    {
        FrameTest::SetUp();
        AfxGetApp()->m_pMainWnd = m_pFrame;
        m_strFile = WriteFile("page.csv", "Name\tOrt\tPLZ\r\n" "Meier\tKöln\t50667\r\n" "Huber\tMünchen\t80331\r\n"
                                          "Schulz\tHamburg\t20095\r\n");
    }
    void TearDown() override
    {
        if (m_pPage != nullptr) {
            m_pPage->RemoveModifiedListener(&m_listener);
            m_pPage->DestroyWindow();
            delete m_pPage;
        }
        AfxGetApp()->m_pMainWnd = NULL;
        FrameTest::TearDown();
    }
    void Open()
    {
        m_pPage = new CInputFilterConfigTextVar(&m_filter, kPageId);
        m_pPage->AddModifiedListener(&m_listener);
        ASSERT_TRUE(m_pPage->Create(m_pFrame));
        EXPECT_FALSE(m_pPage->IsWindowVisible());
        m_pPage->SetWindowPos(NULL, 0, 0, 0, 0, SWP_NOSIZE | SWP_NOZORDER);
        m_pPage->ShowWindow(SW_SHOW);
        qotest::BringToFront(m_pFrame->m_hWnd);
    }
    qotest::Dialog Page() { return qotest::Dialog(m_pPage->m_hWnd); }
    CString Cell(int item, int col)
    {
        CString text;
        DWORD clr, clrSel;
        bool bold;
        m_pPage->m_preview.GetColoredItem(item, col, text, clr, clrSel, bold);
        return text;
    }
    // A real key, read by the host's loop (the helpers' own pumping would give the
    // page no PreTranslateMessage).
    void Key(WORD vk)
    {
        qotest::InjectKey(vk, true);
        qotest::InjectKey(vk, false);
        PumpApp(250);
    }
    void Press(int id)
    {
        Page().Press(id);
        PumpApp(100);
    }
    // The filter's settings in one line, to see that nothing changed.
    std::string State()
    {
        return std::to_string(static_cast<int>(m_filter.Delimiter())) + "/" +
               std::to_string(static_cast<int>(m_filter.Encloser())) + "/" + std::to_string(m_filter.Skip()) +
               "/" + std::to_string(m_filter.GetFirstRowHasNames()) + "/" + std::to_string(m_filter.CharSet());
    }

    CProbeFilter m_filter;
    CRecordingListener m_listener;
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
    m_filter.Init(WriteFile("adressen.txt", "Adressen, Stand Mai\r\nName\tOrt\tPLZ\tStra\xDF" "e\r\n"
                                            "Meier\tK\xF6ln\t50667\tHohe Stra\xDF" "e 12\r\n"
                                            "Huber\tM\xFCnchen\t80331\tMarienplatz 1\r\n"
                                            "Schulz\tHamburg\t20095\tJungfernstieg 7\r\n")
                      .c_str());
    Open();
    qotest::Dialog page = Page();
    EXPECT_EQ("[TAB]", page.Text(IDC_TEXTVAR_DELIMITER));
    EXPECT_EQ("", page.Text(IDC_TEXTVAR_ENCLOSER));
    EXPECT_EQ("\\", page.Text(IDC_TEXTVAR_ESCAPE));
    EXPECT_EQ("1", page.Text(IDC_TEXTVAR_SKIP));
    EXPECT_EQ(2, page.Selection(IDC_TEXTVAR_CHARSET));
    EXPECT_EQ((std::vector<std::string>{"Windows Ansi", "DOS Ascii", "Ansi/Ascii"}),
              page.ComboItems(IDC_TEXTVAR_CHARSET));
    EXPECT_EQ((std::vector<std::string>{"[TAB]", ";", ",", "~", "|"}), page.ComboItems(IDC_TEXTVAR_DELIMITER));
    EXPECT_TRUE(page.IsChecked(IDC_TEXTVAR_FIRST_NAMES));
    EXPECT_FALSE(page.IsVisible(IDOK));
    EXPECT_FALSE(page.IsVisible(IDCANCEL));
    EXPECT_EQ(3, m_pPage->m_preview.GetItemCount());
    EXPECT_EQ("Meier", Cell(0, 0));
    EXPECT_EQ("K\xF6ln", Cell(0, 1));
    EXPECT_EQ("80331", Cell(1, 2));

    qotest::CaptureWindow(m_pPage->m_hWnd, qotest::CapturePath("input-textvar-4007.png").c_str());

    m_pPage->Enable(FALSE);
    for (int id : {IDC_TEXTVAR_DELIMITER, IDC_TEXTVAR_SKIP, IDC_TEXTVAR_APPLY, IDC_TEXTVAR_PREVIEW,
                   IDC_TEXTVAR_FIRST_NAMES, IDC_TEXTVAR_LBL_CHARSET})
        EXPECT_FALSE(page.IsEnabled(id)) << id;
    m_pPage->Enable(TRUE);
    EXPECT_TRUE(page.IsEnabled(IDC_TEXTVAR_CHARSET));
}

TEST_F(TextVarPageTest, AppliesWhatTheUserSetAndTellsTheListenersOnce)
{
    m_filter.Init(m_strFile.c_str());  // ';', which does not split these lines
    Open();
    qotest::Dialog page = Page();
    ASSERT_EQ(1, m_pPage->m_preview.GetHeaderCtrl()->GetItemCount());

    // Picking "[TAB]" and applying: the record boundaries move, the count is dropped.
    page.SelectText(IDC_TEXTVAR_DELIMITER, "[TAB]");
    page.SetText(IDC_TEXTVAR_ENCLOSER, "");
    Press(IDC_TEXTVAR_APPLY);
    EXPECT_EQ('\t', m_filter.Delimiter());
    EXPECT_EQ(0, m_filter.Encloser());
    EXPECT_FALSE(m_filter.m_bCountKnownAtInit);
    EXPECT_EQ(3, m_pPage->m_preview.GetHeaderCtrl()->GetItemCount());
    EXPECT_EQ("Ort", Cell(0, 1));
    EXPECT_EQ(std::vector<int>{kPageId}, m_listener.m_ids);

    // Only the skip, by Enter: the known count stays.
    qotest::Focus(page.Item(IDC_TEXTVAR_SKIP));
    page.SetText(IDC_TEXTVAR_SKIP, "1");
    Key(VK_RETURN);
    EXPECT_EQ(1, m_filter.Skip());
    EXPECT_TRUE(m_filter.m_bCountKnownAtInit);
    EXPECT_EQ("Meier", Cell(0, 0));
    EXPECT_EQ(2u, m_listener.m_ids.size());

    // Escape changes nothing and the page stays.
    page.SelectText(IDC_TEXTVAR_DELIMITER, ";");
    Key(VK_ESCAPE);
    EXPECT_TRUE(m_pPage->IsWindowVisible());
    EXPECT_EQ('\t', m_filter.Delimiter());
    EXPECT_EQ(2u, m_listener.m_ids.size());

    // Ticking the first-line box applies the pending edits with it; the names
    // are read under the new settings.
    page.SelectText(IDC_TEXTVAR_DELIMITER, "[TAB]");
    page.SetText(IDC_TEXTVAR_SKIP, "-3");  // becomes 0, and is shown so
    page.Select(IDC_TEXTVAR_CHARSET, 2);
    page.Check(IDC_TEXTVAR_FIRST_NAMES, true);
    PumpApp(100);
    EXPECT_TRUE(m_filter.GetFirstRowHasNames());
    EXPECT_EQ(0, m_filter.Skip());
    EXPECT_EQ("0", page.Text(IDC_TEXTVAR_SKIP));
    EXPECT_EQ(CQoFile::ansimix, m_filter.CharSet());
    EXPECT_EQ(3, m_pPage->m_preview.GetItemCount());
    EXPECT_EQ("Meier", Cell(0, 0));
    EXPECT_EQ("Ort", ColumnTitle(m_pPage->m_preview, 1));
    EXPECT_EQ(3u, m_listener.m_ids.size());
}

TEST_F(TextVarPageTest, RefusesBadSettingsWithAMessageAndLeavesTheFilterAsItWas)
{
    const std::string binary = WriteFile("bild.png", std::string("\x89PNG\r\n\x1a\n\0\0\0\rIHDR\0\0\0\x10", 20));
    const std::string open = WriteFile("offen.csv", "a;b\r\nc;'d\r\n");
    struct Case {
        const char* what;
        std::string file;  // "" : the page's file
        int control;
        const char* typed;
        std::string message;  // the start of the message shown
        int opens;            // times the filter was opened: only to put it back
    } cases[] = {
        {"empty delimiter", "", IDC_TEXTVAR_DELIMITER, "", "Bitte geben Sie ein Trennzeichen an", 0},
        {"skip not a number", "", IDC_TEXTVAR_SKIP, "zwei", "Geben Sie eine ganze Zahl ein.", 0},
        {"file vanished", TempFolder() + "\\weg.csv", IDC_TEXTVAR_SKIP, "1",
         "Die Datei '" + TempFolder() + "\\weg.csv' konnte nicht ge\xF6""ffnet werden.", 0},
        {"not text", binary, IDC_TEXTVAR_SKIP, "1", "Die Datei '" + binary + "' ist keine Textdatei.", 0},
        {"filter cannot read it", open, IDC_TEXTVAR_ENCLOSER, "'", "", 2},
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
        const int opens = m_filter.m_nInits;
        std::string shown;
        m_driver.Expect([&](qotest::Dialog& box) {
            shown = box.MessageText();
            box.Press(IDOK);
        });
        Page().SetText(c.control, c.typed);
        Press(IDC_TEXTVAR_APPLY);
        EXPECT_TRUE(qotest::WaitFor([&] { return m_driver.Done(); }, 2000));
        EXPECT_EQ(0u, shown.find(c.message)) << shown;
        EXPECT_FALSE(shown.empty());
        EXPECT_EQ(before, State()) << "the settings are the filter's as before";
        EXPECT_EQ(c.opens, m_filter.m_nInits - opens);
        EXPECT_TRUE(m_listener.m_ids.empty());
        EXPECT_EQ(c.typed, Page().Text(c.control)) << "the page keeps what the user typed";
        m_pPage->RemoveModifiedListener(&m_listener);
        m_pPage->DestroyWindow();
        delete m_pPage;
        m_pPage = nullptr;
    }
    // After the refused encloser the filter reads its file as before.
    EXPECT_EQ(0, m_filter.Encloser());
    EXPECT_EQ(2, m_filter.NumRows());
}

TEST_F(TextVarPageTest, InfoExplainsTheFields)
{
    m_filter.Init(m_strFile.c_str());
    Open();
    // The button is hidden in the template; a host that wants it shows it.
    m_pPage->GetDlgItem(IDC_TEXTVAR_INFO)->ShowWindow(SW_SHOW);
    m_pPage->Enable(TRUE);
    std::string text;
    m_driver.Expect([&](qotest::Dialog& box) {
        text = box.Text(IDC_INFO_TEXT);
        box.Press(IDOK);
    });
    Press(IDC_TEXTVAR_INFO);
    EXPECT_TRUE(qotest::WaitFor([&] { return m_driver.Done(); }, 3000));
    EXPECT_EQ(0u, text.find("Das Trennzeichen ist das Zeichen")) << text;
    EXPECT_NE(std::string::npos, text.find("backslash \\ verwendet.\r\n\r\nIm Feld überlesen"));
    EXPECT_NE(std::string::npos, text.find("(dort werden maximal 50 Sätze angezeigt)."));
}

}  // namespace
