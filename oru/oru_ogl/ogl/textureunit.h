// The fixed-function texture units of the current context.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU::OGL {

class Texture;
class Texture1D;
class Texture2D;
class Texture2DArray;
class Texture3D;
class TextureRECT;

/// One texture unit. Its members act on whichever unit is active; make this one active first:
///
/// ```cpp
/// TextureState::SetActiveTextureUnit(1);
/// TextureUnit::Unit(1)->bind(&texture);
/// ```
class ORU_API TextureUnit {
public:
    /// How a fragment's colour and its texel are combined.
    enum Environment : unsigned int {
        ENVIRONMENT_ADD = 0,  ///< GL_ADD
        ENVIRONMENT_BLEND,    ///< GL_BLEND
        ENVIRONMENT_COMBINE,  ///< GL_COMBINE
        ENVIRONMENT_DECAL,    ///< GL_DECAL
        ENVIRONMENT_MODULATE, ///< GL_MODULATE
        ENVIRONMENT_REPLACE   ///< GL_REPLACE
    };

    /// The handle of a unit, which lives as long as the process.
    /// @param index below the context's number of units (at most 256), which is not checked
    static TextureUnit *Unit(unsigned int index);

    /// @name Bind a texture to its target
    /// @note glBindTexture
    /// @{
    void bind(Texture1D const *texture) const;
    void bind(Texture2D const *texture) const;
    void bind(Texture3D const *texture) const;
    void bind(Texture2DArray const *texture) const;
    void bind(TextureRECT const *texture) const;
    /// A texture of any kind: cube maps, buffer textures and multisample textures among them.
    void bind(Texture const *texture) const;
    /// @param target GL enumeration value
    /// @param name GL name of a texture, or 0
    void bind(unsigned int target, unsigned int name) const;
    /// @}

    /// @name Bind no texture to a target
    /// @note glBindTexture
    /// @{
    void bind1DDefault() const;
    void bind2DDefault() const;
    void bind3DDefault() const;
    void bind2DArrayDefault() const;
    void bindRECTDefault() const;
    /// @}

    /// @name Fixed-function texturing with a target
    /// @throws InternalException in a core context, which has none
    /// @note glEnable, glDisable, glIsEnabled
    /// @{
    void enable1D() const;
    void enable2D() const;
    void enable3D() const;
    void enableRECT() const;
    void disable1D() const;
    void disable2D() const;
    void disable3D() const;
    void disableRECT() const;
    bool isEnabled1D() const;
    bool isEnabled2D() const;
    bool isEnabled3D() const;
    bool isEnabledRECT() const;
    /// @}

    /// How fragments and texels are combined in fixed-function drawing.
    /// @throws InternalException in a core context, which has no fixed-function texturing
    /// @note glTexEnvi
    void setEnv(Environment environment) const;

    /// @name Translations to and from GL texture environment modes
    /// @throws InternalException for a value outside the enumeration
    /// @{
    static unsigned int Environment2GL(Environment environment);
    static Environment GL2Environment(unsigned int mode);
    /// @}

private:
    TextureUnit() = default;

    /// Whether this unit is the active one; has its place in the binary interface.
    /// @note glGetIntegerv
    bool verifyActiveTexture() const;

    static TextureUnit sUnits_[]; ///< a unit's index is its place here
};

} // namespace ORU::OGL
