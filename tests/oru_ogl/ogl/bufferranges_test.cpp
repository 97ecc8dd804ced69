// Parts of buffers: copied, mapped for a scope, bound to numbered points; and what is refused.
#include "tests/support/objecttest.h"

#include "oru/oru_ogl/ogl/bufferogl.h"
#include "oru/oru_ogl/ogl/mappedrange.h"

#include <algorithm>
#include <numeric>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

using Bytes = std::vector<unsigned char>;

Bytes Count(std::size_t size, int first) {
    Bytes bytes(size);
    std::iota(bytes.begin(), bytes.end(), static_cast<unsigned char>(first));
    return bytes;
}

Buffer Make(Bytes const &bytes) {
    return Buffer(static_cast<std::int64_t>(bytes.size()), Buffer::TYPE_ARRAY_BUFFER,
                  Buffer::USAGE_DYNAMIC_COPY, bytes.data());
}

Bytes ContentOf(Buffer &buffer) {
    Bytes bytes(buffer.size());
    buffer.bind();
    buffer.getSubData(0, static_cast<std::int64_t>(bytes.size()), bytes.data());
    Buffer::BindDefaultArrayBuffer();
    return bytes;
}

GLint GetIndexed(GLenum name, GLuint index) {
    GLint value = -1;
    ORU_GL(GetIntegeri_v, name, index, &value);
    return value;
}

} // namespace

class BufferRangesTest : public ObjectTest {};

// Every range that fits moves by every way, and nothing beside it; no binding changes.
TEST_F(BufferRangesTest, MoveByEveryWay) {
    int const size = 6;
    Buffer occupant = Make(Count(1, 0));
    for (GLenum const target : {GLenum{GL_COPY_READ_BUFFER}, GLenum{GL_COPY_WRITE_BUFFER}})
        ORU_GL(BindBuffer, target, occupant.objectID());
    auto const write = [&](Buffer &buffer, int to, int count, Bytes const &from, GLenum access) {
        occupant.bind();
        MappedRange range(buffer, to, count, access | MappedRange::ACCESS_WRITE);
        EXPECT_EQ(count, range.size());
        EXPECT_TRUE(buffer.isMapped());
        std::copy_n(from.begin(), count, static_cast<unsigned char *>(range.data()));
        if (access & MappedRange::ACCESS_FLUSH_EXPLICIT)
            range.flush(0, count);
        if (access & MappedRange::ACCESS_INVALIDATE_RANGE) // else the scope's end
            range.unmap();
    };
    for (int from = 0; from < size; ++from) {
        for (int to = 0; to < size; ++to) {
            for (int count = 1; count <= size - std::max(from, to); ++count) {
                Bytes const source = Count(size, 1), rest = Count(size, 100);
                Bytes expected = rest;
                std::copy_n(source.begin() + from, count, expected.begin() + to);
                Buffer first = Make(source), second = Make(rest);
                second.copySubData(first, from, to, count);
                EXPECT_EQ(expected, ContentOf(second));
                Bytes const piece(source.begin() + from, source.end());
                for (GLenum const access : {0u, 0u | MappedRange::ACCESS_INVALIDATE_RANGE,
                                            0u | MappedRange::ACCESS_FLUSH_EXPLICIT,
                                            0u | MappedRange::ACCESS_INVALIDATE_RANGE |
                                                MappedRange::ACCESS_UNSYNCHRONIZED}) {
                    Buffer third = Make(rest);
                    write(third, to, count, piece, access);
                    EXPECT_TRUE(occupant.isBound());
                    EXPECT_EQ(expected, ContentOf(third));
                }
                MappedRange const read(second, to, count, MappedRange::ACCESS_READ);
                EXPECT_TRUE(std::equal(piece.begin(), piece.begin() + count,
                                       static_cast<unsigned char const *>(read.data())));
            }
        }
    }
    EXPECT_EQ(static_cast<GLint>(occupant.objectID()), Get(GL_COPY_READ_BUFFER));
    EXPECT_EQ(static_cast<GLint>(occupant.objectID()), Get(GL_COPY_WRITE_BUFFER));
    Buffer::BindDefaultArrayBuffer();
}

