// Capture.h — pictures of windows as PNG files, for looking at a page and for checking colours.
//
//     qotest::CaptureWindow(page, qotest::CapturePath("input-page.png").c_str());
//
//     qotest::Image img;
//     ASSERT_TRUE(qotest::CaptureImage(list, img));
//     EXPECT_EQ(RGB(255, 0, 0), img.Pixel(5, 20));        // what the user sees at (5,20)
//
// Capturing brings the top-level window to the front, lets it paint and copies the window's
// rectangle from the screen: what the user sees. PNG files use stored deflate blocks.
#pragma once

#include <windows.h>

#include <cstdint>
#include <string>
#include <vector>

namespace qotest {

// An RGB picture, rows top to bottom, 3 bytes per pixel (red, green, blue).
struct Image {
    int width = 0;
    int height = 0;
    std::vector<uint8_t> rgb;

    COLORREF Pixel(int x, int y) const;  // RGB(...) of a pixel; CLR_INVALID outside
};

// Copies what the screen shows of `hwnd` (its window rectangle; client area only if `clientOnly`).
bool CaptureImage(HWND hwnd, Image& out, bool clientOnly = false);
// Captures and writes a PNG file.
bool CaptureWindow(HWND hwnd, const char* pngPath, bool clientOnly = false);
// QO_CAPTURE_DIR (or ".") joined with `fileName`; the folder is created if needed.
std::string CapturePath(const std::string& fileName);

}  // namespace qotest
