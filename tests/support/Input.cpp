#include "Input.h"

#include "DialogDriver.h"

#include <vector>

namespace qotest {

namespace {

constexpr DWORD kSettleMs = 20;  // pumping after each event

void Send(INPUT& in)
{
    SendInput(1, &in, sizeof(INPUT));
}

}  // namespace

void BringToFront(HWND hwnd)
{
    HWND top = GetAncestor(hwnd, GA_ROOT);
    if (!top) top = hwnd;
    if (!IsWindowVisible(top)) ShowWindow(top, SW_SHOW);
    SetWindowPos(top, HWND_TOP, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE | SWP_SHOWWINDOW);
    SetForegroundWindow(top);
    SetActiveWindow(top);
    RedrawWindow(top, nullptr, nullptr, RDW_INVALIDATE | RDW_ERASE | RDW_ALLCHILDREN | RDW_UPDATENOW);
    PumpFor(50);
}

void Focus(HWND hwnd)
{
    BringToFront(hwnd);
    SetFocus(hwnd);
    PumpFor(kSettleMs);
}

POINT ToScreen(HWND hwnd, int x, int y)
{
    POINT pt = {x, y};
    if (hwnd) ClientToScreen(hwnd, &pt);
    return pt;
}

void InjectMove(POINT screen)
{
    // SetCursorPos places the pointer exactly; the move event makes the system send WM_MOUSEMOVE.
    SetCursorPos(screen.x, screen.y);
    const int w = GetSystemMetrics(SM_CXSCREEN), h = GetSystemMetrics(SM_CYSCREEN);
    INPUT in = {};
    in.type = INPUT_MOUSE;
    in.mi.dx = static_cast<LONG>((screen.x * 65536LL + w - 1) / w);
    in.mi.dy = static_cast<LONG>((screen.y * 65536LL + h - 1) / h);
    in.mi.dwFlags = MOUSEEVENTF_MOVE | MOUSEEVENTF_ABSOLUTE;
    Send(in);
    POINT now;
    if (GetCursorPos(&now) && (now.x != screen.x || now.y != screen.y)) SetCursorPos(screen.x, screen.y);
}

void InjectButton(MouseButton button, bool down)
{
    INPUT in = {};
    in.type = INPUT_MOUSE;
    if (button == MouseButton::Right) in.mi.dwFlags = down ? MOUSEEVENTF_RIGHTDOWN : MOUSEEVENTF_RIGHTUP;
    else in.mi.dwFlags = down ? MOUSEEVENTF_LEFTDOWN : MOUSEEVENTF_LEFTUP;
    Send(in);
}

void InjectKey(WORD vk, bool down)
{
    INPUT in = {};
    in.type = INPUT_KEYBOARD;
    in.ki.wVk = vk;
    in.ki.wScan = static_cast<WORD>(MapVirtualKeyA(vk, MAPVK_VK_TO_VSC));
    in.ki.dwFlags = down ? 0 : KEYEVENTF_KEYUP;
    switch (vk) {  // keys of the extended block
    case VK_LEFT: case VK_RIGHT: case VK_UP: case VK_DOWN: case VK_HOME: case VK_END:
    case VK_PRIOR: case VK_NEXT: case VK_INSERT: case VK_DELETE: case VK_APPS:
        in.ki.dwFlags |= KEYEVENTF_EXTENDEDKEY;
        break;
    default: break;
    }
    Send(in);
}

void MoveMouse(HWND hwnd, int x, int y)
{
    InjectMove(ToScreen(hwnd, x, y));
    PumpFor(kSettleMs);
}

void Click(HWND hwnd, int x, int y, MouseButton button)
{
    MoveMouse(hwnd, x, y);
    InjectButton(button, true);
    PumpFor(kSettleMs);
    InjectButton(button, false);
    PumpFor(kSettleMs);
}

void DoubleClick(HWND hwnd, int x, int y, MouseButton button)
{
    MoveMouse(hwnd, x, y);
    for (int i = 0; i < 2; ++i) {
        InjectButton(button, true);
        PumpFor(5);
        InjectButton(button, false);
        PumpFor(5);
    }
    PumpFor(kSettleMs);
}

void RightClick(HWND hwnd, int x, int y) { Click(hwnd, x, y, MouseButton::Right); }

void Drag(HWND hwnd, POINT from, POINT to, MouseButton button, int steps)
{
    if (steps < 1) steps = 1;
    MoveMouse(hwnd, from.x, from.y);
    InjectButton(button, true);
    PumpFor(kSettleMs);
    for (int i = 1; i <= steps; ++i) {
        int x = from.x + (to.x - from.x) * i / steps;
        int y = from.y + (to.y - from.y) * i / steps;
        MoveMouse(hwnd, x, y);
    }
    InjectButton(button, false);
    PumpFor(kSettleMs);
}

void KeyPress(WORD vk, unsigned modifiers)
{
    if (modifiers & kCtrl) InjectKey(VK_CONTROL, true);
    if (modifiers & kAlt) InjectKey(VK_MENU, true);
    if (modifiers & kShift) InjectKey(VK_SHIFT, true);
    InjectKey(vk, true);
    InjectKey(vk, false);
    if (modifiers & kShift) InjectKey(VK_SHIFT, false);
    if (modifiers & kAlt) InjectKey(VK_MENU, false);
    if (modifiers & kCtrl) InjectKey(VK_CONTROL, false);
    PumpFor(kSettleMs);
}

void TypeText(const std::string& text)
{
    for (unsigned char c : text) {
        if (c == '\n') {
            KeyPress(VK_RETURN);
            continue;
        }
        SHORT scan = c < 0x80 ? VkKeyScanA(static_cast<char>(c)) : -1;
        if (scan != -1 && !(HIBYTE(scan) & ~1)) {  // on the layout, at most with Shift
            KeyPress(LOBYTE(scan), (HIBYTE(scan) & 1) ? kShift : 0);
            continue;
        }
        wchar_t wc = 0;
        char ch = static_cast<char>(c);
        MultiByteToWideChar(1252, 0, &ch, 1, &wc, 1);
        INPUT in[2] = {};
        for (int i = 0; i < 2; ++i) {
            in[i].type = INPUT_KEYBOARD;
            in[i].ki.wScan = wc;
            in[i].ki.dwFlags = KEYEVENTF_UNICODE | (i ? KEYEVENTF_KEYUP : 0);
        }
        SendInput(2, in, sizeof(INPUT));
        PumpFor(kSettleMs);
    }
}

}  // namespace qotest
