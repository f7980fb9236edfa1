#include "selftest_window.h"

#include "Input.h"

namespace selftest {

RecordingWindow::RecordingWindow(int cx, int cy, COLORREF background) : m_background(background)
{
    static bool registered = false;
    if (!registered) {
        WNDCLASSA wc = {};
        wc.style = CS_DBLCLKS;
        wc.lpfnWndProc = Proc;
        wc.hInstance = GetModuleHandleA(nullptr);
        wc.hCursor = LoadCursor(nullptr, IDC_ARROW);
        wc.lpszClassName = "QoSelftestWindow";
        RegisterClassA(&wc);
        registered = true;
    }
    RECT rc = {0, 0, cx, cy};
    AdjustWindowRectEx(&rc, WS_OVERLAPPEDWINDOW, FALSE, 0);
    m_hwnd = CreateWindowExA(0, "QoSelftestWindow", "Testfenster", WS_OVERLAPPEDWINDOW, 100, 100,
                             rc.right - rc.left, rc.bottom - rc.top, nullptr, nullptr,
                             GetModuleHandleA(nullptr), this);
    ShowWindow(m_hwnd, SW_SHOW);
    UpdateWindow(m_hwnd);
    qotest::BringToFront(m_hwnd);
    events.clear();
}

RecordingWindow::~RecordingWindow()
{
    if (IsWindow(m_hwnd)) DestroyWindow(m_hwnd);
}

std::vector<Event> RecordingWindow::Of(UINT msg) const
{
    std::vector<Event> out;
    for (const Event& e : events)
        if (e.msg == msg) out.push_back(e);
    return out;
}

LRESULT CALLBACK RecordingWindow::Proc(HWND hwnd, UINT msg, WPARAM wp, LPARAM lp)
{
    if (msg == WM_NCCREATE) {
        auto* cs = reinterpret_cast<CREATESTRUCTA*>(lp);
        SetWindowLongPtrA(hwnd, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(cs->lpCreateParams));
    }
    auto* self = reinterpret_cast<RecordingWindow*>(GetWindowLongPtrA(hwnd, GWLP_USERDATA));
    if (!self) return DefWindowProcA(hwnd, msg, wp, lp);
    switch (msg) {
    case WM_MOUSEMOVE: case WM_LBUTTONDOWN: case WM_LBUTTONUP: case WM_LBUTTONDBLCLK:
    case WM_RBUTTONDOWN: case WM_RBUTTONUP: case WM_RBUTTONDBLCLK:
        self->events.push_back({msg, static_cast<short>(LOWORD(lp)), static_cast<short>(HIWORD(lp)), wp});
        if (msg == WM_LBUTTONDOWN) SetCapture(hwnd);  // as a window that drags does
        if (msg == WM_LBUTTONUP && GetCapture() == hwnd) ReleaseCapture();
        break;
    case WM_CONTEXTMENU:
        self->events.push_back({msg, static_cast<short>(LOWORD(lp)), static_cast<short>(HIWORD(lp)), wp});
        return 0;
    case WM_KEYDOWN: case WM_KEYUP: case WM_CHAR: case WM_COMMAND:
        self->events.push_back({msg, 0, 0, wp});
        if (msg == WM_COMMAND) return 0;
        break;
    case WM_ERASEBKGND: {
        RECT rc;
        GetClientRect(hwnd, &rc);
        HBRUSH brush = CreateSolidBrush(self->m_background);
        FillRect(reinterpret_cast<HDC>(wp), &rc, brush);
        DeleteObject(brush);
        return 1;
    }
    case WM_PAINT: {
        PAINTSTRUCT ps;
        HDC dc = BeginPaint(hwnd, &ps);
        if (self->onPaint) self->onPaint(dc);
        EndPaint(hwnd, &ps);
        return 0;
    }
    default: break;
    }
    return DefWindowProcA(hwnd, msg, wp, lp);
}

}  // namespace selftest
