// The popup-menu driver on real menus shown by TrackPopupMenu.
#include "DialogDriver.h"
#include "Input.h"
#include "MenuDriver.h"
#include "selftest_window.h"

#include <gtest/gtest-spi.h>
#include <gtest/gtest.h>

namespace {

using qotest::Menu;
using qotest::MenuDriver;

enum { kOpen = 201, kDelete = 202, kMarked = 203, kDeep = 204 };

HMENU MakeMenu()
{
    HMENU sub = CreatePopupMenu();
    AppendMenuA(sub, MF_STRING, kDeep, "Tiefer");
    HMENU m = CreatePopupMenu();
    AppendMenuA(m, MF_STRING, kOpen, "&\xd6" "ffnen\tStrg+O");
    AppendMenuA(m, MF_SEPARATOR, 0, nullptr);
    AppendMenuA(m, MF_STRING | MF_GRAYED, kDelete, "L\xf6schen");
    AppendMenuA(m, MF_STRING, kMarked, "&Markiert");
    AppendMenuA(m, MF_POPUP, reinterpret_cast<UINT_PTR>(sub), "Mehr");
    return m;
}

int Track(HWND owner, HMENU menu, UINT flags = TPM_RETURNCMD)
{
    POINT pt = qotest::ToScreen(owner, 40, 40);
    return TrackPopupMenu(menu, flags | TPM_LEFTALIGN | TPM_TOPALIGN, pt.x, pt.y, 0, owner, nullptr);
}

TEST(MenuDriver, ReadsTheItemsAndChoosesOneByClicking)
{
    selftest::RecordingWindow win(300, 200);
    HMENU menu = MakeMenu();
    MenuDriver menus;
    menus.Expect([&](Menu& m) {
        std::vector<qotest::MenuItem> items = m.Items();
        ASSERT_EQ(5u, items.size());
        EXPECT_TRUE(items[1].separator);
        EXPECT_TRUE(items[2].grayed);
        EXPECT_EQ((std::vector<std::string>{"\xd6" "ffnen", "", "L\xf6schen", "Markiert", "Mehr"}), m.Labels());
        EXPECT_NONFATAL_FAILURE(m.Choose(kDelete), "disabled");
        m.Choose(kMarked);
    });
    // Without TPM_RETURNCMD the choice arrives as WM_COMMAND at the owner.
    menus.Expect([&](Menu& m) { m.ChooseLabel("\xd6" "ffnen"); });
    EXPECT_EQ(kMarked, Track(win.Hwnd(), menu));
    EXPECT_NE(0, Track(win.Hwnd(), menu, 0));
    qotest::PumpFor(50);
    std::vector<selftest::Event> commands = win.Of(WM_COMMAND);
    ASSERT_EQ(1u, commands.size());
    EXPECT_EQ(WPARAM(kOpen), LOWORD(commands[0].wp));
    EXPECT_TRUE(menus.Done());
    EXPECT_EQ(2, menus.Seen());
    EXPECT_EQ(0, menus.Unanswered());
    DestroyMenu(menu);
}

TEST(MenuDriver, ClosesAMenuNoScriptAnswers)
{
    selftest::RecordingWindow win(300, 200);
    HMENU menu = MakeMenu();
    MenuDriver menus;
    menus.SetReportFailures(false);
    menus.SetTimeout(300);
    menus.Expect([](Menu&) {});
    EXPECT_EQ(0, Track(win.Hwnd(), menu));  // left open by its script
    EXPECT_EQ(0, Track(win.Hwnd(), menu));  // no script at all
    EXPECT_EQ(2, menus.Unanswered());
    EXPECT_EQ(2, menus.Seen());
    DestroyMenu(menu);
}

TEST(MenuDriver, ScriptsThatNeverRanAreReported)
{
    EXPECT_NONFATAL_FAILURE(
        {
            MenuDriver menus;
            menus.Expect([](Menu&) {});
        },
        "1 menu script(s) never ran");
}

}  // namespace
