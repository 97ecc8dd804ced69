// ICC profiles of every kind, made by lcms2.
#pragma once

#include "apps/common/picture.h"

#include <lcms2.h>

#include <array>
#include <cmath>
#include <functional>
#include <vector>

namespace apps_test {

/// Colorants as the profiles of their makers have them: X, Y, Z of red, of green, of blue at D50.
using Colorants = std::array<double, 9>;
constexpr Colorants kSrgbColorants{0.43607, 0.22249, 0.01392, 0.38515, 0.71687,
                                   0.09708, 0.14307, 0.06061, 0.71410};
constexpr Colorants kP3Colorants{0.51512, 0.24120, -0.00105, 0.29198, 0.69225,
                                 0.04189, 0.15710, 0.06657,  0.78407};
constexpr Colorants kAdobeColorants{0.60974, 0.31111, 0.01947, 0.20528, 0.62567,
                                    0.06087, 0.14919, 0.06322, 0.74457};
constexpr Colorants kProPhotoColorants{0.79767, 0.28804, 0.0,     0.13519, 0.71188,
                                       0.0,     0.03134, 0.00009, 0.82491};

/// A profile in the making; it is named "Test".
class ProfileMaker {
public:
    using Curve = cmsToneCurve *;

    explicit ProfileMaker(cmsColorSpaceSignature space = cmsSigRgbData) {
        cmsSetProfileVersion(profile_, 4.3);
        cmsSetDeviceClass(profile_, cmsSigDisplayClass);
        cmsSetColorSpace(profile_, space);
        cmsSetPCS(profile_, cmsSigXYZData);
        cmsMLU *const name = cmsMLUalloc(nullptr, 1);
        cmsMLUsetASCII(name, "en", "US", "Test");
        cmsWriteTag(profile_, cmsSigProfileDescriptionTag, name);
        cmsMLUfree(name);
    }
    ~ProfileMaker() { cmsCloseProfile(profile_); }
    ProfileMaker(ProfileMaker const &) = delete;
    ProfileMaker &operator=(ProfileMaker const &) = delete;

    /// @param number of the function in ICC.1, whose numbers are stored as 16.16
    static Curve Function(int number, std::vector<double> parameters) {
        parameters.resize(10);
        return cmsBuildParametricToneCurve(nullptr, number + 1, parameters.data());
    }
    static Curve Table(std::size_t size, std::function<double(double)> const &light) {
        std::vector<cmsUInt16Number> table;
        for (std::size_t i = 0; i < size; ++i)
            table.push_back(static_cast<cmsUInt16Number>(std::lround(
                65535 * light(static_cast<double>(i) / static_cast<double>(size - 1)))));
        return cmsBuildTabulatedToneCurve16(nullptr, static_cast<cmsUInt32Number>(size),
                                            table.data());
    }

    ProfileMaker &deviceClass(cmsProfileClassSignature deviceClass) {
        cmsSetDeviceClass(profile_, deviceClass);
        return *this;
    }
    ProfileMaker &curve(Curve curve, std::vector<cmsTagSignature> const &tags = {
                                         cmsSigRedTRCTag, cmsSigGreenTRCTag, cmsSigBlueTRCTag}) {
        for (cmsTagSignature const tag : tags)
            cmsWriteTag(profile_, tag, curve);
        cmsFreeToneCurve(curve);
        return *this;
    }
    ProfileMaker &colorants(Colorants const &xyz) {
        cmsTagSignature const tags[] = {cmsSigRedColorantTag, cmsSigGreenColorantTag,
                                        cmsSigBlueColorantTag};
        for (std::size_t i = 0; i < 3; ++i) {
            cmsCIEXYZ const colour{xyz[3 * i], xyz[3 * i + 1], xyz[3 * i + 2]};
            cmsWriteTag(profile_, tags[i], &colour);
        }
        return *this;
    }

    /// Says by a table of colours in CIE L*a*b*, so many along each edge, what another profile
    /// says.
    ProfileMaker &table(App::Bytes const &other, unsigned int points = 33) {
        cmsHPROFILE const from =
            cmsOpenProfileFromMem(other.data(), static_cast<cmsUInt32Number>(other.size()));
        cmsHPROFILE const lab = cmsCreateLab4Profile(nullptr);
        cmsHTRANSFORM const transform = cmsCreateTransform(
            from, TYPE_RGB_16, lab, TYPE_Lab_16, INTENT_RELATIVE_COLORIMETRIC, cmsFLAGS_NOOPTIMIZE);
        cmsStage *const colours = cmsStageAllocCLut16bit(nullptr, points, 3, 3, nullptr);
        cmsStageSampleCLut16bit(
            colours,
            [](cmsUInt16Number const *in, cmsUInt16Number *out, void *cargo) -> cmsInt32Number {
                cmsDoTransform(cargo, in, out, 1);
                return 1;
            },
            transform, 0);
        cmsPipeline *const pipeline = cmsPipelineAlloc(nullptr, 3, 3);
        cmsPipelineInsertStage(pipeline, cmsAT_END, cmsStageAllocToneCurves(nullptr, 3, nullptr));
        cmsPipelineInsertStage(pipeline, cmsAT_END, colours);
        cmsPipelineInsertStage(pipeline, cmsAT_END, cmsStageAllocToneCurves(nullptr, 3, nullptr));
        cmsSetPCS(profile_, cmsSigLabData);
        cmsWriteTag(profile_, cmsSigAToB0Tag, pipeline);
        cmsPipelineFree(pipeline);
        cmsDeleteTransform(transform);
        cmsCloseProfile(lab);
        cmsCloseProfile(from);
        return *this;
    }

    App::Bytes bytes() {
        cmsUInt32Number size = 0;
        cmsSaveProfileToMem(profile_, nullptr, &size);
        App::Bytes bytes(size);
        cmsSaveProfileToMem(profile_, bytes.data(), &size);
        return bytes;
    }

private:
    cmsHPROFILE profile_ = cmsCreateProfilePlaceholder(nullptr);
};

inline App::Bytes RgbProfile(ProfileMaker::Curve curve,
                             Colorants const &colorants = kSrgbColorants) {
    return ProfileMaker().curve(curve).colorants(colorants).bytes();
}

inline App::Bytes GreyProfile(ProfileMaker::Curve curve) {
    return ProfileMaker(cmsSigGrayData).curve(curve, {cmsSigGrayTRCTag}).bytes();
}

} // namespace apps_test
