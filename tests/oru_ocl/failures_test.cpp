// Every entry point that the layer calls is made to fail once.
#include "oru/core/utility/integerrect.h"
#include "oru/oru_ocl/sampler.h"
#include "tests/oru_ocl/sharingtest.h"

#include <fstream>
#include <functional>

using namespace ORU::OCL;
using namespace oru_test;

namespace {

/// One object of each kind, for the failing calls to work on.
class FailuresTest : public SharingTest {
protected:
    void TearDown() override {
        // Context, queue and what the members below hold.
        EXPECT_EQ(9u, runtime()->liveHandles());
    }

    std::vector<int> values = std::vector<int>(16);
    cl_image_format format = {CL_RGBA, CL_UNORM_INT8};
    OGL::Buffer glBuffer{64, OGL::Buffer::TYPE_ARRAY_BUFFER, OGL::Buffer::USAGE_STATIC_DRAW,
                         nullptr};
    OGL::Texture2D glTexture{OGL::Texture::INTERNALFORMAT_RGBA8, 4, 4, false};
    OGL::Texture3D glVolume{OGL::Texture::INTERNALFORMAT_RGBA8, 4, 4, 4, false};
    OGL::Renderbuffer glRenderbuffer{GL_RGBA8, 4, 4};
    Buffer buffer{context, Memory::MEMORY_READ_WRITE, false, 64};
    Buffer shared{context, Memory::MEMORY_READ_WRITE, glBuffer};
    Image2D image{context, Memory::MEMORY_READ_WRITE, false, {CL_RGBA, CL_UNORM_INT8}, 4, 4, 0};
    Sampler sampler{context, false, Sampler::ADDRESS_CLAMP, Sampler::FILTER_NEAREST};
    Program program{context, "kernel void f(global int *v) { v[0] = 0; }"};
    Kernel kernel = built();
    Event event = queue.enqueueMarker();

    struct Case {
        char const *entryPoint; ///< without its "cl"
        unsigned int call;      ///< which of the operation's calls of it
        char const *file;       ///< in oru/oru_ocl
        std::function<void()> operation;
    };

