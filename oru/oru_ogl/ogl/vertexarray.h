// Vertex arrays: which buffers the attributes of vertices come from, and drawing them.
#pragma once

#include "oru/oru_ogl/ogl/object.h"

#include <cstddef>
#include <cstdint>

namespace ORU::OGL {

class Buffer;

/// One OpenGL vertex array object: attributes from any buffers, vertex indices, and the draws.
///
/// ```cpp
/// VertexArray array;
/// array.setAttribute(program.getAttributeLocation("place"), corners, {3, GL_FLOAT});
/// array.setAttribute(program.getAttributeLocation("shade"), shades,
///                    VertexArray::Attribute(4, GL_UNSIGNED_BYTE).normalized());
/// array.setIndices(triangles, GL_UNSIGNED_SHORT);
/// array.drawElements(GL_TRIANGLES, 36);
/// ```
///
/// The vertex array holds the buffers' names only: keep them alive while it is drawn. What a
/// primitive is, GL_TRIANGLES say or VertexBuffer::PrimitiveType, is OpenGL's to judge.
///
/// A draw binds the vertex array and then again what was bound before; of a bound one it only asks
/// whether it is, and within a VertexArrayBindScope not even that. Contexts that share objects do
/// not share vertex arrays: one is made, used and destroyed in the same context. OpenGL 3.0, or
/// GL_ARB_vertex_array_object with OpenGL 2.0.
class ORU_API VertexArray : public Object {
public:
    /// How the values of an attribute lie in a buffer.
    class ORU_API Attribute {
    public:
        /// What the shader gets.
        enum Kind : unsigned int {
            KIND_FLOAT = 0,  ///< floats; integers in the buffer become floats of the same value
            KIND_NORMALIZED, ///< floats; integers become 0 to 1, those with a sign -1 to 1
            KIND_INTEGER,    ///< integers, for int, uint and their vectors; OpenGL 3.0
            KIND_DOUBLE      ///< doubles, for double and its vectors; GL_ARB_vertex_attrib_64bit
        };

        /// Values that lie one after the other, from the buffer's beginning on, as floats.
        /// @param components 1 to 4, or GL_BGRA
        /// @param type of each in the buffer: GL_FLOAT, GL_UNSIGNED_BYTE and so on
        Attribute(unsigned int components, unsigned int type)
            : components_(components), type_(type) {}

        /// @name Changes, each of which returns the attribute
        /// @{
        Attribute &normalized() { return setKind(KIND_NORMALIZED); } ///< See KIND_NORMALIZED.
        Attribute &integer() { return setKind(KIND_INTEGER); }       ///< See KIND_INTEGER.
        Attribute &asDouble() { return setKind(KIND_DOUBLE); }       ///< See KIND_DOUBLE.

        /// Says how far apart the vertices are.
        /// @param bytes from one to the next; 0 when they lie one after the other
        Attribute &stride(int bytes) {
            stride_ = bytes;
            return *this;
        }
        /// Says where the values begin.
        /// @param bytes before the first
        Attribute &offset(std::int64_t bytes) {
            offset_ = bytes;
            return *this;
        }
        /// Says how many instances are drawn with each value; OpenGL 3.3.
        /// @param instances 0 for a value for each vertex
        Attribute &divisor(unsigned int instances) {
            divisor_ = instances;
            return *this;
        }
        /// @}

    private:
        friend class VertexArray;

        Attribute &setKind(Kind kind) {
            kind_ = kind;
            return *this;
        }

        unsigned int components_;
        unsigned int type_;
        Kind kind_ = KIND_FLOAT;
        int stride_ = 0;
        std::int64_t offset_ = 0;
        unsigned int divisor_ = 0;
    };

    /// Makes a vertex array without attributes. What was bound stays bound.
    /// @throws InternalException without GL_ARB_vertex_array_object or OpenGL 2.0
    /// @note glGenVertexArrays, glGetIntegerv, glBindVertexArray
    VertexArray();

    /// A vertex array that was made elsewhere. Its indices, if any, are set anew before they are
    /// drawn. After a failure the name is the caller's as before.
    /// @throws InternalException also for a name that is no vertex array
    /// @note glIsVertexArray
    VertexArray(unsigned int name, ownership_tag ownership);

    VertexArray(VertexArray &&other) noexcept = default;
    VertexArray &operator=(VertexArray &&other) noexcept;

    /// Deletes the vertex array that the object owns. @note glDeleteVertexArrays
    ~VertexArray() override;

    /// Makes this the bound vertex array. @note glBindVertexArray
    void bind() const;

    /// Binds no vertex array. @note glBindVertexArray
    static void BindDefault();

