// Versions that drivers report: of OpenGL, of its shading language, of OpenCL platforms.
#include "fuzz/harness.h"

#include "oru/core/utility/versionstring.h"
#include "oru/oru_ocl/internal/versiontext.h"

#include <stdexcept>

namespace {

struct OpenGLVersion {
    unsigned int major = 0, minor = 0;
    int release = 0;
    std::string vendor;

    explicit OpenGLVersion(std::string const &text) {
        ORU::TokenizeVersionString(text, major, minor, release, vendor);
    }

    std::string text() const {
        return std::to_string(major) + "." + std::to_string(minor) +
               (release == -1 ? "" : "." + std::to_string(release)) +
               (vendor.empty() ? "" : " " + vendor);
    }
};

void ReadOpenGL(std::string const &text) {
    OpenGLVersion const version(text), again(version.text());
    HOLDS(version.vendor.size() <= text.size() &&
          text.compare(text.size() - version.vendor.size(), std::string::npos, version.vendor) ==
              0);
    HOLDS(version.major == again.major && version.minor == again.minor);
    HOLDS(version.release == again.release && version.vendor == again.vendor);
}

void ReadOpenCL(std::string const &text) {
    bool const isTooShort = !text.empty() && text.size() < std::string("OpenCL ").size();
    try {
        ORU::OCL::Version const version = ORU::OCL::ParseVersion(text);
        HOLDS(!isTooShort);
        HOLDS(version.major <= 9 && version.minor <= 9);
    } catch (std::out_of_range const &) {
        HOLDS(isTooShort);
    }
}

} // namespace

int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size) {
    std::string const text = fuzz::Text(data, size);
    ReadOpenGL(text);
    ReadOpenCL(text);
    return 0;
}
