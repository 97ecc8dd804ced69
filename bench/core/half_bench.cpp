// Conversion of half floats: rows by the library against the processor's bare loop, the class,
// copying.
#include "bench/comparison.h"

#include "oru/core/math/halfrow.h"

#include <benchmark/benchmark.h>

#include <immintrin.h>

#include <cstring>
#include <vector>

#if defined(_MSC_VER) && !defined(__clang__)
#define F16C_FUNCTION
#else
#define F16C_FUNCTION __attribute__((target("avx,f16c")))
#endif

using ORU::half;

namespace {

F16C_FUNCTION void BareToFloat(half const *source, float *target, std::size_t count) {
    for (std::size_t i = 0; i < count; i += 8)
        _mm256_storeu_ps(target + i, _mm256_cvtph_ps(_mm_loadu_si128(
                                         reinterpret_cast<__m128i const *>(source + i))));
}

/// Rounds ties to even, unlike the class: a measure of speed only.
F16C_FUNCTION void BareToHalf(float const *source, half *target, std::size_t count) {
    for (std::size_t i = 0; i < count; i += 8)
        _mm_storeu_si128(reinterpret_cast<__m128i *>(target + i),
                         _mm256_cvtps_ph(_mm256_loadu_ps(source + i), 0));
}

void ClassToFloat(half const *source, float *target, std::size_t count) {
    for (std::size_t i = 0; i < count; ++i)
        target[i] = source[i];
}

void ClassToHalf(float const *source, half *target, std::size_t count) {
    for (std::size_t i = 0; i < count; ++i)
        target[i] = source[i];
}

/// As many bytes as the conversion writes.
template<class From, class To>
void Copy(From const *source, To *target, std::size_t count) {
    auto const bytes = std::min(sizeof(From), sizeof(To)) * count;
    std::memcpy(static_cast<void *>(target), source, bytes);
}

template<class T>
using Row = std::vector<T>;

/// Linear light as pictures have it: 0 to 1, with one black value in 16.
template<class T>
Row<T> Picture(std::size_t count) {
    Row<T> row(count);
    for (std::size_t i = 0; i < count; ++i)
        row[i] = i % 16 == 0 ? 0.0f : static_cast<float>(i * 2654435761u % 65521 + 8) / 65536.0f;
    return row;
}

/// `ratio` is the time of the library's row conversion by the time of `base`, for state.range(0)
/// values; GB/s counts what the conversion reads and writes.
template<class From, class To>
void Rows(benchmark::State &state, void (*base)(From const *, To *, std::size_t),
          void (*library)(From const *, To *, std::size_t)) {
    auto const count = static_cast<std::size_t>(state.range(0));
    Row<From> const source = Picture<From>(count);
    Row<To> target(count);
    int const calls = static_cast<int>(std::max<std::size_t>(1, 65536 / count));
    auto const call = [&](auto convert) {
        return [&, convert] {
            convert(source.data(), target.data(), count);
            benchmark::ClobberMemory();
        };
    };
    oru_bench::Compare(state, calls, call(base), call(library));
    state.SetBytesProcessed(state.iterations() * calls *
                            static_cast<std::int64_t>(count * (sizeof(From) + sizeof(To))));
}

// In the first cache, and from memory.
#define ORU_ROWS(...) BENCHMARK_CAPTURE(Rows, __VA_ARGS__)->Arg(2048)->Arg(1 << 23)->UseManualTime()

ORU_ROWS(ToFloatByF16C, BareToFloat, ORU::HalfToFloat);
ORU_ROWS(ToFloatByClass, ClassToFloat, ORU::HalfToFloat);
ORU_ROWS(ToFloatByCopy, Copy<half, float>, ORU::HalfToFloat);
ORU_ROWS(ToHalfByF16C, BareToHalf, ORU::FloatToHalf);
ORU_ROWS(ToHalfByClass, ClassToHalf, ORU::FloatToHalf);
ORU_ROWS(ToHalfByCopy, Copy<float, half>, ORU::FloatToHalf);

} // namespace
