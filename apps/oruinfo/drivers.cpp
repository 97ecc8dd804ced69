// The drivers that a report is about.
#include "apps/oruinfo/drivers.h"

namespace OruInfo {

namespace {

/// Makes what is not there yet, unless that failed before.
template<class Driver, class Make>
Driver &Opened(std::unique_ptr<Driver> &driver, std::exception_ptr &failure, Make const &make) {
    if (!driver && !failure) {
        try {
            driver = make();
        } catch (...) {
            failure = std::current_exception();
        }
    }
    if (failure)
        std::rethrow_exception(failure);
    return *driver;
}

/// The layer takes a directory only with the separator at its end.
std::string Directory(std::string const &folder) {
    bool const complete = folder.empty() || folder.back() == '/' || folder.back() == '\\';
    return complete ? folder : folder + "\\";
}

} // namespace

Drivers::~Drivers() = default;

ORU::OGL::ContextOffscreen const &Drivers::openGL() {
    OpenGL &driver = Opened(openGL_, openGLFailure_, [] { return std::make_unique<OpenGL>(); });
    driver.context.makeCurrent();
    return driver.context;
}

void Drivers::openOpenCL() {
    Opened(openCL_, openCLFailure_, [this] {
        // Settles the folder; Initialize then says what is wrong, where something is.
        ORU::OCL::Library::IsOpenCLAvailable(Directory(openCLFolder_));
        return std::make_unique<ORU::OCL::AutoInitializer>();
    });
}

} // namespace OruInfo
