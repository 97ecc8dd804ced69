// Drawing that depends on a query, for a scope.
#include "oru/oru_ogl/ogl/conditionalrenderscope.h"

#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/objects/pendingerror.h"
#include "oru/oru_ogl/ogl/internal/objects/release.h"
#include "oru/oru_ogl/ogl/internal/objects/supported.h"
#include "oru/oru_ogl/ogl/internal/objects/translation.h"
#include "oru/oru_ogl/ogl/query.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {

namespace {

#define ORU_MODE(Name)                                                                             \
    { ConditionalRenderScope::MODE_##Name, GL_QUERY_##Name }
constexpr internal::Translation<ConditionalRenderScope::Mode, 4> kModes = {
    ORU_TRANSLATION_FAILURE("Conditional rendering mode enums are not all properly translated."),
    {ORU_MODE(WAIT), ORU_MODE(NO_WAIT), ORU_MODE(BY_REGION_WAIT), ORU_MODE(BY_REGION_NO_WAIT)}};
#undef ORU_MODE

} // namespace

ConditionalRenderScope::ConditionalRenderScope(Query const &query, Mode mode) {
    ORU_ASSERT_SUPPORTED(GL_VERSION_3_0);
    if (query.type() != Query::TYPE_SAMPLES && query.type() != Query::TYPE_ANY_SAMPLES)
        ORU_THROW_INTERNAL("Drawing can depend on a query of samples only: make it of "
                           "Query::TYPE_SAMPLES or TYPE_ANY_SAMPLES");
    auto const glMode = Mode2GL(mode);
    internal::ReportPendingError(__FILE__, __LINE__, "glBeginConditionalRender");
    ORU_GL(BeginConditionalRender, query.objectID(), glMode);
}

ConditionalRenderScope::~ConditionalRenderScope() {
    internal::Release([] { ORU_GL0(EndConditionalRender); });
}

ORU_TRANSLATED(ConditionalRenderScope, Mode, kModes)

bool ConditionalRenderScope::IsSupported() {
    return internal::Supports(GL_VERSION_3_0);
}

} // namespace ORU::OGL
