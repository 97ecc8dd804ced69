// What the tests' runtime says about itself: the system's answers, or another face.
#include "runtime.h"

#include <atomic>
#include <cstring>
#include <mutex>
#include <optional>

namespace oru_test::runtime {

namespace {

constexpr cl_int noPlatform = -1001; // CL_PLATFORM_NOT_FOUND_KHR

std::mutex versionMutex;
std::optional<std::string> version;
std::atomic<bool> hasPlatforms = true;
std::atomic<bool> hasImages = true;

cl_int AnswerText(std::string const &text, std::size_t room, void *result,
                  std::size_t *sizeReturned) {
    return Answer(text.c_str(), text.size() + 1, room, result, sizeReturned);
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
    return AnswerText(text + " cl_khr_gl_sharing", room, result, sizeReturned);
}

cl_int CL_API_CALL GetPlatformIDs(cl_uint count, cl_platform_id *platforms, cl_uint *found) {
    if (hasPlatforms)
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
    std::lock_guard const lock(versionMutex);
    if (query == CL_PLATFORM_VERSION && version)
        return AnswerText(*version, room, result, sizeReturned);
    return ask(room, result, sizeReturned);
}

cl_int CL_API_CALL GetDeviceInfo(cl_device_id device, cl_device_info query, std::size_t room,
                                 void *result, std::size_t *sizeReturned) {
    auto const ask = [=](std::size_t size, void *value, std::size_t *returned) {
        return System().clGetDeviceInfo(device, query, size, value, returned);
    };
    if (query == CL_DEVICE_EXTENSIONS)
        return AnswerExtensions(ask, room, result, sizeReturned);
    if (query == CL_DEVICE_IMAGE_SUPPORT && !hasImages) {
        cl_bool const no = CL_FALSE;
        return Answer(&no, sizeof no, room, result, sizeReturned);
    }
    return ask(room, result, sizeReturned);
}

cl_mem CL_API_CALL CreateImage2D(cl_context context, cl_mem_flags flags,
                                 cl_image_format const *format, std::size_t width,
                                 std::size_t height, std::size_t rowPitch, void *host,
                                 cl_int *error) {
    if (!hasImages)
        return Refuse(error, CL_INVALID_OPERATION);
    return System().clCreateImage2D(context, flags, format, width, height, rowPitch, host, error);
}

cl_mem CL_API_CALL CreateImage3D(cl_context context, cl_mem_flags flags,
                                 cl_image_format const *format, std::size_t width,
                                 std::size_t height, std::size_t depth, std::size_t rowPitch,
                                 std::size_t slicePitch, void *host, cl_int *error) {
    if (!hasImages)
        return Refuse(error, CL_INVALID_OPERATION);
    return System().clCreateImage3D(context, flags, format, width, height, depth, rowPitch,
                                    slicePitch, host, error);
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

cl_int Answer(void const *value, std::size_t size, std::size_t room, void *result,
              std::size_t *sizeReturned) {
    if (result && room < size)
        return CL_INVALID_VALUE;
    if (result)
        std::memcpy(result, value, size);
    if (sizeReturned)
        *sizeReturned = size;
    return CL_SUCCESS;
}

void SetVersion(char const *text) {
    std::lock_guard const lock(versionMutex);
    version = text ? std::optional<std::string>(text) : std::nullopt;
}

void SetPlatforms(bool some) {
    hasPlatforms = some;
}

void SetImages(bool supported) {
    hasImages = supported;
}

bool HasImages() {
    return hasImages;
}

void ReplaceQueries(FunctionTable &table) {
    table.clGetPlatformIDs = GetPlatformIDs;
    table.clGetPlatformInfo = GetPlatformInfo;
    table.clGetDeviceInfo = GetDeviceInfo;
    table.clBuildProgram = BuildProgram;
    table.clCreateImage2D = CreateImage2D;
    table.clCreateImage3D = CreateImage3D;
}

} // namespace oru_test::runtime