TEST_F(BufferRangesTest, BindToNumberedPoints) {
    Buffer buffer = Make(Bytes(1024));
    struct Target {
        GLenum target, binding, start, size;
    };
    for (auto const &[target, binding, start, size] :
         {Target{GL_UNIFORM_BUFFER, GL_UNIFORM_BUFFER_BINDING, GL_UNIFORM_BUFFER_START,
                 GL_UNIFORM_BUFFER_SIZE},
          Target{GL_TRANSFORM_FEEDBACK_BUFFER, GL_TRANSFORM_FEEDBACK_BUFFER_BINDING,
                 GL_TRANSFORM_FEEDBACK_BUFFER_START, GL_TRANSFORM_FEEDBACK_BUFFER_SIZE}}) {
        buffer.bindRange(target, 2, 512, 256);
        buffer.bindBase(target, 1);
        EXPECT_EQ(static_cast<GLint>(buffer.objectID()), GetIndexed(binding, 1));
        EXPECT_EQ(static_cast<GLint>(buffer.objectID()), GetIndexed(binding, 2));
        EXPECT_EQ(512, GetIndexed(start, 2));
        EXPECT_EQ(256, GetIndexed(size, 2));
        for (GLuint const index : {1u, 2u}) {
            Buffer::BindDefaultBase(target, index);
            EXPECT_EQ(0, GetIndexed(binding, index));
        }
    }
}

TEST_F(BufferRangesTest, RefuseWhatLeavesTheBuffer) {
    Buffer buffer = Make(Count(8, 0)), other = Make(Count(8, 0));
    char const *const leaves = " bytes from ";
    struct Row {
        std::int64_t offset, size;
        std::string text;
    };
    for (Row const &row :
         {Row{-1, 4, "offset must not be negative"}, Row{0, 0, "size must be at least 1"},
          Row{3, 6, std::string("the range of 6") + leaves + "3 on leaves the buffer, which has 8"},
          Row{INT64_MAX, 8,
              std::string("the range of 8") + leaves +
                  "9223372036854775807 on leaves the buffer, which has 8"}}) {
        EXPECT_FAILURE("Buffer::copySubData " + row.text,
                       buffer.copySubData(other, row.offset, 0, row.size));
        EXPECT_FAILURE("Buffer::copySubData " + row.text,
                       buffer.copySubData(other, 0, row.offset, row.size));
        EXPECT_FAILURE("Buffer::bindRange " + row.text,
                       buffer.bindRange(GL_UNIFORM_BUFFER, 0, row.offset, row.size));
        EXPECT_FAILURE("Buffer::mapRange " + row.text,
                       MappedRange(buffer, row.offset, row.size, MappedRange::ACCESS_READ));
    }
    EXPECT_FAILURE("GL_INVALID_VALUE", buffer.copySubData(buffer, 0, 1, 4)) << "they meet";
    EXPECT_FAILURE("GL_INVALID_OPERATION", MappedRange(buffer, 0, 8, 0)) << "neither way";
    EXPECT_FALSE(buffer.isMapped());
    EXPECT_FALSE(buffer.isBound());
    {
        MappedRange range(buffer, 0, 8, MappedRange::ACCESS_WRITE);
        EXPECT_FAILURE("Buffer is already mapped (this will cause a GL error)",
                       MappedRange(buffer, 0, 8, MappedRange::ACCESS_READ));
        EXPECT_FAILURE("Buffer::copySubData buffer cannot be mapped",
                       other.copySubData(buffer, 0, 0, 8));
        EXPECT_FAILURE("Buffer::copySubData buffer cannot be mapped",
                       buffer.copySubData(other, 0, 0, 8));
        EXPECT_FAILURE("Buffer::orphan buffer cannot be mapped", buffer.orphan());
        {
            MappedRange first(other, 0, 8,
                              MappedRange::ACCESS_WRITE | MappedRange::ACCESS_FLUSH_EXPLICIT);
            Buffer third(8, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
            MappedRange const second(third, 0, 8, MappedRange::ACCESS_WRITE);
            EXPECT_FAILURE("", first.flush(0, 8)) << "its own buffer, not what was bound last";
        }
        range.unmap();
        EXPECT_FAILURE("The MappedRange is no longer mapped: unmap() was called", range.unmap());
        EXPECT_FAILURE("The MappedRange is no longer mapped: unmap() was called",
                       range.flush(0, 8));
    }
    EXPECT_FAILURE("Buffer::flushMappedRange: the buffer is not mapped",
                   buffer.flushMappedRange(0, 8));
    buffer.bind();
    buffer.orphan();
    GLint size = 0;
    ORU_GL(GetBufferParameteriv, GL_ARRAY_BUFFER, GL_BUFFER_SIZE, &size);
    EXPECT_EQ(8, size);
    Buffer::BindDefaultArrayBuffer();
}
