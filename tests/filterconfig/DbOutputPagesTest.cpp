// The file-database and dBase output pages on real windows: what reaches the
// real output filters (what they write has tests of its own).
#include <gtest/gtest.h>

#include <afxcmn.h>

#include <COutputFilterConfigDao.h>
#include <COutputFilterConfigDbase.h>
#include <CQoOutputFilterDao.h>
#include <CQoOutputFilterDbase.h>

#include <string>

#include "FileSource.h"
#include "MfcTestHost.h"
#include "resource.h"

namespace {

using qotest::PressKey;
using qotest::PumpApp;

const char* const kCustomers = "Name;Ort;PLZ\r\nM\xFCller;K\xF6ln;50667\r\nSchmidt;Br\xFChl;50321\r\n";

class DbOutputPagesTest : public qotest::OutputPageTest {
protected:
    bool Enabled(int id) const { return ::IsWindowEnabled(Item(id)) != FALSE; }
    qotest::Dialog Page() const { return qotest::Dialog(m_pPage->m_hWnd); }

    std::string Cells(int listId, int columns)
    {
        CColoredListCtrl* list = dynamic_cast<CColoredListCtrl*>(CWnd::FromHandlePermanent(Item(listId)));
        std::string out;
        for (int row = 0; row < list->GetItemCount(); ++row) {
            out += row ? "," : "";
            for (int col = 0; col < columns; ++col) {
                CString text;
                DWORD clr, clrSel;
                bool bold;
                list->GetColoredItem(row, col, text, clr, clrSel, bold);
                out += (col ? "|" : "") + std::string(static_cast<const char*>(text));
            }
        }
        return out;
    }
    void ClickRow(int listId, int row)
    {
        HWND list = Item(listId);
        CRect rc;
        ListView_GetItemRect(list, row, &rc, LVIR_BOUNDS);
        qotest::Click(list, rc.left + 10, rc.CenterPoint().y);
        PumpApp(100);
    }
};

class DaoOutputPageTest : public DbOutputPagesTest {
protected:
    void Show() { DbOutputPagesTest::Show(new COutputFilterConfigDao(9, m_pFrame), &m_filter); }
    std::string Cells() { return DbOutputPagesTest::Cells(IDC_OUTDAO_LIST, 4); }
    std::string FilterColumns()
    {
        std::string out = std::string(m_filter.GetTableName().GetString()) + ":";
        for (int i = 0; i < m_filter.NumCols(); ++i) {
            CQoString name;
            m_filter.GetColumnName(i, name);
            out += (i ? "," : "") + std::string(name.GetString()) + "=" + std::to_string(m_filter.GetType(i)) + "/" +
                   std::to_string(m_filter.GetLength(i)) + (m_filter.GetIndexed(i) ? "i" : "");
        }
        return out;
    }

