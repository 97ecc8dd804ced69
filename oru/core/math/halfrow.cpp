// Conversion of whole rows between half and single precision.
#include "oru/core/math/halfrow.h"

#include <immintrin.h>
#if defined(_MSC_VER) && !defined(__clang__)
#include <intrin.h>
#define ORU_TARGET(features)
#else
#ifdef _MSC_VER // clang-cl's immintrin.h leaves out what not every processor of the target has
#include <smmintrin.h>
#include <xsaveintrin.h>

#include <avxintrin.h>
#include <f16cintrin.h>

#include <avx2intrin.h>
#endif
#include <cpuid.h>
#define ORU_TARGET(features) __attribute__((target(features)))
#endif

// The processor's conversion instructions serve where they agree with the class; a block of values
// with any on which they differ goes through the class. They differ on signalling NaNs to float,
// which they make quiet, and to half on ties, on the sign of zeros, on denormals, overflow and
// NaNs. Of these ties are mended by rounding before the instruction cuts; the rest is rare in
// pictures.

namespace ORU {

namespace {

void ScalarToFloat(half const *source, float *target, std::size_t count) {
    for (std::size_t i = 0; i < count; ++i)
        target[i] = source[i];
}

void ScalarToHalf(float const *source, half *target, std::size_t count) {
    for (std::size_t i = 0; i < count; ++i)
        target[i] = source[i];
}

ORU_TARGET("avx,f16c")
void VectorToFloat(half const *source, float *target, std::size_t count) {
    constexpr std::size_t kBlock = 32; // one test for four vectors
    __m128i const magnitude = _mm_set1_epi16(0x7FFF);
    __m128i const infinity = _mm_set1_epi16(0x7C00);
    std::size_t i = 0;
    for (; i + kBlock <= count; i += kBlock) {
        auto const *const from = reinterpret_cast<__m128i const *>(source + i);
        __m128i const a = _mm_loadu_si128(from);
        __m128i const b = _mm_loadu_si128(from + 1);
        __m128i const c = _mm_loadu_si128(from + 2);
        __m128i const d = _mm_loadu_si128(from + 3);
        __m128i const largest =
            _mm_max_epi16(_mm_max_epi16(_mm_and_si128(a, magnitude), _mm_and_si128(b, magnitude)),
                          _mm_max_epi16(_mm_and_si128(c, magnitude), _mm_and_si128(d, magnitude)));
        if (_mm_movemask_epi8(_mm_cmpgt_epi16(largest, infinity))) { // a NaN of either kind
            ScalarToFloat(source + i, target + i, kBlock);
            continue;
        }
        _mm256_storeu_ps(target + i, _mm256_cvtph_ps(a));
        _mm256_storeu_ps(target + i + 8, _mm256_cvtph_ps(b));
        _mm256_storeu_ps(target + i + 16, _mm256_cvtph_ps(c));
        _mm256_storeu_ps(target + i + 24, _mm256_cvtph_ps(d));
    }
    ScalarToFloat(source + i, target + i, count - i);
}

ORU_TARGET("avx2,f16c")
void VectorToHalf(float const *source, half *target, std::size_t count) {
    // From 2^-14, the smallest normal half, to below 65520, which rounds up to infinity.
    __m256i const magnitude = _mm256_set1_epi32(0x7FFFFFFF);
    __m256i const belowNormal = _mm256_set1_epi32(0x387FFFFF);
    __m256i const overflow = _mm256_set1_epi32(0x477FF000);
    __m256i const halfPlace = _mm256_set1_epi32(0x1000);
    __m256i const zero = _mm256_setzero_si256();
    std::size_t i = 0;
    for (; i + 8 <= count; i += 8) {
        __m256i const bits = _mm256_castps_si256(_mm256_loadu_ps(source + i));
        __m256i const size = _mm256_and_si256(bits, magnitude);
        __m256i const isNormal = _mm256_and_si256(_mm256_cmpgt_epi32(size, belowNormal),
                                                  _mm256_cmpgt_epi32(overflow, size));
        __m256i const isPlain = _mm256_or_si256(isNormal, _mm256_cmpeq_epi32(bits, zero));
        if (_mm256_movemask_epi8(isPlain) != -1) {
            ScalarToHalf(source + i, target + i, 8);
            continue;
        }
        __m256 const rounded = _mm256_castsi256_ps(_mm256_add_epi32(bits, halfPlace));
        _mm_storeu_si128(reinterpret_cast<__m128i *>(target + i),
                         _mm256_cvtps_ph(rounded, _MM_FROUND_TO_ZERO | _MM_FROUND_NO_EXC));
    }
    ScalarToHalf(source + i, target + i, count - i);
}

/// What the processor and the system offer (Intel 64 manual, volume 1, 14.3 and 14.4); asked by
/// hand, since `__builtin_cpu_supports` of older clang does not know F16C.
struct Processor {
    bool hasF16C = false;
    bool hasAVX2 = false;

    Processor() {
        unsigned registers[4];
        Query(1, registers);
        bool const usesXSave = (registers[2] >> 27) & 1;
        bool const hasAVX = (registers[2] >> 28) & 1;
        bool const converts = (registers[2] >> 29) & 1;
        // The system must save the wide registers, too.
        hasF16C = usesXSave && hasAVX && converts && (EnabledStates() & 6) == 6;
        Query(7, registers);
        hasAVX2 = hasF16C && ((registers[1] >> 5) & 1);
    }

private:
    /// eax, ebx, ecx, edx of a leaf; zeros when the processor does not have it.
    static void Query(unsigned leaf, unsigned (&registers)[4]) {
#if defined(_MSC_VER) && !defined(__clang__)
        int values[4];
        __cpuid(values, 0);
        bool const isKnown = static_cast<unsigned>(values[0]) >= leaf;
        __cpuidex(values, static_cast<int>(leaf), 0);
        for (int i = 0; i < 4; ++i)
            registers[i] = isKnown ? static_cast<unsigned>(values[i]) : 0;
#else
        registers[0] = registers[1] = registers[2] = registers[3] = 0;
        __get_cpuid_count(leaf, 0, &registers[0], &registers[1], &registers[2], &registers[3]);
#endif
    }

    ORU_TARGET("xsave") static unsigned EnabledStates() {
        return static_cast<unsigned>(_xgetbv(0));
    }
};

using ToFloat = void (*)(half const *, float *, std::size_t);
using ToHalf = void (*)(float const *, half *, std::size_t);

Processor const kProcessor;
ToFloat const kToFloat = kProcessor.hasF16C ? VectorToFloat : ScalarToFloat;
ToHalf const kToHalf = kProcessor.hasAVX2 ? VectorToHalf : ScalarToHalf;

} // namespace

void HalfToFloat(half const *source, float *target, std::size_t count) {
    kToFloat(source, target, count);
}

void FloatToHalf(float const *source, half *target, std::size_t count) {
    kToHalf(source, target, count);
}

} // namespace ORU
