// The output source page on a real window over a host's source.
#include <gtest/gtest.h>

#include <COutputFilterSourceConfig.h>

#include <functional>
#include <string>
#include <vector>

#include "MappingTestSource.h"
#include "MfcTestHost.h"
#include "resource.h"

namespace {

using mappingtest::TableSource;

// A host that can lose columns at the end.
class ShrinkingSource : public TableSource {
public:
    using TableSource::TableSource;
    int NumSourceColumns() override { return columnLimit >= 0 ? columnLimit : TableSource::NumSourceColumns(); }
    int columnLimit = -1;
};

class Host : public CModifiedListener {
public:
    int ModifiedListenerSetModified(int bModified, int nNotifierId) override
    {
        ++calls;
        EXPECT_EQ(1, bModified);
        EXPECT_EQ(7, nNotifierId);
        return answer;
    }
    int calls = 0;
    int answer = 1;
};

class OutputSourceConfigTest : public qotest::HostFrameTest {
protected:
    OutputSourceConfigTest() : HostFrameTest("Ausgabespalten", 360, 320) {}
    void SetUp() override
    {
        HostFrameTest::SetUp();
        m_page.SetSource(&m_source);
        ASSERT_TRUE(m_page.Create(m_pFrame));
        m_page.AddModifiedListener(&m_host);
        m_page.SetWindowPos(NULL, 10, 10, 220, 200, SWP_NOZORDER);
        qotest::ShowChild(m_page, 10, 10);
        m_list = ::GetDlgItem(m_page.m_hWnd, IDC_OUTSOURCE_COLUMNS);
    }
    void TearDown() override
    {
        m_page.DestroyWindow();
        HostFrameTest::TearDown();
    }

    RECT Item(int i)
    {
        RECT rc = {};
        ::SendMessageA(m_list, LB_GETITEMRECT, i, reinterpret_cast<LPARAM>(&rc));
        return rc;
    }
    void ClickBox(int i)
    {
        ::Sleep(600);  // no double click with the click before
        qotest::Click(m_list, Item(i).left + 8, (Item(i).top + Item(i).bottom) / 2);
    }
    std::vector<std::string> ListTexts()
    {
        std::vector<std::string> texts;
        char text[64];
        for (int i = 0; i < ::SendMessageA(m_list, LB_GETCOUNT, 0, 0); ++i) {
            ::SendMessageA(m_list, LB_GETTEXT, i, reinterpret_cast<LPARAM>(text));
            texts.push_back(text);
        }
        return texts;
    }
    std::string Entries()
    {
        std::string out;
        for (int i = 0; i < m_source.GetEntryCount(); ++i) {
            COutputFilterSource::CEntry e;
            m_source.GetEntry(i, e);
            out += std::string(i ? " " : "") + (e.GetSelected() ? "" : "-") + std::string(e.GetName()) + ":" +
                   std::to_string(e.GetColumn());
        }
        return out;
    }

    ShrinkingSource m_source{{"Name", "Vorname", "PLZ", "Ort"}, {{"Meier", "Anna", "10115", "Berlin"}}};
    COutputFilterSourceConfig m_page{7, nullptr};
    Host m_host;
    HWND m_list = nullptr;
};

}  // namespace

