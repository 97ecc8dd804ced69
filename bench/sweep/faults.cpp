// The hooks: oru.dll's imports and what it asks for by name lead to stubs, which know their entry
// point.
#include "bench/sweep/faults.h"

#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <iterator>
#include <mutex>
#include <unordered_map>
#include <utility>

namespace sweep {

namespace {

struct EntryPoint {
    std::string name;
    std::uintptr_t address;
    std::uintptr_t stub = 0;
};

DWORD gThread = 0;
bool gIsArmed = false;
Kind gKind = Kind::Call;
unsigned gFailing = 0;
unsigned gCount = 0;
char gFailedName[64] = "";
bool gIsEnding = false;
bool gFailedAtEnd = false;
GLenum gPendingError = GL_NO_ERROR;
Holdings gHoldings;

/// Whether the call that is being made is the one to fail.
bool IsTheOne(Kind kind, char const *name) {
    if (!gIsArmed || gKind != kind || ::GetCurrentThreadId() != gThread || ++gCount != gFailing)
        return false;
    std::strncpy(gFailedName, name, sizeof gFailedName - 1);
    gFailedAtEnd = gIsEnding;
    return true;
}

bool Begins(std::string const &name, char const *prefix) {
    return name.rfind(prefix, 0) == 0;
}

/// Which argument of an OpenCL entry point that returns an object takes the error code; 0 for
/// others.
unsigned ErrorArgument(std::string const &name) {
    static std::unordered_map<std::string, unsigned> const kArguments = {
        {"clCreateContext", 6},
        {"clCreateContextFromType", 5},
        {"clCreateCommandQueue", 4},
        {"clCreateBuffer", 5},
        {"clCreateSubBuffer", 5},
        {"clCreateImage2D", 8},
        {"clCreateImage3D", 10},
        {"clCreateSampler", 5},
        {"clCreateProgramWithSource", 5},
        {"clCreateProgramWithBinary", 7},
        {"clCreateKernel", 3},
        {"clCreateUserEvent", 2},
        {"clCreateFromGLBuffer", 4},
        {"clCreateFromGLTexture2D", 6},
        {"clCreateFromGLTexture3D", 6},
        {"clCreateFromGLRenderbuffer", 4},
        {"clEnqueueMapBuffer", 10},
        {"clEnqueueMapImage", 12}};
    auto const found = kArguments.find(name);
    return found == kArguments.end() ? 0 : found->second;
}

/// Names that a call makes or gives up. A deletion that fails counts: its caller can do no more.
void CountNames(std::string const &name, std::uintptr_t const *arguments) {
    if (name == "glCreateShader" || name == "glCreateProgram" || name == "glFenceSync") {
        ++gHoldings.names;
    } else if (name == "glDeleteShader" || name == "glDeleteProgram" || name == "glDeleteSync") {
        gHoldings.names -= arguments[0] != 0;
    } else if (Begins(name, "wglCreateContext")) {
        ++gHoldings.contexts;
    } else if (name == "wglDeleteContext") {
        gHoldings.contexts -= arguments[0] != 0;
    } else if (name.find("Lists") != std::string::npos || Begins(name, "glGenerate")) {
        return;
    } else if (Begins(name, "glGen")) {
        gHoldings.names += static_cast<long>(arguments[0]);
    } else if (Begins(name, "glDelete")) {
        auto const *const names = reinterpret_cast<GLuint const *>(arguments[1]);
        gHoldings.names -= static_cast<long>(
            std::count_if(names, names + arguments[0], [](GLuint n) { return n != 0; }));
    }
}

struct Verdict {
    std::uintptr_t address; ///< where to go on; 0: back to the caller with `result`
    std::uintptr_t result;
};

/// @param arguments the four in registers, then, 22 places on, those on the stack
Verdict Decide(EntryPoint const &entry, std::uintptr_t const *arguments) {
    bool const isOpenCL = Begins(entry.name, "cl");
    if (entry.name == "glGetError" && gPendingError != GL_NO_ERROR)
        return {0, std::exchange(gPendingError, GLenum{GL_NO_ERROR})};
    // Three questions that no driver refuses to answer.
    bool const canFail = entry.name != "glGetError" && entry.name != "wglGetCurrentContext" &&
                         entry.name != "wglGetCurrentDC";
    bool const fails = canFail && IsTheOne(Kind::Call, entry.name.c_str());
    bool const givesUp = entry.name.find("Delete") < 4;
    if (!isOpenCL && (!fails || givesUp))
        CountNames(entry.name, arguments);
    if (!fails)
        return {entry.address, 0};
    if (Begins(entry.name, "gl"))
        gPendingError = GL_OUT_OF_MEMORY;
    if (!isOpenCL)
        return {0, 0};
    if (Begins(entry.name, "clRelease") ||
        Begins(entry.name, "clRetain")) // wrappers do not look: keep the count right
        reinterpret_cast<int (*)(std::uintptr_t)>(entry.address)(arguments[0]);
    constexpr int kOutOfHostMemory = -6;
    unsigned const argument = ErrorArgument(entry.name);
    if (argument == 0)
        return {0, static_cast<std::uintptr_t>(kOutOfHostMemory)};
    std::uintptr_t const place = argument <= 4 ? arguments[argument - 1] : arguments[17 + argument];
    if (place)
        *reinterpret_cast<int *>(place) = kOutOfHostMemory;
    return {0, 0};
}

} // namespace

} // namespace sweep

