// The exceptions across the border of the library, their copies, and the texts of the checks.
#include "tests/countinghooks.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/math/region_2d/boundingrect.h"
#include "oru/core/utility/composetext.h"
#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ocl/exceptionocl.h"
#include "oru/oru_ogl/exceptionogl.h"

#include <gtest/gtest.h>

#include <functional>
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

TEST(Checks, ThrowTheirTextAndPosition) {
    void *const table_ = nullptr;
    long const failed = -1;
    auto const check = [](std::string const &text, int line, std::function<void()> const &action) {
        try {
            action();
            ADD_FAILURE() << "nothing was thrown";
        } catch (InternalException const &e) {
            EXPECT_EQ(Written(e),
                      "ORU Internal exception tests/core/exceptions/exceptions_test.cpp:" +
                          std::to_string(line) + " (" + text + ")");
        }
    };
    // clang-format off
    check("table_ != NULL", __LINE__, [&] { ORU_ASSERT(table_ != NULL); });
    check("std::is_same<int, char>::value", __LINE__, [&] { ORU_ASSERT(std::is_same<int, char>::value); });
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

// The handler and the exception's class lie in programs with run-times of their own.
TEST(Exceptions, AreCaughtOutsideTheLibrary) {
    auto const fail = [] { ORU::BoundingRect().outset(ambra::lumo::TVec2<float>(-1, 0)); };
    EXPECT_THROW(fail(), LogicalException);
    EXPECT_THROW(fail(), std::exception);
    try {
        fail();
        FAIL() << "nothing was thrown";
    } catch (ExceptionBase const &e) {
        auto const &full = dynamic_cast<InternalException const &>(e);
        std::string const position =
            "oru/core/math/region_2d/boundingregionbase.cpp:" + std::to_string(full.line());
        EXPECT_EQ(Written(e),
                  "ORU Internal exception " + position + " (vOutset.x >= 0.f && vOutset.y >= 0.f)");
    }
}

TEST(Exceptions, StandInForMissingTexts) {
    EXPECT_STREQ(ExceptionBase().what(), "ORU exception");
    EXPECT_EQ(Written(ExceptionBase("mine")), "mine");
    EXPECT_EQ(Written(LogicalException()), "ORU logical exception Undefined:0 (Undefined)");
    EXPECT_EQ(Written(LogicalException(nullptr, 5, nullptr)),
              "ORU logical exception Undefined:5 (Undefined)");
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
void ExpectCopies(E const &original, E assigned) {
    oru_test::CountingHooks hooks;
    {
        ORU::ScopedPtr<ExceptionBase> const clone(original.clone());
        auto const &allocation = hooks.outstanding().at(clone.get());
        EXPECT_EQ(allocation.size, sizeof original);
        EXPECT_EQ(allocation.type, ORU::MEMORYTYPE_DEFAULT);
        ExpectSame(*clone, original);
        assigned = original;
        ExpectSame(assigned, original);
        ExpectSame(E(std::move(assigned)), original);
    }
    EXPECT_EQ(hooks.allocations(), 1);
    EXPECT_TRUE(hooks.outstanding().empty());
    EXPECT_EQ(hooks.wrongReleases(), 0);
}

TEST(Exceptions, AreCopiedWholeAndFreedThroughTheHooks) {
    ExpectCopies(ExceptionBase("one"), ExceptionBase());
    ExpectCopies(LogicalException("f.cpp", 12, "message"), LogicalException());
    ExpectCopies(InternalException("f.cpp", 12, "message"), InternalException());
    ExpectCopies(ExceptionOGL("f.cpp", 12, "message", 0x0506), ExceptionOGL("o", 1, "other", 1));
    ExpectCopies(ExceptionOCL("f.cpp", 12, "message", 0xFFFFFFDAu), ExceptionOCL("o", 1, "x", 1));
}

} // namespace
