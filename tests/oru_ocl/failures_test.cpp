// Memory over OpenGL objects, and every entry point that the layer calls made to fail once.
#include "oru/core/utility/integerrect.h"
#include "oru/oru_ocl/exceptionocl.h"
#include "oru/oru_ocl/sampler.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/texture3.h"
#include "oru/oru_ogl/platformgl.h"
#include "tests/support/computetest.h"

#include <fstream>
#include <functional>
#include <tuple>

using namespace ORU::OCL;
using namespace oru_test;

namespace {

namespace OGL = ORU::OGL;

/// With an OpenGL context, current.
class OpenGLTest : public QueueTest {
protected:
    OpenGLTest() { glContext_.makeCurrent(); }

    void TearDown() override { EXPECT_EQ(GLenum(GL_NO_ERROR), ::glGetError()); }

private:
    OGL::AutoInitializer library_;
    OGL::ContextOffscreen glContext_;
};

/// One object of each kind.
class FailuresTest : public OpenGLTest {
protected:
    OGL::Buffer glBuffer{64, OGL::Buffer::TYPE_ARRAY_BUFFER, OGL::Buffer::USAGE_STATIC_DRAW,
                         nullptr};
    OGL::Texture2D glTexture{OGL::Texture::INTERNALFORMAT_RGBA8, 4, 4, true};
    OGL::TextureRECT glRectangle{OGL::Texture::INTERNALFORMAT_RGBA8, 4, 4};
    OGL::Texture3D glVolume{OGL::Texture::INTERNALFORMAT_RGBA8, 4, 4, 4, true};
    OGL::Renderbuffer glRenderbuffer{GL_RGBA8, 4, 4};
    Buffer buffer{context, kBoth, false, 64};
    Buffer shared{context, kBoth, glBuffer};
    Image2D image{context, kBoth, false, kRGBA8, 4, 4, 0};
    Sampler sampler{context, false, Sampler::ADDRESS_CLAMP, Sampler::FILTER_NEAREST};
    Program program = built("kernel void f(global int *v) {}");
    Kernel kernel = program.kernel("f");
    Event event = queue.enqueueMarker();
};

using SharingTest = FailuresTest;

struct Case {
    char const *entryPoint; ///< without its "cl"
    std::function<void()> operation;
    unsigned int call = 1; ///< which of the operation's calls of the entry point
};

std::string SourceLine(std::string const &file, int line) {
    std::ifstream source(std::string(ORU_SOURCE_DIR "/") + file);
    std::string text;
    for (int i = 0; i < line; ++i)
        std::getline(source, text);
    return text;
}

} // namespace

TEST_F(SharingTest, TheRuntimeIsToldTheObject) {
    // Of an access that is none the runtime is told nothing.
    cl_mem_flags const flags[] = {CL_MEM_READ_ONLY, CL_MEM_WRITE_ONLY, CL_MEM_READ_WRITE, 0};
    for (int i = 0; i < 4; ++i) {
        auto const access = Memory::MemoryAccessFlags(i);
        auto const passes = [&](Memory const &, char const *entryPoint, auto... object) {
            EXPECT_EQ(TextOf(context.id(), flags[i], object...), runtime->arguments(entryPoint));
        };
        passes(Buffer(context, access, glBuffer), "clCreateFromGLBuffer", glBuffer.objectID());
        passes(Image2D(context, access, glTexture, 2), "clCreateFromGLTexture2D", GL_TEXTURE_2D, 2,
               glTexture.objectID());
        passes(Image2D(context, access, glRectangle, 0), "clCreateFromGLTexture2D",
               GL_TEXTURE_RECTANGLE, 0, glRectangle.objectID());
        passes(Image2D(context, access, glRenderbuffer), "clCreateFromGLRenderbuffer",
               glRenderbuffer.objectID());
        passes(Image3D(context, access, glVolume, 2), "clCreateFromGLTexture3D", GL_TEXTURE_3D, 2,
               glVolume.objectID());
    }
}