// What every stub jumps to, its entry point in r10: asks Decide with the arguments saved, then goes
// on to the real function as if nothing had happened, or returns.
extern "C" {
std::uintptr_t gSweepResult = 0;
std::uintptr_t OruSweepDecide(sweep::EntryPoint const *entry, std::uintptr_t const *arguments) {
    auto const [address, result] = sweep::Decide(*entry, arguments);
    gSweepResult = result;
    return address;
}
void OruSweepCommon();
}
asm(R"(
    .text
    .globl OruSweepCommon
OruSweepCommon:
    sub $0xa8, %rsp
    mov %rcx, 0x20(%rsp)
    mov %rdx, 0x28(%rsp)
    mov %r8, 0x30(%rsp)
    mov %r9, 0x38(%rsp)
    movups %xmm0, 0x40(%rsp)
    movups %xmm1, 0x50(%rsp)
    movups %xmm2, 0x60(%rsp)
    movups %xmm3, 0x70(%rsp)
    mov %r10, %rcx
    lea 0x20(%rsp), %rdx
    call OruSweepDecide
    mov 0x20(%rsp), %rcx
    mov 0x28(%rsp), %rdx
    mov 0x30(%rsp), %r8
    mov 0x38(%rsp), %r9
    movups 0x40(%rsp), %xmm0
    movups 0x50(%rsp), %xmm1
    movups 0x60(%rsp), %xmm2
    movups 0x70(%rsp), %xmm3
    add $0xa8, %rsp
    test %rax, %rax
    jz 1f
    jmp *%rax
1:  mov gSweepResult(%rip), %rax
    ret
)");

namespace sweep {

namespace {

/// The stub of an entry point, made when it is first asked for.
std::uintptr_t StubOf(std::string const &name, std::uintptr_t address) {
    static std::mutex mutex;
    static std::unordered_map<std::string, EntryPoint> entryPoints;
    std::lock_guard<std::mutex> const lock(mutex);
    bool const wasArmed =
        std::exchange(gIsArmed, false); // what is allocated here is not the library's
    EntryPoint &entry = entryPoints.try_emplace(name, EntryPoint{name, address}).first->second;
    if (entry.stub == 0) {
        unsigned char code[] = {0x49, 0xba, 0,   0, 0, 0, 0, 0, 0, 0, // mov r10, entry
                                0x49, 0xbb, 0,   0, 0, 0, 0, 0, 0, 0, // mov r11, common
                                0x41, 0xff, 0xe3};                    // jmp r11
        EntryPoint const *const place = &entry;
        void (*const common)() = OruSweepCommon;
        std::memcpy(code + 2, &place, sizeof place);
        std::memcpy(code + 12, &common, sizeof common);
        void *const memory =
            ::VirtualAlloc(nullptr, sizeof code, MEM_COMMIT | MEM_RESERVE, PAGE_EXECUTE_READWRITE);
        std::memcpy(memory, code, sizeof code);
        entry.stub = reinterpret_cast<std::uintptr_t>(memory);
    }
    gIsArmed = wasArmed;
    return entry.stub;
}

decltype(&::wglGetProcAddress) gGetWglAddress = nullptr;
decltype(&::GetProcAddress) gGetAddress = nullptr;

template<class Address>
Address Hooked(char const *name, Address address) {
    return address
               ? reinterpret_cast<Address>(StubOf(name, reinterpret_cast<std::uintptr_t>(address)))
               : nullptr;
}

PROC WINAPI GetWglAddress(char const *name) {
    return IsTheOne(Kind::Call, "wglGetProcAddress") ? nullptr : Hooked(name, gGetWglAddress(name));
}

FARPROC WINAPI GetAddress(HMODULE module, char const *name) {
    FARPROC const address = gGetAddress(module, name);
    return std::strncmp(name, "cl", 2) == 0 ? Hooked(name, address) : address;
}

/// The blocks that this thread allocated through the C++ run-time library and nobody has freed: a
/// hash table that allocates nothing itself.
class Blocks {
public:
    void add(void *block) {
        std::size_t at = home(block);
        while (places_[at] && places_[at] != kGone)
            at = next(at);
        places_[at] = block;
    }

