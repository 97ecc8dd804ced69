// The middle stage: photos are developed.
#pragma once

#include "apps/develop/developer.h"
#include "apps/develop/photowork.h"
#include "apps/develop/spotareas.h"

#include <optional>

namespace Develop {

/// Develops photos band by band.
class DevelopStage {
public:
    /// @param isLocal whether the developed bands hold a base, of which only what spots can change
    ///        is computed
    DevelopStage(Developer &developer, Recipe const &recipe, bool isLocal, bool withReport)
        : developer_(developer), recipe_(recipe), isLocal_(isLocal), withReport_(withReport) {}

    /// Develops a band, or completes the report at the end.
    void run(Piece const &piece);

private:
    /// A photo, while its bands come.
    struct Current {
        Current(PhotoWork const &work, ColourSpace const &space, Recipe const &recipe);
        Task task;
        SpotAreas spotAreas;
        std::size_t pixels = 0; ///< computed of it
        double fullFrame = 0;   ///< milliseconds that all pixels take
    };

    void begin(PhotoWork &work);
    void develop(PhotoWork &work, Piece const &piece);
    void report(PhotoWork &work) const;

    Developer &developer_;
    Recipe const &recipe_;
    bool isLocal_;
    bool withReport_;
    std::optional<Current> current_;
    Band unused_; ///< of the full frame, which is developed for the comparison's sake alone
};

} // namespace Develop
