// An OpenCL context and its properties.
#include "oru/oru_ocl/contextocl.h"

#include "oru/oru_ocl/clcall.h"
#include "oru/oru_ocl/internal/handlearray.h"
#include "oru/oru_ocl/internal/infoquery.h"

namespace ORU::OCL {

static_assert(std::is_same_v<cl_context_properties, long long>, "properties are 64-bit values");

std::vector<cl_context_properties> ContextProperties::properties() const {
    std::vector<cl_context_properties> list;
    buildContextPropertiesList(list);
    return list;
}

void ContextProperties::buildContextPropertiesList(std::vector<cl_context_properties> &list) const {
    auto const append = [&](cl_context_properties key, auto const &value) {
        list.insert(list.end(), {key, reinterpret_cast<cl_context_properties>(value)});
    };
    append(CL_CONTEXT_PLATFORM, platform_.id());
    if (sharedRenderContext_) {
        append(CL_WGL_HDC_KHR, displayContext_);
        append(CL_GL_CONTEXT_KHR, sharedRenderContext_);
    }
    list.push_back(0);
}

Context::Context(ContextProperties const &properties, std::vector<Device> const &devices,
                 NotifyCallback const &callback) {
    initialize(properties, devices, callback);
}

Context::Context(ContextProperties const &properties, Device const &device,
                 NotifyCallback const &callback) {
    initialize(properties, {device}, callback);
}

Context::Context(ContextProperties const &properties, Device::Type type,
                 NotifyCallback const &callback) {
    adopt(ORU_CL(CreateContextFromType, properties.properties().data(), cl_device_type(type),
                 callback.pf_notify(), callback.user_data()));
}

void Context::initialize(ContextProperties const &properties, std::vector<Device> const &devices,
                         NotifyCallback const &callback) {
    HandleArray<cl_device_id> const ids(devices);
    adopt(ORU_CL(CreateContext, properties.properties().data(), ids.count(), ids.data(),
                 callback.pf_notify(), callback.user_data()));
}

std::vector<Device> Context::devices() const {
    auto const ids =
        QueryList<cl_device_id>([&](std::size_t bytes, void *value, std::size_t *bytesReturned) {
            ORU_CL(GetContextInfo, id(), cl_context_info(CL_CONTEXT_DEVICES), bytes, value,
                   bytesReturned);
        });
    return std::vector<Device>(ids.begin(), ids.end());
}

Platform Context::platform() const {
    auto const list = QueryList<cl_context_properties>(
        [&](std::size_t bytes, void *value, std::size_t *bytesReturned) {
            ORU_CL(GetContextInfo, id(), cl_context_info(CL_CONTEXT_PROPERTIES), bytes, value,
                   bytesReturned);
        });
    for (std::size_t i = 0; i + 1 < list.size() && list[i] != 0; i += 2)
        if (list[i] == CL_CONTEXT_PLATFORM)
            return Platform(reinterpret_cast<cl_platform_id>(list[i + 1]));
    ORU_THROW_INTERNAL("NULL");
}

} // namespace ORU::OCL
