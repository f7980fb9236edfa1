#include "DialogDriver.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <exception>

namespace qotest {

namespace {

constexpr UINT_PTR kScriptTimer = 0x51A0;
constexpr UINT_PTR kWatchTimer = 0x51A1;
constexpr UINT kEscalationMs = 300;  // between the steps of a forced close

thread_local DialogDriver* t_driver = nullptr;

std::string ClassOf(HWND hwnd)
{
    char name[64] = "";
    if (hwnd) GetClassNameA(hwnd, name, sizeof name);
    return name;
}

bool IsClass(HWND hwnd, const char* name) { return lstrcmpiA(ClassOf(hwnd).c_str(), name) == 0; }

HWND ComboEdit(HWND combo)
{
    for (HWND child = GetWindow(combo, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT))
        if (IsClass(child, "Edit")) return child;
    return nullptr;
}

}  // namespace

namespace detail {

void RunGuarded(const std::function<void()>& script, bool report, const std::string& what)
{
    try {
        script();
    } catch (const std::exception& e) {
        if (report) ADD_FAILURE() << what << " threw: " << e.what();
    } catch (...) {
        if (report) ADD_FAILURE() << what << " threw";
    }
}

}  // namespace detail

std::string WindowText(HWND hwnd)
{
    if (!hwnd) return std::string();
    std::string s(static_cast<size_t>(GetWindowTextLengthA(hwnd)) + 1, '\0');
    s.resize(static_cast<size_t>(std::max(GetWindowTextA(hwnd, &s[0], static_cast<int>(s.size())), 0)));
    return s;
}

void PumpWith(DWORD ms, BOOL (*pre)(MSG*))
{
    const DWORD start = GetTickCount();
    for (;;) {
        MSG msg;
        while (PeekMessageA(&msg, nullptr, 0, 0, PM_REMOVE)) {
            if (msg.message == WM_QUIT) {  // leave it for the loop that owns it
                PostQuitMessage(static_cast<int>(msg.wParam));
                return;
            }
            if (pre && pre(&msg)) continue;
            TranslateMessage(&msg);
            DispatchMessageA(&msg);
        }
        DWORD elapsed = GetTickCount() - start;
        if (elapsed >= ms) return;
        MsgWaitForMultipleObjects(0, nullptr, FALSE, ms - elapsed, QS_ALLINPUT);
    }
}

bool WaitFor(const std::function<bool()>& done, DWORD ms)
{
    const DWORD start = GetTickCount();
    while (!done()) {
        if (GetTickCount() - start >= ms) return done();
        PumpFor(10);
    }
    return true;
}

std::string Dialog::Title() const { return WindowText(m_hwnd); }

std::string Dialog::Text(int id) const { return WindowText(Item(id)); }

std::string Dialog::MessageText() const { return Text(0xFFFF); }

std::string Dialog::ClassName(int id) const { return ClassOf(Item(id)); }

bool Dialog::IsVisible(int id) const
{
    HWND h = Item(id);
    return h && IsWindowVisible(h);
}

bool Dialog::IsEnabled(int id) const
{
    HWND h = Item(id);
    return h && IsWindowEnabled(h);
}

bool Dialog::IsChecked(int id) const
{
    HWND h = Item(id);
    return h && SendMessageA(h, BM_GETCHECK, 0, 0) == BST_CHECKED;
}

int Dialog::Selection(int id) const
{
    HWND h = Item(id);
    if (!h) return -1;
    LRESULT r = IsClass(h, "ComboBox") ? SendMessageA(h, CB_GETCURSEL, 0, 0)
                                       : SendMessageA(h, LB_GETCURSEL, 0, 0);
    return r < 0 ? -1 : static_cast<int>(r);
}

std::vector<std::string> Dialog::ListItems(int id) const
{
    std::vector<std::string> items;
    HWND h = Item(id);
    const LRESULT n = h ? SendMessageA(h, LB_GETCOUNT, 0, 0) : 0;
    for (LRESULT i = 0; i < n; ++i) {
        std::string s(static_cast<size_t>(std::max<LRESULT>(SendMessageA(h, LB_GETTEXTLEN, i, 0), 0)) + 1, '\0');
        s.resize(static_cast<size_t>(std::max<LRESULT>(SendMessageA(h, LB_GETTEXT, i, reinterpret_cast<LPARAM>(&s[0])), 0)));
        items.push_back(s);
    }
    return items;
}

std::vector<int> Dialog::ButtonIds() const
{
    std::vector<std::pair<int, int>> found;  // x position, id
    for (HWND child = GetWindow(m_hwnd, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT)) {
        if (!IsClass(child, "Button") || !IsWindowVisible(child)) continue;
        LONG type = GetWindowLongA(child, GWL_STYLE) & BS_TYPEMASK;
        if (type != BS_PUSHBUTTON && type != BS_DEFPUSHBUTTON) continue;
        RECT rc;
        GetWindowRect(child, &rc);
        found.emplace_back(rc.left, GetDlgCtrlID(child));
    }
    std::sort(found.begin(), found.end());
    std::vector<int> ids;
    for (auto& f : found) ids.push_back(f.second);
    return ids;
}

IconKind Dialog::Icon() const
{
    for (HWND child = GetWindow(m_hwnd, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT)) {
        if (!IsClass(child, "Static")) continue;
        if ((GetWindowLongA(child, GWL_STYLE) & SS_TYPEMASK) != SS_ICON) continue;
        HICON icon = reinterpret_cast<HICON>(SendMessageA(child, STM_GETICON, 0, 0));
        if (!icon || !IsWindowVisible(child)) continue;
        if (icon == LoadIcon(nullptr, IDI_QUESTION)) return IconKind::Question;
        if (icon == LoadIcon(nullptr, IDI_HAND)) return IconKind::Error;
        if (icon == LoadIcon(nullptr, IDI_EXCLAMATION)) return IconKind::Warning;
        if (icon == LoadIcon(nullptr, IDI_ASTERISK)) return IconKind::Information;
        return IconKind::Other;
    }
    return IconKind::None;
}

HWND Dialog::Control(int id, const char* action, bool mustBeEnabled) const
{
    HWND h = Item(id);
    if (!h) {
        ADD_FAILURE() << action << ": dialog \"" << Title() << "\" has no control " << id;
        return nullptr;
    }
    if (mustBeEnabled && (!IsWindowEnabled(h) || !IsWindowVisible(h))) {
        ADD_FAILURE() << action << ": control " << id << " of dialog \"" << Title() << "\" is "
                      << (IsWindowEnabled(h) ? "hidden" : "disabled");
        return nullptr;
    }
    return h;
}

bool Dialog::SetText(int id, const std::string& text)
{
    HWND h = Control(id, "SetText", true);
    if (!h) return false;
    HWND edit = IsClass(h, "Edit") ? h : IsClass(h, "ComboBox") ? ComboEdit(h) : nullptr;
    if (IsClass(h, "ComboBox") && !edit) {
        ADD_FAILURE() << "SetText: combo box " << id << " has no edit field; use Select";
        return false;
    }
    if (!edit) {
        SendMessageA(h, WM_SETTEXT, 0, reinterpret_cast<LPARAM>(text.c_str()));
        return true;
    }
    if (GetWindowLongA(edit, GWL_STYLE) & ES_READONLY) {
        ADD_FAILURE() << "SetText: edit " << id << " of dialog \"" << Title() << "\" is read-only";
        return false;
    }
    // Replacing the selection is user input to the edit: it notifies its parent itself.
    SendMessageA(edit, EM_SETSEL, 0, -1);
    SendMessageA(edit, EM_REPLACESEL, TRUE, reinterpret_cast<LPARAM>(text.c_str()));
    return true;
}

bool Dialog::Type(int id, const std::string& text)
{
    HWND h = Control(id, "Type", true);
    if (!h) return false;
    HWND target = IsClass(h, "ComboBox") && ComboEdit(h) ? ComboEdit(h) : h;
    SetFocus(target);
    for (unsigned char c : text) {
        WPARAM ch = c == '\n' ? '\r' : c;  // the Enter key produces a carriage return
        SendMessageA(target, WM_CHAR, ch, 1);
    }
    return true;
}

bool Dialog::Check(int id, bool checked)
{
    HWND h = Control(id, "Check", true);
    if (!h) return false;
    const WPARAM want = checked ? BST_CHECKED : BST_UNCHECKED;
    // A three-state box needs up to two clicks; a radio button cannot be unchecked by a click.
    for (int i = 0; i <= 3 && IsWindow(h); ++i) {
        if (static_cast<WPARAM>(SendMessageA(h, BM_GETCHECK, 0, 0)) == want) return true;
        if (i < 3) SendMessageA(h, BM_CLICK, 0, 0);
    }
    ADD_FAILURE() << "Check: control " << id << " of dialog \"" << Title()
                  << "\" did not become " << (checked ? "checked" : "unchecked");
    return false;
}

bool Dialog::Select(int id, int index)
{
    HWND h = Control(id, "Select", true);
    if (!h) return false;
    HWND parent = GetParent(h);
    if (IsClass(h, "ComboBox")) {
        if (SendMessageA(h, CB_SETCURSEL, index, 0) == CB_ERR) {
            ADD_FAILURE() << "Select: combo box " << id << " has no entry " << index;
            return false;
        }
        SendMessageA(parent, WM_COMMAND, MAKEWPARAM(id, CBN_SELCHANGE), reinterpret_cast<LPARAM>(h));
        return true;
    }
    if (IsClass(h, "ListBox")) {
        LONG style = GetWindowLongA(h, GWL_STYLE);
        LRESULT count = SendMessageA(h, LB_GETCOUNT, 0, 0);
        if (index < 0 || index >= count) {
            ADD_FAILURE() << "Select: list box " << id << " has no entry " << index;
            return false;
        }
        if (style & (LBS_MULTIPLESEL | LBS_EXTENDEDSEL)) {
            SendMessageA(h, LB_SETSEL, FALSE, -1);
            SendMessageA(h, LB_SETSEL, TRUE, index);
            SendMessageA(h, LB_SETCARETINDEX, index, FALSE);
        } else {
            SendMessageA(h, LB_SETCURSEL, index, 0);
        }
        if (style & LBS_NOTIFY)
            SendMessageA(parent, WM_COMMAND, MAKEWPARAM(id, LBN_SELCHANGE), reinterpret_cast<LPARAM>(h));
        return true;
    }
    ADD_FAILURE() << "Select: control " << id << " is a " << ClassOf(h) << ", not a combo or list box";
    return false;
}

bool Dialog::SelectText(int id, const std::string& text)
{
    HWND h = Control(id, "SelectText", true);
    if (!h) return false;
    bool combo = IsClass(h, "ComboBox");
    LRESULT i = SendMessageA(h, combo ? CB_FINDSTRINGEXACT : LB_FINDSTRINGEXACT, static_cast<WPARAM>(-1),
                             reinterpret_cast<LPARAM>(text.c_str()));
    if (i < 0) {
        ADD_FAILURE() << "SelectText: control " << id << " has no entry \"" << text << "\"";
        return false;
    }
    return Select(id, static_cast<int>(i));
}

bool Dialog::Press(int buttonId)
{
    HWND h = Control(buttonId, "Press", true);
    if (!h) return false;
    PostMessageA(m_hwnd, WM_COMMAND, MAKEWPARAM(buttonId, BN_CLICKED), reinterpret_cast<LPARAM>(h));
    return true;
}

void Dialog::Cancel() { PostMessageA(m_hwnd, WM_COMMAND, MAKEWPARAM(IDCANCEL, BN_CLICKED), 0); }

LRESULT Dialog::Send(int id, UINT msg, WPARAM wp, LPARAM lp) const
{
    HWND h = Item(id);
    return h ? SendMessageA(h, msg, wp, lp) : 0;
}

DialogDriver::DialogDriver()
{
    m_previous = t_driver;
    t_driver = this;
    m_hook = SetWindowsHookExA(WH_CBT, CbtProc, nullptr, GetCurrentThreadId());
    if (!m_hook) ADD_FAILURE() << "DialogDriver: SetWindowsHookEx failed, error " << GetLastError();
}

DialogDriver::~DialogDriver()
{
    if (m_hook) UnhookWindowsHookEx(m_hook);
    if (m_reportFailures && !m_queue.empty())
        ADD_FAILURE() << m_queue.size() << " dialog script(s) never ran: the dialogs did not appear";
    for (const Watch& w : m_watch) {
        if (!IsWindow(w.hwnd)) continue;
        KillTimer(w.hwnd, kScriptTimer);
        KillTimer(w.hwnd, kWatchTimer);
    }
    t_driver = m_previous;
}

void DialogDriver::Expect(DialogScript script) { m_queue.push_back(std::move(script)); }

LRESULT CALLBACK DialogDriver::CbtProc(int code, WPARAM wp, LPARAM lp)
{
    DialogDriver* self = t_driver;
    if (self && code == HCBT_ACTIVATE) self->OnActivate(reinterpret_cast<HWND>(wp));
    if (self && code == HCBT_DESTROYWND) self->OnDestroy(reinterpret_cast<HWND>(wp));
    return CallNextHookEx(nullptr, code, wp, lp);
}

DialogDriver::Watch* DialogDriver::Find(HWND hwnd)
{
    for (Watch& w : m_watch)
        if (w.hwnd == hwnd) return &w;
    return nullptr;
}

void DialogDriver::OnActivate(HWND hwnd)
{
    // Only top-level dialogs, and each only once: a dialog is activated again when a nested box
    // over it closes.
    if (!IsClass(hwnd, "#32770") || (GetWindowLongA(hwnd, GWL_STYLE) & WS_CHILD) || Find(hwnd))
        return;
    ++m_seen;
    bool scripted = !m_queue.empty();
    m_watch.push_back(Watch{hwnd, scripted, 0});
    // Without a script the dialog is closed a moment later, as an unanswered one.
    SetTimer(hwnd, scripted ? kScriptTimer : kWatchTimer, m_delay, TimerProc);
}

void DialogDriver::OnDestroy(HWND hwnd)
{
    m_watch.erase(std::remove_if(m_watch.begin(), m_watch.end(),
                                 [hwnd](const Watch& w) { return w.hwnd == hwnd; }),
                  m_watch.end());
}

void CALLBACK DialogDriver::TimerProc(HWND hwnd, UINT, UINT_PTR id, DWORD)
{
    KillTimer(hwnd, id);
    DialogDriver* self = t_driver;
    if (!self || !self->Find(hwnd)) return;
    if (id == kScriptTimer) self->RunScript(hwnd);
    else if (id == kWatchTimer) self->CheckClosed(hwnd);
}

void DialogDriver::RunScript(HWND hwnd)
{
    if (m_queue.empty()) return;
    DialogScript script = std::move(m_queue.front());
    m_queue.pop_front();
    ++m_running;
    Dialog d(hwnd);
    detail::RunGuarded([&] { script(d); }, m_reportFailures, "script for \"" + WindowText(hwnd) + "\"");
    --m_running;
    // The watch may be gone already (the script's own pumping closed the dialog).
    if (IsWindow(hwnd) && Find(hwnd)) SetTimer(hwnd, kWatchTimer, m_timeout, TimerProc);
}

void DialogDriver::CheckClosed(HWND hwnd)
{
    Watch* w = Find(hwnd);
    if (!w || !IsWindow(hwnd)) return;
    // A nested modal box disables its owner; wait until it has gone.
    if (!IsWindowEnabled(hwnd)) {
        SetTimer(hwnd, kWatchTimer, kEscalationMs, TimerProc);
        return;
    }
    int stage = w->stage++;
    if (stage == 0) {
        const std::string title = WindowText(hwnd);
        ++m_unanswered;
        if (m_reportFailures)
            ADD_FAILURE() << (w->scripted ? "dialog \"" + title + "\" still open after its script; closed"
                                          : "unexpected dialog \"" + title + "\"; closed");
        PostMessageA(hwnd, WM_COMMAND, MAKEWPARAM(IDCANCEL, BN_CLICKED), 0);
    } else if (stage == 1) {
        PostMessageA(hwnd, WM_CLOSE, 0, 0);
    } else if (stage == 2) {
        EndDialog(hwnd, IDCANCEL);
    } else {
        DestroyWindow(hwnd);
        return;
    }
    SetTimer(hwnd, kWatchTimer, kEscalationMs, TimerProc);
}

}  // namespace qotest
