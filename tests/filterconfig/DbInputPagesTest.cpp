// The dBase and file-database input pages on real windows over real files.
#include <gtest/gtest.h>

#include <afxcmn.h>
#include <afxdao.h>

#include <fstream>
#include <string>
#include <vector>

#include "CInputFilterConfig.h"
#include "CInputFilterConfigDao.h"
#include "CInputFilterConfigDbase.h"
#include "CModifiedListener.h"
#include "CQoInputFilterDao.h"
#include "CQoInputFilterDbase34.h"
#include "CQoInterActive.h"
#include "MfcTestHost.h"
#include "resource.h"

#include "../qotools/PythonPeer.h"

namespace {

using qotest::Answering;
using qotest::ColumnTitle;
using qotest::MessageOf;
using qotest::PumpApp;

// A dBase III file without a code page mark (read as DOS text): character fields
// of the given widths, the records as given (a value longer than its field is cut).
std::string DbaseFile(const std::vector<std::pair<std::string, int>>& fields,
                      const std::vector<std::vector<std::string>>& records)
{
    auto le = [](size_t v, int bytes) {
        std::string out;
        for (int i = 0; i < bytes; ++i) out += char((v >> (8 * i)) & 0xFF);
        return out;
    };
    size_t recordLength = 1;
    for (const auto& f : fields) recordLength += size_t(f.second);
    std::string s = std::string("\x03\x7C\x03\x05", 4) + le(records.size(), 4) + le(32 + 32 * fields.size() + 1, 2) +
                    le(recordLength, 2) + std::string(20, '\0');
    for (const auto& f : fields)
        s += f.first + std::string(11 - f.first.size(), '\0') + 'C' + std::string(4, '\0') + char(f.second) +
             std::string(15, '\0');
    s += '\x0D';
    for (const auto& r : records) {
        s += ' ';
        for (size_t i = 0; i < fields.size(); ++i) {
            std::string v = r[i].substr(0, size_t(fields[i].second));
            s += v + std::string(size_t(fields[i].second) - v.size(), ' ');
        }
    }
    return s + '\x1A';
}

// Rows of a report list, cells joined by '|', rows by ','.
std::string Rows(CListCtrl& list)
{
    std::string out;
    const int cols = list.GetHeaderCtrl()->GetItemCount();
    for (int r = 0; r < list.GetItemCount(); ++r) {
        for (int c = 0; c < cols; ++c) out += (c ? "|" : "") + std::string((LPCSTR)list.GetItemText(r, c));
        out += ",";
    }
    return out;
}

// An Access-type database with the tables Kunden and Artikel and the select query
// Koelner, made by the engine.
std::string MakeDatabase(const std::string& name)
{
    const std::string path = qotest::TempPath(name);
    ::DeleteFileA(path.c_str());
    CDaoDatabase db;
    db.Create(path.c_str());
    db.Execute("CREATE TABLE Kunden (Name TEXT(40), Ort TEXT(40))");
    db.Execute("INSERT INTO Kunden VALUES ('M\xFCller', 'K\xF6ln')");
    db.Execute("INSERT INTO Kunden VALUES ('Schmidt', 'Bonn')");
    db.Execute("CREATE TABLE Artikel (Nr TEXT(10), Bezeichnung TEXT(40))");
    db.Execute("INSERT INTO Artikel VALUES ('1', 'Tisch')");
    CDaoQueryDef query(&db);
    query.Create("Koelner", "SELECT Name FROM Kunden WHERE Ort = 'K\xF6ln'");
    query.Append();
    query.Close();
    db.Close();
    return path;
}

class DbInputPageTest : public qotest::HostFrameTest, public CModifiedListener {
protected:
    DbInputPageTest() : HostFrameTest("Eingabe", 720, 520) {}
    void TearDown() override
    {
        if (m_pPage != NULL) m_pPage->DestroyWindow();
        delete m_pPage;
        HostFrameTest::TearDown();
    }
    int ModifiedListenerSetModified(int, int nNotifierId) override
    {
        EXPECT_EQ(7, nNotifierId);
        ++m_nCalls;
        return m_nAnswer;
    }
    void Show(CQoInputFilter* pFilter, CRuntimeClass* pKind)
    {
        m_pPage = CInputFilterConfig::GetAppropriateConfig(pFilter, 7);
        ASSERT_NE(nullptr, m_pPage);
        ASSERT_TRUE(m_pPage->IsKindOf(pKind)) << pKind->m_lpszClassName;
        m_pPage->AddModifiedListener(this);
        ASSERT_TRUE(m_pPage->Create(m_pFrame));
        qotest::ShowChild(*m_pPage, 5, 5);
        PumpApp(100);
    }
    HWND Item(int id) { return ::GetDlgItem(m_pPage->m_hWnd, id); }