TEST_F(FailuresTest, EachSaysWhatFailedAndWhere) {
    ContextProperties const properties(platform);
    Program::BinaryArray const binaries({device}, {2}, {{0, 0}});
    ORU::IntegerRect const rect({0, 0}, {2, 2});
    int values[16] = {};
    void *const data = values;
    Case const cases[] = {
        {"GetPlatformIDs", [] { platforms(); }, 2},
        {"GetPlatformInfo", [&] { platform.profile(); }, 2},
        {"GetDeviceIDs", [&] { platform.devices(Device::TYPE_ALL); }, 2},
        {"GetDeviceInfo", [&] { device.type(); }},
        {"GetDeviceInfo", [&] { device.name(); }, 2},
        {"CreateContext", [&] { Context(properties, device); }},
        {"CreateContextFromType", [&] { Context(properties, Device::TYPE_ALL); }},
        {"GetContextInfo", [&] { context.devices(); }},
        {"GetContextInfo", [&] { context.platform(); }, 2},
        {"CreateCommandQueue", [&] { CommandQueue(context, device, false, false); }},
        {"CreateBuffer", [&] { Buffer(context, kBoth, false, 4); }},
        {"CreateBuffer", [&] { Buffer(context, kBoth, std::size_t(4), data); }},
        {"CreateBuffer", [&] { Buffer(context, kBoth, false, 4, data); }},
        {"CreateImage2D", [&] { Image2D(context, kBoth, false, kRGBA8, 2, 2, 0); }},
        {"CreateImage2D", [&] { Image2D(context, kBoth, kRGBA8, 2, 2, 0, data); }},
        {"CreateImage2D", [&] { Image2D(context, kBoth, false, kRGBA8, 2, 2, 0, data); }},
        {"CreateImage3D", [&] { Image3D(context, kBoth, false, kRGBA8, 2, 2, 2, 0, 0); }},
        {"CreateImage3D", [&] { Image3D(context, kBoth, kRGBA8, 2, 2, 2, 0, 0, data); }},
        {"CreateImage3D", [&] { Image3D(context, kBoth, false, kRGBA8, 2, 2, 2, 0, 0, data); }},
        {"GetImageInfo", [&] { image.getInfo(Image::IMAGEINFO_WIDTH, 0, nullptr, nullptr); }},
        {"CreateSampler",
         [&] { Sampler(context, false, Sampler::ADDRESS_CLAMP, Sampler::FILTER_LINEAR); }},
        {"GetSamplerInfo", [&] { sampler.filterMode(); }},
        {"CreateProgramWithSource", [&] { Program(context, "source"); }},
        {"CreateProgramWithBinary", [&] { Program(context, binaries); }},
        {"BuildProgram", [&] { program.build(""); }},
        {"GetProgramBuildInfo", [&] { program.buildLog(device); }},
        {"GetProgramBuildInfo", [&] { program.buildStatus(device); }, 2},
        {"CreateKernel", [&] { program.kernel("f"); }},
        {"CreateKernelsInProgram", [&] { program.kernels(); }, 2},
        {"SetKernelArg", [&] { kernel.setArg(0, buffer); }},
        {"WaitForEvents", [&] { event.wait(); }},
        {"WaitForEvents", [&] { Event::WaitForEvents({event}); }},
        {"GetEventInfo", [&] { event.commandType(); }},
        {"GetEventInfo", [&] { event.commandExecutionStatus(); }},
        {"GetEventInfo", [&] { event.commandQueue(); }},
        {"Flush", [&] { queue.flush(); }},
        {"Finish", [&] { queue.finish(); }},
        {"EnqueueReadBuffer", [&] { queue.enqueueRead(buffer, 0, 4, data); }},
        {"EnqueueWriteBuffer", [&] { queue.enqueueBlockingWrite(buffer, 0, 4, data); }},
        {"GetMemObjectInfo", [&] { queue.enqueueRead(image, rect, data, 0); }},
        {"EnqueueReadImage", [&] { queue.enqueueRead(image, rect, data, 0); }},
        {"EnqueueNDRangeKernel", [&] { queue.enqueueKernel(kernel, Range<1>(1), 0, 0, {event}); }},
        {"EnqueueMarker", [&] { queue.enqueueMarker(); }},
        {"EnqueueBarrier", [&] { queue.enqueueBarrier(); }},
        {"CreateFromGLBuffer", [&] { Buffer(context, kBoth, glBuffer); }},
        {"CreateFromGLTexture2D", [&] { Image2D(context, kBoth, glTexture, 0); }},
        {"CreateFromGLTexture3D", [&] { Image3D(context, kBoth, glVolume, 0); }},
        {"CreateFromGLRenderbuffer", [&] { Image2D(context, kBoth, glRenderbuffer); }},
        {"EnqueueAcquireGLObjects", [&] { queue.enqueueAcquireGLObjects({shared}); }},
        {"EnqueueReleaseGLObjects", [&] { queue.enqueueReleaseGLObjects({shared}); }},
    };
    // A code of its own for each case, the vendors' range and unnamed ones included.
    int code = 0;
    for (Case const &failing : cases) {
        --code;
        std::string const entryPoint = std::string("cl") + failing.entryPoint;
        SCOPED_TRACE(entryPoint + " call " + std::to_string(failing.call));
        runtime->reset();
        runtime->fail(entryPoint, failing.call, code);
        std::size_t const live = runtime->references().size();
        Failure const failure = FailureOf(failing.operation);
        EXPECT_EQ(std::string("OCL Exception: ") + ExceptionOCL::ErrorToCString(code),
                  failure.text);
        bool const isNamed = failure.text.find("UNKNOWN") == std::string::npos;
        EXPECT_EQ(0u, failure.note.find("in " + entryPoint));
        EXPECT_NE(isNamed, failure.note.find(std::to_string(code)) != std::string::npos)
            << failure.note;
        EXPECT_EQ(0u, failure.file.find("oru/oru_ocl/"));
        std::string const call = "ORU_CL(" + std::string(failing.entryPoint) + ",";
        EXPECT_NE(std::string::npos, SourceLine(failure.file, failure.line).find(call))
            << failure.file << ":" << failure.line;
        EXPECT_EQ(failing.call, runtime->calls(entryPoint)) << "nothing after the failure";
        EXPECT_EQ(live, runtime->references().size());
    }
}

TEST_F(FailuresTest, RetainingAndReleasingGoUnchecked) {
    for (std::string const kind :
         {"Context", "CommandQueue", "MemObject", "Sampler", "Program", "Kernel", "Event"}) {
        runtime->reset();
        runtime->fail("clRetain" + kind, 1, CL_OUT_OF_RESOURCES);
        runtime->fail("clRelease" + kind, 1, CL_OUT_OF_RESOURCES);
        { std::tuple const copies(context, queue, buffer, sampler, program, kernel, event); }
        EXPECT_GE(runtime->calls("clRetain" + kind), 1u) << kind;
        EXPECT_EQ(runtime->calls("clRetain" + kind), runtime->calls("clRelease" + kind));
    }
}
