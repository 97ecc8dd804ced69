// Photos on their way through decoding, the GPU and encoding.
#pragma once

#include "apps/common/picture.h"
#include "apps/develop/bandplan.h"
#include "apps/develop/developer.h"
#include "apps/develop/photolist.h"

#include <atomic>
#include <cstddef>
#include <exception>
#include <filesystem>
#include <functional>
#include <string>
#include <vector>

namespace Develop {

/// What became of a photo.
struct PhotoResult {
    Photo photo;
    std::exception_ptr failure;     ///< null when it was developed
    App::PictureHead head;          ///< of the photo, as far as it was read
    std::vector<std::string> notes; ///< what a person should know: an assumed profile, lost records
    std::vector<std::string> report; ///< how it was made, if that was asked for
    double milliseconds = 0;         ///< from its first byte to its last
};

/// Takes photos through their stages, each stage on a thread of its own: while the last rows of one
/// are encoded, the next is decoded. Holds some bands of rows, never a whole picture unless its
/// file cannot be read in order. OpenGL is used on the thread that calls.
class PhotoQueue {
public:
    /// @param base the picture developed without the recipe's spots, of which only what these can
    ///        change is computed; empty to compute all
    /// @param withReport whether to measure each stage
    /// @param limits of bands and tiles, which change no pixel
    PhotoQueue(Developer &developer, Recipe const &recipe, std::filesystem::path const &base,
               bool withReport, BandPlan::Limits const &limits = BandPlan::Limits());

    /// Develops photos. Which of them fails does not keep the others.
    /// @param onDone is called for each, on this thread, in their order
    /// @param isCancelled once true, no further photo is begun, and those under way leave no
    ///        file and are not reported
    /// @param onBand is called on this thread with the share of a photo that is developed, before
    ///        the photo is reported
    void run(std::vector<Photo> const &photos,
             std::function<void(PhotoResult const &)> const &onDone,
             std::atomic<bool> const &isCancelled,
             std::function<void(double share)> const &onBand = {});

private:
    Developer &developer_;
    Recipe const &recipe_;
    std::filesystem::path base_;
    bool withReport_;
    BandPlan::Limits limits_;
};

} // namespace Develop
