// The fixed-length and delimited text output pages on real windows.
#include <gtest/gtest.h>

#include <afxcmn.h>

#include <COutputFilterConfigTextFix.h>
#include <COutputFilterConfigTextVar.h>
#include <CQoFile.h>
#include <CQoOutputFilterTextFix.h>
#include <CQoOutputFilterTextVar.h>

#include <algorithm>
#include <string>
#include <vector>

#include "FileSource.h"
#include "MfcTestHost.h"
#include "resource.h"

namespace {

using qotest::PumpApp;

using OutputTextPagesTest = qotest::OutputPageTest;

class FixedPageTest : public OutputTextPagesTest {
protected:
    COutputFilterConfigTextFix* Page() { return static_cast<COutputFilterConfigTextFix*>(m_pPage); }
    void Show() { OutputTextPagesTest::Show(new COutputFilterConfigTextFix(7, m_pFrame), &m_filter); }

    std::string Columns()
    {
        std::string out;
        COutputFilterConfigTextFix::SCol col;
        for (int i = 0; Page()->GetColumn(i, col); ++i)
            out += (i ? "," : "") + std::to_string(col.nOffset) + "+" + std::to_string(col.nLength);
        return out;
    }
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
    void SetFilterColumns(const std::vector<std::pair<const char*, int>>& columns)
    {
        m_filter.NumCols(static_cast<int>(columns.size()));
        for (size_t i = 0; i < columns.size(); ++i) {
            m_filter.ColumnName(static_cast<int>(i), columns[i].first);
            m_filter.SetLength(static_cast<int>(i), columns[i].second);
        }
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
    SetFilterColumns({{"Name", 10}, {"Ort", 20}});
    Show();
    EXPECT_EQ("0+10,10+20", Columns());
    EXPECT_EQ("30", Text(IDC_OUTFIX_RECLEN));

    // A new source column gets the default length, the others keep theirs.
    Input("Name;Ort;PLZ\r\nM\xFCller;K\xF6ln;50667\r\n");
    Page()->RefreshDisplay();
    EXPECT_EQ("0+10,10+20,30+30", Columns());
    EXPECT_EQ("60", Text(IDC_OUTFIX_RECLEN));

    ClickRow(1);
    EXPECT_EQ("20", Text(IDC_OUTFIX_FIELDLEN));
    TypeInto(IDC_OUTFIX_FIELDLEN, "25");
    ::SendMessageA(Item(IDC_OUTFIX_CRLF), BM_CLICK, 0, 0);
    ClickButton(IDC_OUTFIX_APPLY);
    EXPECT_EQ("0+10,10+25,35+30", Columns());
    EXPECT_EQ("65", Text(IDC_OUTFIX_RECLEN));
    EXPECT_EQ("Name=10,Ort=25,PLZ=30", FilterColumns());
    EXPECT_FALSE(m_filter.GetCrLf());

    // A renamed column starts again at the default; with no row selected an
    // apply writes every length as the page holds it.
    Input("Name;Wohnort;PLZ\r\nM\xFCller;K\xF6ln;50667\r\n");
    Page()->RefreshDisplay();
    EXPECT_FALSE(::IsWindowEnabled(Item(IDC_OUTFIX_FIELDLEN)));
    ClickButton(IDC_OUTFIX_APPLY);
    EXPECT_EQ("Name=10,Wohnort=30,PLZ=30", FilterColumns());
}

TEST_F(FixedPageTest, LengthsTheFilterCannotWriteAreRefusedWithAMessage)
{
    Input("Name;Ort;PLZ\r\nM\xFCller;K\xF6ln;50667\r\n");
    Show();
    ClickRow(1);
    // What the other two columns leave of the record limit.
    const std::string room = std::to_string(16777216 - 60);
    const std::string range = "Geben Sie eine ganze Zahl zwischen 1 und " + room + " ein.";
    const std::pair<const char*, std::string> cases[] = {
        {"0", range}, {"16777157", range}, {"zehn", "Geben Sie eine ganze Zahl ein."}};
    for (const auto& c : cases) {
        SCOPED_TRACE(c.first);
        TypeInto(IDC_OUTFIX_FIELDLEN, c.first);
        EXPECT_EQ(c.second, qotest::MessageOf([&] { ClickButton(IDC_OUTFIX_APPLY); }));
        EXPECT_EQ("0+30,30+30,60+30", Columns());
        EXPECT_EQ(0, m_filter.NumCols()) << "nothing reached the filter";
        EXPECT_EQ(Item(IDC_OUTFIX_FIELDLEN), ::GetFocus()) << "the user corrects the length";
    }

    // The longest length that still fits.
    TypeInto(IDC_OUTFIX_FIELDLEN, room);
    ClickButton(IDC_OUTFIX_APPLY);
    EXPECT_EQ("16777216", Text(IDC_OUTFIX_RECLEN));
    EXPECT_EQ("Name=30,Ort=" + room + ",PLZ=30", FilterColumns());
}

TEST_F(FixedPageTest, CellsShowTheirColoursAndRowsThePageNoLongerHasStayEmpty)
{
    Input("Name;Ort;PLZ\r\nM\xFCller;K\xF6ln;50667\r\n");
    SetFilterColumns({{"Name", 25}, {"Ort", 15}, {"PLZ", 5}});
    Show();
    ASSERT_EQ("0+25,25+15,40+5", Columns());
    ClickRow(1);
    qotest::CaptureWindow(m_pPage->m_hWnd, qotest::CapturePath("output-textfix-4024.png").c_str());
    qotest::Image img;  // as the click left it
    ASSERT_TRUE(qotest::CaptureImage(List(), img, true));
    // Inside the cell, clear of the focus rectangle around the row.
    auto count = [&img](const CRect& cell, COLORREF colour) {
        return qotest::CountPixels(img, CRect(cell.left + 2, cell.top + 2, cell.right - 2, cell.bottom - 2), colour);
    };
    const COLORREF black = RGB(0, 0, 0), white = RGB(255, 255, 255), grey = RGB(0x7F, 0x7F, 0x7F);
    // The offset is grey, the selected row's name white.
    EXPECT_GT(count(Cell(0, 1), grey), 0);
    EXPECT_EQ(0, count(Cell(0, 1), black));
    EXPECT_GT(count(Cell(1, 0), white), 0);
    EXPECT_EQ(0, count(Cell(1, 0), black));

    // The host loads a filter of one column and has not refreshed yet: the
    // list still has three rows, of which the page knows one.
    m_filter.NumCols(1);
    Page()->UpdateOutputFilter(0);
    img = qotest::Screen(List());
    EXPECT_GT(count(Cell(0, 0), black), 0);
    const CRect row2(Cell(2, 0).left, Cell(2, 0).top, Cell(2, 2).right, Cell(2, 0).bottom);
    EXPECT_EQ(row2.Width() * row2.Height(), qotest::CountPixels(img, row2, ListView_GetBkColor(List())))
        << "row 2 is empty";
}

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
    std::string Preview() { return Text(IDC_OUTVAR_PREVIEW); }
    int Lines()
    {
        const std::string text = Preview();
        return static_cast<int>(std::count(text.begin(), text.end(), '\n'));
    }

