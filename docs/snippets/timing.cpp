// The code of the chapter on timing and fences.
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/conditionalrenderscope.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/fence.h"
#include "oru/oru_ogl/ogl/gputimer.h"
#include "oru/oru_ogl/ogl/mappedrange.h"
#include "oru/oru_ogl/ogl/query.h"
#include "oru/oru_ogl/ogl/queryscope.h"
#include "oru/oru_ogl/ogl/statescope.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <future>
#include <numeric>
#include <thread>
#include <vector>

using namespace ORU::OGL;
using namespace std::chrono_literals;

namespace {

class TimingGuide : public ::testing::Test {
protected:
    void SetUp() override { context_.makeCurrent(); }

    ContextOffscreen &context() { return context_; }

private:
    AutoInitializer library_;
    ContextOffscreen context_;
};

} // namespace

TEST_F(TimingGuide, HandsATextureOver) {
    std::size_t const side = 64;
    std::vector<unsigned char> pixels(4 * side * side), back(pixels.size());
    std::iota(pixels.begin(), pixels.end(), static_cast<unsigned char>(0));
    Context const &drawing = context();
    // [handover]
    struct Loaded {
        Texture2D texture;
        Fence ready;
    };
    std::promise<Loaded> promise;
    std::thread loader([&] {
        ContextOffscreen const own(&drawing); // shares with the drawing thread's context
        own.makeCurrent();
        Texture2D texture(Texture::INTERNALFORMAT_RGBA8, side, side, false);
        TextureUnit::Unit(0)->bind(&texture);
        texture.subImage(0, 0, 0, side, side, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE,
                         pixels.data(), PixelUnpackParameters());
        promise.set_value({std::move(texture), Fence::ForOtherContexts()});
    });

    // The drawing thread, in its own context:
    Loaded const loaded = promise.get_future().get();
    loaded.ready.wait(); // what comes now waits on the GPU; this thread goes on
    TextureUnit::Unit(0)->bind(&loaded.texture);
    // [handover]
    loader.join();
    loaded.texture.getPixelData(back.data(), 0, Texture::FORMAT_RGBA, Texture::TYPE_UNSIGNED_BYTE,
                                1);
    EXPECT_EQ(pixels, back);
}

TEST_F(TimingGuide, WaitsAndAsks) {
    bool isDone = false, wasAsked = false;
    // [clientwait]
    Fence const fence;
    // ... time for something else ...
    wasAsked = fence.isSignalled();   // never waits
    isDone = fence.clientWait(500ms); // false when the time is over first
    // [clientwait]
    EXPECT_TRUE(isDone || !wasAsked);
}

TEST_F(TimingGuide, TimesFrames) {
    int frames = 0, timed = 0;
    auto const drawFrame = [] { ORU_GL(Clear, GL_COLOR_BUFFER_BIT); };
    auto const report = [&](std::chrono::nanoseconds time) { timed += time.count() >= 0; };
    // [timer]
    GpuTimer timer; // once; four frames may be on their way
    while (++frames <= 10) {
        timer.begin();
        drawFrame();
        timer.end();
        while (auto const time = timer.take()) // of a frame some frames ago
            report(*time);
    }
    // [timer]
    ORU_GL0(Finish);
    while (timer.take())
        ++timed;
    EXPECT_EQ(10u, static_cast<unsigned int>(timed) + timer.missed());
}

TEST_F(TimingGuide, CountsSamples) {
    int drawn = 0;
    auto const drawBox = [] {};
    auto const drawModel = [&] { ++drawn; };
    // [samples]
    Query visible(Query::TYPE_ANY_SAMPLES);
    {
        TemporaryColorMaskScope const unseen({0, 0, 0, 0});
        QueryScope const scope(visible);
        drawBox(); // around the model: cheap
    }
    // [samples]

    // [conditional]
    {
        ConditionalRenderScope const scope(visible, ConditionalRenderScope::MODE_NO_WAIT);
        drawModel(); // the calls are made; the GPU skips them where nothing was visible
    }
    // [conditional]

    bool isVisible = true;
    // [result]
    if (visible.available())              // never waits
        isVisible = visible.result() > 0; // waits, if it is not there
    // [result]
    EXPECT_EQ(1, drawn);
    visible.result();
    EXPECT_TRUE(!isVisible || !visible.result());
}

TEST_F(TimingGuide, FillsPartsThatAreFree) {
    std::vector<unsigned char> const vertices(256, 7);
    auto const draw = [](std::int64_t) {};
    // [ring]
    std::int64_t const part = 256, parts = 3;
    Buffer ring(part * parts, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    std::vector<Fence> done(parts); // each marks what was asked for so far: nothing yet
    for (int frame = 0; frame < 9; ++frame) {
        auto const now = static_cast<std::size_t>(frame % parts);
        done[now].clientWait(1s); // what drew from this part three frames ago
        {
            MappedRange range(ring, static_cast<std::int64_t>(now) * part, part,
                              MappedRange::ACCESS_WRITE | MappedRange::ACCESS_UNSYNCHRONIZED);
            std::memcpy(range.data(), vertices.data(), vertices.size());
        } // unmapped; what was bound to the target is bound again
        draw(static_cast<std::int64_t>(now) * part);
        done[now] = Fence();
    }
    // [ring]
    ring.bind();
    std::vector<unsigned char> back(ring.size());
    ring.getSubData(0, part * parts, back.data());
    EXPECT_EQ(part * parts, std::count(back.begin(), back.end(), 7));
    // [orphan]
    ring.orphan(); // the old store lives until it was drawn from
    ring.subData(0, 256, vertices.data());
    // [orphan]
    ring.getSubData(0, 256, back.data());
    EXPECT_EQ(7, back[255]);
    Buffer::BindDefaultArrayBuffer();
}
