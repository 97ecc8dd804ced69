// Failures on the way to a context; the build runs this program where Wine has no Direct3D.
#include "testwindow.h"

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <string>

using namespace ORU::OGL;
using oru_test::ContextCounter;
using oru_test::MessageOf;

namespace {

/// A host's own kind, whose makeCurrent fails in a way that the layer does not know.
class Refusing : public Context {
public:
    explicit Refusing(HWND window) : Context(PrimaryDisplayDevice()) {
        initialize(::GetDC(window), BufferFormat(BufferFormat::FORMAT_RGB8), BUFFERING_SINGLE,
                   MULTISAMPLING_NONE, nullptr);
    }
    void makeCurrent() const override { throw std::range_error("refused"); }
    using Context::DisplayDeviceFromWindow;
};

} // namespace

TEST(ContextFailures, DeleteTheContextAfterAForeignException) {
    AutoInitializer library;
    {
        ContextCounter const counter;
        ContextOffscreen const current;
        current.makeCurrent();
        int const alive = ContextCounter::Alive();
        oru_test::TestWindow const window;
        EXPECT_THROW(Refusing(window.hwnd()), std::range_error);
        EXPECT_EQ(alive, ContextCounter::Alive());
        EXPECT_EQ(current.renderContext(), ::wglGetCurrentContext());
    }
}

TEST(ContextFailures, NameTheFailingCall) {
    oru_test::TestWindow const window;
    std::string const message =
        MessageOf([&] { Refusing::DisplayDeviceFromWindow(window.hwnd()); });
    if (message.compare(0, 5, "D3D11") != 0)
        GTEST_SKIP() << "Direct3D cannot be switched off here";
    EXPECT_EQ("D3D11CreateDeviceAndSwapChain(nullptr, D3D_DRIVER_TYPE_HARDWARE, nullptr, 0x0, "
              "nullptr, 0, D3D11_SDK_VERSION, &swapChainDesc, swapChain.ReleaseAndGetAddressOf(), "
              "d3dDevice.ReleaseAndGetAddressOf(), nullptr, nullptr)",
              message);
}
