// What the tests' runtime says about itself: the system's answers, or another face.
#include "tests/support/oclruntime/runtime.h"

#include <cstring>

namespace oru_test::runtime {

namespace {

constexpr cl_int noPlatform = -1001; // CL_PLATFORM_NOT_FOUND_KHR

/// Answers an information query with a text.
cl_int Answer(std::string const &text, std::size_t room, void *result, std::size_t *sizeReturned) {
    if (result && room <= text.size())
        return CL_INVALID_VALUE;
    if (result)
        std::memcpy(result, text.c_str(), text.size() + 1);
    if (sizeReturned)
        *sizeReturned = text.size() + 1;
    return CL_SUCCESS;
}

/// The system's text with the extension that this runtime adds.
template<class Query>
cl_int AnswerExtensions(Query query, std::size_t room, void *result, std::size_t *sizeReturned) {
    std::size_t size = 0;
    if (cl_int const error = query(std::size_t(0), nullptr, &size))
        return error;
    std::string text(size, '\0');
    if (cl_int const error = query(size, text.data(), nullptr))
        return error;
    text.resize(std::strlen(text.c_str()));
    return Answer(text + " cl_khr_gl_sharing", room, result, sizeReturned);
}

cl_int CL_API_CALL GetPlatformIDs(cl_uint count, cl_platform_id *platforms, cl_uint *found) {
    if (faces.hasPlatforms)
        return System().clGetPlatformIDs(count, platforms, found);
    if (found)
        *found = 0;
    return noPlatform;
}

cl_int CL_API_CALL GetPlatformInfo(cl_platform_id platform, cl_platform_info query,
                                   std::size_t room, void *result, std::size_t *sizeReturned) {
    auto const ask = [=](std::size_t size, void *value, std::size_t *returned) {
        return System().clGetPlatformInfo(platform, query, size, value, returned);
    };
    if (query == CL_PLATFORM_EXTENSIONS)
        return AnswerExtensions(ask, room, result, sizeReturned);
    if (query == CL_PLATFORM_VERSION && faces.version)
        return Answer(*faces.version, room, result, sizeReturned);
    return ask(room, result, sizeReturned);
}

cl_int CL_API_CALL GetDeviceInfo(cl_device_id device, cl_device_info query, std::size_t room,
                                 void *result, std::size_t *sizeReturned) {
    auto const ask = [=](std::size_t size, void *value, std::size_t *returned) {
        return System().clGetDeviceInfo(device, query, size, value, returned);
    };
    if (query == CL_DEVICE_EXTENSIONS)
        return AnswerExtensions(ask, room, result, sizeReturned);
    if (query == CL_DEVICE_IMAGE_SUPPORT && !faces.hasImages && result && room == sizeof(cl_bool)) {
        *static_cast<cl_bool *>(result) = CL_FALSE;
        return CL_SUCCESS;
    }
    return ask(room, result, sizeReturned);
}

/// Wine's opencl.dll takes no callback: the build runs without it, and we call back.
cl_int CL_API_CALL BuildProgram(cl_program program, cl_uint count, cl_device_id const *devices,
                                char const *options, void(CL_CALLBACK *notify)(cl_program, void *),
                                void *userData) {
    cl_int const error =
        System().clBuildProgram(program, count, devices, options, nullptr, nullptr);
    if (notify)
        notify(program, userData);
    return error;
}

} // namespace

void ReplaceQueries(FunctionTable &table) {
    table.clGetPlatformIDs = GetPlatformIDs;
    table.clGetPlatformInfo = GetPlatformInfo;
    table.clGetDeviceInfo = GetDeviceInfo;
    table.clBuildProgram = BuildProgram;
}

} // namespace oru_test::runtime
