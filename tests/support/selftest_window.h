// A plain top-level test window that records the mouse, key and command messages it receives.
#pragma once

#include <windows.h>

#include <functional>
#include <vector>

namespace selftest {

struct Event {
    UINT msg;
    int x, y;      // client coordinates for mouse messages, screen for WM_CONTEXTMENU
    WPARAM wp;
};

class RecordingWindow {
public:
    // A visible, front-most window of the given client size, filled with `background`.
    RecordingWindow(int cx, int cy, COLORREF background = RGB(255, 255, 255));
    ~RecordingWindow();
    RecordingWindow(const RecordingWindow&) = delete;
    RecordingWindow& operator=(const RecordingWindow&) = delete;

    HWND Hwnd() const { return m_hwnd; }
    std::vector<Event> events;
    std::vector<Event> Of(UINT msg) const;
    // Painted over the background on WM_PAINT.
    std::function<void(HDC)> onPaint;

private:
    static LRESULT CALLBACK Proc(HWND, UINT, WPARAM, LPARAM);
    HWND m_hwnd = nullptr;
    COLORREF m_background;
};

}  // namespace selftest
