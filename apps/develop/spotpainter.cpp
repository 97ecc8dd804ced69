// The exposure that spots add to each pixel, as a texture.
#include "apps/develop/spotpainter.h"

#include "apps/develop/shaders.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/blendscope.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"
#include "oru/oru_ogl/platformgl.h"

#include <array>
#include <cmath>

namespace Develop {

using namespace ORU::OGL;

namespace {

/// Adds what is drawn to what is there, for a scope.
class AdditiveBlendScope : public TemporaryBlendScope {
public:
    AdditiveBlendScope() {
        current_.enabled = true;
        current_.srcRGB = current_.srcAlpha = GL_ONE;
        current_.dstRGB = current_.dstAlpha = GL_ONE;
        current_.equationRGB = current_.equationAlpha = GL_FUNC_ADD;
        ORU_GL(Enable, GL_BLEND);
        ORU_GL(BlendFunc, GL_ONE, GL_ONE);
        ORU_GL(BlendEquation, GL_FUNC_ADD);
    }
};

constexpr std::size_t kCorners = 6; // two triangles

/// The vertices of all spots, field by field.
struct SpotVertices {
    std::vector<std::array<float, 2>> position;
    std::vector<std::array<float, 4>> centre;
    std::vector<std::array<float, 2>> spot;

    void append(Spot const &s, ORU::IntegerRect const &area);
    VertexBuffer makeBuffer() const;
};

void SpotVertices::append(Spot const &s, ORU::IntegerRect const &area) {
    static constexpr int kSides[kCorners][2] = {{-1, -1}, {1, -1}, {1, 1},
                                                {-1, -1}, {1, 1},  {-1, 1}};
    // One pixel more, where the spot adds nothing, so that rounding loses none at the edge.
    double const reach = s.radius + 1;
    double const wholeX = std::floor(s.x);
    double const wholeY = std::floor(s.y);
    auto const clip = [](double coordinate, int first, std::size_t size) {
        return static_cast<float>(2 * (coordinate - first) / static_cast<double>(size) - 1);
    };
    for (auto const &side : kSides) {
        position.push_back({clip(s.x + side[0] * reach, area.offset().x, area.width()),
                            clip(s.y + side[1] * reach, area.offset().y, area.height())});
        centre.push_back({static_cast<float>(wholeX), static_cast<float>(wholeY),
                          static_cast<float>(s.x - wholeX), static_cast<float>(s.y - wholeY)});
        spot.push_back({static_cast<float>(s.radius), static_cast<float>(s.stops)});
    }
}

VertexBuffer SpotVertices::makeBuffer() const {
    constexpr auto kUsage = VertexBuffer::EXPECTEDUSAGE_STREAM_DRAW;
    VertexBuffer buffer({{"position", VertexBuffer::ATTRIBUTETYPE_FLOAT2, kUsage},
                         {"centre", VertexBuffer::ATTRIBUTETYPE_FLOAT4, kUsage},
                         {"spot", VertexBuffer::ATTRIBUTETYPE_FLOAT2, kUsage}},
                        static_cast<unsigned int>(position.size()),
                        VertexBuffer::PRIMITIVETYPE_TRIANGLES);
    auto const set = [&buffer](char const *name, auto const &values) {
        buffer.setField(name, reinterpret_cast<unsigned char const *>(values.data()), false, 0, 0);
    };
    set("position", position);
    set("centre", centre);
    set("spot", spot);
    return buffer;
}

} // namespace

SpotPainter::SpotPainter() : pass_(kSpotVertexShader, kSpotShader) {}

Texture2D const *SpotPainter::paint(std::vector<Spot> const &spots, ORU::IntegerRect const &area) {
    SpotVertices vertices;
    for (Spot const &spot : spots)
        if (Touches(spot, area))
            vertices.append(spot, area);
    if (vertices.position.empty())
        return nullptr;
    VertexBuffer buffer = vertices.makeBuffer();
    buffer.setupWithProgram(&pass_.program());
    buffer.marshallData();

    Texture2D &stops = stops_.reserve(Texture::INTERNALFORMAT_R32F, area.width(), area.height());
    ProgramEnabledScope const enabled(&pass_.program());
    pass_.program().setUniform2("offset", 1,
                                std::array<int, 2>{area.offset().x, area.offset().y}.data());
    AdditiveBlendScope const adding;
    pass_.draw(stops, area.width(), area.height(), buffer, true);
    return &stops;
}

} // namespace Develop
