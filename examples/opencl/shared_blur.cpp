// Blurs what OpenGL drew by an OpenCL kernel: in OpenGL's own texture where the runtime can share
// it, through the host's memory where it cannot.
#include "examples/opencl/example.h"
#include "examples/opengl/example.h"

#include "oru/core/utility/integerrect.h"
#include "oru/oru_ocl/commandqueue.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/pixelunpackparameters.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/textureunit.h"

namespace GL = ORU::OGL;
using namespace ORU::OCL;

namespace {

int const kWidth = 320, kHeight = 240;
int const kReach = 4; ///< pixels on each side of the one that is averaged

// Whole numbers, so that every runtime comes to the same picture.
char const *const kSource = R"(
    constant sampler_t pixels =
        CLK_NORMALIZED_COORDS_FALSE | CLK_ADDRESS_CLAMP_TO_EDGE | CLK_FILTER_NEAREST;
    kernel void blur(read_only image2d_t from, write_only image2d_t to) {
        int2 at = (int2)(get_global_id(0), get_global_id(1));
        int count = (2 * REACH + 1) * (2 * REACH + 1);
        int4 sum = count / 2; // which rounds
        for (int y = -REACH; y <= REACH; ++y)
            for (int x = -REACH; x <= REACH; ++x)
                sum += convert_int4_rte(255 * read_imagef(from, pixels, at + (int2)(x, y)));
        write_imagef(to, at, convert_float4(sum / count) / 255);
    })";

using Pixels = std::vector<unsigned char>; ///< red, green, blue and alpha of each, row by row

/// The same on the host.
Pixels Blurred(Pixels const &from) {
    Pixels to(from.size());
    int const count = (2 * kReach + 1) * (2 * kReach + 1);
    for (int i = 0; i < 4 * kWidth * kHeight; ++i) {
        int const channel = i % 4, column = i / 4 % kWidth, row = i / 4 / kWidth;
        int sum = count / 2;
        for (int y = row - kReach; y <= row + kReach; ++y)
            for (int x = column - kReach; x <= column + kReach; ++x) {
                auto const pixel =
                    static_cast<std::size_t>(std::clamp(y, 0, kHeight - 1)) * kWidth +
                    static_cast<std::size_t>(std::clamp(x, 0, kWidth - 1));
                sum += from[4 * pixel + static_cast<std::size_t>(channel)];
            }
        to[static_cast<std::size_t>(i)] = static_cast<unsigned char>(sum / count);
    }
    return to;
}

/// Draws panes of many colours, with fine lines between some of them.
void Draw(GL::Texture2D &picture) {
    GL::Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&picture, 0, 0);
    ORU_GL(Enable, GL_SCISSOR_TEST);
    for (int pane = 0; pane < 12; ++pane) {
        ORU_GL(Scissor, pane % 4 * 80, pane / 4 * 80, 80, 80);
        ORU_GL(ClearColor, static_cast<float>(pane % 4) / 3, static_cast<float>(pane % 3) / 2,
               static_cast<float>(pane % 5) / 4, 1.f);
        ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
        ORU_GL(Scissor, pane % 4 * 80 + 38, pane / 4 * 80 + 10, 3, 60);
        ORU_GL(ClearColor, 1.f, 1.f, 1.f, 1.f);
        ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
    }
    ORU_GL(Disable, GL_SCISSOR_TEST);
    framebuffer.unbind();
}

Pixels Read(GL::Texture2D const &texture) {
    Pixels pixels(std::size_t{4} * kWidth * kHeight);
    GL::TextureUnit::Unit(0)->bind(&texture);
    texture.getPixelData(pixels.data(), 0, GL::Texture::FORMAT_RGBA,
                         GL::Texture::TYPE_UNSIGNED_BYTE, 1);
    GL::TextureUnit::Unit(0)->bind2DDefault();
    return pixels;
}

/// An OpenCL context and queue, which shares with an OpenGL context where that can be.
class Blur {
public:
    explicit Blur(GL::ContextOffscreen const &context)
        : device_(platforms().front().devices(Device::TYPE_ALL).front()),
          shares_(device_.isSupported(Enum::EXTENSION_KHR_GL_SHARING)),
          context_(properties(context), device_), queue_(context_, device_, false, false),
          program_(context_, kSource) {
        program_.build("-D REACH=" + std::to_string(kReach));
    }

