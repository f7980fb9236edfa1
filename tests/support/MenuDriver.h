// MenuDriver.h — reads and answers the popup menus that a test opens.
//
// TrackPopupMenu (and a context menu opened by a real right click) runs a modal menu loop on the
// calling thread, so, as with dialogs, the test queues one script per expected menu first:
//
//     qotest::MenuDriver menus;                           // hooks the calling thread
//     menus.Expect([](qotest::Menu& m) {
//         auto items = m.Items();
//         EXPECT_EQ("Spalte löschen", items[0].label);
//         EXPECT_FALSE(items[2].enabled);
//         m.Choose(ID_DELETE);                           // a real click on the item
//     });
//     qotest::RightClick(list, 20, 30);                  // the window opens its context menu
//     EXPECT_TRUE(menus.Done());
//
// A thread WH_CALLWNDPROC hook sees the owner get WM_ENTERMENULOOP / WM_INITMENUPOPUP; a thread
// timer, run by the menu loop, then runs the next script on the shown menu. Choose clicks the
// item with SendInput; the loop reads the click when the script has returned. A menu still open
// some time after its script, or one without a script, is closed with EndMenu and counted in
// Unanswered(). Menus tracked with TPM_NONOTIFY are not seen.
#pragma once

#include <windows.h>

#include <deque>
#include <functional>
#include <string>
#include <vector>

namespace qotest {

struct MenuItem {
    int position = 0;
    UINT id = 0;
    std::string text;   // as stored, with '&' and a '\t' accelerator part
    std::string label;  // as read: without '&' markers and without the accelerator part
    bool separator = false;
    bool enabled = true;   // neither MFS_DISABLED nor MFS_GRAYED
    bool grayed = false;   // MF_GRAYED
    HMENU submenu = nullptr;
};

// The popup menu handed to a script. Non-owning; valid while the script runs.
class Menu {
public:
    explicit Menu(HMENU menu) : m_menu(menu) {}

    std::vector<MenuItem> Items() const;
    std::vector<std::string> Labels() const;  // labels of all items, "" for separators

    // Clicks the item with the mouse; a test failure if missing, disabled or a separator.
    bool Choose(UINT id);
    bool ChooseLabel(const std::string& label);

private:
    bool ClickPosition(int position);

    HMENU m_menu;
};

using MenuScript = std::function<void(Menu&)>;

class MenuDriver {
public:
    MenuDriver();
    ~MenuDriver();
    MenuDriver(const MenuDriver&) = delete;
    MenuDriver& operator=(const MenuDriver&) = delete;

    void Expect(MenuScript script);
    void SetTimeout(UINT ms) { m_timeout = ms; }
    void SetReportFailures(bool report) { m_reportFailures = report; }

    bool Done() const { return m_queue.empty() && !m_running; }
    int Seen() const { return m_seen; }
    int Unanswered() const { return m_unanswered; }

private:
    static LRESULT CALLBACK HookProc(int code, WPARAM wp, LPARAM lp);
    static void CALLBACK TimerProc(HWND, UINT, UINT_PTR id, DWORD);
    void OnMenuStart(HMENU menu);
    void OnMenuEnd();
    void RunScript();
    void CheckClosed();
    void StartTimer(UINT ms, bool script);

    HHOOK m_hook = nullptr;
    MenuDriver* m_previous = nullptr;
    std::deque<MenuScript> m_queue;
    UINT m_delay = 80, m_timeout = 3000;
    UINT_PTR m_timer = 0;
    bool m_timerIsScript = false;
    bool m_inLoop = false;      // between WM_ENTERMENULOOP (or the first popup) and WM_EXITMENULOOP
    bool m_loopSeen = false;    // this loop has been given its script already
    bool m_loopScripted = false;
    bool m_running = false;
    bool m_reportFailures = true;
    int m_closeStage = 0;
    int m_seen = 0, m_unanswered = 0;
    HMENU m_menu = nullptr;
};

}  // namespace qotest
