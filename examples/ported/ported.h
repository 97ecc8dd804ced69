// What the programs of this folder share: the picture that each draws in two forms.
#pragma once

#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"

#include <string_view>
#include <vector>

namespace ported {

constexpr int kSide = 96; ///< pixels of a picture, which is square

/// Red, green and blue of each pixel, from the lowest row up.
using Picture = std::vector<unsigned char>;

/// The memory of a picture.
inline Picture EmptyPicture() {
    return Picture(std::size_t{kSide} * kSide * 3);
}

/// What a framebuffer holds.
Picture ReadBack(unsigned int framebuffer);

/// A program in both forms. Each gets the framebuffer of a picture, which is bound, cleared and
/// filled by the viewport, and has depth.
struct Comparison {
    char const *name;
    Picture (*plain)(unsigned int target);
    Picture (*ported)(ORU::OGL::Framebuffer &target);
    int marks[3]; ///< lines of the source: before the plain form, between the two, and behind
};

extern Comparison const kShadowMap, kDeferredShader, kBloomWithResolve, kCubeMap, kInstances,
    kUniformBlock, kFeedback, kTimedFrames;

/// A linked program.
inline ORU::OGL::Program MakeProgram(std::string_view vertex, std::string_view fragment) {
    ORU::OGL::Program program;
    program.loadVertexShader(vertex);
    program.loadFragmentShader(fragment);
    program.link(true);
    return program;
}

} // namespace ported
