// What windows can be drawn into with.
#include "apps/oruinfo/drivers.h"
#include "apps/oruinfo/pixelformats.h"
#include "apps/oruinfo/report.h"
#include "apps/oruinfo/sections.h"

#include <algorithm>
#include <map>
#include <set>
#include <tuple>

namespace OruInfo {

namespace {

std::string Colour(PixelFormat const &f) {
    std::pair<char, int> const channels[] = {
        {'R', f.red}, {'G', f.green}, {'B', f.blue}, {'A', f.alpha}};
    std::string text;
    for (auto const &[name, bits] : channels)
        if (bits > 0)
            text += (text.empty() ? "" : " ") + (name + std::to_string(bits));
    return text.empty() ? "none" : text;
}

Names Targets(PixelFormat const &f) {
    Names targets;
    if (f.toWindow)
        targets.push_back("window");
    if (f.toBitmap)
        targets.push_back("bitmap");
    if (f.toPbuffer)
        targets.push_back("pbuffer");
    return targets;
}

Value Bits(int bits) {
    return std::int64_t{bits};
}

/// Formats that differ in depth, stencil, samples and buffers only are one line for people.
struct Family {
    int formats = 0;
    std::set<std::pair<int, int>> depthAndStencil;
    std::set<int> samples;
    std::set<bool> doubleBuffered, sRGB;
};

using FamilyKey = std::tuple<std::string, std::string, std::string, Names>;

Numbers ToNumbers(std::set<int> const &set) {
    return Numbers(set.begin(), set.end());
}

Names DepthNames(std::set<std::pair<int, int>> const &set) {
    Names names;
    for (auto const &[depth, stencil] : set)
        names.push_back(std::to_string(depth) + (stencil ? "+" + std::to_string(stencil) : ""));
    return names;
}

Names Which(std::set<bool> const &set, char const *no, char const *yes) {
    Names names;
    for (bool const value : set)
        names.push_back(value ? yes : no);
    return names;
}

Table Summary(std::vector<NumberedFormat> const &formats) {
    std::vector<FamilyKey> order;
    std::map<FamilyKey, Family> families;
    for (auto const &[number, f] : formats) {
        FamilyKey const key{Colour(f), f.type, f.acceleration, Targets(f)};
        Family &family = families[key];
        if (++family.formats == 1)
            order.push_back(key);
        family.depthAndStencil.emplace(f.depth, f.stencil);
        family.samples.insert(f.samples);
        family.doubleBuffered.insert(f.isDoubleBuffered);
        family.sRGB.insert(f.isSRGB);
    }
    Table table{{{"colour", "Colour bits"},
                 {"type", "Type"},
                 {"acceleration", "Acceleration"},
                 {"targets", "Drawn into"},
                 {"depth_and_stencil", "Depth+stencil"},
                 {"samples", "Samples"},
                 {"buffers", "Buffers"},
                 {"srgb", "sRGB"},
                 {"formats", "Formats"}},
                {}};
    for (FamilyKey const &key : order) {
        Family const &family = families[key];
        auto const &[colour, type, acceleration, targets] = key;
        table.rows.push_back({colour, type, acceleration, targets,
                              DepthNames(family.depthAndStencil), ToNumbers(family.samples),
                              Which(family.doubleBuffered, "single", "double"),
                              Which(family.sRGB, "no", "yes"), Bits(family.formats)});
    }
    return table;
}

bool IsSame(PixelFormat const &a, PixelFormat const &b) {
    auto const all = [](PixelFormat const &f) {
        return std::tie(f.red, f.green, f.blue, f.alpha, f.type, f.acceleration, f.toWindow,
                        f.toBitmap, f.toPbuffer, f.depth, f.stencil, f.accumulation, f.samples,
                        f.isDoubleBuffered, f.isStereo, f.isSRGB);
    };
    return all(a) == all(b);
}

Table Details(std::vector<NumberedFormat> const &formats) {
    std::vector<std::pair<Numbers, PixelFormat>> distinct;
    for (NumberedFormat const &numbered : formats) {
        auto const number = static_cast<std::uint64_t>(numbered.number);
        auto const known =
            std::find_if(distinct.begin(), distinct.end(), [&numbered](auto const &entry) {
                return IsSame(entry.second, numbered.format);
            });
        if (known == distinct.end())
            distinct.push_back({{number}, numbered.format});
        else
            known->first.push_back(number);
    }
    Table table{{{"numbers", "Numbers"},
                 {"red", "Red"},
                 {"green", "Green"},
                 {"blue", "Blue"},
                 {"alpha", "Alpha"},
                 {"type", "Type"},
                 {"acceleration", "Acceleration"},
                 {"targets", "Drawn into"},
                 {"depth", "Depth"},
                 {"stencil", "Stencil"},
                 {"accumulation", "Accumulation"},
                 {"samples", "Samples"},
                 {"is_double_buffered", "Double buffered"},
                 {"is_stereo", "Stereo"},
                 {"is_srgb", "sRGB"}},
                {}};
    for (auto const &[numbers, f] : distinct)
        table.rows.push_back({numbers, Bits(f.red), Bits(f.green), Bits(f.blue), Bits(f.alpha),
                              f.type, f.acceleration, Targets(f), Bits(f.depth), Bits(f.stencil),
                              Bits(f.accumulation), Bits(f.samples), f.isDoubleBuffered, f.isStereo,
                              f.isSRGB});
    return table;
}

} // namespace

void GatherPixelFormats(Drivers &drivers, Group &section) {
    std::vector<NumberedFormat> const formats = ListPixelFormats(drivers.openGL().deviceContext());
    section.add("count", "Formats", static_cast<std::uint64_t>(formats.size()));
    section.add("summary", "By colour", Summary(formats));
    section.addDetail("formats", "Every format", Details(formats));
}

} // namespace OruInfo
