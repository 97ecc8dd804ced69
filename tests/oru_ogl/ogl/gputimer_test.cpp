// The GPU timer: every frame's time or a note that there is none, and never a wait.
#include "tests/support/allocationcount.h"
#include "tests/support/objecttest.h"

#include "oru/oru_ogl/ogl/gputimer.h"

#include <array>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

/// A GPU that is some frames behind, with a clock of 30 bits that is about to begin anew.
class LateGpu : public OpenGLForwarder {
public:
    int frame = 0; ///< what the host is at
    int delay = 0; ///< frames until a stamp is there
    std::uint64_t clock = (1u << 30) - 40;

    void cgmGetQueryiv(char const *, unsigned int, GLenum, GLenum, GLint *value) override {
        *value = 30;
    }
    void cgmQueryCounter(char const *, unsigned int, GLuint id, GLenum) override {
        EXPECT_TRUE(isThere(id)) << "a stamp that is on its way would be waited for";
        stamps_[id % stamps_.size()] = {clock % (1u << 30), frame};
    }
    void cgmGetQueryObjectiv(char const *, unsigned int, GLuint id, GLenum, GLint *value) override {
        *value = isThere(id);
    }
    void cgmGetQueryObjectui64v(char const *, unsigned int, GLuint id, GLenum,
                                GLuint64 *value) override {
        EXPECT_TRUE(isThere(id)) << "a result that is not there would be waited for";
        *value = stamps_[id % stamps_.size()].time;
    }

private:
    struct Stamp {
        std::uint64_t time;
        int frame = -1000;
    };

    bool isThere(GLuint id) const { return frame >= stamps_[id % stamps_.size()].frame + delay; }

    std::array<Stamp, 64> stamps_;
};

std::int64_t Length(int frame) {
    return 1 + frame * frame;
}

} // namespace

class GpuTimerTest : public ObjectTest {};

// Whatever the ring and however late the GPU: the times come in order, each is that of its frame,
// each frame is accounted for, none is missed while the ring is longer than the delay.
TEST_F(GpuTimerTest, AccountsForEveryFrame) {
    int const frames = 40;
    std::vector<std::int64_t> taken;
    taken.reserve(frames);
    for (unsigned int ring = 1; ring <= 4; ++ring) {
        for (int delay = 0; delay <= 5; ++delay) {
            for (bool const takes : {true, false}) {
                SCOPED_TRACE(testing::Message() << ring << ", " << delay << ", " << takes);
                InterceptorScope<LateGpu> gpu;
                gpu->delay = delay;
                GpuTimer timer(ring);
                taken.clear();
                auto const take = [&] {
                    while (auto const time = timer.take())
                        taken.push_back(time->count());
                };
                long const allocations = AllocationCount();
                for (; gpu->frame < frames; ++gpu->frame) {
                    if (takes)
                        take();
                    timer.begin();
                    gpu->clock += static_cast<std::uint64_t>(Length(gpu->frame));
                    timer.end();
                    gpu->clock += 3; // between the frames
                }
                EXPECT_EQ(allocations, AllocationCount());
                gpu->frame += delay;
                take();
                EXPECT_EQ(0u, timer.pending());
                EXPECT_EQ(std::uint64_t{frames}, taken.size() + timer.missed());
                int frame = 0;
                for (std::int64_t const time : taken) {
                    while (frame < frames && Length(frame) != time)
                        ++frame;
                    EXPECT_LT(frame++, frames) << time << " is the time of none, or late";
                }
                if (takes && static_cast<int>(ring) >= delay) {
                    EXPECT_EQ(0u, timer.missed());
                }
            }
        }
    }
}

TEST_F(GpuTimerTest, TimesTheDriverAndRefusesWhatHasNoSense) {
    GpuTimer timer(2);
    auto const start = std::chrono::steady_clock::now();
    timer.begin();
    ORU_GL0(Finish);
    EXPECT_FAILURE("GpuTimer::begin: the timer runs already. Call end() first", timer.begin());
    timer.end();
    ORU_GL0(Finish);
    auto const time = timer.take();
    ASSERT_TRUE(time);
    EXPECT_LE(0, time->count());
    EXPECT_LE(*time, std::chrono::steady_clock::now() - start);
    EXPECT_FALSE(timer.take());
    EXPECT_FAILURE("GpuTimer::end: the timer does not run. Call begin() first", timer.end());
    EXPECT_FAILURE("A GpuTimer needs room for at least one frame", GpuTimer(0));

    timer.begin();
    timer.end();
    GpuTimer moved(std::move(timer));
    EXPECT_EQ(1u, moved.pending());
    for (auto const use : {+[](GpuTimer &t) { t.begin(); }, +[](GpuTimer &t) { t.end(); },
                           +[](GpuTimer &t) { t.take(); }})
        EXPECT_NE("", MessageOf([&] { use(timer); })); // NOLINT(bugprone-use-after-move)
    timer = std::move(moved);
    EXPECT_EQ(1u, timer.pending());
    struct NoClock : OpenGLForwarder {
        void cgmGetQueryiv(char const *, unsigned int, GLenum, GLenum, GLint *value) override {
            *value = 0;
        }
    };
    InterceptorScope<NoClock> const driver;
    EXPECT_FAILURE("The driver has no clock that a GpuTimer could read", GpuTimer());
}