    CQoOutputFilterDao m_filter;
};

TEST_F(DaoOutputPageTest, TheUserSetsTypeLengthAndIndexAndTheFilterGetsThem)
{
    Input(kCustomers);
    Show();
    EXPECT_EQ("Tabelle", Page().Text(IDC_OUTDAO_TABLE)) << "a filter without a table name";
    EXPECT_EQ("Name|Text|255|nein,Ort|Text|255|nein,PLZ|Text|255|nein", Cells());

    ClickRow(IDC_OUTDAO_LIST, 0);
    EXPECT_EQ("255", Page().Text(IDC_OUTDAO_FIELDLEN));
    qotest::TypeOver(Item(IDC_OUTDAO_FIELDLEN), "40");
    Page().Check(IDC_OUTDAO_INDEXED);
    ClickButton(IDC_OUTDAO_APPLY);
    EXPECT_EQ("Tabelle:Name=2/40i,Ort=2/255,PLZ=2/255", FilterColumns());

    // Numeric: no length to type, none shown; Enter applies with the table name typed.
    ClickRow(IDC_OUTDAO_LIST, 2);
    Page().Select(IDC_OUTDAO_TYPE, 1);
    EXPECT_FALSE(Enabled(IDC_OUTDAO_FIELDLEN));
    qotest::TypeOver(Item(IDC_OUTDAO_TABLE), "Kunden");
    PressKey(VK_RETURN);
    EXPECT_EQ("Kunden:Name=2/40i,Ort=2/255,PLZ=1/255", FilterColumns());
    EXPECT_EQ("Name|Text|40|ja,Ort|Text|255|nein,PLZ|numerisch||nein", Cells());
    qotest::CaptureWindow(m_pPage->m_hWnd, qotest::CapturePath("output-dao-4025.png").c_str());

    // Columns keep their settings by name; a renamed one starts as text of 255.
    Input("Name;Wohnort;PLZ\r\nM\xFCller;K\xF6ln;50667\r\n");
    m_pPage->RefreshDisplay();
    EXPECT_EQ("Name|Text|40|ja,Wohnort|Text|255|nein,PLZ|numerisch||nein", Cells());
    ClickButton(IDC_OUTDAO_APPLY);
    EXPECT_EQ("Kunden:Name=2/40i,Wohnort=2/255,PLZ=1/255", FilterColumns());
}

TEST_F(DaoOutputPageTest, BadSettingsAreRefusedAndNothingReachesTheFilter)
{
    Input(kCustomers);
    // A project may hold a type the database cannot create.
    m_filter.SetTableName("Alt");
    m_filter.NumCols(3);
    const char* names[] = {"Name", "Ort", "PLZ"};
    for (int i = 0; i < 3; ++i) m_filter.ColumnName(i, names[i]);
    m_filter.SetType(1, 7);
    Show();
    EXPECT_EQ("Alt", Page().Text(IDC_OUTDAO_TABLE));
    EXPECT_EQ("Name|Text|30|nein,Ort|||nein,PLZ|Text|30|nein", Cells());
    const std::string before = FilterColumns();
    const std::string length = "Die L\xE4nge des Textfeldes 'Name' muss zwischen 1 und 255 liegen.";

    struct Case {
        const char* what;
        int row;  // -1: none selected
        const char* table;
        const char* fieldLen;
        std::string message;
    } cases[] = {
        {"unknown type", -1, "Kunden", nullptr,
         "Das Feld 'Ort' hat einen unbekannten Feldtyp (7). Bitte w\xE4hlen Sie 'Text' oder 'numerisch'."},
        {"unknown type selected", 1, "Kunden", nullptr, "Bitte w\xE4hlen Sie einen Feldtyp f\xFCr das Feld 'Ort'."},
        {"too long", 0, "Kunden", "256", length},
        {"no table", 2, "  ", "20", "Bitte geben Sie den Namen der Tabelle an, in die geschrieben wird."},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        if (c.row >= 0) ClickRow(IDC_OUTDAO_LIST, c.row);
        Page().SetText(IDC_OUTDAO_TABLE, c.table);
        if (c.fieldLen) Page().SetText(IDC_OUTDAO_FIELDLEN, c.fieldLen);
        EXPECT_EQ(c.message, qotest::MessageOf([&] { ClickButton(IDC_OUTDAO_APPLY); }));
        EXPECT_EQ(before, FilterColumns()) << "nothing reached the filter";
    }
    EXPECT_EQ("Name|Text|30|nein,Ort|||nein,PLZ|Text|20|nein", Cells()) << "only PLZ was accepted";

    // The type chosen, the same apply goes through.
    ClickRow(IDC_OUTDAO_LIST, 1);
    Page().Select(IDC_OUTDAO_TYPE, 0);
    Page().SetText(IDC_OUTDAO_TABLE, "Kunden");
    ClickButton(IDC_OUTDAO_APPLY);
    EXPECT_EQ("Kunden:Name=2/30,Ort=2/30,PLZ=2/20", FilterColumns());
}

class DbaseOutputPageTest : public DbOutputPagesTest {
protected:
    void Show() { DbOutputPagesTest::Show(new COutputFilterConfigDbase(10, m_pFrame), &m_filter); }
    std::string Cells() { return DbOutputPagesTest::Cells(IDC_OUTDBF_LIST, 3); }
    std::string Fields()
    {
        std::string out;
        CDbaseField field;
        for (int i = 0; m_filter.GetFieldDesc(i, field); ++i)
            out += (i ? "," : "") + std::string(field.Name().GetString()) + ":" + field.Type() + "/" +
                   std::to_string(field.Length());
        return out;
    }

    CQoOutputFilterDbase m_filter;
};

TEST_F(DbaseOutputPageTest, TheUserSetsTypeAndLengthAndTheFilterGetsThem)
{
    Input(kCustomers);
    Show();
    EXPECT_EQ("Name|Text|255,Ort|Text|255,PLZ|Text|255", Cells());

    ClickRow(IDC_OUTDBF_LIST, 0);
    qotest::TypeOver(Item(IDC_OUTDBF_FIELDLEN), "20");
    PressKey(VK_RETURN);
    ClickRow(IDC_OUTDBF_LIST, 2);
    Page().Select(IDC_OUTDBF_TYPE, 1);
    EXPECT_FALSE(Enabled(IDC_OUTDBF_FIELDLEN));
    ClickButton(IDC_OUTDBF_APPLY);
    // Numeric fields are 8 digits wide whatever length the page holds.
    EXPECT_EQ("Name:C/20,Ort:C/255,PLZ:N/8", Fields());
    EXPECT_EQ("Name|Text|20,Ort|Text|255,PLZ|numerisch|", Cells());
    qotest::CaptureWindow(m_pPage->m_hWnd, qotest::CapturePath("output-dbase-4028.png").c_str());

    // Text lengths a dBase file cannot hold are refused, and the user corrects the length.
    ClickRow(IDC_OUTDBF_LIST, 1);
    const std::string range = "Die L\xE4nge des Textfeldes 'Ort' muss zwischen 1 und 255 liegen.";
    for (const char* typed : {"0", "256"}) {
        SCOPED_TRACE(typed);
        Page().SetText(IDC_OUTDBF_FIELDLEN, typed);
        EXPECT_EQ(range, qotest::MessageOf([&] { ClickButton(IDC_OUTDBF_APPLY); }));
        EXPECT_EQ("Name:C/20,Ort:C/255,PLZ:N/8", Fields()) << "nothing reached the filter";
        EXPECT_EQ(Item(IDC_OUTDBF_FIELDLEN), ::GetFocus());
    }
    Page().SetText(IDC_OUTDBF_FIELDLEN, "1");
    ClickButton(IDC_OUTDBF_APPLY);
    EXPECT_EQ("Name:C/20,Ort:C/1,PLZ:N/8", Fields());

    // A new page over the filter shows its fields; renamed columns start as text of 255.
    DestroyPage();
    Input("Name;Ort;Kasse\r\nM\xFCller;K\xF6ln;12\r\n");
    Show();
    EXPECT_EQ("Name|Text|20,Ort|Text|1,Kasse|Text|255", Cells());
}

}  // namespace