TEST_F(OutputSourceConfigTest, TicksAndADragGoIntoTheSourceAtOnceAndOnlyChangesAreTold)
{
    EXPECT_EQ((std::vector<std::string>{"Name", "Vorname", "PLZ", "Ort"}), ListTexts());
    const struct {
        const char* what;
        std::function<void()> act;
        std::string entries;
        int calls, columns;
    } steps[] = {
        {"untick Vorname", [&] { ClickBox(1); }, "Name:0 -Vorname:1 PLZ:2 Ort:3", 1, 3},
        {"click on the text of Name", [&] { ::Sleep(600), qotest::Click(m_list, 80, Item(0).top + 4); }, "Name:0 -Vorname:1 PLZ:2 Ort:3", 1, 3},
        {"space on Name", [] { qotest::PressKey(VK_SPACE); }, "-Name:0 -Vorname:1 PLZ:2 Ort:3", 2, 2},
        {"drag PLZ to the top", [&] { ::Sleep(600), qotest::Drag(m_list, {80, Item(2).top + 4}, {80, Item(0).top + 3}); }, "PLZ:2 -Name:0 -Vorname:1 Ort:3", 3, 2},
        {"tick Vorname", [&] { ClickBox(2); }, "PLZ:2 -Name:0 Vorname:1 Ort:3", 4, 3},
    };
    for (const auto& s : steps) {
        SCOPED_TRACE(s.what);
        s.act();
        qotest::PumpApp(50);
        EXPECT_EQ(s.entries, Entries());
        EXPECT_EQ(s.calls, m_host.calls);
        EXPECT_EQ(s.columns, m_source.NumColumns());
    }
    qotest::CaptureWindow(m_pFrame->m_hWnd, qotest::CapturePath("output-source-4030.png").c_str());

    // Enter and Escape leave the page open and the source as it was.
    qotest::Focus(m_list);
    qotest::PressKey(VK_RETURN);
    qotest::PressKey(VK_ESCAPE);
    EXPECT_TRUE(m_page.IsWindowVisible());
    EXPECT_EQ("PLZ:2 -Name:0 Vorname:1 Ort:3", Entries());
    EXPECT_EQ(4, m_host.calls);
}

TEST_F(OutputSourceConfigTest, ListAndSourceOutOfStep)
{
    // The source behind the list's back: the list is the user's view and wins,
    // the host hears of it, and its refusal is the answer to the list.
    m_source.SetSelected("PLZ", false);
    m_host.answer = 0;
    EXPECT_EQ(0, m_page.ModifiedListenerSetModified(1, 0));
    EXPECT_EQ("Name:0 Vorname:1 PLZ:2 Ort:3", Entries());
    EXPECT_EQ(1, m_host.calls);
    m_host.answer = 1;

    // Only the name differs: nothing is written, nobody is told.
    m_source.SetEntry(0, COutputFilterSource::CEntry(0, "Nachname", true));
    EXPECT_EQ(1, m_page.ModifiedListenerSetModified(1, 0));
    EXPECT_EQ("Nachname:0 Vorname:1 PLZ:2 Ort:3", Entries());
    EXPECT_EQ(1, m_host.calls);

    // Fewer entries than items: the entries are made anew from the list.
    m_source.RemoveAllEntries();
    m_source.AddEntry(COutputFilterSource::CEntry(3, "Ort", false));
    ClickBox(0);
    EXPECT_EQ("-Name:0 Vorname:1 PLZ:2 Ort:3", Entries());
    EXPECT_EQ(2, m_host.calls);

    // More entries than items: the list shows them all, the host is not told.
    m_source.AddColumn("Land", "DE");
    m_source.InitArray();
    EXPECT_EQ(1, m_page.ModifiedListenerSetModified(1, 0));
    EXPECT_EQ((std::vector<std::string>{"Name", "Vorname", "PLZ", "Ort", "Land"}), ListTexts());
    EXPECT_EQ(2, m_host.calls);
}

TEST_F(OutputSourceConfigTest, AnItemNamingAColumnTheHostNoLongerHasIsNotWrittenBack)
{
    m_source.columnLimit = 2;  // the list still shows four
    m_source.InitArray();
    ClickBox(0);
    EXPECT_EQ("-Name:0 Vorname:1", Entries());
    EXPECT_EQ(1, m_host.calls);
    EXPECT_EQ(1, m_source.NumColumns());

    // Without a source the page shows nothing and accepts everything.
    m_page.SetSource(nullptr);
    EXPECT_TRUE(ListTexts().empty());
    EXPECT_EQ(1, m_page.ModifiedListenerSetModified(1, 0));
}
