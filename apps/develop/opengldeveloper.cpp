// Developing by OpenGL.
#include "apps/develop/opengldeveloper.h"

#include "apps/develop/pixelformat.h"
#include "apps/develop/texturescope.h"

#include "oru/oru_ogl/extensionator/glcall.h"
#include "oru/oru_ogl/ogl/pixelunpackparameters.h"
#include "oru/oru_ogl/ogl/programenabledscope.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace Develop {

using namespace ORU::OGL;
using ORU::IntegerRect;

namespace {

// The shaders look tables up in rows of this length.
constexpr std::size_t kTableWidth = 256;

/// Takes the tables of up to three curves to the channels of a texture.
template<class Value>
void FillTable(ReusedTexture &table, std::vector<Value> const &values, std::size_t curves) {
    std::size_t const entries = values.size() / curves;
    std::vector<float> texels(entries * 4);
    for (std::size_t i = 0; i < entries; ++i)
        for (std::size_t c = 0; c < 3; ++c)
            texels[4 * i + c] = static_cast<float>(values[std::min(c, curves - 1) * entries + i]);
    std::size_t const height = std::max<std::size_t>(1, entries / kTableWidth);
    Texture2D &texture = table.reserve(kLightFormat.storage, kTableWidth, height);
    TextureScope const bound(texture);
    if (entries > 0)
        texture.subImage(0, 0, 0, kTableWidth, height, kLightFormat.layout, kLightFormat.type,
                         texels.data(), PixelUnpackParameters());
}

/// The pixel storage of read-backs into rows of some length, for a scope.
class PackScope {
public:
    explicit PackScope(std::size_t rowLength) {
        ORU_GL(PixelStorei, GL_PACK_ALIGNMENT, 1);
        ORU_GL(PixelStorei, GL_PACK_ROW_LENGTH, static_cast<GLint>(rowLength));
    }
    ~PackScope() {
        ORU::DropExceptions([] {
            ORU_GL(PixelStorei, GL_PACK_ALIGNMENT, 4);
            ORU_GL(PixelStorei, GL_PACK_ROW_LENGTH, 0);
        });
    }
    PackScope(PackScope const &) = delete;
    PackScope &operator=(PackScope const &) = delete;
};

} // namespace

OpenGLDeveloper::OpenGLDeveloper(std::unique_ptr<Sharpener> sharpener)
    : sharpener_(std::move(sharpener)) {}

std::string OpenGLDeveloper::description() const {
    return sharpener_ ? sharpener_->description() : "OpenGL";
}

std::size_t OpenGLDeveloper::sizeLimit() const {
    GLint texture = 0;
    GLint viewport[2] = {0, 0};
    ORU_GL(GetIntegerv, GL_MAX_TEXTURE_SIZE, &texture);
    ORU_GL(GetIntegerv, GL_MAX_VIEWPORT_DIMS, viewport);
    return static_cast<std::size_t>(std::min({texture, viewport[0], viewport[1]}));
}

CoverPass &OpenGLDeveloper::pass(Steps steps) {
    auto const found = passes_.find(steps);
    if (found != passes_.end())
        return found->second;
    return passes_.try_emplace(steps, DevelopShader(steps)).first->second;
}

void OpenGLDeveloper::begin(Task const &task) {
    task_ = &task;
    FillTable(lights_, task.tables.lights, task.tables.curves);
    FillTable(index_, task.tables.index, task.tables.curves);
    FillTable(thresholds_, task.tables.thresholds, task.tables.curves);
}

void OpenGLDeveloper::develop(Band const &photo, Tile const &tile, Band &developed) {
    upload(photo, tile);
    encode(tile, task_->recipe.sharpening.isOn() ? sharpen(tile) : nullptr);
    readBack(tile, developed);
}

void OpenGLDeveloper::upload(Band const &photo, Tile const &tile) {
    PixelFormat const format = PixelFormat::Of(task_->shape);
    IntegerRect const &source = tile.source;
    Texture2D &texture = photo_.reserve(format.storage, source.width(), source.height());
    PixelUnpackParameters part;
    part.setRowLength(task_->shape.width);
    TextureScope const bound(texture);
    texture.subImage(0, 0, 0, source.width(), source.height(), format.layout, format.type,
                     photo.at(source), part);
}

