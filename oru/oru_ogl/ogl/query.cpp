// Queries: what the implementation counted and measured while it drew.
#include "oru/oru_ogl/ogl/query.h"

#include "oru/core/utility/composetext.h"
#include "oru/core/utility/dropexceptions.h"
#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/adopting.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/objects/translation.h"
#include "oru/oru_ogl/platformgl.h"

#include <utility>

namespace ORU::OGL {

namespace {

struct TypeRow {
    Query::Type value;
    unsigned int gl;
    OpenGLExtension needed;
    char const *neededName;
};

#define ORU_TYPE(Type, GLTarget, Needed)                                                           \
    { Query::TYPE_##Type, GL_##GLTarget, Needed, #Needed }
constexpr internal::Translation<Query::Type, 6, TypeRow> kTypes = {
    ORU_TRANSLATION_FAILURE("Query type enums are not all properly translated."),
    {ORU_TYPE(SAMPLES, SAMPLES_PASSED, GL_VERSION_1_5),
     ORU_TYPE(ANY_SAMPLES, ANY_SAMPLES_PASSED, GL_ARB_OCCLUSION_QUERY2),
     ORU_TYPE(PRIMITIVES_GENERATED, PRIMITIVES_GENERATED, GL_VERSION_3_0),
     ORU_TYPE(PRIMITIVES_WRITTEN, TRANSFORM_FEEDBACK_PRIMITIVES_WRITTEN, GL_VERSION_3_0),
     ORU_TYPE(TIME_ELAPSED, TIME_ELAPSED, GL_ARB_TIMER_QUERY),
     ORU_TYPE(TIMESTAMP, TIMESTAMP, GL_ARB_TIMER_QUERY)}};
#undef ORU_TYPE

void RequireSupport(Query::Type type) {
    TypeRow const &row = *kTypes.find(type);
    if (!internal::Supports(row.needed))
        ORU_THROW_INTERNAL("ExtensionManager::Instance()->isSupported(", row.neededName, ")");
}

} // namespace

Query::Query(Type type)
    : Object(Type2GL(type), GL_CURRENT_QUERY), isWide_(internal::Supports(GL_ARB_TIMER_QUERY)) {
    RequireSupport(type);
    try {
        // An error that the host left pending ends the call, too, after the name was made.
        ORU_GL(GenQueries, 1, &objectID_);
        ORU_ASSERT(objectID_ != 0);
    } catch (...) {
        deleteObject();
        throw;
    }
}

Query::Query(unsigned int name, Type type, ownership_tag ownership)
    : Object(Type2GL(type), GL_CURRENT_QUERY, name, ownership), state_(MEASURED),
      isWide_(internal::Supports(GL_ARB_TIMER_QUERY)) {
    RequireSupport(type);
    internal::RequireName(ORU_GL(IsQuery, name), name, "query");
    if (isBound())
        state_ = RUNNING;
}

Query &Query::operator=(Query &&other) noexcept {
    if (this == &other)
        return *this;
    deleteObject();
    state_ = other.state_;
    isWide_ = other.isWide_;
    Object::operator=(std::move(other));
    return *this;
}

Query::~Query() {
    deleteObject();
}

void Query::deleteObject() noexcept {
    if (!ownsName())
        return;
    // A query that is deleted while it runs goes on, and nobody could begin another of its type.
    if (state_ == RUNNING)
        internal::Release([this] { ORU_GL(EndQuery, target()); });
    internal::Release([this] { ORU_GL(DeleteQueries, 1, &objectID_); });
}

Query::Type Query::type() const {
    return GL2Type(target());
}

void Query::begin() {
    if (target() == GL_TIMESTAMP)
        ORU_THROW_INTERNAL("Query::begin: a time stamp is taken by record()");
    if (state_ == RUNNING)
        ORU_THROW_INTERNAL("Query::begin: the query runs already. Call end() first");
    State const before = state_;
    try {
        ORU_GL(BeginQuery, target(), objectID_);
        state_ = RUNNING;
    } catch (...) {
        askWhetherRunning(before);
        throw;
    }
}

void Query::end() {
    requireObject();
    if (state_ != RUNNING)
        ORU_THROW_INTERNAL("Query::end: the query does not run. Call begin() first");
    try {
        ORU_GL(EndQuery, target());
        state_ = MEASURED;
    } catch (...) {
        askWhetherRunning(MEASURED);
        throw;
    }
}

void Query::askWhetherRunning(State otherwise) noexcept {
    DropExceptions([&] { state_ = isBound() ? RUNNING : otherwise; });
}

void Query::record() {
    if (target() != GL_TIMESTAMP)
        ORU_THROW_INTERNAL("Query::record: the query is no time stamp. Call begin() and end()");
    ORU_GL(QueryCounter, objectID_, GL_TIMESTAMP);
    state_ = MEASURED;
}

void Query::requireResult() const {
    requireObject();
    if (state_ == MEASURED)
        return;
    if (state_ == RUNNING)
        ORU_THROW_INTERNAL("Query: there is no result while the query runs. Call end() first");
    ORU_THROW_INTERNAL("Query: nothing was measured yet. Call begin() and end(), or record()");
}

bool Query::available() const {
    requireResult();
    GLint isThere = GL_FALSE;
    ORU_GL(GetQueryObjectiv, objectID_, GL_QUERY_RESULT_AVAILABLE, &isThere);
    return isThere != GL_FALSE;
}

std::uint64_t Query::result() const {
    requireResult();
    if (!isWide_) {
        GLuint narrow = 0;
        ORU_GL(GetQueryObjectuiv, objectID_, GL_QUERY_RESULT, &narrow);
        return narrow;
    }
    GLuint64 value = 0;
    ORU_GL(GetQueryObjectui64v, objectID_, GL_QUERY_RESULT, &value);
    return value;
}

unsigned int Query::getBoundID() const {
    if (target() == GL_TIMESTAMP)
        return 0; // never runs, and not every driver answers
    GLint running = 0;
    ORU_GL(GetQueryiv, target(), GL_CURRENT_QUERY, &running);
    return static_cast<unsigned int>(running);
}

ORU_TRANSLATED(Query, Type, kTypes)

bool Query::IsSupported(Type type) {
    TypeRow const *const row = kTypes.find(type);
    return row && internal::Supports(row->needed);
}

} // namespace ORU::OGL
