// Line smoothing, stippling and width changed for a scope.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU::OGL {

// The scopes put back at their end what they found, each by the one call that a difference needs: a
// scope that found the state as wanted changes nothing at either end. They belong to OpenGL's
// compatibility profile, as stippling does.

/// Whether lines are smoothed.
struct ORU_API LineSmoothState {
    bool enabled = false; ///< GL_LINE_SMOOTH

    /// Reads it from the current context. @note glGetBooleanv
    void getLineSmoothState();
};

/// Smooths lines for a scope.
class ORU_API TemporaryLineSmoothScope {
public:
    /// Captures whether lines are smoothed, and smooths them.
    /// @note glEnable when lines are not smoothed yet
    TemporaryLineSmoothScope();
    TemporaryLineSmoothScope(TemporaryLineSmoothScope const &) = default;
    TemporaryLineSmoothScope &operator=(TemporaryLineSmoothScope const &) = default;
    /// Stops smoothing lines where the scope began it.
    /// @note glDisable
    ~TemporaryLineSmoothScope();

private:
    LineSmoothState saved_;
    LineSmoothState current_;
};

/// How lines are stippled.
struct ORU_API LineStippleState {
    bool enabled = false;       ///< GL_LINE_STIPPLE
    int factor = 0;             ///< pixels per bit of the pattern
    unsigned short pattern = 0; ///< drawn from the lowest bit on

    /// Reads it from the current context; factor and pattern only while stippling is on.
    /// @throws InternalException in a core context, which has no stippling
    /// @note glGetBooleanv, glGetIntegerv
    void setToCurrentGLValues();

    /// Equal in everything, the pattern of disabled stippling too.
    bool operator==(LineStippleState const &other) const {
        return enabled == other.enabled && factor == other.factor && pattern == other.pattern;
    }
};

/// Stipples lines, or not, for a scope.
class ORU_API TemporaryLineStippleScope {
public:
    /// Captures the stippling and sets another.
    /// @param enable 0 for solid lines; factor and pattern then do not matter
    /// @param factor pixels per bit of the pattern, 1 to 256
    /// @throws InternalException in a core context, which has no stippling
    /// @note glEnable and glLineStipple, or glDisable
    TemporaryLineStippleScope(unsigned char enable, int factor, unsigned short pattern);
    TemporaryLineStippleScope(TemporaryLineStippleScope const &) = default;
    TemporaryLineStippleScope &operator=(TemporaryLineStippleScope const &) = default;
    /// Stipples lines, or not, as before.
    /// @note glEnable and glLineStipple, or glDisable
    ~TemporaryLineStippleScope();

private:
    void updateCurrentState(unsigned char enable, int factor, unsigned short pattern);

    LineStippleState saved_;
    LineStippleState current_;
};

/// How wide lines are.
struct ORU_API LineWidthState {
    float width = 1; ///< pixels

    /// Reads it from the current context. @note glGetFloatv
    void setToCurrentGLValues();
};

/// Draws lines of one width for a scope.
class ORU_API TemporaryLineWidthScope {
public:
    /// Captures the width and sets another.
    /// @param width pixels
    /// @note glLineWidth
    explicit TemporaryLineWidthScope(float width);
    TemporaryLineWidthScope(TemporaryLineWidthScope const &) = default;
    TemporaryLineWidthScope &operator=(TemporaryLineWidthScope const &) = default;
    /// Sets the width as before.
    /// @note glLineWidth
    ~TemporaryLineWidthScope();

private:
    LineWidthState saved_;
    LineWidthState current_;
};

} // namespace ORU::OGL
