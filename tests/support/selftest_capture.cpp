// Window pictures: the screen's real pixels, and the PNG file written of them.
#include "Capture.h"
#include "DialogDriver.h"
#include "selftest_window.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>
#include <string>

namespace {

const COLORREF kRed = RGB(200, 30, 60);
const COLORREF kBlue = RGB(10, 40, 220);

TEST(Capture, PictureShowsWhatTheWindowPainted)
{
    selftest::RecordingWindow win(160, 120, kRed);
    win.onPaint = [](HDC dc) {
        RECT square = {0, 0, 20, 20};
        HBRUSH brush = CreateSolidBrush(kBlue);
        FillRect(dc, &square, brush);
        DeleteObject(brush);
    };
    InvalidateRect(win.Hwnd(), nullptr, TRUE);

    qotest::Image img;
    ASSERT_TRUE(qotest::CaptureImage(win.Hwnd(), img, true));
    EXPECT_EQ(160, img.width);
    EXPECT_EQ(120, img.height);
    EXPECT_EQ(kBlue, img.Pixel(19, 19));
    EXPECT_EQ(kRed, img.Pixel(20, 20));
    EXPECT_EQ(CLR_INVALID, img.Pixel(160, 0));

    char dir[MAX_PATH];
    GetTempPathA(MAX_PATH, dir);
    const std::string path = std::string(dir) + "qo-capture-test.png";
    ASSERT_TRUE(qotest::CaptureWindow(win.Hwnd(), path.c_str()));

    // A PNG of the whole window, frame included.
    std::ifstream in(path, std::ios::binary);
    std::string head(24, '\0');
    in.read(&head[0], 24);
    auto be32 = [&head](size_t at) {
        return (unsigned(uint8_t(head[at])) << 24) | (unsigned(uint8_t(head[at + 1])) << 16) |
               (unsigned(uint8_t(head[at + 2])) << 8) | unsigned(uint8_t(head[at + 3]));
    };
    RECT wr;
    GetWindowRect(win.Hwnd(), &wr);
    EXPECT_EQ(std::string("\x89PNG\r\n\x1a\n\0\0\0\x0dIHDR", 16), head.substr(0, 16));
    EXPECT_EQ(unsigned(wr.right - wr.left), be32(16));
    EXPECT_EQ(unsigned(wr.bottom - wr.top), be32(20));
    in.close();
    std::remove(path.c_str());
}

}  // namespace
