// A loader thread fills textures in a context of its own; each is drawn once its fence lets it be,
// and every frame is timed on the GPU without waiting for it.
#include "examples/opengl/example.h"

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/fence.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/gputimer.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/texture2.h"
#include "oru/oru_ogl/ogl/textureunit.h"
#include "oru/oru_ogl/ogl/uniformblockwriter.h"
#include "oru/oru_ogl/ogl/vertexarray.h"

#include <array>
#include <future>
#include <memory>
#include <thread>

using namespace ORU::OGL;

namespace {

unsigned int const kSide = 80;              ///< pixels of a tile, which is square
unsigned int const kColumns = 4, kRows = 3; ///< tiles of the picture
unsigned int const kTiles = kColumns * kRows;

char const *const kVertexShader = R"(#version 140
    in vec2 corner;
    layout(std140) uniform Tile { vec2 place; vec2 size; };
    out vec2 at;
    void main() {
        at = corner;
        gl_Position = vec4(place + corner * size, 0.0, 1.0);
    })";

char const *const kFragmentShader = R"(#version 140
    in vec2 at;
    uniform sampler2D tile;
    void main() { gl_FragColor = texture(tile, at); })";

/// A tile on its way from the one thread to the other.
struct Tile {
    std::unique_ptr<Texture2D> texture;
    Fence ready; ///< behind the upload
};

/// What takes its time: a part of a Julia set.
std::vector<unsigned char> Compute(unsigned int number) {
    std::vector<unsigned char> pixels;
    unsigned int const left = number % kColumns * kSide, bottom = number / kColumns * kSide;
    for (unsigned int y = 0; y < kSide; ++y) {
        for (unsigned int x = 0; x < kSide; ++x) {
            double re = (left + x - 159.5) / 100, im = (bottom + y - 119.5) / 100;
            int steps = 0;
            for (; steps < 100 && re * re + im * im < 4; ++steps) {
                double const next = re * re - im * im - 0.8;
                im = 2 * re * im + 0.156;
                re = next;
            }
            double const t = steps / 100.0, u = 1 - t;
            for (double const colour : {9 * u * t * t * t, 15 * u * u * t * t, 8.5 * u * u * u * t})
                pixels.push_back(static_cast<unsigned char>(255 * colour));
            pixels.push_back(255);
        }
    }
    return pixels;
}

/// The loader thread: everything it makes is of a context that shares with the drawing one.
void Load(Context const &drawing, std::array<std::promise<Tile>, kTiles> &tiles) {
    unsigned int number = 0;
    try {
        ContextOffscreen const context(&drawing);
        context.makeCurrent();
        for (; number < kTiles; ++number) {
            auto const pixels = Compute(number);
            auto texture =
                std::make_unique<Texture2D>(Texture::INTERNALFORMAT_RGBA8, kSide, kSide, false);
            TextureUnit::Unit(0)->bind(texture.get());
            texture->subImage(0, 0, 0, kSide, kSide, Texture::FORMAT_RGBA,
                              Texture::TYPE_UNSIGNED_BYTE, pixels.data(), PixelUnpackParameters());
            TextureUnit::Unit(0)->bind2DDefault();
            tiles[number].set_value({std::move(texture), Fence::ForOtherContexts()});
        }
    } catch (...) {
        if (number < kTiles)
            tiles[number].set_exception(std::current_exception());
    }
}

void Draw(std::filesystem::path const &file) {
    AutoInitializer const library;
    ContextOffscreen const context;
    context.makeCurrent();
    Renderbuffer picture(GL_RGBA8, kColumns * kSide, kRows * kSide);
    Framebuffer framebuffer;
    framebuffer.bind();
    framebuffer.attach(&picture, 0);
    ORU_GL(Viewport, 0, 0, kColumns * kSide, kRows * kSide);

    Program program;
    program.loadVertexShader(1, &kVertexShader, nullptr);
    program.loadFragmentShader(1, &kFragmentShader, nullptr);
    program.link(true);
    unsigned char const corners[] = {0, 0, 1, 0, 0, 1, 1, 1};
    Buffer const square(sizeof corners, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW,
                        corners);
    VertexArray array;
    array.setAttribute(program.getAttributeLocation("corner"), square, {2, GL_UNSIGNED_BYTE});
    UniformBlock const block(program, "Tile");
    UniformBlockWriter values(block); // knows where the driver wants each member
    values.set("size", {2.f / kColumns, 2.f / kRows});
    Buffer uniforms(block.size(), Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_DYNAMIC_DRAW, nullptr);
    uniforms.bindBase(GL_UNIFORM_BUFFER, 0);
    ProgramEnabledScope const scope(&program);

    std::array<std::promise<Tile>, kTiles> tiles;
    std::thread loader([&] { Load(context, tiles); });
    auto const join = [](std::thread *thread) { thread->join(); };
    std::unique_ptr<std::thread, decltype(join)> const joined(&loader, join);

    GpuTimer timer;
    std::chrono::nanoseconds onGpu{0};
    for (unsigned int number = 0; number < kTiles; ++number) {
        Tile const tile = tiles[number].get_future().get();
        tile.ready.wait(); // the GPU waits, this thread goes on
        timer.begin();
        TextureUnit::Unit(0)->bind(tile.texture.get());
        unsigned int const column = number % kColumns, row = number / kColumns;
        values.set("place", {2.f * static_cast<float>(column) / kColumns - 1,
                             2.f * static_cast<float>(row) / kRows - 1});
        values.upload(uniforms);
        array.drawArrays(GL_TRIANGLE_STRIP, 0, 4);
        timer.end();
        ORU_GL0(Flush);                        // as showing a frame would do
        while (auto const time = timer.take()) // of some frames ago
            onGpu += *time;
    }
    example::SavePicture(file, kColumns * kSide, kRows * kSide);
    while (auto const time = timer.take())
        onGpu += *time;
    std::cout << kTiles << " tiles in " << onGpu.count() / 1000 << " microseconds on the GPU, "
              << timer.missed() << " not timed\n";
}

} // namespace

int main(int argc, char **argv) {
    return example::Run(argc, argv, Draw);
}
