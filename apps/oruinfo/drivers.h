// The drivers that a report is about.
#pragma once

#include "oru/oru_ocl/ocllibrary.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"

#include <exception>
#include <memory>
#include <string>

namespace OruInfo {

/// Opens each driver when it is first asked for. One that does not open fails again, with the same
/// exception, whenever it is asked for.
class Drivers {
public:
    /// @param openCLFolder where OpenCL.dll lies; empty for the system's folder
    explicit Drivers(std::string const &openCLFolder) : openCLFolder_(openCLFolder) {}
    ~Drivers();
    Drivers(Drivers const &) = delete;
    Drivers &operator=(Drivers const &) = delete;

    /// A context on the primary display, made current.
    /// @throws what opening the layer or making the context threw
    ORU::OGL::ContextOffscreen const &openGL();

    /// Loads the OpenCL runtime.
    /// @throws what loading threw
    void openOpenCL();

private:
    struct OpenGL {
        ORU::OGL::AutoInitializer library;
        ORU::OGL::ContextOffscreen context;
    };

    std::string openCLFolder_;
    std::unique_ptr<OpenGL> openGL_;
    std::exception_ptr openGLFailure_;
    std::unique_ptr<ORU::OCL::AutoInitializer> openCL_;
    std::exception_ptr openCLFailure_;
};

} // namespace OruInfo
