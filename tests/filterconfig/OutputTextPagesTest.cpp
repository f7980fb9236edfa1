// The fixed-length and delimited text output pages on real windows: real
// output filters over an output source that reads a real delimited file, a
// user who clicks rows, types lengths and presses the page's buttons, Enter
// and Escape, message boxes answered as a user would, and the list's colours
// sampled from what the screen shows.
#include <gtest/gtest.h>

#include <afxcmn.h>

#include <COutputFilterConfigTextFix.h>
#include <COutputFilterConfigTextVar.h>
#include <COutputFilterSource.h>
#include <CQoFile.h>
#include <CQoInputFilterTextVar.h>
#include <CQoOutputFilterTextFix.h>
#include <CQoOutputFilterTextVar.h>

#include <cstdio>
#include <fstream>
#include <string>

#include "Capture.h"
#include "DialogDriver.h"
#include "Input.h"
#include "resource.h"

namespace {

// The rows of a delimited input file as the host's output source, as an
// application of the family maps its input.
class FileSource : public COutputFilterSource
{
public:
    explicit FileSource(CQoInputFilterTextVar& in) : m_in(in) {}

    void GetSourceValue(long row, int column, CString& value) override
    {
        CQoString text;
        if (m_in.AbsoluteRow(row))
            m_in.Value(column, text);
        value = text.GetString();
    }
    void GetSourceName(int column, CString& name, int) override
    {
        CQoString text;
        m_in.ColName(column, text);
        name = text.GetString();
    }
    int NumSourceColumns() override { return m_in.NumCols(); }
    long NumSourceRows() override { return m_in.NumRows(); }

private:
    CQoInputFilterTextVar& m_in;
};

// The application's loop in small: PreTranslateMessage first, so that Enter
// and Escape reach the page as dialog keys.
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
        if (elapsed >= ms)
            return;
        MsgWaitForMultipleObjects(0, NULL, FALSE, ms - elapsed, QS_ALLINPUT);
    }
}

void PressKey(WORD vk)
{
    qotest::InjectKey(vk, true);
    qotest::InjectKey(vk, false);
    PumpApp(250);
}

std::string Text(HWND hwnd)
{
    std::string text(::GetWindowTextLengthA(hwnd) + 1, '\0');
    text.resize(::GetWindowTextA(hwnd, &text[0], static_cast<int>(text.size())));
    return text;
}

int Lines(const std::string& text)
{
    int n = 0;
    for (size_t at = text.find("\r\n"); at != std::string::npos; at = text.find("\r\n", at + 2))
        ++n;
    return n;
}

class OutputTextPagesTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        char folder[MAX_PATH];
        GetTempPathA(MAX_PATH, folder);
        char path[MAX_PATH];
        GetTempFileNameA(folder, "out", 0, path);
        m_path = path;

        m_pFrame = new CFrameWnd;
        ASSERT_TRUE(m_pFrame->CreateEx(0, AfxRegisterWndClass(0, ::LoadCursor(NULL, IDC_ARROW),
                                                              (HBRUSH)(COLOR_BTNFACE + 1)),
                                       "Ausgabe", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 20, 20, 720, 460, NULL, NULL));
        AfxGetApp()->m_pMainWnd = m_pFrame;
    }

    void TearDown() override
    {
        DestroyPage();
        AfxGetApp()->m_pMainWnd = NULL;
        if (::IsWindow(m_pFrame->m_hWnd))
            m_pFrame->DestroyWindow();  // deletes it
        qotest::PumpFor(50);
        DeleteFileA(m_path.c_str());
    }

    // The input file the source reads; the source takes its columns anew.
    void Input(const std::string& content)
    {
        std::ofstream(m_path, std::ios::binary) << content;
        m_in.Delimiter(';');
        m_in.SetFirstRowHasNames(true);
        m_in.Init(m_path.c_str());
        m_source.InitArray();
    }

    // The host's steps: filter and source, window, settings, columns; then shown.
    void Show(COutputFilterConfig* page, CQoOutputFilter* filter)
    {
        m_pPage = page;
        page->SetSourceAndFilter(&m_source, filter);
        ASSERT_TRUE(page->Create(m_pFrame));
        ASSERT_FALSE(page->IsWindowVisible());
        page->UpdateOutputFilter(0);
        page->RefreshDisplay();
        page->SetWindowPos(NULL, 8, 8, 0, 0, SWP_NOSIZE | SWP_NOZORDER);
        page->ShowWindow(SW_SHOW);
        qotest::BringToFront(m_pFrame->m_hWnd);
    }

    void DestroyPage()
    {
        if (m_pPage != NULL) {
            if (::IsWindow(m_pPage->m_hWnd))
                m_pPage->DestroyWindow();
            delete m_pPage;
            m_pPage = NULL;
        }
    }

    HWND Item(int id) const { return ::GetDlgItem(m_pPage->m_hWnd, id); }

    void ClickButton(int id)
    {
        RECT rc;
        ::GetClientRect(Item(id), &rc);
        qotest::Click(Item(id), rc.right / 2, rc.bottom / 2);
        PumpApp(100);
    }

    // Types into an edit over what it holds, as a user who selected it all.
    void TypeInto(int id, const std::string& text)
    {
        qotest::Focus(Item(id));
        ::SendMessageA(Item(id), EM_SETSEL, 0, -1);
        qotest::TypeText(text);
    }

    std::string m_path;
    CQoInputFilterTextVar m_in;
    FileSource m_source{m_in};
    CFrameWnd* m_pFrame = nullptr;
    COutputFilterConfig* m_pPage = nullptr;
};

