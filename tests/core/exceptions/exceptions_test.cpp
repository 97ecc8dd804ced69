// The exceptions across the border of the library, their copies, and the texts of the checks.
#include "tests/support/countinghooks.h"
#include "tests/support/failure.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/math/region_2d/boundingrect.h"
#include "oru/core/utility/composetext.h"
#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ocl/exceptionocl.h"
#include "oru/oru_ogl/exceptionogl.h"

#include <gtest/gtest.h>

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
    auto const check = [](std::string const &text, int line, auto const &call) {
        EXPECT_THROW(call(), InternalException);
        oru_test::Failure const failure = oru_test::FailureOf(call);
        EXPECT_EQ(failure.text, text);
        EXPECT_EQ(failure.file, "tests/core/exceptions/exceptions_test.cpp");
        EXPECT_EQ(failure.line, line);
    };
    // clang-format off
    check("table_ != NULL", __LINE__, [&] { ORU_ASSERT(table_ != NULL); });
    check("std::is_same<int, char>::value", __LINE__, [] { ORU_ASSERT(std::is_same<int, char>::value); });
    check("bFound", __LINE__, [&] { ORU_ASSERT_TEXT("bFound", table_ != NULL); });
    check("Enforce table_ != NULL", __LINE__, [&] { ORU_ENFORCE(table_ != NULL); });
    check("Enforce bFound", __LINE__, [&] { ORU_ENFORCE_TEXT("bFound", std::is_same<int, char>::value); });
    check("long(failed)", __LINE__, [&] { ORU_ASSERT_SUCCEEDED(long(failed)); });
    check("Not implemented.", __LINE__, [] { ORU_THROW_INTERNAL("Not implemented."); });
    check("Mode 4711", __LINE__, [] { ORU_THROW_INTERNAL(ORU::ComposeText("Mode ", 4711)); });
    // clang-format on

    int evaluations = 0;
    ORU_ASSERT(++evaluations == 1);
    ORU_ENFORCE(++evaluations == 2);
    ORU_ASSERT_SUCCEEDED(++evaluations);
    EXPECT_EQ(evaluations, 3) << "a check evaluates its expression once";
}

// The handler and the exception's class lie in programs with run-times of their own.
TEST(Exceptions, AreCaughtOutsideTheLibrary) {
    auto const call = [] { ORU::BoundingRect().outset(ambra::lumo::TVec2<float>(-1, 0)); };
    EXPECT_THROW(call(), InternalException);
    EXPECT_THROW(call(), std::exception);
    EXPECT_EQ(oru_test::FailureOf(call).file, "oru/core/math/region_2d/boundingregionbase.cpp");
}

TEST(Exceptions, WriteThemselves) {
    std::pair<std::string, std::string> const texts[] = {
        {Written(ExceptionBase()), "ORU exception"},
        {Written(ExceptionBase("mine")), "mine"},
        {Written(LogicalException()), "ORU logical exception Undefined:0 (Undefined)"},
        {Written(LogicalException(nullptr, 5, nullptr)),
         "ORU logical exception Undefined:5 (Undefined)"},
        {Written(InternalException()), "ORU Internal exception Undefined:0 (Undefined)"},
        {Written(InternalException("f.cpp", 12, "m")), "ORU Internal exception f.cpp:12 (m)"},
        {Written(ExceptionOGL("f.cpp", 12, "m", 1)), "ORU logical exception f.cpp:12 (m)"}};
    for (auto const &[written, expected] : texts)
        EXPECT_EQ(written, expected);
}

/// The error number of the classes that have one.
unsigned Number(ExceptionBase const &e) {
    if (auto const *gl = dynamic_cast<ExceptionOGL const *>(&e))
        return gl->errorNumber();
    auto const *cl = dynamic_cast<ExceptionOCL const *>(&e);
    return cl ? cl->errorNumber() : 0;
}

template<class E>
void ExpectCopies(E const &original, E assigned) {
    oru_test::CountingHooks hooks;
    {
        ORU::ScopedPtr<ExceptionBase> const clone(original.clone());
        EXPECT_EQ(hooks.outstanding().at(clone.get()).size, sizeof original);
        assigned = original;
        E const moved(E(std::move(assigned)));
        ExceptionBase const *const copies[] = {clone.get(), &moved};
        for (ExceptionBase const *copy : copies) {
            EXPECT_EQ(typeid(*copy), typeid(original));
            EXPECT_STREQ(copy->what(), original.what());
            EXPECT_EQ(Written(*copy), Written(original));
            EXPECT_EQ(Number(*copy), Number(original));
        }
    }
    EXPECT_EQ(hooks.allocations(), 1);
    EXPECT_TRUE(hooks.outstanding().empty());
}

TEST(Exceptions, AreCopiedWholeAndFreedThroughTheHooks) {
    ExpectCopies(ExceptionBase("one"), ExceptionBase());
    ExpectCopies(LogicalException("f.cpp", 12, "message"), LogicalException());
    ExpectCopies(InternalException("f.cpp", 12, "message"), InternalException());
    ExpectCopies(ExceptionOGL("f.cpp", 12, "message", 0x0506), ExceptionOGL("o", 1, "other", 1));
    ExpectCopies(ExceptionOCL("f.cpp", 12, "message", 0xFFFFFFDAu), ExceptionOCL("o", 1, "x", 1));
}

} // namespace
