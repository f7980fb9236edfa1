// The drag check list box and the widening list box on real windows.
#include <gtest/gtest.h>

#include <CDragCheckListBox.h>
#include <CListBoxHorz.h>
#include <CModifiedListener.h>

#include <string>
#include <vector>

#include "MfcTestHost.h"

namespace {

class CountingListener : public CModifiedListener {
public:
    int ModifiedListenerSetModified(int bModified, int nNotifierId) override
    {
        ++calls;
        EXPECT_EQ(1, bModified);
        EXPECT_EQ(42, nNotifierId);
        return 1;
    }
    int calls = 0;
};

// "Text:data:check[:aus]" of each item; Gamma is disabled.
const std::vector<std::string> kStart = {"Alpha:10:1", "Beta:11:0", "Gamma:12:1:aus", "Delta:13:0"};

class DragCheckListBoxTest : public qotest::HostFrameTest {
protected:
    DragCheckListBoxTest() : HostFrameTest("Spalten", 360, 300) {}
    void SetUp() override
    {
        HostFrameTest::SetUp();
        ASSERT_TRUE(m_list.Create(WS_CHILD | WS_VISIBLE | WS_BORDER | WS_VSCROLL | WS_HSCROLL | LBS_NOTIFY |
                                      LBS_OWNERDRAWFIXED | LBS_HASSTRINGS | LBS_NOINTEGRALHEIGHT,
                                  CRect(10, 10, 230, 210), m_pFrame, 100));
        m_list.SetFont(CFont::FromHandle((HFONT)::GetStockObject(DEFAULT_GUI_FONT)));
        m_list.AddModifiedListener(&m_listener);
        Fill(kStart);
        qotest::BringToFront(m_list.m_hWnd);
    }
    void TearDown() override
    {
        m_list.DestroyWindow();
        HostFrameTest::TearDown();
    }

    CRect Item(int i)
    {
        CRect rc;
        m_list.GetItemRect(i, &rc);
        return rc;
    }
    // A point on the text of item i, in its upper or lower half.
    POINT On(int i, bool lower = false)
    {
        const CRect rc = Item(i);
        return {rc.left + 60, lower ? rc.bottom - 3 : rc.top + 3};
    }
    std::vector<std::string> Items()
    {
        std::vector<std::string> items;
        for (int i = 0; i < m_list.GetCount(); ++i) {
            CString text;
            m_list.GetText(i, text);
            items.push_back(std::string(text) + ":" + std::to_string(m_list.GetItemData(i)) + ":" +
                            std::to_string(m_list.GetCheck(i)) + (m_list.IsEnabled(i) ? "" : ":aus"));
        }
        return items;
    }

    void Fill(const std::vector<std::string>& items)
    {
        m_list.ResetContent();
        for (const std::string& item : items) {
            const size_t a = item.find(':'), b = item.find(':', a + 1);
            const int i = m_list.AddString(item.substr(0, a).c_str(), std::stol(item.substr(a + 1, b - a - 1)),
                                           item[b + 1] == '1');
            m_list.Enable(i, item.find(":aus") == std::string::npos);
        }
    }

    CDragCheckListBox m_list{42, false};
    CountingListener m_listener;
};

// Rows of the list's client area that the drop bar covers: runs of at least three rows
// in which neighbouring pixels differ throughout (the halftone inverts every other
// pixel; the dotted focus frame is a single row). Read as the window shows it now,
// without letting it repaint (which would wipe a bar left behind).
std::vector<int> MarkerRows(HWND list)
{
    RECT rc;
    ::GetClientRect(list, &rc);
    HDC dc = ::GetDC(list);
    std::vector<int> flipping, rows;
    for (int y = 0; y < rc.bottom; ++y) {
        int flips = 0;
        for (int x = 150; x < 200; ++x) flips += ::GetPixel(dc, x, y) != ::GetPixel(dc, x + 1, y);
        if (flips > 40) flipping.push_back(y);
    }
    ::ReleaseDC(list, dc);
    for (size_t i = 0; i < flipping.size();) {
        size_t j = i;
        while (j + 1 < flipping.size() && flipping[j + 1] == flipping[j] + 1) ++j;
        if (j - i >= 2) rows.insert(rows.end(), flipping.begin() + i, flipping.begin() + j + 1);
        i = j + 1;
    }
    return rows;
}

}  // namespace

