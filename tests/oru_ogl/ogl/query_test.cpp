// Queries: what they count of a drawing, drawing that depends on one, and what they refuse.
#include "tests/support/objecttest.h"
#include "tests/support/translations.h"

#include "oru/oru_ogl/ogl/conditionalrenderscope.h"
#include "oru/oru_ogl/ogl/framebuffer.h"
#include "oru/oru_ogl/ogl/programogl.h"
#include "oru/oru_ogl/ogl/query.h"
#include "oru/oru_ogl/ogl/queryscope.h"
#include "oru/oru_ogl/ogl/renderbuffer.h"
#include "oru/oru_ogl/ogl/vertexbufferogl.h"

#include <algorithm>
#include <functional>

using namespace ORU::OGL;
using namespace oru_test;

namespace {

int const kSide = 8;

/// A square that fills a picture, as far as the scissors let it.
class Canvas {
public:
    Canvas() {
        char const *const vertex = "attribute vec2 p; void main() { gl_Position = vec4(p, 0, 1); }";
        char const *const fragment = "void main() { gl_FragColor = vec4(1); }";
        program_.loadVertexShader(1, &vertex, nullptr);
        program_.loadFragmentShader(1, &fragment, nullptr);
        program_.link(true);
        program_.enable();
        framebuffer_.bind();
        framebuffer_.attach(&picture_, 0);
        ORU_GL(Viewport, 0, 0, kSide, kSide);
        ORU_GL(Enable, GL_SCISSOR_TEST);
        float const corners[] = {-1, -1, 1, -1, -1, 1, 1, 1};
        square_.setField("p", reinterpret_cast<unsigned char const *>(corners), false, 0, 0);
        square_.setupWithProgram(&program_);
        square_.marshallData();
    }

    void clear() {
        ORU_GL(Scissor, 0, 0, kSide, kSide);
        ORU_GL(Clear, GL_COLOR_BUFFER_BIT);
    }
    void draw(int width, int height) {
        ORU_GL(Scissor, 0, 0, width, height);
        square_.drawPrimitives();
    }
    /// How many pixels are drawn.
    std::uint64_t pixels() const {
        std::vector<GLfloat> reds(std::size_t{kSide} * kSide);
        ORU_GL(ReadPixels, 0, 0, kSide, kSide, GL_RED, GL_FLOAT, reds.data());
        return static_cast<std::uint64_t>(std::count(reds.begin(), reds.end(), 1.f));
    }

private:
    Program program_;
    Renderbuffer picture_{GL_RGBA8, kSide, kSide};
    Framebuffer framebuffer_;
    VertexBuffer square_{{VertexBuffer::Field("p", VertexBuffer::ATTRIBUTETYPE_FLOAT2,
                                              VertexBuffer::EXPECTEDUSAGE_STATIC_DRAW)},
                         4,
                         VertexBuffer::PRIMITIVETYPE_TRIANGLE_STRIP};
};

} // namespace

class QueryTest : public ObjectTest {};

// Whatever part of the picture is drawn, nothing included: the queries agree with the pixels, and
// drawing that depends on them is done or not.
TEST_F(QueryTest, CountsWhatIsDrawn) {
    Canvas canvas;
    Query samples(Query::TYPE_SAMPLES), any(Query::TYPE_ANY_SAMPLES),
        primitives(Query::TYPE_PRIMITIVES_GENERATED), written(Query::TYPE_PRIMITIVES_WRITTEN),
        time(Query::TYPE_TIME_ELAPSED), before(Query::TYPE_TIMESTAMP), after(Query::TYPE_TIMESTAMP);
    for (int width = 0; width <= kSide; ++width) {
        int const height = kSide - width / 2;
        canvas.clear();
        before.record();
        {
            QueryScope const counting(samples), making(primitives), writing(written), timing(time);
            canvas.draw(width, height);
        }
        after.record();
        std::uint64_t const pixels = canvas.pixels();
        EXPECT_EQ(pixels, samples.result());
        EXPECT_TRUE(samples.available());
        EXPECT_EQ(2u, primitives.result());
        EXPECT_EQ(0u, written.result());
        EXPECT_LE(time.result(), after.result() - before.result());

        canvas.clear();
        { // one of the kinds of samples at a time
            QueryScope const counting(any);
            canvas.draw(width, height);
        }
        EXPECT_EQ(pixels > 0, any.result() == 1);
        for (Query const *const query : {&samples, &any}) {
            canvas.clear();
            {
                ConditionalRenderScope const scope(*query, ConditionalRenderScope::MODE_WAIT);
                canvas.draw(3, 2);
            }
            EXPECT_EQ(pixels > 0 ? 6u : 0u, canvas.pixels());
        }
    }
    canvas.draw(1, 1);
    EXPECT_LT(0u, canvas.pixels()) << "after the scope nothing depends on a query";
}

