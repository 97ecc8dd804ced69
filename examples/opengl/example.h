// What the examples of the OpenGL layer share: their argument, and saving what they drew.
#pragma once

#include "apps/common/imagefile.h"
#include "examples/example.h"
#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <filesystem>

namespace example {

/// Runs `work` with the path that the command line names, and prints what it throws.
/// @return the program's exit code
template<class Work>
int Run(int argc, char **argv, Work work) {
    return Run(argc, argv, "FILE", [&work](Arguments const &arguments) {
        work(std::filesystem::path(arguments.front()));
    });
}

/// Saves the colours of the bound framebuffer's lower left corner as a PNG file.
inline void SavePicture(std::filesystem::path const &file, unsigned int width,
                        unsigned int height) {
    App::Image picture({width, height, 3, 8});
    ORU_GL(PixelStorei, GL_PACK_ALIGNMENT, 1); // rows without gaps
    ORU_GL(ReadPixels, 0, 0, static_cast<GLsizei>(width), static_cast<GLsizei>(height), GL_RGB,
           GL_UNSIGNED_BYTE, picture.pixels.data());
    // OpenGL's rows run from the bottom to the top.
    for (std::size_t y = 0; y < height / 2; ++y)
        std::swap_ranges(picture.row(y), picture.row(y) + picture.rowBytes(),
                         picture.row(height - 1 - y));
    App::WriteImage(file, picture);
}

/// Numbers as the bytes that VertexBuffer::setField takes.
template<class Numbers>
unsigned char const *Bytes(Numbers const &numbers) {
    return reinterpret_cast<unsigned char const *>(std::data(numbers));
}

} // namespace example