TEST_F(DragCheckListBoxTest, ADraggedItemLandsWhereTheBarShowedWithItsDataAndStates)
{
    struct {
        const char* what;
        int from, to;  // to -1: below all items
        std::vector<std::string> items;
        int selected;
    } const cases[] = {
        {"Alpha below Gamma", 0, 2, {"Beta:11:0", "Gamma:12:1:aus", "Alpha:10:1", "Delta:13:0"}, 2},
        {"disabled Gamma to the top", 2, 0, {"Gamma:12:1:aus", "Alpha:10:1", "Beta:11:0", "Delta:13:0"}, 0},
        {"Beta released below all items", 1, -1, kStart, 1},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.what);
        Fill(kStart);
        ::Sleep(600);  // no double click with the case before
        const int before = m_listener.calls;
        const POINT to = c.to >= 0 ? On(c.to, c.to > c.from) : POINT{60, Item(3).bottom + 40};
        qotest::Drag(m_list.m_hWnd, On(c.from), to);
        qotest::PumpFor(50);
        EXPECT_EQ(c.items, Items());
        EXPECT_EQ(c.selected, m_list.GetCurSel());
        EXPECT_EQ(before + 1, m_listener.calls);
        EXPECT_EQ(nullptr, ::GetCapture());
        EXPECT_TRUE(MarkerRows(m_list.m_hWnd).empty()) << "the bar is left on the screen";
    }
}

TEST_F(DragCheckListBoxTest, TheBarShowsDuringADragAndNeverWithNoDrag)
{
    for (bool noDrag : {false, true}) {
        SCOPED_TRACE(noDrag ? "no drag" : "drag");
        Fill(kStart);
        m_list.SetNoDrag(noDrag);
        ::Sleep(600);
        qotest::MoveMouse(m_list.m_hWnd, On(0).x, On(0).y);
        qotest::InjectButton(qotest::MouseButton::Left, true);
        qotest::PumpFor(30);
        for (int y = On(0).y; y <= On(1, true).y; y += 4) qotest::MoveMouse(m_list.m_hWnd, On(0).x, y);
        qotest::PumpFor(50);
        const std::vector<int> rows = MarkerRows(m_list.m_hWnd);
        qotest::InjectButton(qotest::MouseButton::Left, false);
        qotest::PumpFor(50);
        // Three rows around the border between Beta and Gamma.
        const int border = Item(1).bottom;
        EXPECT_EQ(noDrag ? std::vector<int>() : (std::vector<int>{border - 1, border, border + 1}), rows);
        EXPECT_EQ(noDrag ? "Alpha:10:1" : "Beta:11:0", Items()[0]);
    }
}

TEST_F(DragCheckListBoxTest, TicksByClickAndSpaceBarReachTheListenersAsDoOtherKeys)
{
    struct {
        int item;  // -1: a key
        WORD key;
        std::vector<int> checks;
    } const steps[] = {
        {1, 0, {1, 1, 1, 0}},  // click in Beta's box
        {-1, VK_SPACE, {1, 0, 1, 0}},
        {-1, VK_DOWN, {1, 0, 1, 0}},  // Gamma is selected, disabled: space does nothing to it
        {-1, VK_SPACE, {1, 0, 1, 0}},
    };
    ::Sleep(600);  // no double click with a click of the test before
    for (const auto& s : steps) {
        SCOPED_TRACE(s.item >= 0 ? "click " + std::to_string(s.item) : "key " + std::to_string(s.key));
        const int before = m_listener.calls;
        s.item < 0 ? qotest::PressKey(s.key)
                   : qotest::Click(m_list.m_hWnd, Item(s.item).left + 8, Item(s.item).CenterPoint().y);
        qotest::PumpFor(30);
        std::vector<int> checks;
        for (int i = 0; i < m_list.GetCount(); ++i) checks.push_back(m_list.GetCheck(i));
        EXPECT_EQ(s.checks, checks);
        EXPECT_EQ(before + 1, m_listener.calls);
    }
}

TEST_F(DragCheckListBoxTest, TheScrollRangeFollowsTheWidestTextEverAdded)
{
    CListBoxHorz plain;
    ASSERT_TRUE(plain.Create(WS_CHILD | WS_VISIBLE | WS_BORDER | WS_HSCROLL, CRect(240, 10, 340, 210), m_pFrame, 101));
    plain.SetFont(CFont::FromHandle((HFONT)::GetStockObject(DEFAULT_GUI_FONT)));
    auto width = [](CWnd& list, const char* text) {
        CClientDC dc(&list);
        CFont* old = dc.SelectObject(list.GetFont());
        const int cx = dc.GetTextExtent(text, lstrlenA(text)).cx;
        dc.SelectObject(old);
        return cx;
    };
    // The wide text added, something else added, the wide text deleted again.
    const char* const wide = "Postleitzahl der Lieferanschrift des Kunden";
    m_list.AddString(wide, 14, 0);
    m_list.AddString("Ort", 15, 1);
    m_list.DeleteString(4);
    EXPECT_EQ(width(m_list, wide) + 20, m_list.GetHorizontalExtent());
    plain.InsertString(0, wide);
    plain.AddString("Name");
    plain.DeleteString(0);
    EXPECT_EQ(width(plain, wide) + 20, plain.GetHorizontalExtent());
    plain.DestroyWindow();
}
