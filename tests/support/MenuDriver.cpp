#include "MenuDriver.h"

#include "DialogDriver.h"
#include "Input.h"

#include <gtest/gtest.h>

#ifndef MN_GETHMENU
#define MN_GETHMENU 0x01E1
#endif

namespace qotest {

namespace {

thread_local MenuDriver* t_menuDriver = nullptr;

struct FindMenuWindow {
    HMENU menu;
    HWND found;
};

BOOL CALLBACK FindMenuWindowProc(HWND hwnd, LPARAM lp)
{
    auto* f = reinterpret_cast<FindMenuWindow*>(lp);
    char cls[16] = "";
    GetClassNameA(hwnd, cls, sizeof cls);
    if (lstrcmpA(cls, "#32768") != 0 || !IsWindowVisible(hwnd)) return TRUE;
    HMENU m = reinterpret_cast<HMENU>(SendMessageA(hwnd, MN_GETHMENU, 0, 0));
    if (!f->menu || m == f->menu) {
        f->found = hwnd;
        if (!f->menu) f->menu = m;
        return FALSE;
    }
    return TRUE;
}

// The visible menu window of this thread that shows `menu` (any, if `menu` is null).
HWND MenuWindow(HMENU& menu)
{
    FindMenuWindow f = {menu, nullptr};
    EnumThreadWindows(GetCurrentThreadId(), FindMenuWindowProc, reinterpret_cast<LPARAM>(&f));
    if (!f.found) EnumWindows(FindMenuWindowProc, reinterpret_cast<LPARAM>(&f));
    menu = f.menu;
    return f.found;
}

std::string Label(const std::string& text)
{
    std::string out;
    for (size_t i = 0; i < text.size(); ++i) {
        char c = text[i];
        if (c == '\t') break;
        if (c == '&') {
            if (i + 1 < text.size() && text[i + 1] == '&') out += '&', ++i;
            continue;
        }
        out += c;
    }
    return out;
}

}  // namespace

std::vector<MenuItem> Menu::Items() const
{
    std::vector<MenuItem> items;
    int count = GetMenuItemCount(m_menu);
    for (int pos = 0; pos < count; ++pos) {
        MENUITEMINFOA mii = {};
        mii.cbSize = sizeof mii;
        mii.fMask = MIIM_FTYPE | MIIM_STATE | MIIM_ID | MIIM_SUBMENU | MIIM_STRING;
        if (!GetMenuItemInfoA(m_menu, pos, TRUE, &mii)) continue;
        MenuItem item;
        item.position = pos;
        item.id = mii.wID;
        item.submenu = mii.hSubMenu;
        item.separator = (mii.fType & MFT_SEPARATOR) != 0;
        if (!item.separator && !(mii.fType & (MFT_BITMAP | MFT_OWNERDRAW)) && mii.cch > 0) {
            std::string text(mii.cch + 1, '\0');
            mii.dwTypeData = &text[0];
            mii.cch += 1;
            mii.fMask = MIIM_STRING;
            GetMenuItemInfoA(m_menu, pos, TRUE, &mii);
            text.resize(mii.cch);
            item.text = text;
            item.label = Label(text);
        }
        // MFS_GRAYED includes the MFS_DISABLED bit; MF_GRAYED alone is bit 0.
        item.grayed = (mii.fState & MF_GRAYED) != 0;
        item.enabled = (mii.fState & (MF_GRAYED | MF_DISABLED)) == 0;
        items.push_back(item);
    }
    return items;
}

std::vector<std::string> Menu::Labels() const
{
    std::vector<std::string> labels;
    for (const MenuItem& item : Items()) labels.push_back(item.label);
    return labels;
}

bool Menu::ClickPosition(int position)
{
    RECT rc;
    if (!GetMenuItemRect(nullptr, m_menu, position, &rc) || rc.right <= rc.left) {
        ADD_FAILURE() << "menu item " << position << " has no rectangle on screen";
        return false;
    }
    POINT pt = {(rc.left + rc.right) / 2, (rc.top + rc.bottom) / 2};
    // Events only: the menu loop, which dispatched this script, reads them when it returns.
    InjectMove(pt);
    InjectButton(MouseButton::Left, true);
    InjectButton(MouseButton::Left, false);
    return true;
}

bool Menu::Choose(UINT id)
{
    for (const MenuItem& item : Items()) {
        if (item.separator || item.submenu || item.id != id) continue;
        if (!item.enabled) {
            ADD_FAILURE() << "menu item \"" << item.label << "\" (" << id << ") is disabled";
            return false;
        }
        return ClickPosition(item.position);
    }
    ADD_FAILURE() << "menu has no item with id " << id;
    return false;
}

bool Menu::ChooseLabel(const std::string& label)
{
    for (const MenuItem& item : Items())
        if (!item.separator && item.label == label) return Choose(item.id);
    ADD_FAILURE() << "menu has no item \"" << label << "\"";
    return false;
}

MenuDriver::MenuDriver()
{
    m_previous = t_menuDriver;
    t_menuDriver = this;
    m_hook = SetWindowsHookExA(WH_CALLWNDPROC, HookProc, nullptr, GetCurrentThreadId());
    if (!m_hook) ADD_FAILURE() << "MenuDriver: SetWindowsHookEx failed, error " << GetLastError();
}

MenuDriver::~MenuDriver()
{
    if (m_hook) UnhookWindowsHookEx(m_hook);
    if (m_reportFailures && !m_queue.empty())
        ADD_FAILURE() << m_queue.size() << " menu script(s) never ran: the menus did not appear";
    if (m_timer) KillTimer(nullptr, m_timer);
    t_menuDriver = m_previous;
}

void MenuDriver::Expect(MenuScript script) { m_queue.push_back(std::move(script)); }

LRESULT CALLBACK MenuDriver::HookProc(int code, WPARAM wp, LPARAM lp)
{
    MenuDriver* self = t_menuDriver;
    if (self && code == HC_ACTION) {
        const CWPSTRUCT* cwp = reinterpret_cast<const CWPSTRUCT*>(lp);
        switch (cwp->message) {
        case WM_ENTERMENULOOP: self->OnMenuStart(nullptr); break;
        case WM_INITMENUPOPUP:
            if (!HIWORD(cwp->lParam)) self->OnMenuStart(reinterpret_cast<HMENU>(cwp->wParam));
            break;
        case WM_EXITMENULOOP: self->OnMenuEnd(); break;
        default: break;
        }
    }
    return CallNextHookEx(nullptr, code, wp, lp);
}

void MenuDriver::StartTimer(UINT ms, bool script)
{
    if (m_timer) KillTimer(nullptr, m_timer);
    m_timer = SetTimer(nullptr, 0, ms, TimerProc);
    m_timerIsScript = script;
}

void MenuDriver::OnMenuStart(HMENU menu)
{
    if (!m_inLoop) {
        m_inLoop = true;
        m_loopSeen = false;
    }
    if (menu && !m_menu) m_menu = menu;  // the first popup of the loop is the one to answer
    if (m_loopSeen) return;
    m_loopSeen = true;
    ++m_seen;
    m_closeStage = 0;
    m_loopScripted = !m_queue.empty();
    StartTimer(m_delay, m_loopScripted);
}

void MenuDriver::OnMenuEnd()
{
    m_inLoop = false;
    m_menu = nullptr;
    if (m_timer && !m_running) {
        KillTimer(nullptr, m_timer);
        m_timer = 0;
    }
}

void CALLBACK MenuDriver::TimerProc(HWND, UINT, UINT_PTR id, DWORD)
{
    KillTimer(nullptr, id);
    MenuDriver* self = t_menuDriver;
    if (!self || id != self->m_timer) return;
    self->m_timer = 0;
    if (!self->m_inLoop) return;
    if (self->m_timerIsScript) self->RunScript();
    else self->CheckClosed();
}

void MenuDriver::RunScript()
{
    HMENU menu = m_menu;
    if (!MenuWindow(menu)) {  // not on screen yet
        StartTimer(m_delay, true);
        return;
    }
    MenuScript script = std::move(m_queue.front());
    m_queue.pop_front();
    m_running = true;
    Menu m(menu);
    detail::RunGuarded([&] { script(m); }, m_reportFailures, "menu script");
    m_running = false;
    if (m_inLoop) StartTimer(m_timeout, false);
}

void MenuDriver::CheckClosed()
{
    if (m_closeStage++ == 0) {
        ++m_unanswered;
        if (m_reportFailures)
            ADD_FAILURE() << (m_loopScripted ? "popup menu still open after its script; closed"
                                             : "unexpected popup menu; closed");
    }
    EndMenu();
    StartTimer(300, false);
}

}  // namespace qotest
