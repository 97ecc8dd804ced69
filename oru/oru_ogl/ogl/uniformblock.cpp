// Uniform blocks: where the implementation wants each member of one.
#include "oru/oru_ogl/ogl/uniformblock.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/composetext.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>

namespace ORU::OGL {

namespace {

unsigned int Limit(GLenum query) {
    GLint value = 0;
    ORU_GL(GetIntegerv, query, &value);
    return static_cast<unsigned int>(value);
}

/// A property of each of several uniforms.
std::vector<GLint> AskEach(GLuint program, std::vector<GLuint> const &uniforms, GLenum query) {
    std::vector<GLint> values(uniforms.size());
    ORU_GL(GetActiveUniformsiv, program, static_cast<GLsizei>(uniforms.size()), uniforms.data(),
           query, values.data());
    return values;
}

/// OpenGL says -1 of what a uniform does not have.
unsigned int AtLeastNone(GLint value) {
    return static_cast<unsigned int>(std::max(value, 0));
}

} // namespace

UniformBlock::UniformBlock(Program const &program, std::string const &name)
    : name_(name), program_(program.programID()) {
    ORU_ASSERT_SUPPORTED(GL_ARB_UNIFORM_BUFFER_OBJECT);
    index_ = ORU_GL(GetUniformBlockIndex, program_, name.c_str());
    if (index_ == GL_INVALID_INDEX)
        ORU_THROW_INTERNAL("The program has no active uniform block \"", name, "\"");
    size_ = static_cast<unsigned int>(parameter(GL_UNIFORM_BLOCK_DATA_SIZE));
    askForMembers();
}

int UniformBlock::parameter(unsigned int query) const {
    GLint value = 0;
    ORU_GL(GetActiveUniformBlockiv, program_, index_, query, &value);
    return value;
}

void UniformBlock::askForMembers() {
    auto const count = static_cast<std::size_t>(parameter(GL_UNIFORM_BLOCK_ACTIVE_UNIFORMS));
    std::vector<GLint> found(count);
    ORU_GL(GetActiveUniformBlockiv, program_, index_, GL_UNIFORM_BLOCK_ACTIVE_UNIFORM_INDICES,
           found.data());
    std::vector<GLuint> const uniforms(found.begin(), found.end());
    auto const each = [&](GLenum query) { return AskEach(program_, uniforms, query); };
    auto const types = each(GL_UNIFORM_TYPE), counts = each(GL_UNIFORM_SIZE),
               offsets = each(GL_UNIFORM_OFFSET), arrayStrides = each(GL_UNIFORM_ARRAY_STRIDE),
               matrixStrides = each(GL_UNIFORM_MATRIX_STRIDE),
               rowMajor = each(GL_UNIFORM_IS_ROW_MAJOR), lengths = each(GL_UNIFORM_NAME_LENGTH);
    for (std::size_t i = 0; i < count; ++i) {
        std::string spelt(static_cast<std::size_t>(lengths[i]), '\0');
        GLsizei length = 0;
        ORU_GL(GetActiveUniformName, program_, uniforms[i], lengths[i], &length, spelt.data());
        spelt.resize(static_cast<std::size_t>(length));
        members_.push_back({std::string(withoutPrefix(spelt)), static_cast<unsigned int>(types[i]),
                            static_cast<unsigned int>(counts[i]), AtLeastNone(offsets[i]),
                            AtLeastNone(arrayStrides[i]), AtLeastNone(matrixStrides[i]),
                            rowMajor[i] != GL_FALSE});
    }
    std::sort(members_.begin(), members_.end(),
              [](Member const &a, Member const &b) { return a.offset < b.offset; });
}

std::string_view UniformBlock::withoutPrefix(std::string_view name) const {
    // Members of a block that has an instance's name are spelt Block.member, also in an array.
    std::string const prefix = name_.substr(0, name_.find('[')) + '.';
    if (name.substr(0, prefix.size()) == prefix)
        name.remove_prefix(prefix.size());
    constexpr std::string_view kFirst = "[0]";
    if (name.size() > kFirst.size() && name.substr(name.size() - kFirst.size()) == kFirst)
        name.remove_suffix(kFirst.size());
    return name;
}

UniformBlock::Member const &UniformBlock::member(std::string_view name) const {
    auto const named = [](std::string_view wanted) {
        return [wanted](Member const &member) { return member.name == wanted; };
    };
    auto found = std::find_if(members_.begin(), members_.end(), named(name));
    if (found == members_.end())
        found = std::find_if(members_.begin(), members_.end(), named(withoutPrefix(name)));
    if (found == members_.end())
        ORU_THROW_INTERNAL("The uniform block \"", name_, "\" has no active member \"", name, "\"");
    return *found;
}

void UniformBlock::setBinding(unsigned int point) const {
    ORU_GL(UniformBlockBinding, program_, index_, point);
}

unsigned int UniformBlock::binding() const {
    return static_cast<unsigned int>(parameter(GL_UNIFORM_BLOCK_BINDING));
}

unsigned int UniformBlock::OffsetAlignment() {
    return Limit(GL_UNIFORM_BUFFER_OFFSET_ALIGNMENT);
}

unsigned int UniformBlock::MaxBindings() {
    return Limit(GL_MAX_UNIFORM_BUFFER_BINDINGS);
}

unsigned int UniformBlock::MaxSize() {
    return Limit(GL_MAX_UNIFORM_BLOCK_SIZE);
}

bool UniformBlock::IsSupported() {
    return internal::Supports(GL_ARB_UNIFORM_BUFFER_OBJECT);
}

} // namespace ORU::OGL
