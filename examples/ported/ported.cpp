// Eight programs, each in plain calls and in the library's classes: draws both and compares them.
#include "examples/ported/ported.h"
#include "apps/common/imagefile.h"
#include "examples/example.h"
#include "examples/ported/plaingl.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/pixelview.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/statescope.h"

#include <filesystem>
#include <iomanip>

using namespace ORU::OGL;
using namespace ported;

namespace {

/// A picture drawn in a context of its own, so that no form finds what another left there.
template<class Draw>
Picture DrawAlone(Draw draw) {
    ContextOffscreen const context;
    context.makeCurrent();
    Renderbuffer colours(GL_RGBA8, kSide, kSide), depth(GL_DEPTH_COMPONENT24, kSide, kSide);
    Framebuffer target;
    target.bind();
    target.attach(&colours, 0);
    target.attach(&depth, 0);
    TemporaryViewportScope const whole({0, 0, kSide, kSide});
    float const night[] = {0.1f, 0.1f, 0.15f, 1};
    Framebuffer::ClearColor(&target, 0, night, nullptr);
    Framebuffer::ClearDepth(&target, 1, nullptr);
    return draw(target);
}

/// Saves a picture as a PNG file.
void Save(std::filesystem::path const &file, Picture const &picture) {
    App::Image image({kSide, kSide, 3, 8});
    for (std::size_t y = 0; y < kSide; ++y)
        std::copy_n(picture.data() + y * image.rowBytes(), image.rowBytes(),
                    image.row(kSide - 1 - y));
    App::WriteImage(file, image);
}

/// Lines between two marks, without the mark itself and the blank line before the next one.
int Lines(int mark, int next) {
    return next - mark - 2;
}

void CompareAll(example::Arguments const &arguments) {
    AutoInitializer const library;
    ExtensionManager::InitOptions options;
    options.setContextAttributes(
        ContextAttributes().setVersion(4, 1).setProfile(OPENGLPROFILE_CORE));
    ExtensionManager::ScopedInitOptions const core(options);

    std::string different;
    for (Comparison const &program : {kShadowMap, kDeferredShader, kBloomWithResolve, kCubeMap,
                                      kInstances, kUniformBlock, kFeedback, kTimedFrames}) {
        Picture const plain = DrawAlone([&program](Framebuffer &target) {
            plain::LoadFunctions();
            return program.plain(target.objectID());
        });
        Picture const ported = DrawAlone(program.ported);
        if (plain != ported)
            different += std::string(" ") + program.name;
        if (!arguments.empty()) {
            std::filesystem::path const folder = arguments.front();
            Save(folder / (program.name + std::string(".png")), ported);
            if (plain != ported)
                Save(folder / (program.name + std::string("_plain.png")), plain);
        }
        int const *const marks = program.marks;
        std::cout << std::left << std::setw(20) << program.name
                  << (plain == ported ? "equal    " : "DIFFERENT") << std::right << "  lines: plain"
                  << std::setw(4) << Lines(marks[0], marks[1]) << ", ported" << std::setw(4)
                  << Lines(marks[1], marks[2]) << '\n';
    }
    if (!different.empty())
        throw std::runtime_error("plain and ported form draw different pictures:" + different);
}

} // namespace

Picture ported::ReadBack(unsigned int framebuffer) {
    Framebuffer const target(framebuffer, borrow_name_tag());
    Picture picture = EmptyPicture();
    Framebuffer::Read(
        &target, 0, 0,
        MutablePixelView(picture.data(), picture.size(),
                         {Texture::FORMAT_RGB, Texture::TYPE_UNSIGNED_BYTE, kSide, kSide}));
    return picture;
}

int main(int argc, char **argv) {
    return example::Run(argc, argv, "[FOLDER]", CompareAll);
}