void OpenGLDeveloper::setCurves(Program &program) const {
    CodeTables const &tables = task_->tables;
    SetColourMask(program, task_->shape.channels);
    program.setUniform("levels", static_cast<int>(tables.levels));
    program.setUniform("isFloat", task_->shape.bitsPerChannel == 32);
    program.setUniformSampler2D("source", 0);
}

Texture2D const *OpenGLDeveloper::sharpen(Tile const &tile) {
    std::size_t const width = tile.source.width(), height = tile.source.height();
    CoverPass &decode = pass(Steps::Decode);
    Texture2D &light = sharpener_->light(width, height);
    {
        Program &program = decode.program();
        ProgramEnabledScope const enabled(&program);
        setCurves(program);
        program.setUniform2("offset", 1, std::array<int, 2>{0, 0}.data());
        program.setUniform("isLinear", task_->tables.isLinear);
        program.setUniformSampler2D("lights", 1);
        TextureScope const source(photo_.get(), 0);
        TextureScope const curves(lights_.get(), 1);
        decode.draw(light, width, height);
    }
    return &sharpener_->sharpen(width, height, task_->shape.channels, task_->recipe.sharpening);
}

void OpenGLDeveloper::encode(Tile const &tile, Texture2D const *light) {
    IntegerRect const &target = tile.target;
    Texture2D const *const spots = spotPainter_.paint(task_->recipe.spots, target);
    CoverPass &pass = this->pass(light ? Steps::Encode : Steps::DecodeAndEncode);
    Texture2D &developed =
        developed_.reserve(PixelFormat::Of(task_->shape).storage, target.width(), target.height());
    Program &program = pass.program();
    ProgramEnabledScope const enabled(&program);
    setCurves(program);
    std::array<int, 2> const offset = {target.offset().x - tile.source.offset().x,
                                       target.offset().y - tile.source.offset().y};
    program.setUniform2("offset", 1, offset.data());
    program.setUniform("isLinear", task_->tables.isLinear);
    program.setUniform("becomesLinear", task_->tables.becomesLinear);
    program.setUniform("indices", static_cast<int>(task_->tables.indices));
    program.setUniform("steps", static_cast<int>(task_->tables.steps));
    program.setUniform("exposure", static_cast<float>(task_->recipe.exposure));
    program.setUniform("gain", static_cast<float>(std::exp2(task_->recipe.exposure)));
    program.setUniform("hasSpots", spots != nullptr);
    program.setUniform("hasMatrix", task_->matrix.has_value());
    if (task_->matrix) {
        std::array<float, 9> matrix = {};
        for (std::size_t i = 0; i < matrix.size(); ++i)
            matrix[i] = static_cast<float>((*task_->matrix)[i / 3][i % 3]);
        program.setUniformMatrix3("matrix", matrix.data(), true);
    }
    program.setUniformSampler2D(light ? "light" : "lights", 1);
    program.setUniformSampler2D("index", 2);
    program.setUniformSampler2D("thresholds", 3);
    program.setUniformSampler2D("spots", 4);
    TextureScope const boundSource(photo_.get(), 0);
    TextureScope const boundLight(light ? *light : lights_.get(), 1);
    TextureScope const boundIndex(index_.get(), 2);
    TextureScope const boundThresholds(thresholds_.get(), 3);
    TextureScope const boundSpots(spots ? *spots : photo_.get(), 4);
    pass.draw(developed, target.width(), target.height());
}

void OpenGLDeveloper::readBack(Tile const &tile, Band &developed) {
    PixelFormat const format = PixelFormat::Of(task_->shape);
    framebuffer_.bind();
    framebuffer_.attach(&developed_.get(), 0, 0);
    {
        PackScope const rows(task_->shape.width);
        ORU_GL(ReadPixels, 0, 0, static_cast<GLsizei>(tile.target.width()),
               static_cast<GLsizei>(tile.target.height()), format.glLayout, format.glType,
               developed.at(tile.target));
    }
    framebuffer_.detach(&developed_.get(), 0);
    framebuffer_.unbind();
}

} // namespace Develop