// ---------------------------------------------------------------------------
// Fixed-length output

class FixedPageTest : public OutputTextPagesTest {
protected:
    COutputFilterConfigTextFix* Page() { return static_cast<COutputFilterConfigTextFix*>(m_pPage); }
    void Show() { OutputTextPagesTest::Show(new COutputFilterConfigTextFix(7, m_pFrame), &m_filter); }

    // "a,b,c" of the page's offsets or lengths.
    std::string Join(int COutputFilterConfigTextFix::SCol::*field)
    {
        std::string out;
        COutputFilterConfigTextFix::SCol col;
        for (int i = 0; Page()->GetColumn(i, col); ++i)
            out += (i ? "," : "") + std::to_string(col.*field);
        return out;
    }
    std::string Offsets() { return Join(&COutputFilterConfigTextFix::SCol::nOffset); }
    std::string Lengths() { return Join(&COutputFilterConfigTextFix::SCol::nLength); }
    // "name=length,..." of the filter.
    std::string FilterColumns()
    {
        std::string out;
        for (int i = 0; i < m_filter.NumCols(); ++i) {
            CQoString name;
            m_filter.GetColumnName(i, name);
            out += (i ? "," : "") + std::string(name.GetString()) + "=" + std::to_string(m_filter.GetLength(i));
        }
        return out;
    }

    HWND List() const { return Item(IDC_OUTFIX_LIST); }
    CRect Cell(int row, int col) const
    {
        CRect rc, head;
        ListView_GetItemRect(List(), row, &rc, LVIR_BOUNDS);
        Header_GetItemRect(ListView_GetHeader(List()), col, &head);
        return CRect(head.left + 1, rc.top, head.right - 1, rc.bottom);
    }
    void ClickRow(int row)
    {
        const CRect cell = Cell(row, 0);
        qotest::Click(List(), cell.left + 10, cell.CenterPoint().y);
        PumpApp(100);
    }

    CQoOutputFilterTextFix m_filter;
};