TEST_F(QueryTest, RefusesWhatHasNoSense) {
    Query query(Query::TYPE_SAMPLES), stamp(Query::TYPE_TIMESTAMP);
    std::string const nothing =
        "Query: nothing was measured yet. Call begin() and end(), or record()";
    std::string const runs = "Query: there is no result while the query runs. Call end() first";
    auto const expect = [&](std::string const &text, std::function<void()> const &use) {
        EXPECT_FAILURE(text, use());
    };
    expect("Query::begin: a time stamp is taken by record()", [&] { stamp.begin(); });
    expect("Query::record: the query is no time stamp. Call begin() and end()",
           [&] { query.record(); });
    expect("Query::end: the query does not run. Call begin() first", [&] { query.end(); });
    expect(nothing, [&] { query.result(); });
    expect(nothing, [&] { stamp.available(); });
    EXPECT_EQ(0u, stamp.getBoundID());
    query.begin();
    expect("Query::begin: the query runs already. Call end() first", [&] { query.begin(); });
    expect(runs, [&] { query.available(); });
    EXPECT_TRUE(query.isBound());
    EXPECT_TRUE(Query(query.objectID(), Query::TYPE_SAMPLES, borrow_name_tag()).isRunning());
    Query other(Query::TYPE_SAMPLES);
    expect("GL_INVALID_OPERATION", [&] { other.begin(); });
    EXPECT_FALSE(other.isRunning());
    query.end();
    expect("Drawing can depend on a query of samples only: make it of Query::TYPE_SAMPLES or "
           "TYPE_ANY_SAMPLES",
           [&] { ConditionalRenderScope(stamp, ConditionalRenderScope::MODE_WAIT); });

    // An error that the host left ends the calls, which are done all the same.
    ::glEnable(GL_NONE);
    expect("GL_INVALID_ENUM", [&] { other.begin(); });
    EXPECT_TRUE(other.isRunning());
    ::glEnable(GL_NONE);
    expect("GL_INVALID_ENUM", [&] { other.end(); });
    EXPECT_FALSE(other.isRunning());
    EXPECT_EQ(0u, other.result());
    // What nobody would end does not begin, or is ended.
    ::glEnable(GL_NONE);
    expect("GL_INVALID_ENUM", [&] { QueryScope{other}; });
    EXPECT_FALSE(other.isRunning());
    ::glEnable(GL_NONE);
    expect("GL_INVALID_ENUM",
           [&] { ConditionalRenderScope(other, ConditionalRenderScope::MODE_WAIT); });
    EXPECT_NO_THROW(ConditionalRenderScope(other, ConditionalRenderScope::MODE_WAIT));
    {
        ConditionalRenderScope const outer(other, ConditionalRenderScope::MODE_WAIT);
        for (int i = 0; i < 2; ++i) // the first one would end the outer one
            expect("GL_INVALID_OPERATION",
                   [&] { ConditionalRenderScope(other, ConditionalRenderScope::MODE_WAIT); });
    }

    ExpectTranslation("Query type", Query::Type2GL, Query::GL2Type, 6, GL_TIMESTAMP);
    ExpectTranslation("Conditional rendering mode", ConditionalRenderScope::Mode2GL,
                      ConditionalRenderScope::GL2Mode, 4, GL_QUERY_BY_REGION_NO_WAIT);
    EXPECT_FALSE(Query::IsSupported(static_cast<Query::Type>(6)));
}
