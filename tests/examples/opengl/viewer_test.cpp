// Runs the viewer in a real window: screenshots of it, its mouse wheel, its way out.
#include "tests/support/program.h"

#include "apps/common/imagefile.h"
#include "apps/common/unicode.h"

#include <gtest/gtest.h>

#include <windows.h>

#include <chrono>
#include <cstring>
#include <functional>
#include <string>
#include <thread>

namespace {

namespace fs = std::filesystem;

/// Asks until it is so or half a minute is over.
bool Eventually(std::function<bool()> const &isSo) {
    auto const end = std::chrono::steady_clock::now() + std::chrono::seconds(30);
    while (!isSo()) {
        if (std::chrono::steady_clock::now() > end)
            return false;
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
    }
    return true;
}

/// The viewer with a photo.
class Viewer {
public:
    explicit Viewer(fs::path const &photo)
        : process_("viewer.exe", "\"" + App::ToText(photo) + "\"", apps_test::ProgramFolder()) {
        Eventually([&] {
            window_ = ::FindWindowW(L"ORU viewer", photo.filename().c_str());
            return window_ && ::IsWindowVisible(window_);
        });
    }

    void post(UINT message, WPARAM wParam) const { ::PostMessageW(window_, message, wParam, 0); }
    void turnWheel(int notches) const {
        post(WM_MOUSEWHEEL, static_cast<WPARAM>(notches * WHEEL_DELTA) << 16);
    }

    /// What the screen shows inside the window.
    App::Image screenshot() const {
        RECT inside = {};
        POINT corner = {};
        ::GetClientRect(window_, &inside);
        ::ClientToScreen(window_, &corner);
        int const width = inside.right, height = inside.bottom;
        BITMAPINFO info = {};
        info.bmiHeader.biSize = sizeof info.bmiHeader;
        info.bmiHeader.biWidth = width;
        info.bmiHeader.biHeight = -height; // from top to bottom
        info.bmiHeader.biPlanes = 1;
        info.bmiHeader.biBitCount = 32;
        HDC const screen = ::GetDC(nullptr);
        HDC const memory = ::CreateCompatibleDC(screen);
        void *bits = nullptr;
        HBITMAP const bitmap = ::CreateDIBSection(memory, &info, DIB_RGB_COLORS, &bits, nullptr, 0);
        HGDIOBJ const previous = ::SelectObject(memory, bitmap);
        ::BitBlt(memory, 0, 0, width, height, screen, corner.x, corner.y, SRCCOPY);
        ::GdiFlush();
        App::Image image({static_cast<std::size_t>(width), static_cast<std::size_t>(height), 3, 8});
        auto const *source = static_cast<unsigned char const *>(bits);
        for (std::size_t i = 0; i < image.width * image.height; ++i) {
            for (std::size_t c = 0; c < 3; ++c)
                image.pixels[3 * i + c] = source[4 * i + 2 - c]; // blue comes first
        }
        ::SelectObject(memory, previous);
        ::DeleteObject(bitmap);
        ::DeleteDC(memory);
        ::ReleaseDC(nullptr, screen);
        return image;
    }

    /// Whether the screen comes to show a picture.
    bool shows(App::Image const &picture) const {
        return Eventually([&] {
            App::Image const shown = screenshot();
            return static_cast<App::Shape const &>(shown) == picture &&
                   shown.pixels == picture.pixels;
        });
    }

    int exitCode() const { return process_.exitCode(); }

private:
    apps_test::Process const process_;
    HWND window_ = nullptr;
};

/// The middle of a photo, each of its pixels `zoom` pixels wide.
App::Image Zoomed(App::Image const &photo, std::size_t zoom) {
    App::Image view(photo);
    std::size_t const left = (photo.width - photo.width / zoom) / 2;
    std::size_t const top = (photo.height - photo.height / zoom) / 2;
    for (std::size_t y = 0; y < view.height; ++y)
        for (std::size_t x = 0; x < view.width; ++x)
            std::memcpy(view.row(y) + 3 * x, photo.row(top + y / zoom) + 3 * (left + x / zoom), 3);
    return view;
}

} // namespace

TEST(ViewerExample, ShowsZoomsAndCloses) {
    // With even sides no pixel of the zoomed photo is sampled on the border of two.
    fs::path const file = fs::path(ORU_PHOTOS) / "coffee.png";
    App::Image const photo = App::ReadImage(file, {4096});
    Viewer const viewer(file);
    ASSERT_TRUE(viewer.shows(photo));
    for (std::size_t const zoom : {2u, 4u}) {
        viewer.turnWheel(1);
        ASSERT_TRUE(viewer.shows(Zoomed(photo, zoom))) << zoom;
    }
    viewer.turnWheel(-1);
    viewer.turnWheel(-1);
    ASSERT_TRUE(viewer.shows(photo));
    viewer.post(WM_KEYDOWN, VK_ESCAPE);
    EXPECT_EQ(0, viewer.exitCode());
}

TEST(ViewerExample, ShowsAnOddPhotoAndClosesByItsButton) {
    fs::path const file = fs::path(ORU_PHOTOS) / "chelsea.png";
    Viewer const viewer(file);
    ASSERT_TRUE(viewer.shows(App::ReadImage(file, {4096})));
    viewer.post(WM_CLOSE, 0);
    EXPECT_EQ(0, viewer.exitCode());
}