TEST_F(FixedPageTest, ColumnsKeepTheirLengthsByNameAndTheUserSetsTheSelectedOne)
{
    Input("Name;Ort\r\nM\xFCller;K\xF6ln\r\n");
    m_filter.NumCols(2);
    m_filter.ColumnName(0, "Name");
    m_filter.ColumnName(1, "Ort");
    m_filter.SetLength(0, 10);
    m_filter.SetLength(1, 20);
    Show();
    EXPECT_EQ("0,10", Offsets());
    EXPECT_EQ("30", Text(Item(IDC_OUTFIX_RECLEN)));
    EXPECT_FALSE(::IsWindowEnabled(Item(IDC_OUTFIX_FIELDLEN))) << "no row selected";

    // A new source column gets the default length, the others keep theirs.
    Input("Name;Ort;PLZ\r\nM\xFCller;K\xF6ln;50667\r\n");
    Page()->RefreshDisplay();
    EXPECT_EQ("10,20,30", Lengths());
    EXPECT_EQ("0,10,30", Offsets());
    EXPECT_EQ("60", Text(Item(IDC_OUTFIX_RECLEN)));
    EXPECT_EQ(3, ListView_GetItemCount(List()));

    ClickRow(1);
    ASSERT_TRUE(::IsWindowEnabled(Item(IDC_OUTFIX_FIELDLEN)));
    EXPECT_EQ("20", Text(Item(IDC_OUTFIX_FIELDLEN)));
    TypeInto(IDC_OUTFIX_FIELDLEN, "25");
    ClickButton(IDC_OUTFIX_APPLY);
    EXPECT_EQ("0,10,35", Offsets());
    EXPECT_EQ("65", Text(Item(IDC_OUTFIX_RECLEN)));
    EXPECT_EQ("Name=10,Ort=25,PLZ=30", FilterColumns());

    // Enter applies as well, and Escape leaves the page where it is.
    ClickRow(0);
    TypeInto(IDC_OUTFIX_FIELDLEN, "12");
    ::SendMessageA(Item(IDC_OUTFIX_CRLF), BM_CLICK, 0, 0);
    PressKey(VK_RETURN);
    EXPECT_EQ("Name=12,Ort=25,PLZ=30", FilterColumns());
    EXPECT_FALSE(m_filter.GetCrLf());
    EXPECT_EQ("67", Text(Item(IDC_OUTFIX_RECLEN)));
    PressKey(VK_ESCAPE);
    EXPECT_TRUE(::IsWindow(m_pPage->m_hWnd));
    EXPECT_TRUE(m_pPage->IsWindowVisible());

    // A renamed column starts again at the default; with no row selected an
    // apply writes every length as the page holds it.
    Input("Name;Wohnort;PLZ\r\nM\xFCller;K\xF6ln;50667\r\n");
    Page()->RefreshDisplay();
    EXPECT_EQ("12,30,30", Lengths());
    EXPECT_FALSE(::IsWindowEnabled(Item(IDC_OUTFIX_FIELDLEN)));
    ClickButton(IDC_OUTFIX_APPLY);
    EXPECT_EQ("Name=12,Wohnort=30,PLZ=30", FilterColumns());
}

TEST_F(FixedPageTest, LengthsTheFilterCannotWriteAreRefusedWithAMessage)
{
    Input("Name;Ort;PLZ\r\nM\xFCller;K\xF6ln;50667\r\n");
    Show();
    ASSERT_EQ("30,30,30", Lengths());
    ClickRow(1);
    // What the other two columns leave of the record limit.
    const std::string room = std::to_string(16777216 - 60);
    const std::string range = "Geben Sie eine ganze Zahl zwischen 1 und " + room + " ein.";
    struct Case {
        const char* typed;
        std::string message;
    } cases[] = {
        {"0", range},
        {"-5", range},
        {"16777157", range},
        {"zehn", "Geben Sie eine ganze Zahl ein."},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.typed);
        qotest::DialogDriver driver;
        driver.Expect([&](qotest::Dialog& box) {
            EXPECT_EQ(c.message, box.MessageText());
            box.Press(IDOK);
        });
        TypeInto(IDC_OUTFIX_FIELDLEN, c.typed);
        ClickButton(IDC_OUTFIX_APPLY);
        EXPECT_TRUE(qotest::WaitFor([&] { return driver.Done(); }, 3000));
        PumpApp(200);
        EXPECT_EQ(1, driver.Seen()) << "one message per refusal";
        EXPECT_EQ("30,30,30", Lengths());
        EXPECT_EQ(0, m_filter.NumCols()) << "nothing reached the filter";
        EXPECT_EQ(Item(IDC_OUTFIX_FIELDLEN), ::GetFocus()) << "the user corrects the length";
    }

    // The longest length that still fits.
    TypeInto(IDC_OUTFIX_FIELDLEN, room);
    ClickButton(IDC_OUTFIX_APPLY);
    EXPECT_EQ("16777216", Text(Item(IDC_OUTFIX_RECLEN)));
    EXPECT_EQ("Name=30,Ort=" + room + ",PLZ=30", FilterColumns());
}

