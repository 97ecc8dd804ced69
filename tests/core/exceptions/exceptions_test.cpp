// The exceptions across the border of the library, their copies, and the texts of the checks.
#include "../countinghooks.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/math/region_2d/boundingrect.h"
#include "oru/core/utility/composetext.h"
#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ocl/exceptionocl.h"
#include "oru/oru_ogl/exceptionogl.h"

#include <gmock/gmock.h>

#include <functional>
#include <map>
#include <sstream>
#include <typeinfo>

using ORU::ExceptionBase;
using ORU::InternalException;
using ORU::LogicalException;
using ORU::OCL::ExceptionOCL;
using ORU::OGL::ExceptionOGL;

namespace {

std::string Written(ExceptionBase const &e) {
    std::ostringstream stream;
    stream << std::hex << std::showbase << e; // the line stays decimal
    return stream.str();
}

/// The line and the message of the InternalException that `action` throws in this file.
template<class Action>
std::pair<int, std::string> Failure(Action action) {
    try {
        action();
    } catch (InternalException const &e) {
        EXPECT_STREQ(e.file(), "tests/core/exceptions/exceptions_test.cpp");
        return {e.line(), e.message()};
    }
    return {0, "nothing was thrown"};
}

TEST(Checks, ThrowTheirTextAndPosition) {
    void *const table_ = nullptr;
    long const failed = -1;
    auto const check = [](std::string const &text, int line, std::function<void()> const &action) {
        EXPECT_EQ(Failure(action), std::make_pair(line, text));
    };
    // clang-format off
    check("table_ != NULL", __LINE__, [&] { ORU_ASSERT(table_ != NULL); });
    check("std::is_same<int, char>::value", __LINE__, [&] { ORU_ASSERT(std::is_same<int, char>::value); });
    check("!\"Target enums are not all properly translated.\"", __LINE__, [&] { ORU_ASSERT(!"Target enums are not all properly translated."); });
    check("Enforce table_ != NULL", __LINE__, [&] { ORU_ENFORCE(table_ != NULL); });
    check("long(failed)", __LINE__, [&] { ORU_ASSERT_SUCCEEDED(long(failed)); });
    check("Not implemented.", __LINE__, [&] { ORU_THROW_INTERNAL("Not implemented."); });
    check("Mode 4711 of 0.5", __LINE__, [&] { ORU_THROW_INTERNAL(ORU::ComposeText("Mode ", 4711, " of ", 0.5)); });
    // clang-format on

    int evaluations = 0;
    ORU_ASSERT(++evaluations == 1);
    ORU_ENFORCE(++evaluations == 2);
    ORU_ASSERT_SUCCEEDED(++evaluations);
    EXPECT_EQ(evaluations, 3) << "a check evaluates its expression once";
}

/// What the library throws reaches handlers in a program with run-times of its own.
template<class Caught>
void ExpectCaught() {
    try {
        ORU::BoundingRect().outset(ambra::lumo::TVec2<float>(-1, 0));
        FAIL() << "nothing was thrown";
    } catch (Caught const &e) {
        EXPECT_STREQ(e.what(), "ORU Internal exception");
        auto const &full = dynamic_cast<InternalException const &>(e);
        std::ostringstream position;
        position << "oru/core/math/region_2d/boundingregionbase.cpp:" << full.line();
        EXPECT_EQ(Written(full), "ORU Internal exception " + position.str() +
                                     " (vOutset.x >= 0.f && vOutset.y >= 0.f)");
    }
}

TEST(Exceptions, AreCaughtByEveryBaseOutsideTheLibrary) {
    ExpectCaught<InternalException>();
    ExpectCaught<LogicalException>();
    ExpectCaught<ExceptionBase>();
    ExpectCaught<std::exception>();
}

TEST(Exceptions, StandInForMissingTexts) {
    EXPECT_STREQ(ExceptionBase().what(), "ORU exception");
    EXPECT_EQ(Written(ExceptionBase("mine")), "mine");
    EXPECT_EQ(Written(LogicalException()), "ORU logical exception Undefined:0 (Undefined)");
    EXPECT_EQ(Written(LogicalException(nullptr, 5, nullptr)),
              "ORU logical exception Undefined:5 (Undefined)");
    EXPECT_EQ(Written(InternalException()), "ORU Internal exception Undefined:0 (Undefined)");
    EXPECT_EQ(Written(ExceptionOGL("f.cpp", 70, "GL_INVALID_ENUM", 0x0500)),
              "ORU logical exception f.cpp:70 (GL_INVALID_ENUM)");
}

/// The error number of the classes that have one.
unsigned Number(ExceptionBase const &e) {
    if (auto const *gl = dynamic_cast<ExceptionOGL const *>(&e))
        return gl->errorNumber();
    auto const *cl = dynamic_cast<ExceptionOCL const *>(&e);
    return cl ? cl->errorNumber() : 0;
}

/// A copy is the original in class, texts and number.
void ExpectSame(ExceptionBase const &copy, ExceptionBase const &original) {
    EXPECT_EQ(typeid(copy), typeid(original));
    EXPECT_STREQ(copy.what(), original.what());
    EXPECT_EQ(Written(copy), Written(original));
    EXPECT_EQ(Number(copy), Number(original));
}

template<class E>
class CopiedException : public ::testing::Test {
public:
    static E Make() {
        if constexpr (std::is_same_v<E, ExceptionBase>)
            return E("one");
        else if constexpr (std::is_constructible_v<E, char const *, int, char const *>)
            return E("file.cpp", 12, "message");
        else
            return E("file.cpp", 12, "message", 0xFFFFFFDAu);
    }
    static E Other() {
        if constexpr (std::is_constructible_v<E, char const *, int, char const *, unsigned>)
            return E("other.cpp", 1, "other", 0x0502);
        else
            return E();
    }
};

using Classes = ::testing::Types<ExceptionBase, LogicalException, InternalException, ExceptionOGL,
                                 ExceptionOCL>;
TYPED_TEST_SUITE(CopiedException, Classes, );

TYPED_TEST(CopiedException, KeepsEverythingAndIsFreedThroughTheHooks) {
    auto const original = TestFixture::Make();
    oru_test::CountingHooks hooks;
    {
        ORU::ScopedPtr<ExceptionBase> const clone(original.clone());
        ASSERT_EQ(hooks.outstanding().count(clone.get()), 1u);
        auto const &allocation = hooks.outstanding().at(clone.get());
        EXPECT_EQ(allocation.size, sizeof original);
        EXPECT_EQ(allocation.type, ORU::MEMORYTYPE_DEFAULT);
        EXPECT_THAT(allocation.file, ::testing::HasSubstr("exception"));
        ExpectSame(*clone, original);

        TypeParam assigned = TestFixture::Other();
        assigned = original;
        ExpectSame(assigned, original);
        TypeParam const moved(std::move(assigned));
        ExpectSame(moved, original);
    }
    EXPECT_EQ(hooks.allocations(), 1);
    EXPECT_TRUE(hooks.outstanding().empty());
    EXPECT_EQ(hooks.wrongReleases(), 0);
}

} // namespace
