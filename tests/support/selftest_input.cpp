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
    std::vector<Event> down = win.Of(WM_RBUTTONDOWN), up = win.Of(WM_RBUTTONUP);
    ASSERT_EQ(1u, down.size());
    ASSERT_EQ(1u, up.size());
    EXPECT_EQ(30, down[0].x);
    EXPECT_EQ(40, down[0].y);
    EXPECT_EQ(30, up[0].x);
    EXPECT_EQ(40, up[0].y);
    // The system turns the released right button into a context-menu request at that spot.
    std::vector<Event> ctx = win.Of(WM_CONTEXTMENU);
    ASSERT_EQ(1u, ctx.size());
    POINT screen = qotest::ToScreen(win.Hwnd(), 30, 40);
    EXPECT_EQ(screen.x, ctx[0].x);
    EXPECT_EQ(screen.y, ctx[0].y);

    win.events.clear();
    qotest::Click(win.Hwnd(), 200, 150);
    ASSERT_EQ(1u, win.Of(WM_LBUTTONDOWN).size());
    EXPECT_EQ(200, win.Of(WM_LBUTTONDOWN)[0].x);
    EXPECT_EQ(150, win.Of(WM_LBUTTONUP)[0].y);
    EXPECT_TRUE(win.Of(WM_LBUTTONDBLCLK).empty());

    // Wait out the double-click time so that the next click does not pair with this one.
    qotest::PumpFor(GetDoubleClickTime() + 50);
    win.events.clear();
    qotest::DoubleClick(win.Hwnd(), 100, 100);
    ASSERT_EQ(1u, win.Of(WM_LBUTTONDBLCLK).size());
    EXPECT_EQ(100, win.Of(WM_LBUTTONDBLCLK)[0].x);
    EXPECT_EQ(1u, win.Of(WM_LBUTTONDOWN).size());
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
    EXPECT_EQ(20, down[0].y);
    EXPECT_EQ(220, up[0].x);
    EXPECT_EQ(120, up[0].y);
    // Moves between press and release carry the button state and head towards the target.
    int held = 0, lastX = 20;
    bool between = false, monotonic = true;
    for (const Event& e : win.events) {
        if (e.msg == WM_LBUTTONDOWN) between = true;
        if (e.msg == WM_LBUTTONUP) between = false;
        if (between && e.msg == WM_MOUSEMOVE) {
            EXPECT_TRUE(e.wp & MK_LBUTTON);
            ++held;
            monotonic &= e.x >= lastX;
            lastX = e.x;
        }
    }
    EXPECT_GE(held, 4);
    EXPECT_TRUE(monotonic);
    EXPECT_EQ(220, lastX);
}

TEST(Input, KeysGoToTheFocusWindow)
{
    RecordingWindow win(200, 100);
    qotest::Focus(win.Hwnd());
    win.events.clear();
    qotest::TypeText("Ab1\xe4");
    std::vector<Event> chars = win.Of(WM_CHAR);
    ASSERT_EQ(4u, chars.size());
    EXPECT_EQ(WPARAM('A'), chars[0].wp);
    EXPECT_EQ(WPARAM('b'), chars[1].wp);
    EXPECT_EQ(WPARAM('1'), chars[2].wp);
    EXPECT_EQ(WPARAM(0xE4), chars[3].wp);  // the window is an ANSI window: Windows-1252

    win.events.clear();
    qotest::KeyPress(VK_F5);
    qotest::KeyPress('C', qotest::kCtrl);
    std::vector<Event> keys = win.Of(WM_KEYDOWN);
    ASSERT_EQ(3u, keys.size());
    EXPECT_EQ(WPARAM(VK_F5), keys[0].wp);
    EXPECT_EQ(WPARAM(VK_CONTROL), keys[1].wp);
    EXPECT_EQ(WPARAM('C'), keys[2].wp);
    ASSERT_EQ(1u, win.Of(WM_CHAR).size());
    EXPECT_EQ(WPARAM(3), win.Of(WM_CHAR)[0].wp);  // Ctrl+C is the control character 3
}

}  // namespace
