// What tests of GL objects share: the fixture that counts names, expected failures, queries.
#pragma once

#include "tests/support/failure.h"
#include "tests/support/glfixture.h"
#include "tests/support/nameledger.h"

#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"

#include <string>
#include <vector>

namespace oru_test {

inline GLint Get(GLenum name) {
    GLint value = -1;
    ::glGetIntegerv(name, &value);
    return value;
}

inline std::vector<GLint> Get(std::vector<GLenum> const &names) {
    std::vector<GLint> values;
    for (GLenum const name : names)
        values.push_back(Get(name));
    return values;
}

/// Every test ends with the names deleted that it made and the client state popped that it pushed.
class ObjectTest : public OffscreenTest {
protected:
    void TearDown() override {
        EXPECT_EQ("", ledger_->leaks());
        if (!IsCoreRun()) {
            EXPECT_EQ(0, Get(GL_CLIENT_ATTRIB_STACK_DEPTH));
        }
        OffscreenTest::TearDown();
    }

private:
    ORU::OGL::InterceptorScope<NameLedger> ledger_;
};

} // namespace oru_test
