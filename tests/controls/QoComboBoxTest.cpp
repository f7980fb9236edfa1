// The greyable combo box on a real owner-drawn window.
#include <gtest/gtest.h>

#include <vector>

#include "CQoComboBox.h"
#include "MfcTestHost.h"

TEST(QoComboBox, ItemsCarryTheirFlagAndGreyedOnesArePaintedGrey)
{
    CFrameWnd* pFrame = new CFrameWnd;
    ASSERT_TRUE(qotest::CreateHostFrame(pFrame, "Liste", 320, 240));
    CQoComboBox combo;
    ASSERT_TRUE(combo.Create(WS_CHILD | WS_VISIBLE | CBS_DROPDOWNLIST | CBS_OWNERDRAWFIXED | CBS_HASSTRINGS,
                             CRect(10, 10, 210, 200), pFrame, 100));
    CFont font;
    font.CreatePointFont(120, "Arial");
    combo.SetFont(&font);
    ASSERT_EQ(0, combo.AddString("Nachname", TRUE));
    ASSERT_EQ(1, combo.AddString("Vorname", FALSE));

    combo.Init();  // the items as high as the font needs (Wine adds 2 when reading back the field's height)
    CClientDC dc(&combo);
    CFont* old = dc.SelectObject(&font);
    TEXTMETRIC tm;
    dc.GetTextMetrics(&tm);
    dc.SelectObject(old);
    EXPECT_EQ(tm.tmHeight + 2, combo.GetItemHeight(0));

    // The selection field without the button, in the colours of each state.
    qotest::BringToFront(pFrame->m_hWnd);
    const COLORREF text = ::GetSysColor(COLOR_WINDOWTEXT), grey = ::GetSysColor(COLOR_GRAYTEXT);
    struct Case {
        const char* what;
        int item;
        bool focus, enabled;
        COLORREF ink, background, absent;
    } cases[] = {
        {"enabled item", 0, false, true, text, ::GetSysColor(COLOR_WINDOW), grey},
        {"greyed item", 1, false, true, grey, ::GetSysColor(COLOR_WINDOW), text},
        {"selected while focused", 0, true, true, ::GetSysColor(COLOR_HIGHLIGHTTEXT), ::GetSysColor(COLOR_HIGHLIGHT), text},
        {"disabled combo box", 0, false, false, grey, ::GetSysColor(COLOR_BTNFACE), text},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.what);
        combo.SetCurSel(c.item);
        combo.EnableWindow(c.enabled);
        if (c.focus) qotest::Focus(combo.m_hWnd); else pFrame->SetFocus();
        const qotest::Image img = qotest::Screen(combo.m_hWnd);
        const CRect field(3, 3, img.width - ::GetSystemMetrics(SM_CXVSCROLL) - 3, img.height - 3);
        EXPECT_GT(qotest::CountPixels(img, field, c.ink), 10);
        EXPECT_GT(qotest::CountPixels(img, field, c.background), 100);
        EXPECT_EQ(0, qotest::CountPixels(img, field, c.absent));
    }
    qotest::DestroyHostFrame(pFrame);
}
