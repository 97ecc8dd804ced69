// The root of the library's exception classes.
#pragma once

#include "oru/core/utility/export.h"

#include <exception>
#include <iosfwd>
#include <string>

/// The library: exceptions, memory, values, regions; OpenGL in `ORU::OGL`, OpenCL in `ORU::OCL`.
namespace ORU {

/// Root of everything the library throws by itself.
///
/// Catch `LogicalException` to receive every failure of the library; this class adds nothing to
/// that but is the place of the common operations. Standard-library exceptions pass unchanged.
class ORU_API ExceptionBase : public std::exception {
public:
    /// Makes an exception whose what-text is "ORU exception".
    ExceptionBase();

    /// Makes an exception whose what-text is a copy of `text`, which must not be null.
    explicit ExceptionBase(char const *text);

    ExceptionBase(ExceptionBase const &) = default;
    ExceptionBase(ExceptionBase &&) noexcept = default;
    ExceptionBase &operator=(ExceptionBase const &) = default;
    ExceptionBase &operator=(ExceptionBase &&) noexcept = default;
    ~ExceptionBase() override;

    /// The what-text, valid as long as the object lives.
    char const *what() const noexcept override;

    /// A heap copy of the whole object, allocated through the memory hooks; the caller owns it and
    /// frees it with `ORUDeleter<ExceptionBase>`.
    /// @throws std::bad_alloc when memory is exhausted.
    virtual ExceptionBase *clone() const;

    /// Writes the exception's full form, here just the what-text.
    virtual void write(std::ostream &os) const;

protected:
    /// Replaces the what-text with a copy of `text`.
    void setWhat(char const *text) { what_ = text; }

private:
    std::string what_;
};

/// Writes the full form of any exception of the tree, by its virtual `write`.
ORU_API std::ostream &operator<<(std::ostream &os, ExceptionBase const &e);

} // namespace ORU
