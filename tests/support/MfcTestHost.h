// MfcTestHost.h — the host side of UI tests of MFC windows: a visible frame for the
// windows under test, the application's message loop in small, real key presses read
// by that loop, message boxes answered on the way, temporary files and pixel counts.
// Header-only and included by MFC test programs alone: qotestsupport itself knows
// nothing of MFC.
//
//     CFrameWnd* frame = new CFrameWnd;                   // deletes itself with its window
//     ASSERT_TRUE(qotest::CreateHostFrame(frame, "Eingabe", 720, 520));
//     ...                                                 // a page as the frame's child
//     qotest::PressKey(VK_RETURN);                        // the page sees Enter as a dialog key
//     EXPECT_EQ("Bitte ...", qotest::MessageOf([&] { page.Press(IDC_APPLY); }));
//     qotest::DestroyHostFrame(frame);
#pragma once

#include <gtest/gtest.h>

#include <afxcmn.h>
#include <afxwin.h>

#include <fstream>
#include <functional>
#include <string>
#include <vector>

#include "Capture.h"
#include "DialogDriver.h"
#include "Input.h"

namespace qotest {

// The application's message loop for about `ms` milliseconds: every message goes to
// AfxPreTranslateMessage first, so that a page in a frame gets Enter, Escape and the
// frame's shortcuts as in the application.
inline void PumpApp(DWORD ms)
{
    PumpWith(ms, [](MSG* msg) -> BOOL { return AfxPreTranslateMessage(msg); });
}

// A real key press to the window with the focus (Ctrl held if `ctrl`), read by PumpApp.
inline void PressKey(WORD vk, bool ctrl = false)
{
    if (ctrl) InjectKey(VK_CONTROL, true);
    InjectKey(vk, true);
    InjectKey(vk, false);
    if (ctrl) InjectKey(VK_CONTROL, false);
    PumpApp(250);
}

// Creates `frame` as a visible top-level window at (20, 20) of the outer size given, with
// an arrow cursor and the system colour `background` (COLOR_...) behind its children
// (bring it to the front once they are there). The frame deletes itself with its window.
inline bool CreateHostFrame(CFrameWnd* frame, const char* title, int width, int height,
                            int background = COLOR_BTNFACE)
{
    const LPCTSTR cls =
        AfxRegisterWndClass(0, ::LoadCursor(NULL, IDC_ARROW), reinterpret_cast<HBRUSH>(background + 1));
    return frame->CreateEx(0, cls, title, WS_OVERLAPPEDWINDOW | WS_VISIBLE, 20, 20, width, height, NULL, NULL) !=
           FALSE;
}

// Destroys the frame's window if it is still there (which deletes the frame) and lets the
// messages of the closing windows be handled.
inline void DestroyHostFrame(CFrameWnd* frame)
{
    if (frame != NULL && ::IsWindow(frame->m_hWnd)) frame->DestroyWindow();
    PumpFor(50);
}

// A real left click at the middle of a control, then the application's loop for a moment.
inline void ClickMiddle(HWND hwnd)
{
    RECT rc;
    ::GetClientRect(hwnd, &rc);
    Click(hwnd, rc.right / 2, rc.bottom / 2);
    PumpApp(100);
}

// Types into an edit over what it holds, as a user who selected it all first.
inline void TypeOver(HWND edit, const std::string& text)
{
    Focus(edit);
    ::SendMessageA(edit, EM_SETSEL, 0, -1);
    TypeText(text);
}

// What the screen shows of the window's client area once it has painted itself anew.
inline Image Screen(HWND hwnd)
{
    ::RedrawWindow(hwnd, NULL, NULL, RDW_INVALIDATE | RDW_ERASE | RDW_UPDATENOW);
    PumpApp(100);
    Image img;
    EXPECT_TRUE(CaptureImage(hwnd, img, true));
    return img;
}

// Places a child window (a page) at (x, y) of its parent, shows it and brings its frame to the front.
inline void ShowChild(CWnd& child, int x = 0, int y = 0)
{
    child.SetWindowPos(NULL, x, y, 0, 0, SWP_NOSIZE | SWP_NOZORDER);
    child.ShowWindow(SW_SHOW);
    BringToFront(child.m_hWnd);
}

// A fixture whose frame, made by SetUp, is the application's main window while the test runs,
// as the host of a page is.
class HostFrameTest : public ::testing::Test {
protected:
    HostFrameTest(const char* title, int width, int height) : m_title(title), m_width(width), m_height(height) {}
    void SetUp() override
    {
        ASSERT_TRUE(CreateHostFrame(m_pFrame, m_title, m_width, m_height));
        AfxGetApp()->m_pMainWnd = m_pFrame;
    }
    void TearDown() override
    {
        AfxGetApp()->m_pMainWnd = NULL;  // else its end would end the program's loop
        DestroyHostFrame(m_pFrame);
    }
    CFrameWnd* m_pFrame = new CFrameWnd;  // deletes itself with its window

private:
    const char* m_title;
    int m_width, m_height;
};

// Runs `action` with one script queued for each dialog it is to open, waits until every
// script ran and a moment longer, and checks that no other dialog appeared and that none
// had to be closed by force.
inline void Answering(std::vector<DialogScript> scripts, const std::function<void()>& action,
                      DWORD ms = 3000)
{
    DialogDriver driver;
    const int expected = static_cast<int>(scripts.size());
    for (DialogScript& script : scripts) driver.Expect(std::move(script));
    action();
    EXPECT_TRUE(WaitFor([&] { return driver.Done(); }, ms)) << "a dialog did not appear";
    PumpApp(100);
    EXPECT_EQ(expected, driver.Seen());
    EXPECT_EQ(0, driver.Unanswered());
}

// A script for a message box that keeps its text in `into` and answers it with `answer`.
inline DialogScript Reading(std::string& into, int answer = IDOK)
{
    return [&into, answer](Dialog& box) {
        into = box.MessageText();
        box.Press(answer);
    };
}

// The text of the one message box that `action` shows, answered with OK.
inline std::string MessageOf(const std::function<void()>& action)
{
    std::string text;
    Answering({Reading(text)}, action);
    return text;
}

// A path in the system's temporary folder.
inline std::string TempPath(const std::string& name)
{
    char dir[MAX_PATH] = "";
    ::GetTempPathA(MAX_PATH, dir);
    return dir + name;
}

// Writes `bytes` as the file `name` in the temporary folder and returns its path.
inline std::string WriteTempFile(const std::string& name, const std::string& bytes)
{
    const std::string path = TempPath(name);
    std::ofstream(path, std::ios::binary) << bytes;
    return path;
}

// How many pixels of `img` inside `rc`, or in the whole picture, have the colour.
inline int CountPixels(const Image& img, const RECT& rc, COLORREF colour)
{
    int n = 0;
    for (int y = rc.top; y < rc.bottom; ++y)
        for (int x = rc.left; x < rc.right; ++x) n += img.Pixel(x, y) == colour;
    return n;
}
inline int CountPixels(const Image& img, COLORREF colour)
{
    return CountPixels(img, RECT{0, 0, img.width, img.height}, colour);
}

// The caption of a report list's column.
inline CString ColumnTitle(const CListCtrl& list, int col)
{
    char buf[128] = "";
    LVCOLUMN column = {};
    column.mask = LVCF_TEXT;
    column.pszText = buf;
    column.cchTextMax = sizeof(buf);
    list.GetColumn(col, &column);
    return buf;
}

}  // namespace qotest
