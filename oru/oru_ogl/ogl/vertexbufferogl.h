// Vertices with named attributes, and drawing them with a program.
#pragma once

#include "oru/core/utility/export.h"

#include <cstddef>
#include <string>
#include <vector>

namespace ORU::OGL {

class Program;

/// Vertices as named float attributes: a copy in memory, and once prepared the OpenGL objects that
/// feed a program from it.
///
/// ```cpp
/// VertexBuffer triangle({{"position", VertexBuffer::ATTRIBUTETYPE_FLOAT2,
///                         VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW}},
///                       3, VertexBuffer::PRIMITIVETYPE_TRIANGLES);
/// triangle.setField("position", bytes, false, 0, 0);
/// triangle.setupWithProgram(&program);
/// triangle.marshallData();
/// triangle.drawPrimitives();
/// ```
///
/// A copy has the vertices and no OpenGL objects: set it up with a program before drawing. Moving
/// takes the objects along. Quadrilaterals and polygons need a compatibility context. OpenGL 3.0,
/// or GL_ARB_vertex_array_object with OpenGL 2.0.
class ORU_API VertexBuffer {
public:
    /// Components of an attribute.
    enum AttributeType : unsigned int {
        ATTRIBUTETYPE_FLOAT = 1,  ///< one component
        ATTRIBUTETYPE_FLOAT2 = 2, ///< two, vec2 in the shader
        ATTRIBUTETYPE_FLOAT3 = 3, ///< three, vec3
        ATTRIBUTETYPE_FLOAT4 = 4  ///< four, vec4
    };

    /// How often an attribute changes, and who reads it; the values are OpenGL's.
    enum ExpectedUsage : unsigned int {
        EXPECTEDUSAGE_STREAM_DRAW = 0x88E0,  ///< GL_STREAM_DRAW
        EXPECTEDUSAGE_STREAM_READ = 0x88E1,  ///< GL_STREAM_READ
        EXPECTEDUSAGE_STREAM_COPY = 0x88E2,  ///< GL_STREAM_COPY
        EXPECTEDUSAGE_STATIC_DRAW = 0x88E4,  ///< GL_STATIC_DRAW
        EXPECTEDUSAGE_STATIC_READ = 0x88E5,  ///< GL_STATIC_READ
        EXPECTEDUSAGE_STATIC_COPY = 0x88E6,  ///< GL_STATIC_COPY
        EXPECTEDUSAGE_DYNAMIC_DRAW = 0x88E8, ///< GL_DYNAMIC_DRAW
        EXPECTEDUSAGE_DYNAMIC_READ = 0x88E9, ///< GL_DYNAMIC_READ
        EXPECTEDUSAGE_DYNAMIC_COPY = 0x88EA  ///< GL_DYNAMIC_COPY
    };

    /// What the vertices make up; the values are OpenGL's.
    enum PrimitiveType : unsigned int {
        PRIMITIVETYPE_POINTS = 0,                    ///< GL_POINTS
        PRIMITIVETYPE_LINES = 1,                     ///< GL_LINES
        PRIMITIVETYPE_LINE_LOOP = 2,                 ///< GL_LINE_LOOP
        PRIMITIVETYPE_LINE_STRIP = 3,                ///< GL_LINE_STRIP
        PRIMITIVETYPE_TRIANGLES = 4,                 ///< GL_TRIANGLES
        PRIMITIVETYPE_TRIANGLE_STRIP = 5,            ///< GL_TRIANGLE_STRIP
        PRIMITIVETYPE_TRIANGLE_FAN = 6,              ///< GL_TRIANGLE_FAN
        PRIMITIVETYPE_QUADS = 7,                     ///< GL_QUADS
        PRIMITIVETYPE_QUAD_STRIP = 8,                ///< GL_QUAD_STRIP
        PRIMITIVETYPE_POLYGON = 9,                   ///< GL_POLYGON
        PRIMITIVETYPE_LINES_ADJACENCY = 10,          ///< GL_LINES_ADJACENCY
        PRIMITIVETYPE_LINE_STRIP_ADJACENCY = 11,     ///< GL_LINE_STRIP_ADJACENCY
        PRIMITIVETYPE_TRIANGLES_ADJACENCY = 12,      ///< GL_TRIANGLES_ADJACENCY
        PRIMITIVETYPE_TRIANGLE_STRIP_ADJACENCY = 13, ///< GL_TRIANGLE_STRIP_ADJACENCY
        PRIMITIVETYPE_PATCHES = 14                   ///< GL_PATCHES
    };

