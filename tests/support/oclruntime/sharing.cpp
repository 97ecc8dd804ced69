// cl_khr_gl_sharing for WGL contexts, by copying when an object is acquired and released.
#include "tests/support/oclruntime/glcopies.h"
#include "tests/support/oclruntime/runtime.h"

#include <map>
#include <mutex>

#include <GL/gl.h>

#include <GL/glext.h>

namespace oru_test::runtime {

namespace {

constexpr cl_int invalidShareGroup = -1000; // CL_INVALID_GL_SHAREGROUP_REFERENCE_KHR

using ContextCallback = void(CL_CALLBACK *)(char const *, void const *, std::size_t, void *);

/// The OpenGL context with whose objects an OpenCL context shares.
struct SharingContext {
    HDC dc = nullptr;
    HGLRC context = nullptr;
};

struct SharedMemory {
    GLObject object;
    cl_context context = nullptr;
    bool acquired = false;
};

/// Everything that the runtime knows about sharing.
struct State {
    std::recursive_mutex mutex;
    std::map<cl_context, SharingContext> contexts;
    std::map<cl_mem, SharedMemory> memory;
    std::map<cl_kernel, std::map<cl_uint, cl_mem>> arguments;
};

State &TheState() {
    static State state;
    return state;
}

#define ORU_LOCKED_STATE(name)                                                                     \
    State &name = TheState();                                                                      \
    std::lock_guard const lock(name.mutex)

/// Moves the sharing keys out of a list of properties.
SharingContext TakeSharing(cl_context_properties const *properties,
                           std::vector<cl_context_properties> &others) {
    SharingContext sharing;
    for (; properties && *properties; properties += 2)
        if (properties[0] == CL_WGL_HDC_KHR)
            sharing.dc = reinterpret_cast<HDC>(properties[1]);
        else if (properties[0] == CL_GL_CONTEXT_KHR)
            sharing.context = reinterpret_cast<HGLRC>(properties[1]);
        else
            others.insert(others.end(), {properties[0], properties[1]});
    others.push_back(0);
    return sharing;
}

/// Creates a context by `create(properties, error)` of the system, and remembers what it shares.
template<class Create>
cl_context CreateSharing(cl_context_properties const *properties, ContextCallback notify,
                         void *userData, cl_int *error, Create create) {
    std::vector<cl_context_properties> others;
    SharingContext const sharing = TakeSharing(properties, others);
    if (sharing.context && !CurrentGL(sharing.dc, sharing.context)) {
        // Wine's opencl.dll takes no callback, so the only thing to call it for is ours.
        if (notify)
            notify("The OpenGL context is gone or current on another thread", nullptr, 0, userData);
        return Refuse(error, invalidShareGroup);
    }
    cl_context const context = create(properties ? others.data() : nullptr, error);
    if (context && sharing.context) {
        ORU_LOCKED_STATE(state);
        state.contexts[context] = sharing;
    }
    return context;
}

cl_context CL_API_CALL CreateContext(cl_context_properties const *properties, cl_uint count,
                                     cl_device_id const *devices, ContextCallback notify,
                                     void *userData, cl_int *error) {
    return CreateSharing(properties, notify, userData, error, [&](auto list, cl_int *result) {
        return System().clCreateContext(list, count, devices, nullptr, nullptr, result);
    });
}

cl_context CL_API_CALL CreateContextFromType(cl_context_properties const *properties,
                                             cl_device_type type, ContextCallback notify,
                                             void *userData, cl_int *error) {
    return CreateSharing(properties, notify, userData, error, [&](auto list, cl_int *result) {
        return System().clCreateContextFromType(list, type, nullptr, nullptr, result);
    });
}

/// The system's memory object that stands in for an OpenGL object.
cl_mem CreateStandIn(cl_context context, cl_mem_flags flags, GLObject const &object,
                     cl_int *error) {
    // The forwarders do not see these calls.
    if (object.format && !faces.hasImages)
        return Refuse(error, CL_INVALID_OPERATION);
    if (!object.format)
        return System().clCreateBuffer(context, flags, object.width, nullptr, error);
    cl_mem const image =
        object.kind == CL_GL_OBJECT_TEXTURE3D
            ? System().clCreateImage3D(context, flags, &object.format->image, object.width,
                                       object.height, object.depth, 0, 0, nullptr, error)
            : System().clCreateImage2D(context, flags, &object.format->image, object.width,
                                       object.height, 0, nullptr, error);
    if (!image && *error == CL_IMAGE_FORMAT_NOT_SUPPORTED)
        *error = CL_INVALID_IMAGE_FORMAT_DESCRIPTOR;
    return image;
}

cl_mem CreateShared(cl_context context, cl_mem_flags flags, GLObject object,
                    cl_int *errorReturned) {
    ORU_LOCKED_STATE(state);
    auto const sharing = state.contexts.find(context);
    if (sharing == state.contexts.end())
        return Refuse(errorReturned, CL_INVALID_CONTEXT);
    if (flags & ~cl_mem_flags(CL_MEM_READ_ONLY | CL_MEM_WRITE_ONLY | CL_MEM_READ_WRITE))
        return Refuse(errorReturned, CL_INVALID_VALUE);
    CurrentGL const current(sharing->second.dc, sharing->second.context);
    if (!current)
        return Refuse(errorReturned, CL_INVALID_GL_OBJECT);
    if (cl_int const error = Describe(object))
        return Refuse(errorReturned, error);
    cl_int error = CL_SUCCESS;
    cl_mem const memory = CreateStandIn(context, flags, object, &error);
    if (memory)
        state.memory[memory] = {object, context, false};
    if (errorReturned)
        *errorReturned = error;
    return memory;
}

cl_mem CL_API_CALL CreateFromGLBuffer(cl_context context, cl_mem_flags flags, cl_GLuint name,
                                      cl_int *error) {
    return CreateShared(context, flags, {CL_GL_OBJECT_BUFFER, name}, error);
}

cl_mem CL_API_CALL CreateFromGLRenderbuffer(cl_context context, cl_mem_flags flags, cl_GLuint name,
                                            cl_int *error) {
    return CreateShared(context, flags, {CL_GL_OBJECT_RENDERBUFFER, name}, error);
}

template<cl_gl_object_type Kind, cl_GLenum... Targets>
cl_mem CL_API_CALL CreateFromTexture(cl_context context, cl_mem_flags flags, cl_GLenum target,
                                     cl_GLint level, cl_GLuint name, cl_int *error) {
    if (((target != Targets) && ...))
        return Refuse(error, CL_INVALID_VALUE);
    return CreateShared(context, flags, {Kind, name, target, level}, error);
}

/// Copies between an OpenGL object and its stand-in, through the host.
cl_int Copy(cl_command_queue queue, cl_mem memory, GLObject const &object, bool toOpenGL) {
    std::vector<unsigned char> pixels(object.bytes());
    std::size_t const origin[3] = {}, region[3] = {object.width, object.height, object.depth};
    auto const &system = System();
    if (!toOpenGL) {
        CopyGL(object, pixels, false);
        return object.format ? system.clEnqueueWriteImage(queue, memory, CL_TRUE, origin, region, 0,
                                                          0, pixels.data(), 0, nullptr, nullptr)
                             : system.clEnqueueWriteBuffer(queue, memory, CL_TRUE, 0, pixels.size(),
                                                           pixels.data(), 0, nullptr, nullptr);
    }
    cl_int const error = object.format
                             ? system.clEnqueueReadImage(queue, memory, CL_TRUE, origin, region, 0,
                                                         0, pixels.data(), 0, nullptr, nullptr)
                             : system.clEnqueueReadBuffer(queue, memory, CL_TRUE, 0, pixels.size(),
                                                          pixels.data(), 0, nullptr, nullptr);
    if (error == CL_SUCCESS)
        CopyGL(object, pixels, true);
    return error;
}

/// Whether the objects of a command may be transferred now; CL_SUCCESS or the error.
cl_int CheckTransfer(State &state, cl_context context, cl_uint count, cl_mem const *objects,
                     bool toOpenGL) {
    for (cl_uint i = 0; i < count; ++i) {
        auto const found = state.memory.find(objects[i]);
        if (found == state.memory.end())
            return CL_INVALID_GL_OBJECT;
        SharedMemory const &shared = found->second;
        if (shared.context != context)
            return CL_INVALID_CONTEXT;
        if (shared.acquired != toOpenGL)
            return CL_INVALID_OPERATION;
        GLObject now = shared.object;
        if (Describe(now) != CL_SUCCESS || !now.hasSameStorage(shared.object))
            return CL_INVALID_GL_OBJECT;
    }
    return CL_SUCCESS;
}

/// Acquires or releases.
template<bool ToOpenGL>
cl_int CL_API_CALL Transfer(cl_command_queue queue, cl_uint count, cl_mem const *objects,
                            cl_uint waitCount, cl_event const *waits, cl_event *event) {
    if ((count == 0) != (objects == nullptr))
        return CL_INVALID_VALUE;
    if ((waitCount == 0) != (waits == nullptr))
        return CL_INVALID_EVENT_WAIT_LIST;
    cl_context context = nullptr;
    if (cl_int const error = System().clGetCommandQueueInfo(queue, CL_QUEUE_CONTEXT, sizeof context,
                                                            &context, nullptr))
        return error;
    ORU_LOCKED_STATE(state);
    auto const sharing = state.contexts.find(context);
    if (sharing == state.contexts.end())
        return CL_INVALID_CONTEXT;
    CurrentGL const current(sharing->second.dc, sharing->second.context);
    if (!current)
        return CL_INVALID_GL_OBJECT;
    if (cl_int const error = CheckTransfer(state, context, count, objects, ToOpenGL))
        return error;
    if (waitCount > 0)
        if (cl_int const error = System().clWaitForEvents(waitCount, waits))
            return error;
    for (cl_uint i = 0; i < count; ++i) {
        SharedMemory &shared = state.memory[objects[i]];
        if (cl_int const error = Copy(queue, objects[i], shared.object, ToOpenGL))
            return error;
        shared.acquired = !ToOpenGL;
    }
    return event ? System().clEnqueueMarker(queue, event) : CL_SUCCESS;
}

cl_int CL_API_CALL SetKernelArg(cl_kernel kernel, cl_uint index, std::size_t size,
                                void const *value) {
    ORU_LOCKED_STATE(state);
    auto &arguments = state.arguments[kernel];
    arguments.erase(index);
    if (size == sizeof(cl_mem) && value) {
        cl_mem const memory = *static_cast<cl_mem const *>(value);
        if (state.memory.count(memory) > 0)
            arguments[index] = memory;
    }
    return System().clSetKernelArg(kernel, index, size, value);
}

} // namespace

bool MayUse(cl_mem memory) {
    ORU_LOCKED_STATE(state);
    auto const found = state.memory.find(memory);
    return found == state.memory.end() || found->second.acquired;
}

bool MayUse(cl_kernel kernel) {
    ORU_LOCKED_STATE(state);
    for (auto const &argument : state.arguments[kernel])
        if (!MayUse(argument.second))
            return false;
    return true;
}

void Forget(void const *handle) {
    ORU_LOCKED_STATE(state);
    void *const key = const_cast<void *>(handle);
    state.contexts.erase(static_cast<cl_context>(key));
    state.memory.erase(static_cast<cl_mem>(key));
    state.arguments.erase(static_cast<cl_kernel>(key));
}

void ReplaceSharing(FunctionTable &table) {
    table.clCreateContext = CreateContext;
    table.clCreateContextFromType = CreateContextFromType;
    table.clCreateFromGLBuffer = CreateFromGLBuffer;
    table.clCreateFromGLTexture2D =
        CreateFromTexture<CL_GL_OBJECT_TEXTURE2D, GL_TEXTURE_2D, GL_TEXTURE_RECTANGLE>;
    table.clCreateFromGLTexture3D = CreateFromTexture<CL_GL_OBJECT_TEXTURE3D, GL_TEXTURE_3D>;
    table.clCreateFromGLRenderbuffer = CreateFromGLRenderbuffer;
    table.clEnqueueAcquireGLObjects = Transfer<false>;
    table.clEnqueueReleaseGLObjects = Transfer<true>;
    table.clSetKernelArg = SetKernelArg;
}

} // namespace oru_test::runtime
