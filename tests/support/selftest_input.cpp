// Real mouse and keyboard input, as the test window's procedure receives it.
#include "DialogDriver.h"
#include "Input.h"
#include "selftest_window.h"

#include <gtest/gtest.h>

namespace {

using selftest::Event;
using selftest::RecordingWindow;

TEST(Input, ClicksArriveWhereTheyWereAimed)
{
    RecordingWindow win(300, 200);
    qotest::RightClick(win.Hwnd(), 30, 40);
    std::vector<Event> up = win.Of(WM_RBUTTONUP);
    ASSERT_EQ(1u, up.size());
    EXPECT_EQ(30, up[0].x);
    EXPECT_EQ(40, up[0].y);
    // The system turns the released right button into a context-menu request at that spot.
    std::vector<Event> ctx = win.Of(WM_CONTEXTMENU);
    ASSERT_EQ(1u, ctx.size());
    POINT screen = qotest::ToScreen(win.Hwnd(), 30, 40);
    EXPECT_EQ(screen.x, ctx[0].x);
    EXPECT_EQ(screen.y, ctx[0].y);

    // After the double-click time, so that the next click does not pair with this one.
    qotest::PumpFor(GetDoubleClickTime() + 50);
    win.events.clear();
    qotest::DoubleClick(win.Hwnd(), 100, 110);
    ASSERT_EQ(1u, win.Of(WM_LBUTTONDBLCLK).size());
    EXPECT_EQ(110, win.Of(WM_LBUTTONDBLCLK)[0].y);
}

TEST(Input, DragPressesMovesAndReleases)
{
    RecordingWindow win(300, 200);
    qotest::PumpFor(GetDoubleClickTime() + 50);
    win.events.clear();
    qotest::Drag(win.Hwnd(), {20, 20}, {220, 120});
    std::vector<Event> down = win.Of(WM_LBUTTONDOWN), up = win.Of(WM_LBUTTONUP);
    ASSERT_EQ(1u, down.size());
    ASSERT_EQ(1u, up.size());
    EXPECT_EQ(20, down[0].x);
    EXPECT_EQ(120, up[0].y);
    // Moves between press and release carry the button state.
    int held = 0;
    bool between = false;
    for (const Event& e : win.events) {
        if (e.msg == WM_LBUTTONDOWN || e.msg == WM_LBUTTONUP) between = e.msg == WM_LBUTTONDOWN;
        if (between && e.msg == WM_MOUSEMOVE) held += (e.wp & MK_LBUTTON) != 0;
    }
    EXPECT_GE(held, 4);
}

TEST(Input, KeysGoToTheFocusWindow)
{
    RecordingWindow win(200, 100);
    qotest::Focus(win.Hwnd());
    win.events.clear();
    qotest::TypeText("Ab1\xe4");
    qotest::KeyPress('C', qotest::kCtrl);
    std::vector<WPARAM> chars;
    for (const Event& e : win.Of(WM_CHAR)) chars.push_back(e.wp);
    // The window is an ANSI window: Windows-1252; Ctrl+C is the control character 3.
    EXPECT_EQ((std::vector<WPARAM>{'A', 'b', '1', 0xE4, 3}), chars);
}

}  // namespace
