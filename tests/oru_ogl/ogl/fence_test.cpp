// Fences: from one thread's context to another's, and what waiting tells.
#include "tests/support/texturekinds.h"

#include "oru/oru_ogl/ogl/fence.h"
#include "oru/oru_ogl/ogl/textureunit.h"

#include <future>
#include <numeric>
#include <thread>

using namespace ORU::OGL;
using namespace oru_test;
using namespace std::chrono_literals;

class FenceTest : public ObjectTest {};

// Round after round: what a loader thread fills a texture with in a context of its own, the drawing
// thread reads whole.
TEST_F(FenceTest, HandsTexturesToTheDrawingThread) {
    struct Loaded {
        std::unique_ptr<Texture2D> texture;
        Fence ready;
    };
    unsigned int const side = 256;
    std::vector<unsigned char> pixels(std::size_t{4} * side * side), read(pixels.size());
    for (int round = 0; round < 5; ++round) {
        std::iota(pixels.begin(), pixels.end(), static_cast<unsigned char>(round));
        std::promise<Loaded> promise;
        std::promise<void> done;
        std::thread loader([&] {
            ContextOffscreen const own(&context());
            own.makeCurrent();
            auto texture = std::make_unique<Texture2D>(kRGBA8, side, side, false);
            TextureUnit::Unit(0)->bind(texture.get());
            texture->subImage(0, 0, 0, side, side, Texture::FORMAT_RGBA,
                              Texture::TYPE_UNSIGNED_BYTE, pixels.data(), kTight);
            promise.set_value({std::move(texture), Fence::ForOtherContexts()});
            done.get_future().wait();
            ReleaseOGLContext();
        });
        Loaded const loaded = promise.get_future().get();
        loaded.ready.wait();
        TextureUnit::Unit(0)->bind(loaded.texture.get());
        loaded.texture->getPixelData(read.data(), 0, Texture::FORMAT_RGBA,
                                     Texture::TYPE_UNSIGNED_BYTE, 1);
        EXPECT_TRUE(loaded.ready.clientWait(30s));
        EXPECT_TRUE(loaded.ready.isSignalled());
        EXPECT_EQ(pixels, read);
        TextureUnit::Unit(0)->bind2DDefault();
        done.set_value();
        loader.join();
    }
}

TEST_F(FenceTest, WaitsAsLongAsItIsTold) {
    /// An implementation that is as far as it is told to be.
    struct Scripted : OpenGLForwarder {
        GLenum outcome = GL_TIMEOUT_EXPIRED;
        GLint status = GL_UNSIGNALED;
        GLuint64 limit = 0;
        GLenum cgmClientWaitSync(char const *, unsigned int, GLsync, GLbitfield flags,
                                 GLuint64 timeout) override {
            EXPECT_EQ(static_cast<GLbitfield>(GL_SYNC_FLUSH_COMMANDS_BIT), flags);
            limit = timeout;
            return outcome;
        }
        void cgmGetSynciv(char const *, unsigned int, GLsync, GLenum, GLsizei, GLsizei *,
                          GLint *values) override {
            *values = status;
        }
    };
    Fence const fence;
    InterceptorScope<Scripted> driver;
    for (auto const &[timeout, limit] : {std::pair{-5ns, 0}, {0ns, 0}, {7ns, 7}, {3us, 3000}}) {
        EXPECT_FALSE(fence.clientWait(timeout));
        EXPECT_EQ(static_cast<GLuint64>(limit), driver->limit);
    }
    EXPECT_FALSE(fence.clientWait(std::chrono::hours(24)));
    EXPECT_EQ(GLuint64{86'400'000'000'000}, driver->limit);
    EXPECT_FALSE(fence.isSignalled());
    driver->status = GL_SIGNALED;
    EXPECT_TRUE(fence.isSignalled());
    for (GLenum const outcome : std::initializer_list<GLenum>{
             GL_ALREADY_SIGNALED, GL_CONDITION_SATISFIED, GL_WAIT_FAILED}) {
        driver->outcome = outcome;
        EXPECT_EQ(outcome != GL_WAIT_FAILED, fence.clientWait(1ns));
    }
}
