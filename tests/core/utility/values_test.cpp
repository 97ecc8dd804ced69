// The small value types and helpers: rectangles, version texts, boundaries.
#include "oru/core/utility/boundary.h"
#include "oru/core/utility/composetext.h"
#include "oru/core/utility/integerrect.h"
#include "oru/core/utility/versionstring.h"

#include <gtest/gtest.h>

#include <locale>
#include <tuple>

using ORU::IntegerRect;
using ORU::size2;

namespace {

TEST(IntegerRect, MovesComparesAndPrints) {
    IntegerRect rect({10, 20}, size2(640, 480));
    rect.translate({-30, 1});
    EXPECT_EQ(testing::PrintToString(rect), "[o=(-20 21), s=(640, 480)]");
    EXPECT_NE(rect, IntegerRect({-20, 21}, size2(640, 481)));
    EXPECT_EQ(IntegerRect({1, 2}, size2(5, 0)).toString(), "Empty");
}

/// A locale that would read "1,024" as one number.
struct Grouping : std::numpunct<char> {
    char do_thousands_sep() const override { return ','; }
    std::string do_grouping() const override { return "\3"; }
};

TEST(Texts, FollowNoLocaleOfTheHost) {
    std::tuple<char const *, unsigned, unsigned, int, std::string> const versions[] = {
        {"3.3.0 - Build 26.20", 3, 3, 0, "- Build 26.20"},
        {"4.50", 4, 50, -1, ""},
        {" 2.1  Mesa 22.3", 2, 1, -1, " Mesa 22.3"},
        {"2.1.x y", 2, 1, 0, "y"},
        {"4", 4, 4, -1, ""},
        {"1,024.0", 1, 0, -1, ""},
        {"", 0, 0, -1, ""},
    };
    std::locale const before =
        std::locale::global(std::locale(std::locale::classic(), new Grouping));
    for (auto const &version : versions) {
        unsigned major = 77, minor = 77;
        int release = 77;
        std::string vendor = "stale";
        char const *const text = std::get<0>(version);
        ORU::TokenizeVersionString(text, major, minor, release, vendor);
        EXPECT_EQ(std::make_tuple(text, major, minor, release, vendor), version);
    }
    EXPECT_EQ(ORU::ComposeText(4711, " of ", 0.5), "4711 of 0.5");
    std::locale::global(before);
}

TEST(Boundary, IsTheNextMultiple) {
    for (int boundary = 1; boundary <= 17; ++boundary)
        for (int value = 0, next = 0; value <= 100; ++value) {
            if (value > next)
                next += boundary;
            EXPECT_EQ(ORU::IncrementToBoundary(value, boundary), next);
            EXPECT_EQ(ORU::IncrementToBoundaryPtr(static_cast<std::size_t>(value), boundary),
                      static_cast<std::size_t>(next));
        }
    EXPECT_EQ(ORU::IncrementToBoundary(-17, 16), 0) << "-17 + 16 - (-1)";
    EXPECT_EQ(ORU::IncrementToBoundaryPtr(5, -16), std::size_t(0) - 16) << "signed when widened";
    for (unsigned x = 1; x <= 1u << 16; ++x)
        EXPECT_EQ(ORU::IsPowerOfTwo(x), (1u << 16) % x == 0);
}

} // namespace
