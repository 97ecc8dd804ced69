// Threads that share objects.
#include "bench/soak/soaks.h"
#include "tests/support/nameledger.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/pixelunpackparameters.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/textureunit.h"

#include <array>
#include <atomic>
#include <memory>
#include <mutex>
#include <random>
#include <sstream>
#include <stdexcept>
#include <thread>
#include <vector>

namespace Soak {

namespace {

using namespace ORU::OGL;

constexpr std::size_t kThreads = 8;

using Bytes = std::vector<unsigned char>;

/// A texture or a buffer, and what it holds.
struct Filled {
    std::unique_ptr<Texture2D> texture;
    std::unique_ptr<Buffer> buffer;
    Bytes content;
};

Filled Make(std::mt19937 &random) {
    Filled made;
    std::size_t const side = 1 + random() % 128;
    made.content.resize(4 * side * side);
    for (unsigned char &byte : made.content)
        byte = static_cast<unsigned char>(random());
    if (random() % 2 == 0) {
        made.texture =
            std::make_unique<Texture2D>(Texture::INTERNALFORMAT_RGBA8, side, side, false);
        TextureUnit::Unit(0)->bind(made.texture.get());
        made.texture->subImage(0, 0, 0, side, side, Texture::FORMAT_RGBA,
                               Texture::TYPE_UNSIGNED_BYTE, made.content.data(),
                               PixelUnpackParameters());
        TextureUnit::Unit(0)->bind2DDefault();
    } else {
        auto const size = static_cast<std::int64_t>(made.content.size());
        made.buffer = std::make_unique<Buffer>(size, Buffer::TYPE_ARRAY_BUFFER,
                                               Buffer::USAGE_DYNAMIC_DRAW, nullptr);
        made.buffer->bind();
        made.buffer->subData(0, size, made.content.data());
        Buffer::BindDefaultArrayBuffer();
    }
    return made;
}

/// Reads an object back and destroys it.
void Compare(Filled filled) {
    Bytes read(filled.content.size());
    if (filled.texture) {
        TextureUnit::Unit(0)->bind(filled.texture.get());
        filled.texture->getPixelData(read.data(), 0, Texture::FORMAT_RGBA,
                                     Texture::TYPE_UNSIGNED_BYTE, 1);
        TextureUnit::Unit(0)->bind2DDefault();
    } else {
        filled.buffer->bind();
        filled.buffer->getSubData(0, static_cast<std::int64_t>(read.size()), read.data());
        Buffer::BindDefaultArrayBuffer();
    }
    if (read != filled.content)
        throw std::runtime_error(filled.texture ? "a texture holds something else"
                                                : "a buffer holds something else");
}

/// The work of all threads.
class Workshop {
public:
    explicit Workshop(std::chrono::duration<double> time) : time_(time) {}

    void run() {
        std::vector<std::thread> threads;
        for (std::size_t i = 0; i < kThreads; ++i)
            threads.emplace_back([this, i] { work(i); });
        for (std::thread &thread : threads)
            thread.join();
        first_.makeCurrent();
        for (std::unique_ptr<Filled> const &given : given_) {
            if (given && !hasFailed_)
                Compare(std::move(*given));
        }
    }

    std::size_t objects() const { return objects_; }
    std::size_t handedOver() const { return handedOver_; }
    std::string failure() const { return failure_; }

private:
    /// The library leaves it to hosts to make and end contexts of one group one after the other.
    std::unique_ptr<ContextOffscreen> makeContext() {
        std::lock_guard<std::mutex> const lock(mutex_);
        return std::make_unique<ContextOffscreen>(&first_);
    }

    void work(std::size_t index) {
        std::unique_ptr<ContextOffscreen> context;
        try {
            context = makeContext();
            context->makeCurrent();
            makeObjects(index);
        } catch (std::exception const &failure) {
            fail(failure.what());
        }
        std::lock_guard<std::mutex> const lock(mutex_);
        context.reset();
    }

    void makeObjects(std::size_t index) {
        std::mt19937 random(static_cast<unsigned int>(index));
        auto const end = std::chrono::steady_clock::now() + time_;
        while (std::chrono::steady_clock::now() < end && !hasFailed_) {
            Filled made = Make(random);
            ++objects_;
            if (random() % 2 != 0) {
                Compare(std::move(made));
                continue;
            }
            ORU_GL0(Finish); // or the next thread may not see the contents
            auto const uncollected =
                exchange((index + 1) % kThreads, std::make_unique<Filled>(std::move(made)));
            if (uncollected)
                Compare(std::move(*uncollected));
            if (auto const given = exchange(index, nullptr)) {
                Compare(std::move(*given));
                ++handedOver_;
            }
        }
    }

    /// Puts an object where a thread finds it, or nothing, and takes what lay there.
    std::unique_ptr<Filled> exchange(std::size_t index, std::unique_ptr<Filled> given) {
        std::lock_guard<std::mutex> const lock(mutex_);
        std::swap(given_[index], given);
        return given;
    }

    void fail(std::string const &reason) {
        std::lock_guard<std::mutex> const lock(mutex_);
        failure_ = reason;
        hasFailed_ = true;
    }

    std::chrono::duration<double> time_;
    ContextOffscreen first_;
    std::mutex mutex_;
    std::array<std::unique_ptr<Filled>, kThreads> given_;
    std::string failure_;
    std::atomic<bool> hasFailed_{false};
    std::atomic<std::size_t> objects_{0}, handedOver_{0};
};

} // namespace

Verdict ShareObjects(std::chrono::duration<double> time) {
    AutoInitializer const library;
    InterceptorScope<oru_test::NameLedger> const ledger;
    std::ostringstream text;
    std::string failure;
    {
        Workshop workshop(time);
        workshop.run();
        failure = workshop.failure();
        text << kThreads << " threads, " << time.count() << " s: " << workshop.objects()
             << " objects filled and compared, " << workshop.handedOver()
             << " of them by the next thread; ";
    }
    std::string const leaks = ledger->leaks();
    text << (failure.empty() ? "no failure" : failure) << "; "
         << (leaks.empty() ? "no name left" : leaks);
    return {failure.empty() && leaks.empty(), text.str()};
}

} // namespace Soak
