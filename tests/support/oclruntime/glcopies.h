// The OpenGL side of sharing by copying.
#pragma once

#include "oru/oru_ocl/openclheaders.h"

#include <cstddef>
#include <vector>

#include <windows.h>

namespace oru_test::runtime {

/// An OpenGL format that the extension maps to one of OpenCL.
struct SharedFormat {
    unsigned int internalFormat; ///< of the texture or renderbuffer
    unsigned int format, type;   ///< of its pixels in memory
    cl_image_format image;
    std::size_t pixelSize; ///< bytes
};

/// An OpenGL object that is shared, and its storage as it was found.
struct GLObject {
    cl_gl_object_type kind = 0;
    unsigned int name = 0;
    unsigned int target = 0; ///< of a texture
    int level = 0;           ///< of a texture
    std::size_t width = 0;   ///< pixels, or the bytes of a buffer
    std::size_t height = 1;
    std::size_t depth = 1;
    SharedFormat const *format = nullptr; ///< null for a buffer

    std::size_t bytes() const { return width * height * depth * (format ? format->pixelSize : 1); }
    bool hasSameStorage(GLObject const &other) const {
        return width == other.width && height == other.height && depth == other.depth &&
               format == other.format;
    }
};

/// Makes an OpenGL context current for a scope, unless it is already.
class CurrentGL {
public:
    CurrentGL(HDC dc, HGLRC context);
    ~CurrentGL();
    CurrentGL(CurrentGL const &) = delete;
    CurrentGL &operator=(CurrentGL const &) = delete;

    /// Whether the context is current; not so when it is gone or current on another thread.
    explicit operator bool() const { return current_; }

private:
    HDC previousDC_;
    HGLRC previousContext_;
    bool switched_ = false;
    bool current_ = false;
};

// With the object's context current. State that they change is put back.

/// Finds the storage of the object named in `object`; CL_SUCCESS or the code that the extension
/// prescribes.
cl_int Describe(GLObject &object);

/// Copies the whole storage to `pixels`, or from there.
void CopyGL(GLObject const &object, std::vector<unsigned char> &pixels, bool toOpenGL);

} // namespace oru_test::runtime