    CInputFilterConfig* m_pPage = nullptr;
    int m_nCalls = 0;
    int m_nAnswer = 1;
};

class DbasePageTest : public DbInputPageTest {
protected:
    CListCtrl& Preview() { return static_cast<CInputFilterConfigDbase*>(m_pPage)->m_preview; }
    CQoInputFilterDbase34 m_filter;
};

TEST_F(DbasePageTest, ShowsTheRecordsAsDosTextAndHasNothingToSet)
{
    const std::string path = qotest::WriteTempFile(
        "qo_dbinput.dbf", DbaseFile({{"NAME", 12}, {"ORT", 10}}, {{"M\x81ller", "K\x94ln"}, {"Schmidt", "Bonn"}}));
    m_filter.Init(path.c_str());
    Show(&m_filter, RUNTIME_CLASS(CInputFilterConfigDbase));
    EXPECT_EQ("ORT", ColumnTitle(Preview(), 1));
    EXPECT_EQ("M\xFCller|K\xF6ln,Schmidt|Bonn,", Rows(Preview()));
    EXPECT_EQ("DOS Ascii", qotest::WindowText(Item(IDC_DBASE_CHARSET)));
    qotest::CaptureWindow(m_pPage->m_hWnd, qotest::CapturePath("input-dbase-4011.png").c_str());
    m_pPage->Enable(1);
    EXPECT_FALSE(::IsWindowEnabled(Item(IDC_DBASE_CHARSET))) << "the character set is never offered";
}

TEST_F(DbasePageTest, AFileCutShortIsReportedAndThePreviewKeepsWhatItShowed)
{
    std::vector<std::vector<std::string>> records;
    for (int i = 0; i < 200; ++i) records.push_back({std::to_string(i), std::string(200, 'x')});
    const std::string path =
        qotest::WriteTempFile("qo_dbinput_cut.dbf", DbaseFile({{"NR", 4}, {"TEXT", 200}}, records));
    m_filter.Init(path.c_str());
    Show(&m_filter, RUNTIME_CLASS(CInputFilterConfigDbase));
    ASSERT_EQ(200, Preview().GetItemCount());

    // Another program empties the file while the filter has it open.
    { std::ofstream(path, std::ios::binary | std::ios::trunc); }
    const std::string message = MessageOf([&] { m_pPage->UpdateInputFilter(0); });
    EXPECT_NE(std::string::npos, message.find("kann nicht gelesen werden")) << message;
    EXPECT_NE(std::string::npos, message.find("qo_dbinput_cut.dbf")) << message;
    EXPECT_EQ(200, Preview().GetItemCount());
    EXPECT_EQ("199", std::string((LPCSTR)Preview().GetItemText(199, 0)));
}

class DaoPageTest : public DbInputPageTest {
protected:
    CInputFilterConfigDao& Page() { return *static_cast<CInputFilterConfigDao*>(m_pPage); }
    CListCtrl& Tables() { return Page().m_tables; }
    std::string Items()
    {
        std::string out;
        for (int i = 0; i < Tables().GetItemCount(); ++i) {
            LVITEMA item = {};
            item.mask = LVIF_IMAGE;
            item.iItem = i;
            ListView_GetItem(Tables().m_hWnd, &item);
            out += std::string((LPCSTR)Tables().GetItemText(i, 0)) + ":" + std::to_string(item.iImage) + ":" +
                   std::to_string(Tables().GetItemData(i)) + ",";
        }
        return out;
    }
    std::string Selected()
    {
        const int i = Tables().GetNextItem(-1, LVNI_SELECTED);
        return i < 0 ? std::string("-") : std::string((LPCSTR)Tables().GetItemText(i, 0));
    }
    void ClickTable(const char* name)
    {
        LVFINDINFO find = {};
        find.flags = LVFI_STRING;
        find.psz = name;
        const int i = Tables().FindItem(&find);
        ASSERT_GE(i, 0) << name;
        RECT rc;
        Tables().GetItemRect(i, &rc, LVIR_LABEL);
        qotest::Click(Tables().m_hWnd, (rc.left + rc.right) / 2, (rc.top + rc.bottom) / 2);
        PumpApp(200);
    }
    void Open(CQoInputFilterDao& filter, const std::string& path, const char* table = nullptr)
    {
        if (table != nullptr) {
            filter.SetTableName(table);
            filter.SetTableType(CQoInputFilterDB::tableTable);
        }
        filter.Init(path.c_str());
        Show(&filter, RUNTIME_CLASS(CInputFilterConfigDao));
        m_pPage->UpdateInputFilter(0);
        PumpApp(100);
    }
};

TEST_F(DaoPageTest, ListsTablesAndQueriesAndTheHostMayKeepTheCurrentTable)
{
    CQoInputFilterDao filter(CQoFile::typeAccess);
    Open(filter, MakeDatabase("qo_dbinput_pick.mdb"), "Kunden");
    EXPECT_EQ("Artikel:0:0,Koelner:1:1,Kunden:0:0,", Items());
    EXPECT_EQ("Kunden", Selected());
    EXPECT_EQ("M\xFCller|K\xF6ln,Schmidt|Bonn,", Rows(Page().m_preview));

    // A pick goes to the filter at once; picking it again changes nothing.
    ClickTable("Koelner");
    EXPECT_EQ("Koelner", std::string(filter.GetTableName().GetString()));
    EXPECT_EQ(CQoInputFilterDB::tableQuery, filter.GetTableType());
    EXPECT_EQ("M\xFCller,", Rows(Page().m_preview));
    EXPECT_GE(m_nCalls, 1);
    const int calls = m_nCalls;
    qotest::CaptureWindow(m_pPage->m_hWnd, qotest::CapturePath("input-dao-4012.png").c_str());

    // The host refuses: the query stays, in the list and in the filter.
    m_nAnswer = 0;
    ClickTable("Artikel");
    EXPECT_EQ("Koelner", Selected());
    EXPECT_EQ("Koelner", std::string(filter.GetTableName().GetString()));
    EXPECT_GT(m_nCalls, calls) << "the host was asked";

    // The host's own sync is not a change the host could refuse.
    filter.InitTable("Artikel", CQoInputFilterDB::tableTable, true);
    m_pPage->UpdateInputFilter(0);
    EXPECT_EQ("Artikel", Selected());
    EXPECT_EQ("1|Tisch,", Rows(Page().m_preview));
}

TEST_F(DaoPageTest, ATableOrDatabaseThatCannotBeOpenedIsReportedAndTheLastStateKept)
{
    CQoInputFilterDao filter(CQoFile::typeAccess);
    const std::string path = MakeDatabase("qo_dbinput_gone.mdb");
    Open(filter, path, "Kunden");
    ASSERT_EQ("Kunden", Selected());

    // A name the database does not know.
    Tables().SetItemData(Tables().InsertItem(0, "Fehlt", 0), 0);
    std::string message;
    Answering({qotest::Reading(message)}, [&] { ClickTable("Fehlt"); });
    EXPECT_FALSE(message.empty());
    EXPECT_EQ("Kunden", Selected());
    EXPECT_EQ("Kunden", std::string(filter.GetTableName().GetString()));
    EXPECT_EQ("M\xFCller|K\xF6ln,Schmidt|Bonn,", Rows(Page().m_preview));

    // The host opens a file that is no database (in batch mode the filter stays
    // closed): said once, the list and the preview as they were.
    const std::string text = qotest::WriteTempFile("qo_dbinput_kein.mdb", "Nr;Name\r\n1;M\xFCller\r\n");
    CQoInterActive::SetQuiet(true);
    filter.Init(text.c_str());
    CQoInterActive::SetQuiet(false);
    ASSERT_FALSE(filter.GetDatabase().IsOpen());
    message = MessageOf([&] { m_pPage->UpdateInputFilter(0); });
    EXPECT_NE(std::string::npos, message.find("qo_dbinput_kein.mdb")) << message;
    EXPECT_NE(std::string::npos, message.find("nicht ge\xF6""ffnet")) << message;
    Answering({}, [&] { m_pPage->UpdateInputFilter(0); }, 300);
    EXPECT_EQ("Artikel:0:0,Fehlt:0:0,Koelner:1:1,Kunden:0:0,", Items());
    EXPECT_EQ("M\xFCller|K\xF6ln,Schmidt|Bonn,", Rows(Page().m_preview));
}

TEST_F(DaoPageTest, AnMdbFileListsItsTables)
{
    char module[MAX_PATH];
    GetModuleFileNameA(NULL, module, MAX_PATH);
    std::string path = module;
    for (int up = 0; up < 3 && path.find_last_of('\\') != std::string::npos; ++up)
        path = path.substr(0, path.find_last_of('\\'));
    path += "\\fixtures\\fruit.mdb";
    if (GetFileAttributesA(path.c_str()) == INVALID_FILE_ATTRIBUTES)
        GTEST_SKIP() << "fruit.mdb is not fetched (tools/setup.sh puts it into build/fixtures)";
    CQoInputFilterDao filter(CQoFile::typeAccess);
    Open(filter, path);
    ASSERT_GT(Tables().GetItemCount(), 0);
    EXPECT_EQ(std::string::npos, Items().find("MSys")) << "no system tables";
    const std::string first((LPCSTR)Tables().GetItemText(0, 0));
    ClickTable(first.c_str());
    EXPECT_EQ(first, std::string(filter.GetTableName().GetString()));
    EXPECT_GT(Page().m_preview.GetItemCount(), 0);
}

TEST_F(DaoPageTest, AWorkbookListsItsSheetsWithTheWorkbookIcon)
{
    PeerFolder folder;
    if (!folder.Usable() || !RunPython(folder, "write", R"PY(
import openpyxl
wb = openpyxl.Workbook()
ws = wb.active
ws.title = 'Kunden'
ws.append(['Name', 'Ort'])
ws.append(['M\u00fcller', 'K\u00f6ln'])
wb.create_sheet('Preise').append(['Artikel'])
wb.save(os.path.join(folder, 'kunden.xlsx'))
)PY"))
        PEER_UNAVAILABLE();
    CQoInputFilterDao filter(CQoFile::typeExcel);
    Open(filter, folder.Path("kunden.xlsx"));
    EXPECT_EQ("Kunden$:2:0,Preise$:2:0,", Items());
    EXPECT_EQ("-", Selected());
    ClickTable("Kunden$");
    EXPECT_EQ("Kunden$", std::string(filter.GetTableName().GetString()));
    EXPECT_EQ("Name", ColumnTitle(Page().m_preview, 0));
    EXPECT_EQ("M\xFCller|K\xF6ln,", Rows(Page().m_preview));
}

}  // namespace
