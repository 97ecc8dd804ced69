// Makes one call of the library to the driver fail, whichever is wanted, or one allocation.
#pragma once

namespace sweep {

enum class Kind { Call, Allocation };

/// Puts hooks between oru.dll and OpenGL, WGL, the pixel formats of GDI and OpenCL, and between the
/// C++ run-time library and malloc; once, before anything else. Only the calling thread counts.
void InstallHooks();

/// From now every call or allocation is counted, and the `failing`-th fails: an OpenGL call does
/// nothing and leaves GL_OUT_OF_MEMORY behind, one of WGL or GDI returns 0, one of OpenCL
/// CL_OUT_OF_HOST_MEMORY.
/// @param failing from 1; 0 for none
void Arm(Kind kind, unsigned failing);
void Disarm();

/// From here to Disarm only destructors run, which swallow what fails.
void BeginEnd();

/// Since the last Arm: how many there were, the entry point that failed ("" before that), and
/// whether that was after BeginEnd.
unsigned Count();
char const *FailedName();
bool FailedAtEnd();

/// What the program holds at the moment.
struct Holdings {
    long names = 0;    ///< of OpenGL objects, made less deleted
    long contexts = 0; ///< of WGL
    long memory = 0;   ///< blocks of the C++ run-time library's that this thread asked for
};
Holdings CurrentHoldings();

} // namespace sweep
