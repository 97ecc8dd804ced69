// Blending changed for a scope.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU::OGL {

/// The blending of the current context: switch, factors and equations.
struct ORU_API BlendState {
    bool enabled = false;       ///< GL_BLEND
    int dstAlpha = 1;           ///< blend factors, GL_ONE unless captured
    int dstRGB = 1;             ///< of the destination's colours
    int srcAlpha = 1;           ///< of the source's alpha
    int srcRGB = 1;             ///< of the source's colours
    int equationAlpha = 0x8006; ///< blend equations, GL_FUNC_ADD unless captured
    int equationRGB = 0x8006;   ///< of the colours

    /// Reads all of it from the current context.
    /// @throws InternalException when an OpenGL error is pending afterwards, whatever caused it
    /// @note glGetBooleanv, glGetIntegerv; OpenGL 2.0
    void setToCurrentGLValues();
};

/// Puts blending back at its end, as far as a derived scope changed it.
///
/// It compares what it found with what the scope set, so changes that the caller makes itself stay,
/// and a scope that changed nothing changes nothing at its end.
class ORU_API TemporaryBlendScope {
public:
    /// Captures the blending. @throws as BlendState::setToCurrentGLValues
    TemporaryBlendScope();
    TemporaryBlendScope(TemporaryBlendScope const &) = default;
    TemporaryBlendScope &operator=(TemporaryBlendScope const &) = default;

    /// Restores what differs, and leaves no OpenGL error pending.
    /// @note glEnable or glDisable, glBlendFuncSeparate, glBlendEquationSeparate
    virtual ~TemporaryBlendScope();

protected:
    BlendState saved_;   ///< what the constructor found
    BlendState current_; ///< what the scope set
};

/// Blends by the source's alpha for a scope: alpha × source + (1 − alpha) × destination.
class ORU_API TemporaryAlphaBlendScope : public TemporaryBlendScope {
public:
    /// Captures the blending and sets its own.
    /// @throws as BlendState::setToCurrentGLValues
    /// @note glEnable, glBlendFunc, glBlendEquation
    TemporaryAlphaBlendScope();
    TemporaryAlphaBlendScope(TemporaryAlphaBlendScope const &) = default;
    TemporaryAlphaBlendScope &operator=(TemporaryAlphaBlendScope const &) = default;
    ~TemporaryAlphaBlendScope() override;
};

} // namespace ORU::OGL
