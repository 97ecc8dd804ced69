// What a process holds of the machine.
#include "bench/soak/footprint.h"

#include "oru/oru_ogl/platformgl.h"

#include <psapi.h>

#include <cmath>
#include <cstdint>
#include <stdexcept>

namespace Soak {

namespace {

/// What the system tells of the handles of all processes.
struct SystemHandles {
    struct Entry {
        void *object;
        std::uintptr_t process;
        std::uintptr_t value;
        unsigned int access;
        unsigned short creator, type;
        unsigned int attributes, reserved;
    };
    std::uintptr_t count;
    std::uintptr_t reserved;
    Entry entries[1];
};

std::size_t KernelHandles() {
    DWORD known = 0;
    if (::GetProcessHandleCount(::GetCurrentProcess(), &known) && known != 0)
        return known;
    // Wine counts none there, but lists them all.
    using Query = LONG(WINAPI *)(int, void *, ULONG, ULONG *);
    auto const query = reinterpret_cast<Query>(reinterpret_cast<void *>(
        ::GetProcAddress(::GetModuleHandleW(L"ntdll.dll"), "NtQuerySystemInformation")));
    constexpr int kExtendedHandleInformation = 64;
    std::vector<std::uintptr_t> memory(1 << 14);
    LONG status = 0;
    do {
        memory.resize(2 * memory.size());
        status = query(kExtendedHandleInformation, memory.data(),
                       static_cast<ULONG>(memory.size() * sizeof(std::uintptr_t)), nullptr);
    } while (status < 0 && memory.size() < (1 << 22));
    if (status < 0)
        throw std::runtime_error("the system does not tell the handles of processes");
    auto const *const handles = reinterpret_cast<SystemHandles const *>(memory.data());
    std::size_t own = 0;
    for (std::size_t i = 0; i < handles->count; ++i)
        own += handles->entries[i].process == ::GetCurrentProcessId();
    return own;
}

std::size_t GdiObjects() {
    if (DWORD const known = ::GetGuiResources(::GetCurrentProcess(), GR_GDIOBJECTS))
        return known;
    // Wine counts none there, but takes an index without the rest for a handle.
    std::size_t own = 0;
    for (std::uintptr_t index = 1; index < 0x10000; ++index)
        own += ::GetObjectType(reinterpret_cast<HGDIOBJ>(index)) != 0;
    return own;
}

BOOL CALLBACK CountOwn(HWND window, LPARAM sum) {
    DWORD process = 0;
    ::GetWindowThreadProcessId(window, &process);
    *reinterpret_cast<std::size_t *>(sum) += process == ::GetCurrentProcessId();
    return TRUE;
}

std::size_t Windows() {
    if (DWORD const known = ::GetGuiResources(::GetCurrentProcess(), GR_USEROBJECTS))
        return known;
    std::size_t own = 0;
    ::EnumWindows(CountOwn, reinterpret_cast<LPARAM>(&own));
    for (HWND window = nullptr;
         (window = ::FindWindowExW(HWND_MESSAGE, window, nullptr, nullptr)) != nullptr;)
        CountOwn(window, reinterpret_cast<LPARAM>(&own));
    return own;
}

std::string Change(char const *what, std::size_t before, std::size_t after) {
    return what + (" " + std::to_string(before)) + " to " + std::to_string(after);
}

} // namespace

Handles Handles::Now() {
    Handles now;
    now.windows = Windows();
    now.gdi = GdiObjects();
    now.kernel = KernelHandles();
    return now;
}

bool Handles::isWithin(Handles const &other) const {
    return kernel <= other.kernel && windows <= other.windows && gdi <= other.gdi;
}

std::string Change(Handles const &before, Handles const &after) {
    return Change("handles", before.kernel, after.kernel) + ", " +
           Change("windows", before.windows, after.windows) + ", " +
           Change("GDI objects", before.gdi, after.gdi);
}

void Growth::measure() {
    PROCESS_MEMORY_COUNTERS counters = {};
    counters.cb = sizeof counters;
    if (!::GetProcessMemoryInfo(::GetCurrentProcess(), &counters, sizeof counters))
        throw std::runtime_error("the system does not tell the memory of the process");
    sizes_.push_back(static_cast<double>(counters.WorkingSetSize));
}

double Growth::bytesPerStep() const {
    std::size_t const first = sizes_.size() / 3;
    double const n = static_cast<double>(sizes_.size() - first);
    double sumX = 0, sumY = 0, sumXX = 0, sumXY = 0;
    for (std::size_t i = first; i < sizes_.size(); ++i) {
        double const x = static_cast<double>(i - first);
        sumX += x;
        sumY += sizes_[i];
        sumXX += x * x;
        sumXY += x * sizes_[i];
    }
    double const spread = n * sumXX - sumX * sumX;
    return spread == 0 ? 0 : (n * sumXY - sumX * sumY) / spread;
}

std::string Growth::limit(double bytes) const {
    return isLongEnough() ? "at most " + std::to_string(std::lround(bytes))
                          : std::string("too few to judge");
}

double Growth::megabytes() const {
    return sizes_.empty() ? 0 : sizes_.back() / (1 << 20);
}

} // namespace Soak
