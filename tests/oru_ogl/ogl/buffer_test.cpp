// Buffer objects: contents, targets, mapping, and what each operation refuses.
#include "tests/support/objecttest.h"

#include "oru/oru_ogl/ogl/bufferogl.h"

#include <cstring>
#include <numeric>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

struct Kind {
    Buffer::Type type;
    unsigned int target;
    unsigned int binding;
    void (*bindDefault)();
    void (Buffer::*convert)();
    bool (Buffer::*is)() const;
    std::string conversion;
};

#define ORU_KIND(Type, target, binding, Name)                                                      \
    {                                                                                              \
        Buffer::TYPE_##Type##_BUFFER, target, binding, &Buffer::BindDefault##Name##Buffer,         \
            &Buffer::convertTo##Name##Buffer, &Buffer::is##Name##Buffer,                           \
            "Buffer::convertTo" #Name "Buffer"                                                     \
    }
Kind const kKinds[] = {
    ORU_KIND(PIXEL_UNPACK, 0x88EC, 0x88EF, Unpack), ORU_KIND(PIXEL_PACK, 0x88EB, 0x88ED, Pack),
    ORU_KIND(ARRAY, 0x8892, 0x8894, Array), ORU_KIND(ELEMENT_ARRAY, 0x8893, 0x8895, ElementArray)};
#undef ORU_KIND

} // namespace

class BufferTest : public ObjectTest {};

// Every type: its target, a constructor that leaves the binding alone, and the way to all others.
TEST_F(BufferTest, UsesAndChangesItsTarget) {
    for (Kind const &from : kKinds) {
        Buffer occupant(4, from.type, Buffer::USAGE_STATIC_DRAW, nullptr);
        occupant.bind();
        Buffer buffer(16, from.type, Buffer::USAGE_STREAM_DRAW, nullptr);
        EXPECT_EQ(static_cast<GLint>(occupant.objectID()), Get(from.binding));
        EXPECT_EQ(from.target, buffer.target());
        EXPECT_EQ(from.target, Buffer::Type2GL(from.type));
        EXPECT_EQ(from.type, Buffer::GL2Type(from.target));
        for (Kind const &to : kKinds) {
            EXPECT_EQ(to.type == from.type, (buffer.*to.is)());
            buffer.bind();
            EXPECT_FAILURE(to.conversion + " cannot convert buffer target while bound",
                           (buffer.*to.convert)());
            EXPECT_EQ(from.target, buffer.target());
            from.bindDefault();
            EXPECT_EQ(0, Get(from.binding));
            (buffer.*to.convert)();
            EXPECT_TRUE((buffer.*to.is)());
            buffer.bind();
            EXPECT_EQ(static_cast<GLint>(buffer.objectID()), Get(to.binding));
            to.bindDefault();
            (buffer.*from.convert)();
        }
    }
    Buffer odd(16, static_cast<Buffer::Type>(4), Buffer::USAGE_STREAM_DRAW, nullptr);
    EXPECT_TRUE(odd.isUnpackBuffer());
}

TEST_F(BufferTest, KeepsWhatIsWrittenToIt) {
    std::vector<unsigned char> bytes(1000), read(1000);
    std::iota(bytes.begin(), bytes.end(), static_cast<unsigned char>(7));
    Buffer buffer(1000, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_DYNAMIC_COPY, bytes.data());
    EXPECT_EQ(1000u, buffer.size());
    EXPECT_EQ(Buffer::USAGE_DYNAMIC_COPY, buffer.usagePolicy());
    buffer.bind();
    GLint usage = 0;
    ORU_GL(GetBufferParameteriv, GL_ARRAY_BUFFER, GL_BUFFER_USAGE, &usage);
    EXPECT_EQ(GL_DYNAMIC_COPY, usage);

    unsigned char const piece[] = {200, 201, 202};
    buffer.subData(500, 3, piece);
    std::memcpy(&bytes[500], piece, sizeof piece);
    buffer.getSubData(0, 1000, read.data());
    EXPECT_EQ(bytes, read);

    auto *const mapped = static_cast<unsigned char *>(buffer.map(GL_READ_WRITE));
    ASSERT_NE(nullptr, mapped);
    EXPECT_TRUE(buffer.isMapped());
    mapped[999] = bytes[999] = 1;
    buffer.unmap();
    EXPECT_FALSE(buffer.isMapped());
    buffer.getSubData(990, 10, read.data() + 990);
    EXPECT_EQ(bytes, read);
    EXPECT_FAILURE("GL_INVALID_VALUE", buffer.subData(998, 3, piece));
    Buffer::BindDefaultArrayBuffer();
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
    // GL has unmapped it behind the object's back: its own unmap fails and it stays mapped.
    ORU_GL(UnmapBuffer, GL_PIXEL_PACK_BUFFER);
    EXPECT_FAILURE("GL_INVALID_OPERATION", buffer.unmap());
    EXPECT_TRUE(buffer.isMapped());
    Buffer::BindDefaultPackBuffer();
}

TEST_F(BufferTest, TranslatesEveryUsage) {
    unsigned int const usages[] = {0x88E0, 0x88E1, 0x88E2, 0x88E4, 0x88E5,
                                   0x88E6, 0x88E8, 0x88E9, 0x88EA};
    for (unsigned int i = 0; i < 9; ++i) {
        EXPECT_EQ(usages[i], Buffer::Usage2GL(static_cast<Buffer::Usage>(i)));
        EXPECT_EQ(i, Buffer::GL2Usage(usages[i]));
    }
    std::string const failure = "!\"Buffer type enums are not all properly translated.\"";
    EXPECT_FAILURE(failure, Buffer::GL2Usage(0x88E3));
    EXPECT_FAILURE(failure, Buffer::Usage2GL(static_cast<Buffer::Usage>(9)));
    EXPECT_FAILURE(failure, Buffer::GL2Type(GL_TEXTURE_BUFFER));
    EXPECT_FAILURE(failure, Buffer::Type2GL(static_cast<Buffer::Type>(4)));
}

// A constructor that fails after it has made its name leaves neither the name nor a binding.
TEST_F(BufferTest, FailedConstructionLeavesNothing) {
    Buffer occupant(4, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr);
    occupant.bind();
    Pushed<NameLedger> ledger;
    EXPECT_FAILURE("!\"Buffer type enums are not all properly translated.\"",
                   Buffer(4, Buffer::TYPE_ARRAY_BUFFER, static_cast<Buffer::Usage>(9), nullptr));
    EXPECT_EQ(1, ledger->made());
    EXPECT_EQ("", ledger->leaks());
    EXPECT_TRUE(occupant.isBound());
    Buffer::BindDefaultArrayBuffer();
}
