// The cost of the operations of bounding regions, and what they allocate.
#include "tests/support/allocationcount.h"

#include "oru/core/math/region_2d/boundingrect.h"
#include "oru/core/math/region_2d/boundingregion.h"

#include <benchmark/benchmark.h>

#include <algorithm>

using ORU::BoundingRect;
using ORU::BoundingRegion;
using ORU::BoundingRegionBase;
using Vec = ambra::lumo::TVec2<float>;

namespace {

/// One operation on a region of one kind with another region of one kind; `allocations` is their
/// number for one call.
template<class Region, class Other, class Operation>
void Measure(benchmark::State &state, Operation operation) {
    Region owner(Vec(0, 0), Vec(640, 480));
    Other const operand(Vec(-1, -1), Vec(641, 1));
    BoundingRegionBase *region = &owner;
    BoundingRegionBase const *other = &operand;
    benchmark::DoNotOptimize(region);
    benchmark::DoNotOptimize(other);
    long const before = oru_test::AllocationCount();
    for ([[maybe_unused]] auto const _ : state) {
        operation(*region, *other);
        benchmark::ClobberMemory();
    }
    auto const calls = static_cast<double>(state.iterations());
    state.counters["allocations"] =
        static_cast<double>(oru_test::AllocationCount() - before) / calls;
}

// The frame of reference: a union of two rectangles of four floats each, without any interface.
void PlainUnion(benchmark::State &state) {
    struct Bounds {
        float minX, minY, maxX, maxY;
    };
    Bounds a{0, 0, 640, 480};
    Bounds b{-1, -1, 641, 1};
    for ([[maybe_unused]] auto const _ : state) {
        benchmark::DoNotOptimize(b);
        a = Bounds{std::min(a.minX, b.minX), std::min(a.minY, b.minY), std::max(a.maxX, b.maxX),
                   std::max(a.maxY, b.maxY)};
        benchmark::DoNotOptimize(a);
    }
}
BENCHMARK(PlainUnion);

/// The operations; what one leaves is again a region it can work on.
struct Named {
    char const *name;
    void (*apply)(BoundingRegionBase &region, BoundingRegionBase const &other);
};

Named const kOperations[] = {
    {"IncludePoint", [](auto &region, auto const &) { region.include(Vec(9, 9)); }},
    {"Include", [](auto &region, auto const &other) { region.include(other); }},
    {"Contains",
     [](auto &region, auto const &other) { benchmark::DoNotOptimize(region.contains(other)); }},
    {"Intersect", [](auto &region, auto const &other) { region.intersect(other); }},
    {"Subtract", [](auto &region, auto const &other) { region.subtract(other); }},
    {"Dilate", [](auto &region, auto const &other) { region.dilate(other); }},
    {"OutsetInset",
     [](auto &region, auto const &) {
         region.outset(Vec(2, 2));
         region.inset(Vec(2, 2));
     }},
    {"Translate", [](auto &region, auto const &) { region.translate(Vec(1, 1)); }},
    {"BoundingRect",
     [](auto &region, auto const &) { benchmark::DoNotOptimize(region.boundingRect()); }},
};

/// Copying is what allocates, once for a handle and never for a rectangle.
template<class Region>
void Copy(benchmark::State &state) {
    Measure<Region, Region>(state, [](BoundingRegionBase &region, BoundingRegionBase const &) {
        Region const copy(static_cast<Region const &>(region));
        benchmark::DoNotOptimize(&copy);
    });
}
BENCHMARK_TEMPLATE(Copy, BoundingRect);
BENCHMARK_TEMPLATE(Copy, BoundingRegion);

template<class Region, class Other>
void Register(std::string const &kinds) {
    for (Named const &operation : kOperations)
        benchmark::RegisterBenchmark((kinds + "/" + operation.name).c_str(),
                                     [&operation](benchmark::State &state) {
                                         Measure<Region, Other>(state, operation.apply);
                                     });
}

[[maybe_unused]] bool const kRegistered = [] {
    Register<BoundingRect, BoundingRect>("RectRect");
    Register<BoundingRect, BoundingRegion>("RectHandle");
    Register<BoundingRegion, BoundingRegion>("HandleHandle");
    return true;
}();

} // namespace
