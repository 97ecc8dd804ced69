// The throw-away context on which a display device's capabilities are read.
#pragma once

#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ogl/internalwindow.h"
#include "oru/oru_ogl/ogl/context.h"

namespace ORU::OGL::internal {

/// A context on a hidden window of a display device. It is neither made current nor registered nor
/// in a share group.
class ContextBootstrap : public Context {
public:
    explicit ContextBootstrap(DisplayDeviceKey const &key = Context::PrimaryDisplayDevice());
    ~ContextBootstrap() override;

private:
    ScopedPtr<InternalWindow> window_;
};

} // namespace ORU::OGL::internal
