// Tries what can be done with internal formats.
#pragma once

#include "oru/oru_ogl/gltypes.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/texture2.h"

namespace OruInfo {

/// What can be done with a format.
struct FormatAnswers {
    bool isTexture = false;    ///< whether a texture of it can be made
    bool isRenderable = false; ///< whether such a texture can be drawn into
    bool isFiltered = false;   ///< whether it is filtered linearly; not tried with depths
    unsigned int samples = 0;  ///< the most of a renderbuffer of it, 0 when it has one only
};

/// Tries formats in the current context, a compatibility one of the caller's own: bindings and the
/// state of fixed functions are not put back.
class FormatProbe {
public:
    /// @throws InternalException when there are no framebuffer objects
    FormatProbe();

    /// @throws LogicalException for what fails whatever the format is
    FormatAnswers ask(GLenum format);

    /// Whether a format is one of depths.
    static bool HasDepth(GLenum format);

private:
    bool makesTexture(GLenum format) const;
    bool isComplete(GLenum format);
    bool isFiltered(GLuint texture);
    bool isMultisampled(GLenum format, GLuint renderbuffer, int samples);
    unsigned int mostSamples(GLenum format);
    void detachAll() const;

    ORU::OGL::Texture2D shown_; ///< into which textures are drawn
    ORU::OGL::Framebuffer framebuffer_;
};

} // namespace OruInfo
