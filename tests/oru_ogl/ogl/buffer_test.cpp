// Buffer objects: contents, targets, mapping, and what each operation refuses.
#include "objecttest.h"

#include "oru/oru_ogl/ogl/bufferogl.h"

#include <cstring>
#include <numeric>

using namespace ORU::OGL;
using oru_test::MessageOf;
using oru_test::NameLedger;
using oru_test::Pushed;

namespace {

std::vector<unsigned char> Counting(std::size_t size) {
    std::vector<unsigned char> bytes(size);
    std::iota(bytes.begin(), bytes.end(), static_cast<unsigned char>(7));
    return bytes;
}

struct Kind {
    Buffer::Type type;
    unsigned int target;
    unsigned int binding;
    void (*bindDefault)();
    void (Buffer::*convert)();
    bool (Buffer::*is)() const;
    char const *conversion;
};

Kind const kKinds[] = {
    {Buffer::TYPE_PIXEL_UNPACK_BUFFER, 0x88EC, 0x88EF, &Buffer::BindDefaultUnpackBuffer,
     &Buffer::convertToUnpackBuffer, &Buffer::isUnpackBuffer, "convertToUnpackBuffer"},
    {Buffer::TYPE_PIXEL_PACK_BUFFER, 0x88EB, 0x88ED, &Buffer::BindDefaultPackBuffer,
     &Buffer::convertToPackBuffer, &Buffer::isPackBuffer, "convertToPackBuffer"},
    {Buffer::TYPE_ARRAY_BUFFER, 0x8892, 0x8894, &Buffer::BindDefaultArrayBuffer,
     &Buffer::convertToArrayBuffer, &Buffer::isArrayBuffer, "convertToArrayBuffer"},
    {Buffer::TYPE_ELEMENT_ARRAY_BUFFER, 0x8893, 0x8895, &Buffer::BindDefaultElementArrayBuffer,
     &Buffer::convertToElementArrayBuffer, &Buffer::isElementArrayBuffer,
     "convertToElementArrayBuffer"},
};

GLint Bound(Kind const &kind) {
    GLint name = -1;
    ::glGetIntegerv(kind.binding, &name);
    return name;
}

} // namespace

class BufferTest : public oru_test::ObjectTest {};

// Every type: its target, a constructor that leaves the binding alone, and the way to all others.
TEST_F(BufferTest, UsesAndChangesItsTarget) {
    for (Kind const &from : kKinds) {
        Buffer occupant(4, from.type, Buffer::USAGE_STATIC_DRAW, nullptr);
        occupant.bind();
        Buffer buffer(16, from.type, Buffer::USAGE_STREAM_DRAW, nullptr);
        EXPECT_EQ(occupant.objectID(), static_cast<unsigned int>(Bound(from)));
        EXPECT_EQ(from.target, buffer.target());
        EXPECT_EQ(from.target, Buffer::Type2GL(from.type));
        EXPECT_EQ(from.type, Buffer::GL2Type(from.target));
        for (Kind const &to : kKinds) {
            EXPECT_EQ(to.type == from.type, (buffer.*to.is)());
            buffer.bind();
            EXPECT_TRUE(buffer.isBound());
            EXPECT_EQ(std::string("Buffer::") + to.conversion +
                          " cannot convert buffer target while bound",
                      MessageOf([&] { (buffer.*to.convert)(); }));
            EXPECT_EQ(from.target, buffer.target());
            from.bindDefault();
            EXPECT_EQ(0, Bound(from));
            (buffer.*to.convert)();
            EXPECT_TRUE((buffer.*to.is)());
            buffer.bind();
            EXPECT_EQ(buffer.objectID(), static_cast<unsigned int>(Bound(to)));
            to.bindDefault();
            (buffer.*from.convert)();
        }
    }
    Buffer odd(16, static_cast<Buffer::Type>(4), Buffer::USAGE_STREAM_DRAW, nullptr);
    EXPECT_TRUE(odd.isUnpackBuffer());
}

TEST_F(BufferTest, KeepsWhatIsWrittenToIt) {
    auto bytes = Counting(1000);
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
    std::vector<unsigned char> read(1000);
    buffer.getSubData(0, 1000, read.data());
    EXPECT_EQ(bytes, read);

    auto *const mapped = static_cast<unsigned char *>(buffer.map(GL_READ_WRITE));
    ASSERT_NE(nullptr, mapped);
    EXPECT_TRUE(buffer.isMapped());
    EXPECT_EQ(0, std::memcmp(mapped, bytes.data(), bytes.size()));
    mapped[999] = bytes[999] = 1;
    buffer.unmap();
    EXPECT_FALSE(buffer.isMapped());
    buffer.getSubData(990, 10, read.data() + 990);
    EXPECT_EQ(bytes, read);
    EXPECT_EQ("GL_INVALID_VALUE", MessageOf([&] { buffer.subData(998, 3, piece); }));
    Buffer::BindDefaultArrayBuffer();
}

