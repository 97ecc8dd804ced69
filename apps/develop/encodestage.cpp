// The last stage: developed photos are written.
#include "apps/develop/encodestage.h"

namespace Develop {

void EncodeStage::run(Piece piece) {
    PhotoWork &work = *piece.work;
    if (piece.bands) {
        work.attempt([&] { write(work, piece); });
        pool_.giveBack(std::move(piece.bands));
        return;
    }
    work.attempt([&] { finish(work); });
    writer_.reset();
    work.result.milliseconds = work.sinceBegin.milliseconds();
    done_.push(std::move(piece.work));
}

void EncodeStage::write(PhotoWork &work, Piece const &piece) {
    TimedScope const timed(work.encoding);
    if (!writer_) {
        App::PictureHead const &head = work.developedHead;
        writer_ =
            App::CreatePicture(work.result.photo.output, head,
                               {head.kind, quality_, head.sampling.value_or(App::Sampling())});
    }
    Rows const rows = piece.bands->developed.rows();
    writer_->write(piece.bands->developed.row(rows.first), rows.count());
}

void EncodeStage::finish(PhotoWork &work) {
    {
        TimedScope const timed(work.encoding);
        writer_->finish();
        work.isComplete = true;
    }
    for (std::string const &loss : writer_->losses())
        work.result.notes.push_back(loss);
    if (withReport_)
        work.result.report.insert(work.result.report.begin(),
                                  work.result.head.description() + ": decode " +
                                      Milliseconds(work.decoding) + ", develop " +
                                      Milliseconds(work.developing) + ", encode " +
                                      Milliseconds(work.encoding) + ", side by side");
}

} // namespace Develop
