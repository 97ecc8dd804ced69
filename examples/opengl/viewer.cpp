// Shows a photo in a window: the mouse wheel zooms, Escape closes.
#include "examples/opengl/example.h"

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextwindowed_win.h"
#include "oru/oru_ogl/ogl/pixelunpackparameters.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <functional>

using namespace ORU::OGL;

namespace {

// The photo lies in the middle of the window, its upper row up.
char const *const kVertexShader = "attribute vec2 corner;"
                                  "uniform vec2 scale;"
                                  "varying vec2 place;"
                                  "void main() {"
                                  "    place = vec2(corner.x, 1.0 - corner.y);"
                                  "    gl_Position = vec4(scale * (2.0 * corner - 1.0), 0.0, 1.0);"
                                  "}";

char const *const kFragmentShader = "uniform sampler2D photo;"
                                    "varying vec2 place;"
                                    "void main() { gl_FragColor = texture2D(photo, place); }";

float const kCorners[] = {0, 0, 1, 0, 0, 1, 1, 1};

/// A photo on the GPU, drawn at any size.
class Photo {
public:
    explicit Photo(App::Image const &image)
        : texture_(Texture::INTERNALFORMAT_RGBA8, image.width, image.height, false) {
        TextureUnit::Unit(0)->bind(&texture_);
        texture_.subImage(0, 0, 0, image.width, image.height,
                          image.channels == 4 ? Texture::FORMAT_RGBA : Texture::FORMAT_RGB,
                          Texture::TYPE_UNSIGNED_BYTE, image.pixels.data(),
                          PixelUnpackParameters());
        program_.loadVertexShader(1, &kVertexShader, nullptr);
        program_.loadFragmentShader(1, &kFragmentShader, nullptr);
        program_.link(true);
        corners_.setField("corner", example::Bytes(kCorners), false, 0, 0);
        corners_.setupWithProgram(&program_);
        corners_.marshallData();
    }

    /// @param zoom window pixels per photo pixel
    void draw(int windowWidth, int windowHeight, float zoom) {
        ORU_GL(Viewport, 0, 0, windowWidth, windowHeight);
        ORU_GL(ClearColor, 0.25f, 0.25f, 0.25f, 1.f);
        ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
        ProgramEnabledScope const scope(&program_);
        program_.setUniform(
            "scale", zoom * static_cast<float>(texture_.width(0)) / static_cast<float>(windowWidth),
            zoom * static_cast<float>(texture_.height(0)) / static_cast<float>(windowHeight));
        corners_.drawPrimitives();
    }

private:
    Texture2D texture_; // stays bound to unit 0, which the sampler reads
    Program program_;
    VertexBuffer corners_{
        {{"corner", VertexBuffer::ATTRIBUTETYPE_FLOAT2, VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW}},
        4,
        VertexBuffer::PRIMITIVETYPE_TRIANGLE_STRIP};
};

/// A window whose inside is as large as the photo. It hands its messages to one receiver.
class Window {
public:
    using Receiver = std::function<LRESULT(UINT, WPARAM, LPARAM)>;

    Window(App::Image const &image, std::wstring const &title) {
        WNDCLASSW windowClass = {};
        windowClass.style = CS_OWNDC | CS_HREDRAW | CS_VREDRAW;
        windowClass.lpfnWndProc = &Window::onMessage;
        windowClass.hInstance = ::GetModuleHandleW(nullptr);
        windowClass.hCursor = ::LoadCursorW(nullptr, IDC_ARROW);
        windowClass.lpszClassName = L"ORU viewer";
        ::RegisterClassW(&windowClass);
        RECT frame = {0, 0, static_cast<LONG>(image.width), static_cast<LONG>(image.height)};
        ::AdjustWindowRect(&frame, WS_OVERLAPPEDWINDOW, FALSE);
        handle_ = ::CreateWindowW(windowClass.lpszClassName, title.c_str(), WS_OVERLAPPEDWINDOW,
                                  CW_USEDEFAULT, CW_USEDEFAULT, frame.right - frame.left,
                                  frame.bottom - frame.top, nullptr, nullptr, windowClass.hInstance,
                                  nullptr);
    }
    ~Window() { ::DestroyWindow(handle_); }
    Window(Window const &) = delete;
    Window &operator=(Window const &) = delete;

    HWND handle() const { return handle_; }

    /// Shows the window until the receiver posts a WM_QUIT; throws what the receiver threw.
    void run(Receiver receiver) {
        receiver_ = std::move(receiver);
        ::SetWindowLongPtrW(handle_, GWLP_USERDATA, reinterpret_cast<LONG_PTR>(this));
        ::ShowWindow(handle_, SW_SHOW);
        MSG message;
        while (::GetMessageW(&message, nullptr, 0, 0) > 0)
            ::DispatchMessageW(&message);
        ::SetWindowLongPtrW(handle_, GWLP_USERDATA, 0);
        if (failure_)
            std::rethrow_exception(failure_);
    }

private:
    static LRESULT CALLBACK onMessage(HWND handle, UINT message, WPARAM wParam, LPARAM lParam) {
        auto *const window = reinterpret_cast<Window *>(::GetWindowLongPtrW(handle, GWLP_USERDATA));
        if (!window)
            return ::DefWindowProcW(handle, message, wParam, lParam);
        try {
            return window->receiver_(message, wParam, lParam);
        } catch (...) {
            window->failure_ = std::current_exception(); // the system takes no exceptions
            ::PostQuitMessage(1);
            return 0;
        }
    }

    HWND handle_ = nullptr;
    Receiver receiver_;
    std::exception_ptr failure_;
};

void View(std::filesystem::path const &file) {
    App::Image const image = App::ReadImage(file, {4096});
    AutoInitializer const library;
    Window window(image, file.filename().wstring());
    ContextWindowed context(window.handle(), BufferFormat::FORMAT_RGBA8, Context::BUFFERING_DOUBLE,
                            Context::MULTISAMPLING_NONE, nullptr);
    context.makeCurrent();
    Photo photo(image);
    float zoom = 1;

    window.run([&](UINT message, WPARAM wParam, LPARAM lParam) -> LRESULT {
        switch (message) {
        case WM_PAINT: {
            RECT inside;
            ::GetClientRect(window.handle(), &inside);
            photo.draw(inside.right, inside.bottom, zoom);
            context.swapBuffers();
            ::ValidateRect(window.handle(), nullptr);
            return 0;
        }
        case WM_MOUSEWHEEL:
            zoom *= GET_WHEEL_DELTA_WPARAM(wParam) > 0 ? 2.f : 0.5f;
            zoom = std::clamp(zoom, 1.f / 16, 64.f);
            ::InvalidateRect(window.handle(), nullptr, FALSE);
            return 0;
        case WM_KEYDOWN:
            if (wParam == VK_ESCAPE)
                ::PostQuitMessage(0);
            return 0;
        case WM_CLOSE:
            ::PostQuitMessage(0);
            return 0;
        default:
            return ::DefWindowProcW(window.handle(), message, wParam, lParam);
        }
    });
}

} // namespace

int main(int argc, char **argv) {
    return example::Run(argc, argv, View);
}
