// Uniform blocks: where the implementation wants each member of one.
#pragma once

#include "oru/core/utility/export.h"

#include <string>
#include <string_view>
#include <vector>

namespace ORU::OGL {

class Program;

/// The layout of a program's uniform block, as the implementation tells it: no host has to guess.
///
/// ```cpp
/// UniformBlock const camera(program, "Camera"); // uniform Camera { mat4 view; vec3 eye; };
/// camera.setBinding(0);
/// UniformBlockWriter values(camera);
/// values.set("view", matrix, 1);
/// values.set("eye", {0.f, 1.f, 2.f});
/// Buffer buffer(camera.size(), Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_DYNAMIC_DRAW, nullptr);
/// values.upload(buffer);
/// buffer.bindBase(GL_UNIFORM_BUFFER, 0);
/// ```
///
/// It holds what was asked once: ask anew after the program was linked anew. OpenGL 3.1 or
/// GL_ARB_uniform_buffer_object.
class ORU_API UniformBlock {
public:
    /// One active uniform of the block.
    struct Member {
        std::string name;          ///< as in the block: without the block's name and without `[0]`
        unsigned int type;         ///< GL type: GL_FLOAT_VEC3, say
        unsigned int count;        ///< elements of an array, 1 for others
        unsigned int offset;       ///< bytes from the block's beginning
        unsigned int arrayStride;  ///< bytes from one element to the next; 0 for no array
        unsigned int matrixStride; ///< bytes from one column, or row, to the next; 0 for no matrix
        bool isRowMajor;           ///< whether a matrix lies row after row
    };

    /// Asks for the layout.
    /// @param program linked
    /// @param name of the block; `Lights[1]` for one of an array of blocks
    /// @throws InternalException without GL_ARB_uniform_buffer_object, and when the program has no
    ///         active block of that name
    /// @note glGetUniformBlockIndex, glGetActiveUniformBlockiv, glGetActiveUniformsiv,
    ///       glGetActiveUniformName
    UniformBlock(Program const &program, std::string const &name);

    std::string const &name() const { return name_; } ///< As given to the constructor.
    unsigned int index() const { return index_; }     ///< OpenGL's number of the block.
    unsigned int size() const { return size_; }       ///< Bytes that a buffer must have for it.

    /// The active members, in the order of their offsets.
    std::vector<Member> const &members() const { return members_; }

    /// A member by its name.
    /// @param name as Member::name, or as OpenGL spells it
    /// @throws InternalException when the block has no such active member
    Member const &member(std::string_view name) const;

    /// Lets the program find the block's values in the buffer that is bound to a binding point of
    /// GL_UNIFORM_BUFFER; see Buffer::bindBase.
    /// @throws ExceptionOGL for a point that the context does not have, or a deleted program
    /// @note glUniformBlockBinding
    void setBinding(unsigned int point) const;

    /// The binding point; 0 unless set. @note glGetActiveUniformBlockiv
    unsigned int binding() const;

    /// What the offset of Buffer::bindRange must be a multiple of, in bytes. @note glGetIntegerv
    static unsigned int OffsetAlignment();

    /// How many binding points there are, at least 36. @note glGetIntegerv
    static unsigned int MaxBindings();

    /// How many bytes a block may have, at least 16384. @note glGetIntegerv
    static unsigned int MaxSize();

    /// Whether the current context has GL_ARB_uniform_buffer_object; false without a context.
    static bool IsSupported();

private:
    int parameter(unsigned int query) const;
    void askForMembers();
    std::string_view withoutPrefix(std::string_view name) const;

    std::string name_;
    unsigned int program_; ///< GL name
    unsigned int index_;
    unsigned int size_;
    std::vector<Member> members_;
};

} // namespace ORU::OGL