    CQoOutputFilterTextVar m_filter;
};

TEST_F(DelimitedPageTest, ThePreviewShowsTheFirstRowsAsTheFilterWritesThem)
{
    Customers(120);
    m_filter.Delimiter(',');
    Show();
    // Opening the page wrote its settings into the filter; "no escape" stayed none.
    EXPECT_EQ(0, m_filter.Escape());
    EXPECT_EQ(",", Text(IDC_OUTVAR_DELIMITER));
    EXPECT_EQ(50, Lines());
    EXPECT_EQ(0u, Preview().find("Kunde 0,Ort 0\r\n\"Wei\xDF, S\xF6hne\",Ort 1\r\n"));

    qotest::Dialog page(m_pPage->m_hWnd);
    page.SelectText(IDC_OUTVAR_DELIMITER, "[TAB]");
    page.Check(IDC_OUTVAR_ALWAYS_ENCLOSE);
    page.Check(IDC_OUTVAR_NAMES_FIRST);
    ClickButton(IDC_OUTVAR_REFRESH);
    EXPECT_EQ('\t', m_filter.Delimiter());
    EXPECT_TRUE(m_filter.ForceEncloser());
    EXPECT_TRUE(m_filter.WriteHeaderFlag());
    EXPECT_EQ(51, Lines()) << "the header and 50 rows";
    EXPECT_EQ(0u, Preview().find("\"Name\"\t\"Ort\"\r\n\"Kunde 0\"\t\"Ort 0\"\r\n\"Wei\xDF, S\xF6hne\"\t\"Ort 1\"\r\n"));
    qotest::CaptureWindow(m_pPage->m_hWnd, qotest::CapturePath("output-textvar-4023.png").c_str());

    // Settings that make no readable file say so instead of showing rows.
    page.SetText(IDC_OUTVAR_DELIMITER, "\"");
    ClickButton(IDC_OUTVAR_REFRESH);
    EXPECT_EQ("Trennzeichen und Begrenzer d\xFCrfen nicht gleich sein", Preview());
}

TEST_F(DelimitedPageTest, TheDosHintIsShownOncePerPage)
{
    Customers(3);
    const auto hint = [](qotest::Dialog& box) {
        EXPECT_EQ(0u, box.MessageText().find("Hinweis: Das Vorschaufenster verwendet den Windows-Ansi"));
        box.Press(IDOK);
    };
    Show();
    // Refreshed twice by the user and once by the host: one hint.
    qotest::Answering({hint}, [&] {
        qotest::Dialog(m_pPage->m_hWnd).Select(IDC_OUTVAR_CHARSET, 1);
        ClickButton(IDC_OUTVAR_REFRESH);
        ClickButton(IDC_OUTVAR_REFRESH);
        Page()->RefreshDisplay();
    });
    EXPECT_EQ(CQoFile::ascii, m_filter.FileCharSet()) << "the setting stays";
    EXPECT_EQ(3, Lines());

    // A new page over the same filter opens with DOS Ascii and tells it again.
    DestroyPage();
    qotest::Answering({hint}, [&] { Show(); });
    EXPECT_EQ(1, qotest::Dialog(m_pPage->m_hWnd).Selection(IDC_OUTVAR_CHARSET));
}

}  // namespace