TEST_F(BufferTest, RefusesInOrder) {
    EXPECT_EQ("Range error: nSize > 0", MessageOf([] {
                  Buffer(0, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr);
              }));
    Buffer buffer(8, Buffer::TYPE_PIXEL_PACK_BUFFER, Buffer::USAGE_STREAM_READ, nullptr);
    char data[8] = {};
    buffer.bind();
    EXPECT_EQ("Buffer must be mapped before umapping it (this will cause a GL error)",
              MessageOf([&] { buffer.unmap(); }));
    EXPECT_EQ("Buffer::subData pointer to data must not be NULL",
              MessageOf([&] { buffer.subData(-1, 8, nullptr); }));
    EXPECT_EQ("Buffer::subData offset must not be negative",
              MessageOf([&] { buffer.subData(-1, 8, data); }));
    EXPECT_EQ("Buffer::getSubData pointer to data must not be NULL",
              MessageOf([&] { buffer.getSubData(-1, 8, nullptr); }));
    EXPECT_EQ("Buffer::getSubData offset must not be negative",
              MessageOf([&] { buffer.getSubData(-1, 8, data); }));
    buffer.map(GL_READ_ONLY);
    EXPECT_EQ("Buffer is already mapped (this will cause a GL error)",
              MessageOf([&] { buffer.map(GL_READ_ONLY); }));
    EXPECT_EQ("Buffer::subData buffer cannot be mapped",
              MessageOf([&] { buffer.subData(-1, 8, nullptr); }));
    EXPECT_EQ("Buffer::getSubData buffer cannot be mapped",
              MessageOf([&] { buffer.getSubData(-1, 8, nullptr); }));
    // GL has unmapped it behind the object's back: its own unmap fails and it stays mapped.
    ORU_GL(UnmapBuffer, GL_PIXEL_PACK_BUFFER);
    EXPECT_EQ("GL_INVALID_OPERATION", MessageOf([&] { buffer.unmap(); }));
    EXPECT_TRUE(buffer.isMapped());
    Buffer::BindDefaultPackBuffer();
}

TEST_F(BufferTest, TranslatesEveryUsage) {
    for (unsigned int i = 0; i < 9; ++i) {
        auto const usage = static_cast<Buffer::Usage>(i);
        EXPECT_EQ(usage, Buffer::GL2Usage(Buffer::Usage2GL(usage)));
    }
    EXPECT_EQ(0x88E0u, Buffer::Usage2GL(Buffer::USAGE_STREAM_DRAW));
    EXPECT_EQ(0x88EAu, Buffer::Usage2GL(Buffer::USAGE_DYNAMIC_COPY));
    std::string const failure = "!\"Buffer type enums are not all properly translated.\"";
    EXPECT_EQ(failure, MessageOf([] { Buffer::GL2Usage(0x88E3); }));
    EXPECT_EQ(failure, MessageOf([] { Buffer::Usage2GL(static_cast<Buffer::Usage>(9)); }));
    EXPECT_EQ(failure, MessageOf([] { Buffer::GL2Type(GL_TEXTURE_BUFFER); }));
    EXPECT_EQ(failure, MessageOf([] { Buffer::Type2GL(static_cast<Buffer::Type>(4)); }));
}

// A constructor that fails after it has made its name leaves neither the name nor a binding.
TEST_F(BufferTest, FailedConstructionLeavesNothing) {
    Buffer occupant(4, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr);
    occupant.bind();
    Pushed<NameLedger> ledger;
    EXPECT_NE("", MessageOf([] {
                  Buffer(4, Buffer::TYPE_ARRAY_BUFFER, static_cast<Buffer::Usage>(9), nullptr);
              }));
    EXPECT_EQ(1, ledger->made());
    EXPECT_EQ("", ledger->leaks());
    EXPECT_TRUE(occupant.isBound());
    Buffer::BindDefaultArrayBuffer();
}

TEST_F(BufferTest, NeedsItsExtensionsAndAContext) {
    EXPECT_TRUE(Buffer::IsSupported());
    ReleaseOGLContext();
    EXPECT_FALSE(Buffer::IsSupported());
    EXPECT_EQ("ExtensionManager::Instance()->isSupported(GL_ARB_PIXEL_BUFFER_OBJECT)",
              MessageOf([] {
                  Buffer(4, Buffer::TYPE_ARRAY_BUFFER, Buffer::USAGE_STATIC_DRAW, nullptr);
              }));
}