    /// @return whether the block was one of them
    bool remove(void *block) {
        std::size_t at = home(block);
        while (places_[at] && places_[at] != block)
            at = next(at);
        if (!places_[at])
            return false;
        places_[at] = places_[next(at)] ? kGone : nullptr;
        return true;
    }

private:
    static constexpr std::size_t kSize = 1 << 20;
    inline static void *const kGone = reinterpret_cast<void *>(1);

    static std::size_t home(void *block) {
        return reinterpret_cast<std::uintptr_t>(block) / 16 * 0x9e3779b1u % kSize;
    }
    static std::size_t next(std::size_t at) { return (at + 1) % kSize; }

    void *places_[kSize] = {};
};

Blocks gBlocks;
SRWLOCK gBlocksLock = SRWLOCK_INIT;

void *Allocate(std::size_t size) {
    if (IsTheOne(Kind::Allocation, "malloc"))
        return nullptr;
    void *const block = std::malloc(size);
    if (block && ::GetCurrentThreadId() == gThread) {
        ::AcquireSRWLockExclusive(&gBlocksLock);
        gBlocks.add(block);
        ++gHoldings.memory;
        ::ReleaseSRWLockExclusive(&gBlocksLock);
    }
    return block;
}

void Free(void *block) {
    if (block) {
        ::AcquireSRWLockExclusive(&gBlocksLock);
        gHoldings.memory -= gBlocks.remove(block);
        ::ReleaseSRWLockExclusive(&gBlocksLock);
    }
    std::free(block);
}

/// Goes through what a module imports: `change(name, slot)`.
template<class Change>
void ForEachImport(char const *moduleName, Change const &change) {
    auto *const base = reinterpret_cast<unsigned char *>(::GetModuleHandleA(moduleName));
    auto const *const dos = reinterpret_cast<IMAGE_DOS_HEADER const *>(base);
    auto const *const nt = reinterpret_cast<IMAGE_NT_HEADERS const *>(base + dos->e_lfanew);
    auto const *import = reinterpret_cast<IMAGE_IMPORT_DESCRIPTOR const *>(
        base + nt->OptionalHeader.DataDirectory[IMAGE_DIRECTORY_ENTRY_IMPORT].VirtualAddress);
    for (; import->Name; ++import) {
        auto const *name =
            reinterpret_cast<IMAGE_THUNK_DATA const *>(base + import->OriginalFirstThunk);
        auto *slot = reinterpret_cast<std::uintptr_t *>(base + import->FirstThunk);
        for (; name->u1.AddressOfData; ++name, ++slot) {
            if (IMAGE_SNAP_BY_ORDINAL(name->u1.Ordinal))
                continue;
            DWORD protection;
            ::VirtualProtect(slot, sizeof *slot, PAGE_READWRITE, &protection);
            change(reinterpret_cast<char const *>(base + name->u1.AddressOfData + 2), *slot);
            ::VirtualProtect(slot, sizeof *slot, protection, &protection);
        }
    }
}

template<class Function, class Slot>
void Replace(Slot &slot, Function &original, Function replacement) {
    original = reinterpret_cast<Function>(slot);
    slot = reinterpret_cast<std::uintptr_t>(replacement);
}

} // namespace

void InstallHooks() {
    gThread = ::GetCurrentThreadId();
    ForEachImport("oru.dll", [](std::string const &name, std::uintptr_t &slot) {
        static char const *const kPixelFormats[] = {"ChoosePixelFormat", "DescribePixelFormat",
                                                    "SetPixelFormat", "SwapBuffers"};
        if (name == "wglGetProcAddress")
            Replace(slot, gGetWglAddress, &GetWglAddress);
        else if (name == "GetProcAddress")
            Replace(slot, gGetAddress, &GetAddress);
        else if (Begins(name, "gl") || Begins(name, "wgl") ||
                 std::count(std::begin(kPixelFormats), std::end(kPixelFormats), name))
            slot = StubOf(name, slot);
    });
    ForEachImport("libstdc++-6.dll", [](std::string const &name, std::uintptr_t &slot) {
        if (name == "malloc")
            slot = reinterpret_cast<std::uintptr_t>(&Allocate);
        else if (name == "free")
            slot = reinterpret_cast<std::uintptr_t>(&Free);
    });
}

void Arm(Kind kind, unsigned failing) {
    gKind = kind;
    gFailing = failing;
    gCount = 0;
    gFailedName[0] = '\0';
    gIsEnding = gFailedAtEnd = false;
    gPendingError = GL_NO_ERROR;
    gIsArmed = true;
}

void BeginEnd() {
    gIsEnding = true;
}

bool FailedAtEnd() {
    return gFailedAtEnd;
}

void Disarm() {
    gIsArmed = false;
}

unsigned Count() {
    return gCount;
}

char const *FailedName() {
    return gFailedName;
}

Holdings CurrentHoldings() {
    return gHoldings;
}

} // namespace sweep
