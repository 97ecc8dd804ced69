// Runs the viewer in a real window: screenshots of it, its mouse wheel, its way out.
#include "tests/support/program.h"

#include "apps/common/imagefile.h"

#include <gtest/gtest.h>

#include <windows.h>

#include <chrono>
#include <cmath>
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
    explicit Viewer(fs::path const &photo) {
        wchar_t path[MAX_PATH];
        ::GetModuleFileNameW(nullptr, path, MAX_PATH);
        std::wstring const program = (fs::path(path).parent_path() / "viewer.exe").wstring();
        std::wstring command = L"\"" + program + L"\" \"" + photo.wstring() + L"\"";
        STARTUPINFOW startup = {};
        startup.cb = sizeof startup;
        ::CreateProcessW(nullptr, command.data(), nullptr, nullptr, FALSE, 0, nullptr, nullptr,
                         &startup, &process_);
        Eventually([&] {
            window_ = ::FindWindowW(L"ORU viewer", photo.filename().c_str());
            return window_ && ::IsWindowVisible(window_);
        });
    }
    ~Viewer() {
        ::TerminateProcess(process_.hProcess, 99); // when a test left it running
        ::CloseHandle(process_.hProcess);
        ::CloseHandle(process_.hThread);
    }
    Viewer(Viewer const &) = delete;
    Viewer &operator=(Viewer const &) = delete;

    HWND window() const { return window_; }

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

    /// Waits for its end. @return its exit code, -1 when it goes on
    int exitCode() const {
        if (::WaitForSingleObject(process_.hProcess, 30000) != WAIT_OBJECT_0)
            return -1;
        DWORD code = 0;
        ::GetExitCodeProcess(process_.hProcess, &code);
        return static_cast<int>(code);
    }

private:
    PROCESS_INFORMATION process_ = {};
    HWND window_ = nullptr;
};

/// The photo in the middle of a window of its size, each of its pixels `zoom` window pixels wide.
App::Image Zoomed(App::Image const &photo, double zoom) {
    App::Image view(photo);
    auto const source = [&](std::size_t i, std::size_t size) {
        double const centre = static_cast<double>(size) / 2;
        return std::floor((static_cast<double>(i) + 0.5 - centre) / zoom + centre);
    };
    for (std::size_t y = 0; y < view.height; ++y) {
        for (std::size_t x = 0; x < view.width; ++x) {
            double const fromX = source(x, view.width), fromY = source(y, view.height);
            unsigned char *pixel = view.row(y) + 3 * x;
            if (fromX < 0 || fromY < 0 || fromX >= static_cast<double>(view.width) ||
                fromY >= static_cast<double>(view.height))
                std::memset(pixel, 64, 3); // the background
            else
                std::memcpy(pixel,
                            photo.row(static_cast<std::size_t>(fromY)) +
                                3 * static_cast<std::size_t>(fromX),
                            3);
        }
    }
    return view;
}

/// Pixels in which the screen differs from a picture, once it has had time to show it.
std::size_t Difference(Viewer const &viewer, App::Image const &wanted) {
    std::size_t different = 0;
    Eventually([&] {
        App::Image const shown = viewer.screenshot();
        if (static_cast<App::Shape const &>(shown) != wanted) {
            different = wanted.width * wanted.height;
            return false;
        }
        different = 0;
        for (std::size_t i = 0; i < wanted.pixels.size(); i += 3)
            different += std::memcmp(&shown.pixels[i], &wanted.pixels[i], 3) != 0;
        return different == 0;
    });
    return different;
}

} // namespace

TEST(ViewerExample, ShowsZoomsAndCloses) {
    // With even sides no pixel of the zoomed photo is sampled on the border of two.
    fs::path const file = fs::path(ORU_PHOTOS) / "coffee.png";
    App::Image const photo = App::ReadImage(file, {4096});
    Viewer const viewer(file);
    ASSERT_NE(nullptr, viewer.window());
    EXPECT_EQ(0u, Difference(viewer, photo));
    viewer.turnWheel(1);
    EXPECT_EQ(0u, Difference(viewer, Zoomed(photo, 2)));
    viewer.turnWheel(1);
    EXPECT_EQ(0u, Difference(viewer, Zoomed(photo, 4)));
    viewer.turnWheel(-1);
    viewer.turnWheel(-1);
    EXPECT_EQ(0u, Difference(viewer, photo));
    viewer.post(WM_KEYDOWN, VK_ESCAPE);
    EXPECT_EQ(0, viewer.exitCode());
}

TEST(ViewerExample, ShowsAnOddPhotoAndClosesByItsButton) {
    fs::path const file = fs::path(ORU_PHOTOS) / "chelsea.png";
    Viewer const viewer(file);
    ASSERT_NE(nullptr, viewer.window());
    EXPECT_EQ(0u, Difference(viewer, App::ReadImage(file, {4096})));
    viewer.post(WM_CLOSE, 0);
    EXPECT_EQ(0, viewer.exitCode());
}
