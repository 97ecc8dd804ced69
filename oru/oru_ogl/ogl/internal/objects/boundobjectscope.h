// An object bound to its target for a scope.
#pragma once

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/ending.h"
#include "oru/oru_ogl/ogl/object.h"

namespace ORU::OGL::internal {

/// Binds an object to its target until `restore()`, or until an exception ends the scope first;
/// what was bound there before is then bound again.
///
///     BoundObjectScope bound(buffer, ORU_BINDER(BindBuffer));
///     …
///     bound.restore();
class BoundObjectScope {
public:
    /// The call that binds objects of a kind to a target.
    using Bind = void (*)(char const *file, unsigned int line, GLenum target, GLuint name);

    /// @param bind, file, line what `ORU_BINDER` makes
    BoundObjectScope(Object const &object, Bind bind, char const *file, unsigned int line)
        : restore_(Binding{bind, file, line, object.target(), object.getBoundID()}) {
        Binding{bind, file, line, object.target(), object.objectID()}();
    }

    /// A failure leaves here; a destructor would drop it.
    void restore() { restore_.now(); }

private:
    struct Binding {
        Bind bind;
        char const *file;
        unsigned int line;
        GLenum target;
        GLuint name;

        void operator()() const { bind(file, line, target, name); }
    };

    Ending<Binding> restore_;
};

} // namespace ORU::OGL::internal

/// The last arguments of a BoundObjectScope: `ORU_BINDER(BindTexture)` binds by glBindTexture, with
/// this source position.
#define ORU_BINDER(Name) ::ORU::OGL::internal::Call##Name, __FILE__, __LINE__
