// What the tests' runtime says about itself: the system's answers, or those that a test wants.
#include "tests/support/oclruntime/runtime.h"

#include <cstring>

namespace oru_test::runtime {

namespace {

template<class Object>
using QuerySlot = cl_int (CL_API_CALL *FunctionTable::*)(Object, cl_uint, std::size_t, void *,
                                                         std::size_t *);

/// An information query, of which `extensions` asks for the extensions' names.
template<class Object, QuerySlot<Object> slot, cl_uint extensions>
cl_int CL_API_CALL GetInfo(Object object, cl_uint query, std::size_t room, void *result,
                           std::size_t *sizeReturned) {
    auto answer = TheCallBook().answerTo(query);
    if (!answer && query != extensions)
        return (System().*slot)(object, query, room, result, sizeReturned);
    if (!answer) {
        char text[8192] = {};
        if (cl_int const error = (System().*slot)(object, query, sizeof text, text, nullptr))
            return error;
        answer = std::string(text) + " cl_khr_gl_sharing" + '\0';
    }
    if (result && room < answer->size())
        return CL_INVALID_VALUE;
    if (result)
        std::memcpy(result, answer->data(), answer->size());
    if (sizeReturned)
        *sizeReturned = answer->size();
    return CL_SUCCESS;
}

/// Wine's opencl.dll takes no callback: the build runs without it.
cl_int CL_API_CALL BuildProgram(cl_program program, cl_uint count, cl_device_id const *devices,
                                char const *options, void(CL_CALLBACK *)(cl_program, void *),
                                void *) {
    return System().clBuildProgram(program, count, devices, options, nullptr, nullptr);
}

} // namespace

void ReplaceQueries(FunctionTable &table) {
    table.clGetPlatformInfo =
        GetInfo<cl_platform_id, &FunctionTable::clGetPlatformInfo, CL_PLATFORM_EXTENSIONS>;
    table.clGetDeviceInfo =
        GetInfo<cl_device_id, &FunctionTable::clGetDeviceInfo, CL_DEVICE_EXTENSIONS>;
    table.clGetMemObjectInfo = GetInfo<cl_mem, &FunctionTable::clGetMemObjectInfo, 0>;
    table.clBuildProgram = BuildProgram;
}

} // namespace oru_test::runtime