    std::vector<Case> cases();

private:
    Kernel built() {
        program.build("");
        return program.kernel("f");
    }
};

std::vector<FailuresTest::Case> FailuresTest::cases() {
    auto const access = Memory::MEMORY_READ_WRITE;
    ContextProperties const properties(platform());
    Device const dev = device();
    std::size_t const length = 2;
    unsigned char const bytes[2] = {};
    unsigned char const *pointer = bytes;
    Program::BinaryArray const binaries({dev.id()}, &length, &pointer);
    return {
        {"GetPlatformIDs", 1, "platform.cpp", [] { platforms(); }},
        {"GetPlatformIDs", 2, "platform.cpp", [] { platforms(); }},
        {"GetPlatformInfo", 1, "platform.cpp", [=] { properties.platform().name(); }},
        {"GetPlatformInfo", 2, "platform.cpp", [=] { properties.platform().profile(); }},
        {"GetDeviceIDs", 1, "platform.cpp",
         [=] { properties.platform().devices(Device::TYPE_ALL); }},
        {"GetDeviceIDs", 2, "platform.cpp",
         [=] { properties.platform().devices(Device::TYPE_ALL); }},
        {"GetDeviceInfo", 1, "device.cpp", [=] { dev.type(); }},
        {"GetDeviceInfo", 2, "device.cpp", [=] { dev.name(); }},
        {"CreateContext", 1, "contextocl.cpp", [=] { Context(properties, dev); }},
        {"CreateContextFromType", 1, "contextocl.cpp",
         [=] { Context(properties, Device::TYPE_ALL); }},
        {"GetContextInfo", 1, "contextocl.cpp", [=] { context.devices(); }},
        {"GetContextInfo", 2, "contextocl.cpp", [=] { context.platform(); }},
        {"CreateCommandQueue", 1, "commandqueue.cpp",
         [=] { CommandQueue(context, dev, false, false); }},
        {"CreateBuffer", 1, "bufferocl.cpp", [=] { Buffer(context, access, false, 4); }},
        {"CreateBuffer", 1, "bufferocl.cpp",
         [=] { Buffer(context, access, std::size_t(4), values.data()); }},
        {"CreateBuffer", 1, "bufferocl.cpp",
         [=] { Buffer(context, access, false, 4, values.data()); }},
        {"CreateImage2D", 1, "image.cpp",
         [=] { Image2D(context, access, false, format, 2, 2, 0); }},
        {"CreateImage2D", 1, "image.cpp",
         [=] { Image2D(context, access, format, 2, 2, 0, values.data()); }},
        {"CreateImage3D", 1, "image.cpp",
         [=] { Image3D(context, access, false, format, 2, 2, 2, 0, 0); }},
        {"CreateImage3D", 1, "image.cpp",
         [=] { Image3D(context, access, false, format, 2, 2, 2, 0, 0, values.data()); }},
        {"GetMemObjectInfo", 1, "memory.cpp", [=] { buffer.memType(); }},
        {"GetImageInfo", 1, "image.cpp",
         [=] { image.getInfo(Image::IMAGEINFO_WIDTH, 0, nullptr, nullptr); }},
        {"CreateSampler", 1, "sampler.cpp",
         [=] { Sampler(context, false, Sampler::ADDRESS_CLAMP, Sampler::FILTER_LINEAR); }},
        {"GetSamplerInfo", 1, "sampler.cpp", [=] { sampler.filterMode(); }},
        {"CreateProgramWithSource", 1, "programocl.cpp", [=] { Program(context, "source"); }},
        {"CreateProgramWithBinary", 1, "programocl.cpp", [=] { Program(context, binaries); }},
        {"BuildProgram", 1, "programocl.cpp", [this] { program.build(""); }},
        {"GetProgramBuildInfo", 1, "programocl.cpp", [=] { program.buildLog(dev); }},
        {"GetProgramBuildInfo", 2, "programocl.cpp", [=] { program.buildStatus(dev); }},
        {"CreateKernel", 1, "programocl.cpp", [this] { program.kernel("f"); }},
        {"CreateKernelsInProgram", 1, "programocl.cpp", [this] { program.kernels(); }},
        {"CreateKernelsInProgram", 2, "programocl.cpp", [this] { program.kernels(); }},
        {"SetKernelArg", 1, "kernel.h", [this] { kernel.setArg(0, buffer); }},
        {"WaitForEvents", 1, "event.cpp", [this] { event.wait(); }},
        {"WaitForEvents", 1, "event.cpp", [this] { Event::WaitForEvents({event}); }},
        {"GetEventInfo", 1, "event.cpp", [this] { event.commandType(); }},
        {"GetEventInfo", 1, "event.cpp", [this] { event.commandQueue(); }},
        {"Flush", 1, "commandqueue.cpp", [this] { queue.flush(); }},
        {"Finish", 1, "commandqueue.cpp", [this] { queue.finish(); }},
        {"EnqueueReadBuffer", 1, "commandqueue.cpp",
         [this] { queue.enqueueRead(buffer, 0, 4, values.data()); }},
        {"EnqueueWriteBuffer", 1, "commandqueue.cpp",
         [this] { queue.enqueueBlockingWrite(buffer, 0, 4, values.data()); }},
        {"GetMemObjectInfo", 1, "memory.cpp",
         [this] {
             queue.enqueueRead(image, ORU::IntegerRect({0, 0}, {2, 2}), values.data(), 0);
         }},
        {"EnqueueReadImage", 1, "commandqueue.cpp",
         [this] {
             queue.enqueueRead(image, ORU::IntegerRect({0, 0}, {2, 2}), values.data(), 0);
         }},
        {"EnqueueNDRangeKernel", 1, "commandqueue.cpp",
         [this] { queue.enqueueKernel(kernel, Range<1>(1), 0, 0, {event}); }},
        {"EnqueueMarker", 1, "commandqueue.cpp", [this] { queue.enqueueMarker(); }},
        {"EnqueueBarrier", 1, "commandqueue.cpp", [this] { queue.enqueueBarrier(); }},
        {"CreateFromGLBuffer", 1, "bufferocl.cpp", [=] { Buffer(context, access, glBuffer); }},
        {"CreateFromGLTexture2D", 1, "image.cpp", [=] { Image2D(context, access, glTexture, 0); }},
        {"CreateFromGLTexture3D", 1, "image.cpp", [=] { Image3D(context, access, glVolume, 0); }},
        {"CreateFromGLRenderbuffer", 1, "image.cpp",
         [=] { Image2D(context, access, glRenderbuffer); }},
        {"EnqueueAcquireGLObjects", 1, "commandqueue.cpp",
         [this] { queue.enqueueAcquireGLObjects({shared}); }},
        {"EnqueueReleaseGLObjects", 1, "commandqueue.cpp",
         [this] { queue.enqueueReleaseGLObjects({shared}); }},
    };
}

std::string SourceLine(std::string const &file, int line) {
    std::ifstream source(std::string(ORU_SOURCE_DIR "/") + file);
    std::string text;
    for (int i = 0; i < line; ++i)
        std::getline(source, text);
    return text;
}

} // namespace

