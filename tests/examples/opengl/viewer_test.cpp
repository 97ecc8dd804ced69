// Runs the viewer in a real window: what the screen shows, its mouse wheel, its way out.
#include "tests/support/program.h"

#include "apps/common/imagefile.h"

#include <gtest/gtest.h>

#include <windows.h>

#include <functional>

namespace {

/// Asks until it is so or half a minute is over.
bool Eventually(std::function<bool()> const &isSo) {
    for (int tries = 0; tries < 1500; ++tries) {
        if (isSo())
            return true;
        ::Sleep(20);
    }
    return false;
}

/// The viewer with a photo. With even sides no pixel is sampled on the border of two when zoomed.
class Viewer {
public:
    Viewer() {
        Eventually([this] {
            window_ = ::FindWindowA("ORU viewer", "coffee.png");
            return window_ && ::IsWindowVisible(window_);
        });
    }

    void post(UINT message, WPARAM wParam) const { ::PostMessageW(window_, message, wParam, 0); }
    void turnWheel(int notches) const {
        post(WM_MOUSEWHEEL, static_cast<WPARAM>(notches * WHEEL_DELTA) << 16);
    }

    /// Whether the screen comes to show the middle of the photo, each of its pixels `zoom` wide.
    bool shows(std::size_t zoom) const {
        return Eventually([&] { return wrongPixels(zoom) == 0; });
    }

    int exitCode() const { return process_.exitCode(); }

private:
    /// How many of the window's pixels, in a grid that is no multiple of any zoom, are others.
    int wrongPixels(std::size_t zoom) const {
        POINT corner = {};
        ::ClientToScreen(window_, &corner);
        HDC const screen = ::GetDC(nullptr);
        std::size_t const left = (photo_.width - photo_.width / zoom) / 2;
        std::size_t const top = (photo_.height - photo_.height / zoom) / 2;
        int wrong = 0;
        for (std::size_t y = 0; y < photo_.height; y += 19)
            for (std::size_t x = 0; x < photo_.width; x += 23) {
                auto const *const pixel = photo_.row(top + y / zoom) + 3 * (left + x / zoom);
                wrong +=
                    ::GetPixel(screen, corner.x + static_cast<int>(x),
                               corner.y + static_cast<int>(y)) != RGB(pixel[0], pixel[1], pixel[2]);
            }
        ::ReleaseDC(nullptr, screen);
        return wrong;
    }

    App::Image const photo_ = App::ReadImage(ORU_PHOTOS "/coffee.png", {4096});
    apps_test::Process const process_{"viewer.exe", "\"" ORU_PHOTOS "/coffee.png\"",
                                      apps_test::ProgramFolder()};
    HWND window_ = nullptr;
};

} // namespace

TEST(ViewerExample, ShowsZoomsAndCloses) {
    Viewer const viewer;
    ASSERT_TRUE(viewer.shows(1));
    viewer.turnWheel(1);
    ASSERT_TRUE(viewer.shows(2));
    viewer.turnWheel(1);
    ASSERT_TRUE(viewer.shows(4));
    viewer.turnWheel(-1);
    viewer.turnWheel(-1);
    ASSERT_TRUE(viewer.shows(1));
    viewer.post(WM_KEYDOWN, VK_ESCAPE);
    EXPECT_EQ(0, viewer.exitCode());
}
