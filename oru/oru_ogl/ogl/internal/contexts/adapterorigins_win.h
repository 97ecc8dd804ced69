// Where the adapters' desktops begin, remembered while the desktop stays as it is.
#pragma once

#include "oru/core/math/tvec2.h"

#include <optional>
#include <string>

namespace ORU::OGL::internal {

/// The desktop position of an adapter's first output, for a context's hidden window.
///
/// Only DXGI knows it, at the price of a factory, which costs more than the context itself. So what
/// one look saw serves the next, as long as the monitors are where they were; asking those is
/// cheap.
/// @throws InternalException when there is no such adapter
ambra::lumo::TVec2<int> AdapterOrigin(std::string const &adapterName);

/// What is remembered. Any thread may use it.
class AdapterOrigins {
public:
    using Origin = ambra::lumo::TVec2<int>;

    /// Nothing for an adapter that was not seen since the desktop last changed.
    static std::optional<Origin> Find(std::string const &adapterName);

    /// What a look at the system has seen.
    static void Remember(std::string const &adapterName, Origin const &origin);
};

} // namespace ORU::OGL::internal
