// Texturing with one 2-D texture for a scope.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU::OGL {

class Texture2D;

/// Binds a 2-D texture on a unit and lets it replace the fragments' colours until the scope ends,
/// in fixed-function drawing. The texture is sampled with FILTER_NEAREST and clamped to its edges,
/// and stays so. At the end the unit has no 2-D texture, whatever it had before. A core context has
/// no fixed-function drawing: there the scope binds the texture for a shader.
class ORU_API Texture2DBindScope {
public:
    /// Binds the texture, if active.
    /// @param texture may be null in a scope that is not active
    /// @param unit index of a texture unit
    /// @param active whether the scope does anything
    /// @throws InternalException for a null texture in an active scope
    /// @note glActiveTexture, glEnable, glBindTexture, glTexParameteri, glTexEnvi; needs OpenGL 1.3
    Texture2DBindScope(Texture2D *texture, unsigned int unit, bool active);

    /// Makes the unit active again that was; a failure is dropped.
    ~Texture2DBindScope();

    Texture2DBindScope(Texture2DBindScope const &) = default;
    Texture2DBindScope &operator=(Texture2DBindScope const &) = default;

private:
    void end() const noexcept;

    unsigned int previousUnit_ = 0;
    unsigned int unit_ = 0;
    bool active_;
};

} // namespace ORU::OGL
