// The greyable combo box on a real owner-drawn window: the flags the items
// carry and how the selection field is painted, sampled from captures.
#include <gtest/gtest.h>

#include <afxwin.h>

#include <vector>

#include "CQoComboBox.h"
#include "Capture.h"
#include "DialogDriver.h"
#include "Input.h"

namespace {

class QoComboBoxTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        m_pFrame = new CFrameWnd;
        ASSERT_TRUE(m_pFrame->CreateEx(0, AfxRegisterWndClass(0, ::LoadCursor(NULL, IDC_ARROW), (HBRUSH)(COLOR_BTNFACE + 1)),
                                       "Liste", WS_OVERLAPPEDWINDOW | WS_VISIBLE, 40, 40, 320, 240, NULL, NULL));
        ASSERT_TRUE(m_combo.Create(WS_CHILD | WS_VISIBLE | CBS_DROPDOWNLIST | CBS_OWNERDRAWFIXED | CBS_HASSTRINGS,
                                   CRect(10, 10, 210, 200), m_pFrame, 100));
        m_font.CreatePointFont(120, "Arial");
        m_combo.SetFont(&m_font);
        qotest::BringToFront(m_pFrame->m_hWnd);
    }
    void TearDown() override
    {
        if (::IsWindow(m_pFrame->m_hWnd)) m_pFrame->DestroyWindow();  // deletes it
        qotest::PumpFor(50);
    }

    // Pixels of the selection field (the combo box without its button).
    int Count(COLORREF colour)
    {
        m_combo.Invalidate();
        m_combo.UpdateWindow();
        qotest::Image img;
        EXPECT_TRUE(qotest::CaptureImage(m_combo.m_hWnd, img, true));
        int n = 0;
        for (int y = 3; y < img.height - 3; ++y)
            for (int x = 3; x < img.width - ::GetSystemMetrics(SM_CXVSCROLL) - 3; ++x) n += img.Pixel(x, y) == colour;
        return n;
    }

    CFrameWnd* m_pFrame = nullptr;
    CQoComboBox m_combo;
    CFont m_font;
};

TEST_F(QoComboBoxTest, ItemsCarryTheirFlagAndGreyedOnesArePaintedGrey)
{
    ASSERT_EQ(0, m_combo.AddString("Nachname", TRUE));
    ASSERT_EQ(1, m_combo.AddString("Vorname", FALSE));
    EXPECT_EQ((std::vector<int>{1, 0, 0, 0}), (std::vector<int>{m_combo.IsEnabled(0), m_combo.IsEnabled(1),
                                                               m_combo.IsEnabled(2), m_combo.IsEnabled(-1)}));
    m_combo.Enable(1, 1);
    EXPECT_TRUE(m_combo.IsEnabled(1));
    m_combo.Enable(1, 0);

    // The item height follows the control's font.
    m_combo.Init();
    CClientDC dc(&m_combo);
    CFont* old = dc.SelectObject(&m_font);
    TEXTMETRIC tm;
    dc.GetTextMetrics(&tm);
    dc.SelectObject(old);
    EXPECT_EQ(tm.tmHeight + 2, m_combo.GetItemHeight(0));
    // (Wine answers 2 more for the selection field than was set, so it is not read back.)

    const COLORREF text = ::GetSysColor(COLOR_WINDOWTEXT), grey = ::GetSysColor(COLOR_GRAYTEXT),
                   highlight = ::GetSysColor(COLOR_HIGHLIGHT), highlightText = ::GetSysColor(COLOR_HIGHLIGHTTEXT),
                   face = ::GetSysColor(COLOR_BTNFACE);
    struct Case {
        const char* what;
        int item;
        bool focus;
        bool enabled;
        COLORREF ink, background, absent;
    } cases[] = {
        {"enabled item", 0, false, true, text, ::GetSysColor(COLOR_WINDOW), grey},
        {"greyed item", 1, false, true, grey, ::GetSysColor(COLOR_WINDOW), text},
        {"selected while focused", 0, true, true, highlightText, highlight, text},
        {"disabled combo box", 0, false, false, grey, face, text},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        m_combo.SetCurSel(c.item);
        m_combo.EnableWindow(c.enabled);
        if (c.focus) qotest::Focus(m_combo.m_hWnd); else m_pFrame->SetFocus();
        EXPECT_GT(Count(c.ink), 10);
        EXPECT_GT(Count(c.background), 100);
        EXPECT_EQ(0, Count(c.absent));
    }
    qotest::CaptureWindow(m_combo.m_hWnd, qotest::CapturePath("qo-combobox.png").c_str());
}

}  // namespace
