// A program current for a scope.
#pragma once

#include "oru/core/utility/export.h"

namespace ORU::OGL {

class Program;

/// Makes a program current, and none at its end (not the one that was current before).
class ORU_API ProgramEnabledScope {
public:
    /// Holds no program until `enable`.
    ProgramEnabledScope() = default;

    /// Makes a program current.
    /// @param program a linked program that outlives the scope
    /// @throws InternalException for null or a program that is not linked
    /// @note glUseProgram
    explicit ProgramEnabledScope(Program *program);
    ProgramEnabledScope(ProgramEnabledScope const &) = default;
    ProgramEnabledScope &operator=(ProgramEnabledScope const &) = default;

    /// Makes no program current.
    /// @note glUseProgram
    ~ProgramEnabledScope();

    /// Makes a program current, in a scope that has none.
    /// @param program as the constructor's
    /// @throws InternalException also when the scope holds a program already
    void enable(Program *program);

private:
    Program *theProgram_ = nullptr;
};

} // namespace ORU::OGL
