// The exports of the tests' runtime.

// The headers' declarations become those of exports.
#define CL_API_ENTRY __declspec(dllexport)
#define CL_USE_DEPRECATED_OPENCL_1_0_APIS
#define CL_USE_DEPRECATED_OPENCL_1_1_APIS
#define CL_USE_DEPRECATED_OPENCL_1_2_APIS
#include "oru/oru_ocl/functiontable.h"
#include "tests/support/oclruntime/callbook.h"

#include <algorithm>
#include <cstring>
#include <mutex>
#include <type_traits>
#include <vector>

#include <windows.h>

#include <GL/gl.h>

#include <GL/glext.h>

namespace oru_test {

namespace {

using ORU::OCL::FunctionTable;

/// Calls go one after the other, as they all use the call book.
std::mutex gMutex;
CallBook gBook;

/// The system's runtime, loaded by the first call.
FunctionTable const &System() {
    static FunctionTable const kTable = [] {
        char directory[MAX_PATH];
        UINT const length = GetSystemDirectoryA(directory, MAX_PATH);
        HMODULE const module =
            LoadLibraryA((std::string(directory, length) + "\\OpenCL.dll").c_str());
        FunctionTable table;
#define ORU_CL_SLOT(Extension, Name)                                                               \
    table.Name = reinterpret_cast<decltype(table.Name)>(                                           \
        reinterpret_cast<void *>(GetProcAddress(module, #Name)));
#include "oru/oru_ocl/internal/functiontable_slots.inc"
        return table;
    }();
    return kTable;
}

// What replaces entry points of the system. Wine's opencl.dll takes no callbacks: contexts and
// builds go without them. Of a context's properties it knows the platform, which the layer puts
// first.

using ContextCallback = void(CL_CALLBACK *)(char const *, void const *, std::size_t, void *);

cl_context CL_API_CALL CreateContext(cl_context_properties const *properties, cl_uint count,
                                     cl_device_id const *devices, ContextCallback, void *,
                                     cl_int *error) {
    cl_context_properties const platform[] = {properties[0], properties[1], 0};
    return System().clCreateContext(platform, count, devices, nullptr, nullptr, error);
}

cl_context CL_API_CALL CreateContextFromType(cl_context_properties const *properties,
                                             cl_device_type type, ContextCallback, void *,
                                             cl_int *error) {
    cl_context_properties const platform[] = {properties[0], properties[1], 0};
    return System().clCreateContextFromType(platform, type, nullptr, nullptr, error);
}

cl_int CL_API_CALL BuildProgram(cl_program program, cl_uint count, cl_device_id const *devices,
                                char const *options, void(CL_CALLBACK *)(cl_program, void *),
                                void *) {
    return System().clBuildProgram(program, count, devices, options, nullptr, nullptr);
}

cl_int CL_API_CALL CreateKernelsInProgram(cl_program program, cl_uint count, cl_kernel *kernels,
                                          cl_uint *found) {
    cl_int const error = System().clCreateKernelsInProgram(program, count, kernels, found);
    for (cl_uint i = 0; error == CL_SUCCESS && i < count; ++i)
        gBook.count(kernels[i], 1);
    return error;
}

/// What stands in for an object whose contents are not copied.
cl_mem CL_API_CALL CreateFromGL(cl_context context, cl_mem_flags flags, cl_GLuint, cl_int *error) {
    return System().clCreateBuffer(context, flags, 1, nullptr, error);
}

/// A level of a 2-D texture, for which an image of floats stands in.
struct Level {
    GLuint texture;
    GLint level, width, height;
};

std::map<cl_mem, Level> gLevels;

/// An entry point that takes a texture's name, so that nothing needs binding.
template<class Function>
Function NamedFunction(char const *name) {
    return reinterpret_cast<Function>(reinterpret_cast<void *>(wglGetProcAddress(name)));
}

cl_mem CL_API_CALL CreateFromGLTexture(cl_context context, cl_mem_flags flags, cl_GLenum target,
                                       cl_GLint level, cl_GLuint name, cl_int *error) {
    if (target != GL_TEXTURE_2D)
        return CreateFromGL(context, flags, name, error);
    auto const get =
        NamedFunction<PFNGLGETTEXTURELEVELPARAMETERIVPROC>("glGetTextureLevelParameteriv");
    Level shared = {name, level, 0, 0};
    get(name, level, GL_TEXTURE_WIDTH, &shared.width);
    get(name, level, GL_TEXTURE_HEIGHT, &shared.height);
    cl_image_format const format = {CL_RGBA, CL_FLOAT};
    cl_mem const image =
        System().clCreateImage2D(context, flags, &format, std::size_t(shared.width),
                                 std::size_t(shared.height), 0, nullptr, error);
    gLevels[image] = shared;
    return image;
}

/// Copies between a level and its image, through the host; an error shows in the pixels.
void Copy(cl_command_queue queue, cl_mem image, Level const &level, bool toOpenGL) {
    std::size_t const origin[3] = {};
    std::size_t const region[3] = {std::size_t(level.width), std::size_t(level.height), 1};
    std::vector<float> pixels(region[0] * region[1] * 4);
    if (toOpenGL) {
        System().clEnqueueReadImage(queue, image, CL_TRUE, origin, region, 0, 0, pixels.data(), 0,
                                    nullptr, nullptr);
        NamedFunction<PFNGLTEXTURESUBIMAGE2DPROC>("glTextureSubImage2D")(
            level.texture, level.level, 0, 0, level.width, level.height, GL_RGBA, GL_FLOAT,
            pixels.data());
    } else {
        NamedFunction<PFNGLGETTEXTUREIMAGEPROC>("glGetTextureImage")(
            level.texture, level.level, GL_RGBA, GL_FLOAT, GLsizei(pixels.size() * sizeof(float)),
            pixels.data());
        System().clEnqueueWriteImage(queue, image, CL_TRUE, origin, region, 0, 0, pixels.data(), 0,
                                     nullptr, nullptr);
    }
}

/// Acquires or releases. Where no OpenGL context is current, the handle is one that memory of
/// OpenCL's own has got again.
template<bool ToOpenGL>
cl_int CL_API_CALL Transfer(cl_command_queue queue, cl_uint count, cl_mem const *objects,
                            cl_uint waitCount, cl_event const *waits, cl_event *event) {
    if (waitCount > 0)
        System().clWaitForEvents(waitCount, waits);
    for (cl_uint i = 0; wglGetCurrentContext() && i < count; ++i)
        if (auto const found = gLevels.find(objects[i]); found != gLevels.end())
            Copy(queue, found->first, found->second, ToOpenGL);
    return System().clEnqueueMarker(queue, event);
}

/// What is called: the system's entry points, some of them replaced.
FunctionTable Replaced(FunctionTable table) {
    table.clCreateContext = CreateContext;
    table.clCreateContextFromType = CreateContextFromType;
    table.clBuildProgram = BuildProgram;
    table.clCreateKernelsInProgram = CreateKernelsInProgram;
    table.clCreateFromGLBuffer = CreateFromGL;
    table.clCreateFromGLRenderbuffer = CreateFromGL;
    table.clCreateFromGLTexture2D = CreateFromGLTexture;
    table.clCreateFromGLTexture3D = CreateFromGLTexture;
    table.clEnqueueAcquireGLObjects = Transfer<false>;
    table.clEnqueueReleaseGLObjects = Transfer<true>;
    return table;
}

template<class Argument>
constexpr bool kIsHandle = false;
template<class Object>
constexpr bool kIsHandle<Object *> = std::is_class_v<Object> && !std::is_const_v<Object>;

/// The text of an argument as the call book wants it. `previous` is the number before it, which is
/// the length of a list.
template<class Argument>
std::string Recorded([[maybe_unused]] std::string const &name, [[maybe_unused]] Argument argument,
                     [[maybe_unused]] std::size_t &previous) {
    using Target = std::remove_pointer_t<Argument>;
    constexpr bool kIsSizes = std::is_same_v<Target, std::size_t const>;
    std::string text;
    if constexpr (std::is_integral_v<Argument>) {
        previous = static_cast<std::size_t>(argument);
        text = TextOf(argument);
    } else if constexpr (std::is_function_v<Target> || std::is_void_v<Target> ||
                         kIsHandle<Argument>) {
        text = TextOf(reinterpret_cast<void const *>(argument));
    } else if constexpr (std::is_same_v<Target, char const>) {
        text = TextOf(argument ? argument : "null");
    } else if constexpr (std::is_same_v<Target, cl_context_properties const>) {
        for (; *argument != 0; ++argument)
            text += TextOf(*argument);
    } else if constexpr (kIsSizes ||
                         (std::is_const_v<Target> && kIsHandle<std::remove_const_t<Target>>)) {
        if (!argument)
            return TextOf("null");
        std::size_t const count = kIsSizes && name == "clEnqueueReadImage" ? 3 : previous;
        for (std::size_t i = 0; i < count; ++i)
            text += TextOf(argument[i]);
    }
    return text;
}

/// Notes the references that an argument of a successful call brought: `change` to a handle, one to
/// a received event.
template<class Argument>
void NoteReferences([[maybe_unused]] Argument argument, [[maybe_unused]] int change) {
    if constexpr (kIsHandle<Argument>)
        gBook.count(argument, change);
    else if constexpr (std::is_same_v<Argument, cl_event *>)
        gBook.count(argument ? *argument : nullptr, 1);
}

/// Answers an information query as the call book wants it, if it does.
template<class Object>
bool Answered(Object, cl_uint query, std::size_t room, void *result, std::size_t *sizeReturned) {
    std::string const answer = gBook.answerTo(query);
    if (result)
        std::memcpy(result, answer.data(), std::min(room, answer.size()));
    if (sizeReturned && !answer.empty())
        *sizeReturned = answer.size();
    return !answer.empty();
}
template<class... Arguments>
bool Answered(Arguments...) {
    return false;
}

/// What an export does.
template<class Result, class... Parameters>
auto Call(std::string const &name, Result (CL_API_CALL *FunctionTable::*slot)(Parameters...)) {
    return [=](Parameters... arguments) -> Result {
        std::lock_guard const lock(gMutex);
        static FunctionTable const kFunctions = Replaced(System());
        [[maybe_unused]] std::size_t previous = 0;
        std::string recorded;
        ((recorded += Recorded(name, arguments, previous)), ...);
        cl_int const code = gBook.enter(name, recorded);
        if constexpr (std::is_same_v<Result, cl_int>) {
            if (code != CL_SUCCESS || Answered(arguments...))
                return code;
            Result const result = (kFunctions.*slot)(arguments...);
            int const change = (name.rfind("clRetain", 0) == 0) - (name.rfind("clRelease", 0) == 0);
            if (result == CL_SUCCESS)
                (NoteReferences(arguments, change), ...);
            return result;
        } else {
            auto const setError = [code](auto argument) {
                if constexpr (std::is_same_v<decltype(argument), cl_int *>)
                    if (argument)
                        *argument = code;
            };
            (setError(arguments), ...);
            Result const result = code == CL_SUCCESS ? (kFunctions.*slot)(arguments...) : nullptr;
            NoteReferences(result, 1);
            return result;
        }
    };
}

} // namespace

#define ORU_CL_ENTRY(Result, Name, Parameters, Arguments)                                          \
    extern "C" CL_API_ENTRY Result CL_API_CALL Name Parameters {                                   \
        return Call(#Name, &FunctionTable::Name) Arguments;                                        \
    }
#include "tests/support/oclruntime/entrypoints.inc"

extern "C" __declspec(dllexport) CallBook *OruTestCallBook() {
    return &gBook;
}

} // namespace oru_test
