// Start-up and shut-down of the OpenGL layer.
#include "oru/oru_ogl/libraryogl.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/dropexceptions.h"
#include "oru/core/utility/sharedptr.h"
#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"
#include "oru/oru_ogl/extensionator/internal/contextservices.h"
#include "oru/oru_ogl/extensionator/openglinterceptor.h"
#include "oru/oru_ogl/extensionator/wgl/wglinterceptor.h"

#include <fstream>

namespace ORU::OGL {

bool Library::sIsInitialized_ = false;
Library::InitOptions Library::sInitOptions_;
std::fstream *Library::sSrcFile_ = nullptr;
std::fstream *Library::sBinFile_ = nullptr;

void Library::Initialize(InitOptions const &options) {
    ORU_ASSERT(!sIsInitialized_);
    sInitOptions_ = options;
    sIsInitialized_ = true;
}

bool Library::IsInitialized() {
    return sIsInitialized_;
}

void Library::Terminate() {
    if (sSrcFile_) {
        ORU_ENFORCE_TEXT("sBinFile_ != NULL", sBinFile_);
        for (std::fstream *file : {sSrcFile_, sBinFile_}) {
            file->flush();
            file->close();
        }
        ORUDeleter<std::fstream>()(sSrcFile_);
        sSrcFile_ = nullptr;
        ORUDeleter<std::fstream>()(sBinFile_);
        sBinFile_ = nullptr;
    }
    WGLInterceptor::Destroy();
    OpenGLInterceptor::Destroy();
    ExtensionManager::Terminate();
    ORU_ASSERT(sIsInitialized_);
    sIsInitialized_ = false;
}

AutoInitializer::AutoInitializer() : AutoInitializer(Library::InitOptions()) {}

AutoInitializer::AutoInitializer(Library::InitOptions const &options) : active_(true) {
    Library::Initialize(options);
}

AutoInitializer::~AutoInitializer() {
    if (active_)
        DropExceptions([] { Library::Terminate(); });
}

bool internal::IsLibraryInitialized() {
    return Library::IsInitialized();
}

} // namespace ORU::OGL
