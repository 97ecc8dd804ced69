// The base of the classes that own an OpenGL object.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU::OGL {

/// An OpenGL object's name, the target it is bound to, and the query for what is bound there.
///
/// The derived class makes the name and deletes it. An object lives and dies while its context, or
/// one that shares with it, is current.
class ORU_API Object {
public:
    /// Deletes nothing: that is the derived classes' part.
    virtual ~Object();

    Object(Object const &) = delete;
    Object &operator=(Object const &) = delete;

    /// The GL name; 0 while there is none.
    unsigned int objectID() const { return objectID_; }

    /// The GL enumeration value of the target the object is used with.
    unsigned int target() const { return target_; }

    bool isInitialized() const { return objectID_ != 0; }

    /// The name of whatever is bound to this object's target.
    /// @throws ExceptionOGL when the context does not know the target
    /// @note glGetIntegerv
    unsigned int getBoundID() const;

    /// Whether this object is what is bound to its target. Throws and calls as `getBoundID()`.
    bool isBound() const { return getBoundID() == objectID_; }

protected:
    /// @param target, targetBinding GL enumeration values of the target and of its binding's query
    Object(unsigned int target, unsigned int targetBinding);

    /// The object will be bound to another target; no GL call is made.
    void changeTarget(unsigned int target, unsigned int targetBinding);

    unsigned int objectID_ = 0;

private:
    unsigned int target_;
    unsigned int targetBinding_;
};

} // namespace ORU::OGL