    /// One attribute of the layout.
    class ORU_API Field {
    public:
        /// Names an attribute.
        /// @param name the attribute's name in the shader
        /// @throws InternalException for a type that is none of the four
        Field(std::string const &name, AttributeType type, ExpectedUsage usage);

        AttributeType type() const { return type_; }      ///< Components.
        std::string const &name() const { return name_; } ///< As in the shader.
        ExpectedUsage usage() const { return usage_; }    ///< A hint for OpenGL.

        /// Bytes of the attribute in one vertex.
        unsigned int byteSize() const { return byteSize_; }

    private:
        friend class VertexBuffer;

        AttributeType type_;
        std::string name_;
        ExpectedUsage usage_;
        int resolvedSlot_ = -1;      ///< location in the program that was set up last
        unsigned int componentType_; ///< GL type, always float
        unsigned int byteSize_;
        unsigned int componentCount_;
    };

    /// No vertices.
    VertexBuffer() = default;

    /// Makes room for the vertices in memory; no OpenGL call is made.
    /// @param vertexCount number of vertices, which are zeros until `setField`
    VertexBuffer(std::vector<Field> const &fields, unsigned int vertexCount,
                 PrimitiveType primitiveType);
    VertexBuffer(VertexBuffer const &other);
    VertexBuffer(VertexBuffer &&other) noexcept;
    VertexBuffer &operator=(VertexBuffer other) noexcept;

    /// Deletes the OpenGL objects.
    /// @note glDeleteBuffers, glDeleteVertexArrays
    ~VertexBuffer();

    /// Number of vertices.
    unsigned int vertexCount() const { return vertexCount_; }
    PrimitiveType primitiveType() const { return primitiveType_; } ///< What `drawPrimitives` draws.

    /// Copies one attribute's values into the buffer's memory; `marshallData` sends them on.
    /// @param data floats of the field's type, as bytes
    /// @param ignoreMissingFields whether a name that is no field is ignored rather than a failure
    /// @param stride bytes from one vertex to the next in `data`; 0 when they lie together
    /// @param count number of vertices, at most `vertexCount()`; 0 for all of them
    /// @throws InternalException for a missing field
    void setField(std::string const &name, unsigned char const *data, bool ignoreMissingFields,
                  unsigned int stride, std::size_t count);

    /// As above, by the field's place.
    /// @param index position of the field in the layout, which must exist
    void setField(unsigned int index, unsigned char const *data, unsigned int stride,
                  std::size_t count);

    /// Makes the OpenGL objects anew and looks up where the program takes each field.
    /// @param programID GL name of a linked program
    /// @throws InternalException without OpenGL 2.0 and GL_ARB_vertex_array_object, and for a field
    ///         that the program does not use
    /// @note glGenVertexArrays, glGenBuffers, glGetAttribLocation
    void setupWithProgram(unsigned int programID);

    /// The same for a program of the library's.
    /// @throws InternalException also for null
    void setupWithProgram(Program *program);

    /// Sends the first `count` vertices, at most `vertexCount()`, to the OpenGL objects. The array
    /// buffer binding is left changed.
    /// @throws InternalException before `setupWithProgram`
    /// @note glBindVertexArray, glBindBuffer, glBufferData, glVertexAttribPointer,
    ///       glEnableVertexAttribArray
    void marshallData() { marshallData(vertexCount_); }
    void marshallData(std::size_t count); ///< as `marshallData()`

    /// Draws the first `count` vertices with the current program, and leaves no vertex array bound.
    /// @note glBindVertexArray, glDrawArrays
    void drawPrimitives() { drawPrimitives(vertexCount_); }
    void drawPrimitives(std::size_t count); ///< as `drawPrimitives()`

private:
    void setup() { prepareDeviceSideResources(); }
    void useWithProgram(Program *program);
    unsigned int fieldIndex(std::string const &name) const;

    /// Fails for a field that the program does not use.
    static void requireFound(Field const &field);
    void prepareHostSideResources();
    void prepareDeviceSideResources();
    void deleteDeviceSideResources();
    void swap(VertexBuffer &other) noexcept;

    std::vector<Field> fields_;
    unsigned int vertexSize_ = 0; ///< bytes of all fields in one vertex
    unsigned int vertexCount_ = 0;
    unsigned int totalSize_ = 0; ///< bytes of all vertices; has its place in the binary interface
    PrimitiveType primitiveType_ = PRIMITIVETYPE_POINTS;
    std::vector<unsigned int> attributeBuffers_; ///< GL buffer names, one per field once prepared
    unsigned int vertexBuffer_ = 0;              ///< GL vertex array name, 0 until prepared
    std::vector<std::vector<unsigned char>> hostData_; ///< one array per field
};

} // namespace ORU::OGL
