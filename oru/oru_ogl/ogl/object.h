// The base of the classes that own an OpenGL object.
#pragma once

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/export.h"
#include "oru/oru_ogl/ogl/ownershiptag.h"

namespace ORU::OGL {

/// An OpenGL object's name, the target it is bound to, and the query for what is bound there.
///
/// The derived class makes the name and deletes it. An object lives and dies while its context, or
/// one that shares with it, is current. It moves: what it is moved from, or has given up its name
/// by `disown()`, is empty. An empty object has the name 0 and is not initialised, can be assigned
/// to and is destroyed without a GL call; whatever else it is asked throws InternalException.
class ORU_API Object {
public:
    /// Deletes nothing: that is the derived classes' part.
    virtual ~Object();

    Object(Object const &) = delete;
    Object &operator=(Object const &) = delete;

    /// The GL name; 0 while there is none.
    unsigned int objectID() const { return objectID_; }

    /// The GL name of an object that must not be empty.
    unsigned int checkedID() const {
        requireObject();
        return objectID_;
    }

    /// The GL enumeration value of the target the object is used with.
    unsigned int target() const {
        requireObject();
        return target_;
    }

    bool isInitialized() const { return objectID_ != 0; } ///< whether there is a name

    /// The name of whatever is bound to this object's target.
    /// @throws ExceptionOGL when the context does not know the target
    /// @note glGetIntegerv
    unsigned int getBoundID() const;

    /// Whether this object is what is bound to its target. Throws and calls as `getBoundID()`.
    bool isBound() const { return getBoundID() == objectID_; }

    /// Whether the destructor deletes the name.
    bool ownsName() const { return objectID_ != 0 && !isBorrowed_; }

    /// Gives up the name, which is the caller's to delete now; the object is empty afterwards.
    /// @return the name
    unsigned int disown();

protected:
    /// An object without a name yet.
    /// @param target, targetBinding GL enumeration values of the target and of its binding's query
    Object(unsigned int target, unsigned int targetBinding);

    /// An object over a name that was made elsewhere.
    /// @throws InternalException for the name 0
    Object(unsigned int target, unsigned int targetBinding, unsigned int name,
           ownership_tag ownership);

    Object(Object &&other) noexcept;

    /// The derived class has deleted what this object owned.
    Object &operator=(Object &&other) noexcept;

    /// Throws InternalException for an empty object.
    void requireObject() const {
        if (isEmpty_)
            ThrowEmpty();
    }

    /// The object will be bound to another target; no GL call is made.
    void changeTarget(unsigned int target, unsigned int targetBinding);

    unsigned int objectID_ = 0; ///< the GL name, which the derived class makes

private:
    [[noreturn]] ORU_COLD static void ThrowEmpty();

    unsigned int target_;
    // The flags lie in bits that no GL enumeration value uses: hosts know the size of the classes.
    unsigned int targetBinding_ : 30;
    unsigned int isBorrowed_ : 1; ///< the name is another's to delete
    unsigned int isEmpty_ : 1;    ///< moved from, or without the name that it gave up
};

} // namespace ORU::OGL