    std::string description() const {
        return device_.name() + (shares_ ? ", in the texture shared with OpenGL"
                                         : ", on a copy, as it cannot share");
    }

    void run(GL::Texture2D &from, GL::Texture2D &to) {
        if (shares_)
            runShared(from, to);
        else
            runCopy(from, to);
    }

private:
    ContextProperties properties(GL::ContextOffscreen const &context) const {
        ContextProperties properties(device_.platform());
        if (shares_) {
            properties.setSharedRenderContext(context.renderContext());
            properties.setDisplayContext(context.deviceContext());
        }
        return properties;
    }

    void runShared(GL::Texture2D &from, GL::Texture2D &to) {
        Image2D const source(context_, Memory::MEMORY_READ_ONLY, from, 0);
        Image2D const target(context_, Memory::MEMORY_WRITE_ONLY, to, 0);
        ORU_GL0(Finish); // OpenGL is done with both
        queue_.enqueueAcquireGLObjects({source, target});
        launch(source, target);
        queue_.enqueueReleaseGLObjects({source, target}).wait(); // they are OpenGL's again
    }

    void runCopy(GL::Texture2D &from, GL::Texture2D &to) {
        cl_image_format const rgba8 = {CL_RGBA, CL_UNORM_INT8};
        Pixels pixels = Read(from);
        Image2D const source(context_, Memory::MEMORY_READ_ONLY, false, rgba8, kWidth, kHeight, 0,
                             pixels.data());
        Image2D const target(context_, Memory::MEMORY_WRITE_ONLY, false, rgba8, kWidth, kHeight, 0);
        launch(source, target);
        queue_.enqueueBlockingRead(target, ORU::IntegerRect({0, 0}, ORU::size2(kWidth, kHeight)),
                                   pixels.data(), 0);
        GL::TextureUnit::Unit(0)->bind(&to);
        to.subImage(0, 0, 0, kWidth, kHeight, GL::Texture::FORMAT_RGBA,
                    GL::Texture::TYPE_UNSIGNED_BYTE, pixels.data(), GL::PixelUnpackParameters());
        GL::TextureUnit::Unit(0)->bind2DDefault();
    }

    void launch(Image2D const &source, Image2D const &target) {
        Kernel blur = program_.kernel("blur");
        blur.setArg(0, source);
        blur.setArg(1, target);
        queue_.enqueueKernel(blur, Range<2>(kWidth, kHeight), 0, 0);
    }

    Device device_;
    bool shares_;
    Context context_;
    CommandQueue queue_;
    Program program_;
};

void Work(example::Arguments const &arguments) {
    // The folder of another OpenCL.dll, with a separator at its end; none for the system's.
    std::string const folder = arguments.size() > 1 ? arguments[1] + '\\' : "";
    if (!Library::IsOpenCLAvailable(folder))
        throw std::runtime_error("there is no OpenCL runtime with a platform in " +
                                 (folder.empty() ? "this system" : folder));

    // OpenGL first, and last to go.
    GL::AutoInitializer const openGL;
    GL::ContextOffscreen const context;
    context.makeCurrent();
    GL::Texture2D drawn(GL::Texture::INTERNALFORMAT_RGBA8, kWidth, kHeight, false);
    GL::Texture2D blurred(GL::Texture::INTERNALFORMAT_RGBA8, kWidth, kHeight, false);
    Draw(drawn);

    AutoInitializer const openCL;
    Blur blur(context);
    blur.run(drawn, blurred);

    example::Compare(Read(blurred), Blurred(Read(drawn)));
    GL::Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&blurred, 0, 0);
    example::SavePicture(arguments[0], kWidth, kHeight);
    std::cout << "blurred " << kWidth << " x " << kHeight << " pixels on " << blur.description()
              << ", all as the host did\n";
}

} // namespace

int main(int argc, char **argv) {
    return example::Run(argc, argv, "FILE [FOLDER-OF-OPENCL.DLL]", Work);
}
