// The last stage: developed photos are written.
#pragma once

#include "apps/common/picturefile.h"
#include "apps/develop/channel.h"
#include "apps/develop/photowork.h"

#include <memory>

namespace Develop {

/// Writes photos band by band.
class EncodeStage {
public:
    /// @param done told of each photo at its end
    EncodeStage(int quality, bool withReport, BandPool &pool,
                Channel<std::shared_ptr<PhotoWork>> &done)
        : quality_(quality), withReport_(withReport), pool_(pool), done_(done) {}

    /// Writes a band, or completes the file at the end. Of a failed photo no file is left.
    void run(Piece piece);

private:
    void write(PhotoWork &work, Piece const &piece);
    void finish(PhotoWork &work);

    int quality_;
    bool withReport_;
    BandPool &pool_;
    Channel<std::shared_ptr<PhotoWork>> &done_;
    std::unique_ptr<App::PictureWriter> writer_;
};

} // namespace Develop
