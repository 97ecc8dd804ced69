// The exceptions across the border of the library, their copies, and the texts of the checks.
#include "tests/support/countinghooks.h"
#include "tests/support/failure.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/math/region_2d/boundingrect.h"
#include "oru/core/utility/composetext.h"
#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ocl/exceptionocl.h"
#include "oru/oru_ogl/exceptionogl.h"

#include <sstream>
#include <typeinfo>

using namespace ORU;

namespace {

std::string Written(ExceptionBase const &e) {
    std::ostringstream stream;
    stream << std::hex << std::showbase << e; // the line stays decimal
    return stream.str();
}

TEST(Checks, ThrowTheirTextAndPosition) {
    long const failed = -1;
    EXPECT_FAILURE("std::is_same<int, char>::value", ORU_ASSERT(std::is_same<int, char>::value));
    EXPECT_FAILURE("Enforce failed > 0", ORU_ENFORCE(failed > 0));
    EXPECT_FAILURE("Enforce bFound", ORU_ENFORCE_TEXT("bFound", failed > 0));
    EXPECT_FAILURE("long(failed)", ORU_ASSERT_SUCCEEDED(long(failed)));
    EXPECT_FAILURE("Mode 4711", ORU_THROW_INTERNAL(ComposeText("Mode ", 4711)));
    oru_test::Failure const here = oru_test::FailureOf([&] { ORU_ASSERT(failed > 0); });
    EXPECT_EQ(here.line, __LINE__ - 1);
    EXPECT_EQ(here.file, "tests/core/exceptions/exceptions_test.cpp");
}

// The handler and the exception's class lie in programs with run-times of their own.
TEST(Exceptions, AreCaughtOutsideTheLibrary) {
    auto const call = [] { BoundingRect().outset(ambra::lumo::TVec2<float>(-1, 0)); };
    EXPECT_THROW(call(), InternalException);
    EXPECT_EQ(oru_test::FailureOf(call).file, "oru/core/math/region_2d/boundingregionbase.cpp");
}

TEST(Exceptions, AreClonedWholeAndFreedThroughTheHooks) {
    ExceptionBase const text("mine");
    LogicalException const unknown(nullptr, 5, nullptr);
    InternalException const internal("f.cpp", 12, "m");
    OGL::ExceptionOGL const gl("f.cpp", 12, "m", 0x0506);
    OCL::ExceptionOCL const cl("f.cpp", 12, "m", 0xFFFFFFDAu);
    std::pair<ExceptionBase const *, std::string> const rows[] = {
        {&text, "mine"},
        {&unknown, "ORU logical exception Undefined:5 (Undefined)"},
        {&internal, "ORU Internal exception f.cpp:12 (m)"},
        {&gl, "ORU logical exception f.cpp:12 (m)"},
        {&cl, "OCL Exception: CL_INVALID_MEM_OBJECT f.cpp:12 (m)"}};
    for (auto const &[original, written] : rows) {
        oru_test::CountingHooks hooks;
        ScopedPtr<ExceptionBase> clone(original->clone());
        EXPECT_EQ(hooks.outstanding().count(clone.get()), 1u);
        ORU::ExceptionBase const &copied = *clone;
        EXPECT_EQ(typeid(copied), typeid(*original));
        EXPECT_EQ(Written(*clone), written);
        clone.reset();
        EXPECT_TRUE(hooks.outstanding().empty());
    }
}

} // namespace
