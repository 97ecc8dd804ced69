// ICC profiles, by lcms2.
#include "apps/develop/iccprofile.h"

#include "apps/common/failure.h"

#include <lcms2.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <iterator>
#include <memory>
#include <new>
#include <type_traits>

namespace Develop {

namespace {

using App::Failure;

// The largest profiles in use are those of presses, of some megabytes.
constexpr std::size_t kLargestProfile = std::size_t{32} << 20;

// Steps of grey at which a profile of tables is looked at.
constexpr std::size_t kGreySteps = 4096;

// Roundings of a profile's numbers: white is meant to be D50 exactly.
constexpr double kWhiteTolerance = 0.02;

struct Deleter {
    void operator()(cmsToneCurve *curve) const { cmsFreeToneCurve(curve); }
    void operator()(cmsMLU *text) const { cmsMLUfree(text); }
};
struct ContextDeleter {
    void operator()(cmsContext context) const { cmsDeleteContext(context); }
};
struct ProfileDeleter {
    void operator()(void *profile) const { cmsCloseProfile(profile); }
};
struct TransformDeleter {
    void operator()(void *transform) const { cmsDeleteTransform(transform); }
};
using ProfilePtr = std::unique_ptr<void, ProfileDeleter>;

std::string Printable(std::string text) {
    constexpr std::size_t kLongest = 60;
    std::replace_if(
        text.begin(), text.end(), [](char c) { return c < ' ' || c > '~'; }, '?');
    return text.substr(0, kLongest);
}

/// lcms2's state of one profile, with what it complained of last.
class Context {
public:
    Context() : context_(cmsCreateContext(nullptr, &complaint_)) {
        if (!context_)
            throw std::bad_alloc();
        cmsSetLogErrorHandlerTHR(context_.get(), OnError);
    }

    cmsContext get() const { return context_.get(); }

    Failure damage() const {
        return Failure("is damaged" + (complaint_.empty() ? "" : " (" + complaint_ + ")"));
    }

private:
    static void OnError(cmsContext context, cmsUInt32Number, char const *text) {
        *static_cast<std::string *>(cmsGetContextUserData(context)) = Printable(text);
    }

