// A program current for a scope.
#include "oru/oru_ogl/ogl/programenabledscope.h"

#include "oru/core/exceptions/checks.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/programogl.h"

namespace ORU::OGL {

ProgramEnabledScope::ProgramEnabledScope(Program *program) : theProgram_(program) {
    ORU_ASSERT_TEXT("theProgram", program);
    theProgram_->enable();
}

ProgramEnabledScope::~ProgramEnabledScope() {
    if (theProgram_)
        internal::Release([this] { theProgram_->disable(); });
}

void ProgramEnabledScope::enable(Program *program) {
    ORU_ASSERT(!theProgram_);
    ORU_ASSERT(program);
    theProgram_ = program;
    theProgram_->enable();
}

} // namespace ORU::OGL
