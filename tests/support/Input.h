// Input.h — real mouse and keyboard input for UI tests.
//
// These helpers go through SendInput and SetCursorPos, the way a user's hardware input arrives:
// the system routes a mouse event to the window under the cursor (or the one with the capture)
// and a key to the window with the focus, and the window sees the whole genuine message sequence
// (WM_MOUSEMOVE, WM_xBUTTONDOWN/UP, WM_xBUTTONDBLCLK, WM_CONTEXTMENU, WM_KEYDOWN, WM_CHAR, ...).
//
//     HWND list = ...;                                   // a visible window of the test
//     qotest::BringToFront(list);
//     qotest::RightClick(list, 30, 12);                  // client coordinates of `list`
//     qotest::Drag(list, {10, 10}, {120, 10});           // press, move in steps, release
//     qotest::Focus(edit);
//     qotest::TypeText("Müller");                        // WM_KEYDOWN/WM_CHAR per character
//
// Coordinates are client coordinates of the window passed (screen coordinates if it is null); the
// point must be visible. Each helper pumps a moment after each event; the Inject* functions do not
// (for use inside a menu or drag loop, which reads the events itself).
#pragma once

#include <windows.h>

#include <string>

namespace qotest {

enum class MouseButton { Left, Right };

enum : unsigned { kShift = 1, kCtrl = 2, kAlt = 4 };

void BringToFront(HWND hwnd);  // shows, raises, activates its top-level window and lets it paint
void Focus(HWND hwnd);         // activates its top-level window and gives `hwnd` the keyboard focus

POINT ToScreen(HWND hwnd, int x, int y);
void MoveMouse(HWND hwnd, int x, int y);
void Click(HWND hwnd, int x, int y, MouseButton button = MouseButton::Left);
void DoubleClick(HWND hwnd, int x, int y, MouseButton button = MouseButton::Left);
void RightClick(HWND hwnd, int x, int y);
// Presses at `from`, moves in `steps` steps to `to`, releases there.
void Drag(HWND hwnd, POINT from, POINT to, MouseButton button = MouseButton::Left, int steps = 8);

// Keyboard (to the window with the focus)
void KeyPress(WORD vk, unsigned modifiers = 0);
// Types Windows-1252 text: characters on the keyboard layout as their keys (with Shift where
// needed), others as Unicode key events; '\n' is the Enter key.
void TypeText(const std::string& text);

// Without pumping, in screen coordinates.
void InjectMove(POINT screen);
void InjectButton(MouseButton button, bool down);
void InjectKey(WORD vk, bool down);

}  // namespace qotest