    std::string complaint_;
    std::unique_ptr<std::remove_pointer_t<cmsContext>, ContextDeleter> context_;
};

std::string Name(cmsHPROFILE profile) {
    char name[256] = {};
    cmsGetProfileInfoASCII(profile, cmsInfoDescription, "en", "US", name, sizeof name);
    name[sizeof name - 1] = '\0';
    return *name ? Printable(name) : "unnamed";
}

/// Refuses profiles that do not say what the codes of a picture of so many channels are.
void RequireFit(cmsHPROFILE profile, std::size_t channels) {
    switch (cmsGetDeviceClass(profile)) {
    case cmsSigInputClass:
    case cmsSigDisplayClass:
    case cmsSigOutputClass:
    case cmsSigColorSpaceClass:
        break;
    default:
        throw Failure("tells of no pictures, but links or names colours");
    }
    cmsColorSpaceSignature const space = cmsGetColorSpace(profile);
    if (space != cmsSigRgbData && space != cmsSigGrayData)
        throw Failure(space == cmsSigCmykData ? "is for CMYK pictures"
                                              : "is for neither RGB nor grey pictures");
    if ((space == cmsSigRgbData) != (channels == 3))
        throw Failure(channels == 3 ? "is for grey pictures, and this one has colours"
                                    : "is for RGB pictures, and this one is grey");
}

StoredCurve ReadCurve(Context const &context, cmsHPROFILE profile, cmsTagSignature tag) {
    auto const *const curve = static_cast<cmsToneCurve const *>(cmsReadTag(profile, tag));
    if (!curve)
        throw context.damage();
    StoredCurve stored;
    if (cmsInt32Number const type = cmsGetToneCurveParametricType(curve)) {
        // lcms2 counts the functions of ICC.1 from 1.
        constexpr std::size_t kParameters[] = {1, 3, 4, 5, 7};
        double const *const parameters = cmsGetToneCurveParams(curve);
        if (type < 1 || type > 5 || !parameters)
            throw context.damage();
        stored.function = static_cast<unsigned int>(type - 1);
        std::copy_n(parameters, kParameters[stored.function], stored.parameters.begin());
        return stored;
    }
    std::size_t const size = cmsGetToneCurveEstimatedTableEntries(curve);
    if (size < 2)
        throw context.damage();
    cmsUInt16Number const *const table = cmsGetToneCurveEstimatedTable(curve);
    std::transform(table, table + size, std::back_inserter(stored.table),
                   [](cmsUInt16Number value) { return value / 65535.0; });
    return stored;
}

Triple ReadColorant(Context const &context, cmsHPROFILE profile, cmsTagSignature tag) {
    auto const *const colour = static_cast<cmsCIEXYZ const *>(cmsReadTag(profile, tag));
    if (!colour)
        throw context.damage();
    return {colour->X, colour->Y, colour->Z};
}

ColourMatrix Columns(std::array<Triple, 3> const &columns) {
    ColourMatrix matrix{};
    for (std::size_t row = 0; row < 3; ++row)
        for (std::size_t column = 0; column < 3; ++column)
            matrix[row][column] = columns[column][row];
    return matrix;
}

/// Reads curves and primaries.
void ReadMatrix(Context const &context, cmsHPROFILE profile, IccProfile &result) {
    if (cmsGetPCS(profile) != cmsSigXYZData)
        throw Failure("contradicts itself: it has primaries, but not in CIE XYZ");
    for (cmsTagSignature const tag : {cmsSigRedTRCTag, cmsSigGreenTRCTag, cmsSigBlueTRCTag})
        result.curves.push_back(ReadCurve(context, profile, tag));
    ColourMatrix const matrix = Columns({ReadColorant(context, profile, cmsSigRedColorantTag),
                                         ReadColorant(context, profile, cmsSigGreenColorantTag),
                                         ReadColorant(context, profile, cmsSigBlueColorantTag)});
    ColourMatrix const exact = WithWhite(matrix, kD50);
    bool isRounding = true;
    for (std::size_t row = 0; row < 3; ++row) {
        double const white = matrix[row][0] + matrix[row][1] + matrix[row][2];
        isRounding = isRounding && std::abs(white - kD50[row]) < kWhiteTolerance;
    }
    result.toXyz = isRounding ? exact : matrix;
}

/// Takes a curve from a profile of tables: how the light of its greys grows.
void ReadTables(Context const &context, cmsHPROFILE profile, IccProfile &result) {
    ProfilePtr const xyz(cmsCreateXYZProfileTHR(context.get()));
    std::unique_ptr<void, TransformDeleter> const transform(
        xyz ? cmsCreateTransformTHR(context.get(), profile, TYPE_RGB_DBL, xyz.get(), TYPE_XYZ_DBL,
                                    INTENT_RELATIVE_COLORIMETRIC,
                                    cmsFLAGS_NOOPTIMIZE | cmsFLAGS_NOCACHE)
            : nullptr);
    if (!transform)
        throw context.damage();
    auto const seen = [&](Triple const &code) {
        Triple light{};
        cmsDoTransform(transform.get(), code.data(), light.data(), 1);
        return light;
    };
    Triple const black = seen({0, 0, 0});
    double const range = seen({1, 1, 1})[1] - black[1];
    StoredCurve curve;
    for (std::size_t step = 0; step <= kGreySteps; ++step) {
        double const code = static_cast<double>(step) / kGreySteps;
        curve.table.push_back((seen({code, code, code})[1] - black[1]) / range);
    }
    result.curves.assign(3, curve);
    std::array<Triple, 3> colours{seen({1, 0, 0}), seen({0, 1, 0}), seen({0, 0, 1})};
    for (Triple &colour : colours)
        for (std::size_t i = 0; i < 3; ++i)
            colour[i] -= black[i];
    result.toXyz = WithWhite(Columns(colours), kD50);
    result.isOfTables = true;
}

/// The bytes of a finished profile.
App::Bytes Saved(cmsHPROFILE profile) {
    cmsUInt32Number size = 0;
    if (!cmsSaveProfileToMem(profile, nullptr, &size))
        throw std::bad_alloc();
    App::Bytes bytes(size);
    if (!cmsSaveProfileToMem(profile, bytes.data(), &size))
        throw std::bad_alloc();
    // In place of the time of now: 1 January 2026, big-endian.
    constexpr unsigned char kDate[12] = {0x07, 0xea, 0, 1, 0, 1};
    constexpr std::size_t kDateOffset = 24;
    std::copy(std::begin(kDate), std::end(kDate), bytes.begin() + kDateOffset);
    return bytes;
}

void WriteText(Context const &context, cmsHPROFILE profile, cmsTagSignature tag,
               std::string const &text) {
    std::unique_ptr<cmsMLU, Deleter> const mlu(cmsMLUalloc(context.get(), 1));
    if (!mlu || !cmsMLUsetASCII(mlu.get(), "en", "US", text.c_str()) ||
        !cmsWriteTag(profile, tag, mlu.get()))
        throw std::bad_alloc();
}

} // namespace

IccProfile ReadIccProfile(App::Bytes const &bytes, std::size_t channels) {
    if (bytes.size() > kLargestProfile)
        throw Failure("is too large for one: " + std::to_string(bytes.size() >> 20) + " MiB");
    Context const context;
    ProfilePtr const profile(cmsOpenProfileFromMemTHR(context.get(), bytes.data(),
                                                      static_cast<cmsUInt32Number>(bytes.size())));
    if (!profile)
        throw context.damage();
    RequireFit(profile.get(), channels);
    IccProfile result;
    result.name = Name(profile.get());
    if (channels == 1) {
        if (cmsGetPCS(profile.get()) != cmsSigXYZData || !cmsIsTag(profile.get(), cmsSigGrayTRCTag))
            throw Failure("has no curve of light for grey");
        result.curves = {ReadCurve(context, profile.get(), cmsSigGrayTRCTag)};
    } else if (cmsIsTag(profile.get(), cmsSigRedTRCTag)) {
        ReadMatrix(context, profile.get(), result);
    } else if (cmsIsTag(profile.get(), cmsSigAToB0Tag)) {
        ReadTables(context, profile.get(), result);
    } else {
        throw Failure("has neither curves nor tables");
    }
    return result;
}

App::Bytes WriteIccProfile(std::string const &name, std::size_t channels, StoredCurve const &curve,
                           App::Primaries const &primaries) {
    Context const context;
    std::unique_ptr<cmsToneCurve, Deleter> const tone(cmsBuildParametricToneCurve(
        context.get(), static_cast<cmsInt32Number>(curve.function) + 1, curve.parameters.data()));
    if (!tone)
        throw std::bad_alloc();
    auto const xyY = [&](std::size_t i) { return cmsCIExyY{primaries[i][0], primaries[i][1], 1}; };
    cmsCIExyY const white = xyY(0);
    cmsCIExyYTRIPLE const colours{xyY(1), xyY(2), xyY(3)};
    cmsToneCurve *const curves[] = {tone.get(), tone.get(), tone.get()};
    ProfilePtr const profile(
        channels == 3 ? cmsCreateRGBProfileTHR(context.get(), &white, &colours, curves)
                      : cmsCreateGrayProfileTHR(context.get(), cmsD50_xyY(), tone.get()));
    if (!profile)
        throw std::bad_alloc();
    WriteText(context, profile.get(), cmsSigProfileDescriptionTag, name);
    WriteText(context, profile.get(), cmsSigCopyrightTag, "No copyright, use freely");
    return Saved(profile.get());
}

} // namespace Develop