    /// Lets an attribute have its values from a buffer.
    /// @param location of the attribute: see Program::getAttributeLocation
    /// @throws InternalException for a location below 0, of an attribute that the program does not
    ///         have, and for an offset below 0; ExceptionOGL for values that OpenGL does not have
    /// @note glGetIntegerv, glBindVertexArray, glBindBuffer, glVertexAttribPointer,
    ///       glVertexAttribIPointer, glVertexAttribLPointer, glVertexAttribDivisor,
    ///       glEnableVertexAttribArray
    void setAttribute(int location, Buffer const &buffer, Attribute const &attribute);

    /// Lets an attribute have one value for all vertices, OpenGL's current one.
    /// @throws InternalException for a location below 0
    /// @note glGetIntegerv, glBindVertexArray, glDisableVertexAttribArray
    void disableAttribute(int location);

    /// Sets the buffer that the `drawElements…` have the vertices' indices from.
    /// @param type GL_UNSIGNED_BYTE, GL_UNSIGNED_SHORT or GL_UNSIGNED_INT
    /// @throws InternalException for another type
    /// @note glGetIntegerv, glBindVertexArray, glBindBuffer
    void setIndices(Buffer const &buffer, unsigned int type);

    /// @name Vertices in their order
    /// Each draws with the current program.
    /// @param mode what they make up: GL_TRIANGLES, say
    /// @param first, count vertices
    /// @throws ExceptionOGL for a mode that the context does not have, and without a program that
    ///         can run
    /// @{

    /// Draws vertices. @note glDrawArrays
    void drawArrays(unsigned int mode, int first, int count) const;

    /// Draws several instances of them; OpenGL 3.1. @note glDrawArraysInstanced
    void drawArraysInstanced(unsigned int mode, int first, int count, int instances) const;

    /// Draws several ranges of vertices. @param ranges number of them @note glMultiDrawArrays
    void drawRanges(unsigned int mode, int const *firsts, int const *counts, int ranges) const;

    /// Draws what a buffer says: count, instances, first, 0, as unsigned 32-bit integers.
    /// @param offset bytes before them, a multiple of 4
    /// @throws InternalException when they leave the buffer
    /// @note glDrawArraysIndirect; needs OpenGL 4.0 or GL_ARB_draw_indirect
    void drawArraysIndirect(unsigned int mode, Buffer const &commands,
                            std::int64_t offset = 0) const;

    /// Draws patches for the tessellation stages; the number of vertices in one is put back.
    /// @param patchVertices vertices of each patch
    /// @note glGetIntegerv, glPatchParameteri, glDrawArrays; needs OpenGL 4.0 or
    ///       GL_ARB_tessellation_shader
    void drawPatches(int patchVertices, int first, int count) const;
    /// @}

    /// @name Vertices by their indices
    /// As above, with the indices that `setIndices` has set.
    /// @param first, count indices, not bytes
    /// @param baseVertex is added to each index; needs OpenGL 3.2 or
    ///        GL_ARB_draw_elements_base_vertex
    /// @throws InternalException also without indices, and for more than there are
    /// @{

    /// Draws vertices. @note glDrawElements, glDrawElementsBaseVertex
    void drawElements(unsigned int mode, int count, std::int64_t first = 0,
                      int baseVertex = 0) const;

    /// Draws several instances of them; OpenGL 3.1.
    /// @note glDrawElementsInstanced, glDrawElementsInstancedBaseVertex
    void drawElementsInstanced(unsigned int mode, int count, int instances, std::int64_t first = 0,
                               int baseVertex = 0) const;

    /// Draws vertices, and says which.
    /// @param smallest, largest of all the indices, before `baseVertex` is added
    /// @note glDrawRangeElements, glDrawRangeElementsBaseVertex
    void drawRangeElements(unsigned int mode, unsigned int smallest, unsigned int largest,
                           int count, std::int64_t first = 0, int baseVertex = 0) const;

    /// Draws what a buffer says: count, instances, first index, base vertex, 0, as 32-bit integers.
    /// @param offset as of `drawArraysIndirect`
    /// @note glDrawElementsIndirect; needs OpenGL 4.0 or GL_ARB_draw_indirect
    void drawElementsIndirect(unsigned int mode, Buffer const &commands,
                              std::int64_t offset = 0) const;

    /// As `drawPatches`, by indices. @note glGetIntegerv, glPatchParameteri, glDrawElements
    void drawPatchElements(int patchVertices, int count, std::int64_t first = 0) const;
    /// @}

    /// Whether the current context has vertex arrays; false without a context.
    static bool IsSupported();

private:
    friend class VertexArrayBindScope;

    template<class Step>
    void whileBound(Step step) const;
    void deleteObject() noexcept;
    void const *placeOfIndices(int count, std::int64_t first) const;
    void requireIndices() const;

    unsigned int indexType_ = 0;  ///< GL type, 0 until indices are set
    std::int64_t indexCount_ = 0; ///< how many the buffer has
    mutable bool isHeld_ = false; ///< bound by a scope
};

} // namespace ORU::OGL