TEST_F(FixedPageTest, CellsShowTheirColoursAndRowsThePageNoLongerHasStayEmpty)
{
    Input("Name;Ort;PLZ\r\nM\xFCller;K\xF6ln;50667\r\n");
    m_filter.NumCols(3);
    const char* names[] = {"Name", "Ort", "PLZ"};
    for (int i = 0; i < 3; ++i) {
        m_filter.ColumnName(i, names[i]);
        m_filter.SetLength(i, 25 - 10 * i);
    }
    Show();
    ASSERT_EQ("0,25,40", Offsets());
    ClickRow(1);
    qotest::CaptureWindow(m_pPage->m_hWnd, qotest::CapturePath("output-textfix-4024.png").c_str());
    qotest::Image img;
    ASSERT_TRUE(qotest::CaptureImage(List(), img, true));

    // Inside the cell, clear of the focus rectangle around the row.
    auto contains = [&img](const CRect& rc, COLORREF colour) {
        for (int y = rc.top + 2; y < rc.bottom - 2; ++y)
            for (int x = rc.left + 2; x < rc.right - 2; ++x)
                if (img.Pixel(x, y) == colour)
                    return true;
        return false;
    };
    const COLORREF black = RGB(0, 0, 0), white = RGB(255, 255, 255), grey = RGB(0x7F, 0x7F, 0x7F);
    struct Case {
        const char* what;
        int row, col;
        COLORREF ink, absent;
    } cases[] = {
        {"name", 0, 0, black, grey},         {"offset", 0, 1, grey, black},
        {"length", 0, 2, black, grey},       {"selected name", 1, 0, white, black},
        {"selected offset", 1, 1, grey, white}, {"selected length", 1, 2, white, black},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        EXPECT_TRUE(contains(Cell(c.row, c.col), c.ink));
        EXPECT_FALSE(contains(Cell(c.row, c.col), c.absent));
    }
    EXPECT_EQ(::GetSysColor(COLOR_HIGHLIGHT), img.Pixel(Cell(1, 1).left + 2, Cell(1, 1).top + 1));

    // Switched off, nothing of the page can be used; on again, the length
    // edit follows the selection.
    Page()->Enable(false);
    for (int id : {IDC_OUTFIX_LIST, IDC_OUTFIX_FIELDLEN, IDC_OUTFIX_APPLY, IDC_OUTFIX_CRLF, IDC_OUTFIX_CHARSET})
        EXPECT_FALSE(::IsWindowEnabled(Item(id))) << id;
    Page()->Enable(true);
    EXPECT_TRUE(::IsWindowEnabled(Item(IDC_OUTFIX_FIELDLEN)));

    // The host loads a filter of one column and has not refreshed yet: the
    // list still has three rows, of which the page knows one.
    m_filter.NumCols(1);
    Page()->UpdateOutputFilter(0);
    ::RedrawWindow(List(), NULL, NULL, RDW_INVALIDATE | RDW_ERASE | RDW_UPDATENOW);
    PumpApp(100);
    ASSERT_TRUE(qotest::CaptureImage(List(), img, true));
    const COLORREF window = ListView_GetBkColor(List());
    EXPECT_TRUE(contains(Cell(0, 0), black));
    for (int col = 0; col < 3; ++col) {
        const CRect cell = Cell(2, col);
        for (int y = cell.top; y < cell.bottom; ++y)
            for (int x = cell.left; x < cell.right; ++x)
                ASSERT_EQ(window, img.Pixel(x, y)) << "row 2 is empty; column " << col;
    }
}

// ---------------------------------------------------------------------------
// Delimited output

class DelimitedPageTest : public OutputTextPagesTest {
protected:
    COutputFilterConfigTextVar* Page() { return static_cast<COutputFilterConfigTextVar*>(m_pPage); }
    void Show() { OutputTextPagesTest::Show(new COutputFilterConfigTextVar(8, m_pFrame), &m_filter); }

    // A customer file of `rows` rows; row 1 holds the output's delimiter.
    void Customers(int rows)
    {
        std::string content = "Name;Ort\r\n";
        for (int i = 0; i < rows; ++i)
            content += (i == 1 ? std::string("\"Wei\xDF, S\xF6hne\"") : "Kunde " + std::to_string(i)) + ";Ort " +
                       std::to_string(i) + "\r\n";
        Input(content);
    }

    std::string Preview() { return Text(Item(IDC_OUTVAR_PREVIEW)); }

    CQoOutputFilterTextVar m_filter;
};

