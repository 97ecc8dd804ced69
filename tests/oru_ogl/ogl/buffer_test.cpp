// Buffer objects: contents, targets, mapping, and what each operation refuses.
#include "tests/support/objecttest.h"
#include "tests/support/translations.h"

#include "oru/oru_ogl/ogl/bufferogl.h"

#include <algorithm>
#include <numeric>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

struct Kind {
    Buffer::Type type;
    GLenum target;
    GLenum binding;
    void (*bindDefault)();
    void (Buffer::*convert)();
};

#define ORU_KIND(gl, Name)                                                                         \
    {                                                                                              \
        Buffer::TYPE_##gl, GL_##gl, GL_##gl##_BINDING, &Buffer::BindDefault##Name##Buffer,         \
            &Buffer::convertTo##Name##Buffer                                                       \
    }
Kind const kKinds[] = {ORU_KIND(PIXEL_UNPACK_BUFFER, Unpack), ORU_KIND(PIXEL_PACK_BUFFER, Pack),
                       ORU_KIND(ARRAY_BUFFER, Array), ORU_KIND(ELEMENT_ARRAY_BUFFER, ElementArray)};
#undef ORU_KIND

} // namespace

class BufferTest : public ObjectTest {};

// Every type: a constructor that leaves the binding alone, the way to all others, and the contents
// written and read on each.
TEST_F(BufferTest, KeepsItsContentsOnEveryTarget) {
    std::vector<unsigned char> bytes(1000), read(1000);
    std::iota(bytes.begin(), bytes.end(), static_cast<unsigned char>(7));
    for (Kind const &from : kKinds) {
        Buffer occupant(4, from.type, Buffer::USAGE_STATIC_DRAW, nullptr);
        occupant.bind();
        Buffer buffer(1000, from.type, Buffer::USAGE_DYNAMIC_COPY, bytes.data());
        EXPECT_TRUE(occupant.isBound());
        for (Kind const &to : kKinds) {
            SCOPED_TRACE(testing::Message() << from.target << " to " << to.target);
            buffer.bind();
            EXPECT_NE("", MessageOf([&] { (buffer.*to.convert)(); })) << "bound";
            from.bindDefault();
            EXPECT_FALSE(buffer.isBound());
            (buffer.*to.convert)();
            EXPECT_EQ(to.target, buffer.target());
            buffer.bind();
            EXPECT_EQ(static_cast<GLint>(buffer.objectID()), Get(to.binding));
            std::reverse(&bytes[500], &bytes[503]);
            buffer.subData(500, 3, &bytes[500]);
            auto *const mapped = static_cast<unsigned char *>(buffer.map(GL_READ_WRITE));
            mapped[999] = ++bytes[999];
            buffer.unmap();
            buffer.getSubData(0, 10, read.data());
            buffer.getSubData(10, 990, read.data() + 10);
            EXPECT_EQ(bytes, read);
            to.bindDefault();
            (buffer.*from.convert)();
        }
    }
}

TEST_F(BufferTest, RefusesInOrder) {
    EXPECT_FAILURE("Range error: nSize > 0",
                   Buffer(0, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr));
    Buffer buffer(8, Buffer::TYPE_PIXEL_PACK_BUFFER, Buffer::USAGE_STREAM_READ, nullptr);
    char data[8] = {};
    auto const both = [&](std::string const &text, std::int64_t offset, char *bytes) {
        EXPECT_FAILURE("Buffer::subData " + text, buffer.subData(offset, 8, bytes));
        EXPECT_FAILURE("Buffer::getSubData " + text, buffer.getSubData(offset, 8, bytes));
    };
    buffer.bind();
    EXPECT_FAILURE("Buffer must be mapped before umapping it (this will cause a GL error)",
                   buffer.unmap());
    both("pointer to data must not be NULL", -1, nullptr);
    both("offset must not be negative", -1, data);
    buffer.map(GL_READ_ONLY);
    EXPECT_FAILURE("Buffer is already mapped (this will cause a GL error)",
                   buffer.map(GL_READ_ONLY));
    both("buffer cannot be mapped", -1, nullptr);

    /// The system has lost the contents meanwhile.
    struct Losing : OpenGLForwarder {
        GLboolean cgmUnmapBuffer(char const *, unsigned int, GLenum) override { return GL_FALSE; }
    };
    EXPECT_FAILURE("Cannot unmap buffer", InterceptorScope<Losing> const losing; buffer.unmap());
    EXPECT_TRUE(buffer.isMapped());
    buffer.unmap();
    Buffer::BindDefaultPackBuffer();
}

TEST_F(BufferTest, TranslatesItsEnumerations) {
    ExpectTranslation("Buffer type", Buffer::Type2GL, Buffer::GL2Type, 4, GL_ELEMENT_ARRAY_BUFFER);
    ExpectTranslation("Buffer type", Buffer::Usage2GL, Buffer::GL2Usage, 9, GL_DYNAMIC_COPY);
    // A usage that is none fails when the name is there: it goes, and the binding stays.
    Buffer bound(16, Buffer::TYPE_PIXEL_UNPACK_BUFFER, Buffer::USAGE_STREAM_DRAW, nullptr);
    bound.bind();
    EXPECT_NE("", MessageOf([] {
                  Buffer(4, Buffer::TYPE_PIXEL_UNPACK_BUFFER, static_cast<Buffer::Usage>(9),
                         nullptr);
              }));
    EXPECT_TRUE(bound.isBound());
    Buffer::BindDefaultUnpackBuffer();
}
