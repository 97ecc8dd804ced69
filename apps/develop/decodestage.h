// The first stage: photos are read.
#pragma once

#include "apps/common/picturefile.h"
#include "apps/develop/channel.h"
#include "apps/develop/photowork.h"

#include <filesystem>
#include <memory>
#include <vector>

namespace Develop {

/// Reads photos band by band, and with each band the same rows of the base, if there is one.
class DecodeStage {
public:
    /// @param reach rows that a band depends on above and below
    DecodeStage(std::filesystem::path const &base, std::size_t reach,
                BandPlan::Limits const &limits, BandPool &pool, Channel<Piece> &next)
        : base_(base), reach_(reach), limits_(limits), pool_(pool), next_(next) {}

    /// Reads a photo to its end or failure.
    void run(std::shared_ptr<PhotoWork> const &work);

private:
    void open(PhotoWork &work);
    std::unique_ptr<App::PictureReader> openBase(App::Shape const &photo) const;
    void readBands(std::shared_ptr<PhotoWork> const &work);
    void readBand(PhotoWork &work, std::size_t number, BandPair &bands);

    std::filesystem::path base_;
    std::size_t reach_;
    BandPlan::Limits limits_;
    BandPool &pool_;
    Channel<Piece> &next_;

    std::unique_ptr<App::PictureReader> photo_, baseReader_; ///< of the photo that is read
    Band kept_; ///< its last rows, which the next band depends on too
};

} // namespace Develop