TEST_F(DelimitedPageTest, ThePreviewShowsTheFirstRowsAsTheFilterWritesThem)
{
    Customers(120);
    m_filter.Delimiter(',');
    Show();
    // Opening the page wrote its settings into the filter; "no escape" stayed none.
    EXPECT_EQ(0, m_filter.Escape());
    EXPECT_EQ("", Text(Item(IDC_OUTVAR_ESCAPE)));
    EXPECT_EQ(",", Text(Item(IDC_OUTVAR_DELIMITER)));
    EXPECT_EQ(2, m_filter.NumCols());
    EXPECT_EQ(50, Lines(Preview()));
    EXPECT_EQ(0u, Preview().find("Kunde 0,Ort 0\r\n\"Wei\xDF, S\xF6hne\",Ort 1\r\n"));

    qotest::Dialog page(m_pPage->m_hWnd);
    page.SelectText(IDC_OUTVAR_DELIMITER, "[TAB]");
    page.Check(IDC_OUTVAR_ALWAYS_ENCLOSE);
    page.Check(IDC_OUTVAR_NAMES_FIRST);
    ClickButton(IDC_OUTVAR_REFRESH);
    EXPECT_EQ('\t', m_filter.Delimiter());
    EXPECT_TRUE(m_filter.ForceEncloser());
    EXPECT_TRUE(m_filter.WriteHeaderFlag());
    EXPECT_EQ(51, Lines(Preview())) << "the header and 50 rows";
    EXPECT_EQ(0u, Preview().find("\"Name\"\t\"Ort\"\r\n\"Kunde 0\"\t\"Ort 0\"\r\n\"Wei\xDF, S\xF6hne\"\t\"Ort 1\"\r\n"));
    EXPECT_EQ(std::string(Page()->GetPreview()), Preview());
    qotest::CaptureWindow(m_pPage->m_hWnd, qotest::CapturePath("output-textvar-4023.png").c_str());

    // A tab in the filter comes back as "[TAB]".
    page.SelectText(IDC_OUTVAR_DELIMITER, ";");
    Page()->UpdateOutputFilter(0);
    EXPECT_EQ("[TAB]", Text(Item(IDC_OUTVAR_DELIMITER)));

    // A typed delimiter and Enter; Escape leaves the page open.
    page.Check(IDC_OUTVAR_NAMES_FIRST, false);
    page.Check(IDC_OUTVAR_ALWAYS_ENCLOSE, false);
    TypeInto(IDC_OUTVAR_DELIMITER, "|");
    PressKey(VK_RETURN);
    EXPECT_EQ('|', m_filter.Delimiter());
    EXPECT_EQ(0u, Preview().find("Kunde 0|Ort 0\r\nWei\xDF, S\xF6hne|Ort 1\r\n"));
    PressKey(VK_ESCAPE);
    EXPECT_TRUE(m_pPage->IsWindowVisible());

    // Settings that make no readable file say so instead of showing rows.
    page.SetText(IDC_OUTVAR_DELIMITER, "\"");
    ClickButton(IDC_OUTVAR_REFRESH);
    EXPECT_EQ("Trennzeichen und Begrenzer d\xFCrfen nicht gleich sein", Preview());
}

TEST_F(DelimitedPageTest, TheDosHintIsShownOncePerPage)
{
    Customers(3);
    qotest::DialogDriver driver;
    auto hint = [](qotest::Dialog& box) {
        EXPECT_EQ(0u, box.MessageText().find("Hinweis: Das Vorschaufenster verwendet den Windows-Ansi"));
        box.Press(IDOK);
    };
    Show();
    qotest::Dialog page(m_pPage->m_hWnd);
    driver.Expect(hint);
    page.Select(IDC_OUTVAR_CHARSET, 1);
    ClickButton(IDC_OUTVAR_REFRESH);
    EXPECT_TRUE(qotest::WaitFor([&] { return driver.Done(); }, 3000));
    ClickButton(IDC_OUTVAR_REFRESH);
    Page()->RefreshDisplay();
    PumpApp(300);
    EXPECT_EQ(1, driver.Seen());
    EXPECT_EQ(CQoFile::ascii, m_filter.FileCharSet()) << "the setting stays";
    EXPECT_EQ(3, Lines(Preview()));

    // A new page over the same filter opens with DOS Ascii and tells it again.
    DestroyPage();
    driver.Expect(hint);
    Show();
    EXPECT_TRUE(qotest::WaitFor([&] { return driver.Done(); }, 3000));
    EXPECT_EQ(2, driver.Seen());
    EXPECT_EQ(1, qotest::Dialog(m_pPage->m_hWnd).Selection(IDC_OUTVAR_CHARSET));
}

}  // namespace
