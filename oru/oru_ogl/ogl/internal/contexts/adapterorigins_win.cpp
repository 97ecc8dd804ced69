// Where the adapters' desktops begin, remembered while the desktop stays as it is.
#include "oru/oru_ogl/ogl/internal/contexts/adapterorigins_win.h"

#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <exception>
#include <map>
#include <mutex>
#include <vector>

namespace ORU::OGL::internal {

namespace {

/// The places of all monitors: where these are the same, no output was moved, added or taken away.
using Monitors = std::vector<RECT>;

struct Listing {
    Monitors monitors;
    std::exception_ptr failure; ///< kept, for no exception may pass through the system's frames
};

BOOL CALLBACK AddMonitor(HMONITOR, HDC, RECT *place, LPARAM parameter) {
    auto &listing = *reinterpret_cast<Listing *>(parameter);
    try {
        listing.monitors.push_back(*place);
    } catch (...) {
        listing.failure = std::current_exception();
    }
    return !listing.failure;
}

Monitors CurrentMonitors() {
    Listing listing;
    ::EnumDisplayMonitors(nullptr, nullptr, &AddMonitor, reinterpret_cast<LPARAM>(&listing));
    if (listing.failure)
        std::rethrow_exception(listing.failure);
    return std::move(listing.monitors);
}

bool AreSame(Monitors const &a, Monitors const &b) {
    return std::equal(a.begin(), a.end(), b.begin(), b.end(),
                      [](RECT const &x, RECT const &y) { return ::EqualRect(&x, &y) != FALSE; });
}

struct Memory {
    std::mutex mutex;
    Monitors monitors;
    std::map<std::string, AdapterOrigins::Origin> origins;

    /// Forgets what a changed desktop has made stale.
    void refresh() {
        Monitors current = CurrentMonitors();
        if (AreSame(current, monitors))
            return;
        origins.clear();
        monitors = std::move(current);
    }
};

Memory &TheMemory() {
    static auto &memory = *new Memory; // never destroyed, as contexts may still be made at exit
    return memory;
}

} // namespace

std::optional<AdapterOrigins::Origin> AdapterOrigins::Find(std::string const &adapterName) {
    Memory &memory = TheMemory();
    std::lock_guard<std::mutex> const lock(memory.mutex);
    memory.refresh();
    auto const found = memory.origins.find(adapterName);
    if (found == memory.origins.end())
        return std::nullopt;
    return found->second;
}

void AdapterOrigins::Remember(std::string const &adapterName, Origin const &origin) {
    Memory &memory = TheMemory();
    std::lock_guard<std::mutex> const lock(memory.mutex);
    memory.refresh();
    memory.origins.emplace(adapterName, origin); // of two adapters of one name the first counts
}

} // namespace ORU::OGL::internal
