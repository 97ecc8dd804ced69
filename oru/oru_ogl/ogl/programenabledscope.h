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

    /// @param program a linked program that outlives the scope
    /// @throws InternalException for null or a program that is not linked
    /// @note glUseProgram
    explicit ProgramEnabledScope(Program *program);
    ProgramEnabledScope(ProgramEnabledScope const &) = default;
    ProgramEnabledScope &operator=(ProgramEnabledScope const &) = default;

    /// @note glUseProgram
    ~ProgramEnabledScope();

    /// @param program as the constructor's
    /// @throws InternalException also when the scope holds a program already
    void enable(Program *program);

private:
    Program *theProgram_ = nullptr;
};

} // namespace ORU::OGL