TEST_F(FailuresTest, EachSaysWhatFailedAndWhere) {
    // A code of its own for each case, the vendors' range and unnamed ones included.
    int code = -1;
    for (Case const &failing : cases()) {
        std::string const entryPoint = std::string("cl") + failing.entryPoint;
        SCOPED_TRACE(entryPoint + " call " + std::to_string(failing.call));
        runtime()->reset();
        runtime()->fail(entryPoint.c_str(), failing.call, code);
        unsigned int const live = runtime()->liveHandles();
        try {
            failing.operation();
            ADD_FAILURE() << "nothing was thrown";
        } catch (ExceptionOCL const &e) {
            EXPECT_EQ(code, static_cast<int>(e.errorNumber()));
            EXPECT_EQ(std::string("OCL Exception: ") + ExceptionOCL::ErrorToCString(code),
                      e.what());
            EXPECT_STREQ("", e.message());
            EXPECT_EQ(std::string("oru/oru_ocl/") + failing.file, e.file());
            EXPECT_NE(std::string::npos,
                      SourceLine(e.file(), e.line())
                          .find("ORU_CL(" + std::string(failing.entryPoint) + ","))
                << e.file() << ":" << e.line();
        }
        EXPECT_EQ(failing.call, runtime()->calls(entryPoint.c_str()))
            << "nothing after the failure";
        EXPECT_EQ(live, runtime()->liveHandles());
        --code;
    }
}

TEST_F(FailuresTest, RetainingAndReleasingGoUnchecked) {
    for (char const *kind :
         {"Context", "CommandQueue", "MemObject", "Sampler", "Program", "Kernel", "Event"}) {
        std::string const retain = std::string("clRetain") + kind;
        std::string const release = std::string("clRelease") + kind;
        runtime()->reset();
        runtime()->fail(retain.c_str(), 1, CL_OUT_OF_RESOURCES);
        runtime()->fail(release.c_str(), 1, CL_OUT_OF_RESOURCES);
        EXPECT_NO_THROW({
            Context const c = context;
            CommandQueue const q = queue;
            Buffer const b = buffer;
            Sampler const s = sampler;
            Program const p = program;
            Kernel const k = kernel;
            Event const e = event;
        });
        EXPECT_GE(runtime()->calls(retain.c_str()), 1u);
        EXPECT_EQ(runtime()->calls(retain.c_str()), runtime()->calls(release.c_str())) << kind;
    }
}

TEST_F(FailuresTest, AWrapperKeepsItsHandleThroughAFailure) {
    Program fresh(context, "kernel void f() {}");
    cl_program const before = fresh.id();
    runtime()->fail("clBuildProgram", 1, CL_OUT_OF_HOST_MEMORY);
    EXPECT_EQ(CL_OUT_OF_HOST_MEMORY, ErrorCode([&] { fresh.build(""); }));
    EXPECT_EQ(before, fresh.id());
    EXPECT_EQ(CL_SUCCESS, ErrorCode([&] { fresh.build(""); }));
}
