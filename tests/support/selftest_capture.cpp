// Window pictures: the screen's real pixels, written as PNG by our encoder and read back.
#include "Capture.h"
#include "DialogDriver.h"
#include "selftest_window.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>

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
    EXPECT_EQ(kBlue, img.Pixel(5, 5));
    EXPECT_EQ(kBlue, img.Pixel(19, 19));
    EXPECT_EQ(kRed, img.Pixel(20, 20));
    EXPECT_EQ(kRed, img.Pixel(100, 80));
    EXPECT_EQ(CLR_INVALID, img.Pixel(160, 0));

    // The whole window includes the frame around the client area.
    char dir[MAX_PATH];
    GetTempPathA(MAX_PATH, dir);
    std::string saved = std::getenv("QO_CAPTURE_DIR") ? std::getenv("QO_CAPTURE_DIR") : "";
    SetEnvironmentVariableA("QO_CAPTURE_DIR", nullptr);
    _putenv((std::string("QO_CAPTURE_DIR=") + dir + "qo-capture-test").c_str());
    std::string path = qotest::CapturePath("fenster.png");
    EXPECT_EQ(std::string(dir) + "qo-capture-test\\fenster.png", path);
    ASSERT_TRUE(qotest::CaptureWindow(win.Hwnd(), path.c_str()));
    _putenv((std::string("QO_CAPTURE_DIR=") + saved).c_str());

    qotest::Image file;
    ASSERT_TRUE(qotest::ReadPng(path.c_str(), file));
    RECT wr, cr;
    GetWindowRect(win.Hwnd(), &wr);
    GetClientRect(win.Hwnd(), &cr);
    MapWindowPoints(win.Hwnd(), nullptr, reinterpret_cast<POINT*>(&cr), 2);
    EXPECT_EQ(wr.right - wr.left, file.width);
    EXPECT_EQ(wr.bottom - wr.top, file.height);
    int cx = cr.left - wr.left, cy = cr.top - wr.top;  // client origin in the picture
    EXPECT_EQ(kBlue, file.Pixel(cx + 3, cy + 3));
    EXPECT_EQ(kRed, file.Pixel(cx + 80, cy + 60));
    std::remove(path.c_str());
}

TEST(Capture, PngRoundTripAndDamageDetection)
{
    // Larger than one stored block (65535 bytes), with every byte value.
    qotest::Image img;
    img.Resize(300, 160);
    unsigned seed = 12345;
    for (uint8_t& b : img.rgb) b = static_cast<uint8_t>((seed = seed * 1103515245u + 12345u) >> 16);
    std::vector<uint8_t> png;
    ASSERT_TRUE(qotest::EncodePng(img, png));
    EXPECT_GT(png.size(), 2u * 65535u);

    qotest::Image back;
    ASSERT_TRUE(qotest::DecodePng(png, back));
    EXPECT_EQ(img.width, back.width);
    EXPECT_EQ(img.height, back.height);
    EXPECT_TRUE(img.rgb == back.rgb);

    std::vector<uint8_t> damaged = png;
    damaged[damaged.size() / 2] ^= 0x40;  // inside the image data: the chunk CRC no longer fits
    EXPECT_FALSE(qotest::DecodePng(damaged, back));
    damaged = png;
    damaged.resize(png.size() - 20);
    EXPECT_FALSE(qotest::DecodePng(damaged, back));

    qotest::Image empty;
    EXPECT_FALSE(qotest::EncodePng(empty, png));
}

}  // namespace
