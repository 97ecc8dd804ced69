// An OpenCL context and its properties.
#pragma once

#include "oru/core/utility/windowsforward.h"
#include "oru/oru_ocl/notifycallback.h"
#include "oru/oru_ocl/platform.h"

#include <vector>

namespace ORU::OCL {

/// What a context is made of: a platform and, to share objects with OpenGL, a rendering context.
class ORU_API ContextProperties {
public:
    /// No sharing.
    explicit ContextProperties(Platform const &platform) : platform_(platform) {}

    Platform const &platform() const { return platform_; } ///< What the context is made on.
    /// Takes the context's devices from another platform.
    void setPlatform(Platform const &platform) { platform_ = platform; }

    /// The OpenGL rendering context to share objects with, null for none. It must outlive the
    /// OpenCL context and its queues, and is best current on the thread that makes them.
    HGLRC const &sharedRenderContext() const { return sharedRenderContext_; }
    /// Give its device context too.
    void setSharedRenderContext(HGLRC const &context) { sharedRenderContext_ = context; }

    /// The device context of the shared rendering context.
    HDC displayContext() const { return displayContext_; }
    /// Needed with a rendering context.
    void setDisplayContext(HDC context) { displayContext_ = context; }

    /// The properties as clCreateContext takes them: pairs of key and value, then 0. The sharing
    /// keys, CL_WGL_HDC_KHR and CL_GL_CONTEXT_KHR, are left out without a rendering context.
    std::vector<cl_context_properties> properties() const;

private:
    void buildContextPropertiesList(std::vector<cl_context_properties> &list) const;

    Platform platform_;
    HGLRC sharedRenderContext_ = nullptr;
    HDC displayContext_ = nullptr;
};

/// A group of devices of one platform with the objects on them, counted by reference.
///
/// ```cpp
/// Platform const platform = platforms().front();
/// Device const device = platform.devices(Device::TYPE_ALL).front();
/// Context const context(ContextProperties(platform), device);
/// ```
///
/// The operations throw InternalException "table_ != 0" when the layer is not initialised, and
/// ExceptionOCL when the runtime refuses.
class ORU_API Context : public OpenCLObjectWrapper<cl_context> {
public:
    /// Called by the runtime with an error text, its private information (a pointer and its size
    /// in bytes) and the user data; possibly on a thread of the runtime.
    using NotifyCallback =
        OCL::NotifyCallback<void(CL_CALLBACK *)(char const *, void const *, std::size_t, void *)>;

    /// Over the given devices, in their order (clCreateContext).
    Context(ContextProperties const &properties, std::vector<Device> const &devices,
            NotifyCallback const &callback = {});

    /// Over one device.
    Context(ContextProperties const &properties, Device const &device,
            NotifyCallback const &callback = {});

    /// Over the platform's devices of a type (clCreateContextFromType).
    Context(ContextProperties const &properties, Device::Type type,
            NotifyCallback const &callback = {});

    /// @name Over a handle that was made elsewhere
    /// The tag tells whose reference the object holds.
    /// @{
    Context(cl_context handle, take_ref_tag const &tag) : OpenCLObjectWrapper(handle, tag) {}
    Context(cl_context handle, add_ref_tag const &tag) : OpenCLObjectWrapper(handle, tag) {}
    /// @}

    /// The devices in the runtime's order (clGetContextInfo).
    std::vector<Device> devices() const;

    /// The platform (clGetContextInfo).
    /// @throws InternalException "NULL" when the context was made without naming one
    Platform platform() const;

protected:
    /// Creates the context of an object that has none yet.
    void initialize(ContextProperties const &properties, std::vector<Device> const &devices,
                    NotifyCallback const &callback);
};

} // namespace ORU::OCL
