// Share groups: which contexts share their objects.
#include "oru/oru_ogl/ogl/context.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <cstddef>
#include <vector>

namespace ORU::OGL {

namespace {

using ContextVector = std::vector<Context const *>;
using ContextVectors = std::vector<ContextVector>;

/// The share groups; exists only while there is one.
ContextVectors *gVectorOfContextVectors = nullptr;

/// The group index of a context that was not found (yet); no index comes near it.
std::size_t const LARGE_INDEX = 0x0FFFFFFF;

ContextVectors &ShareGroups() {
    if (!gVectorOfContextVectors)
        gVectorOfContextVectors = ORU_NEW ContextVectors();
    return *gVectorOfContextVectors;
}

/// Whether a display list made in `a` appears in `b`, and disappears there when deleted in `a`.
bool SharesLists(Context const *a, Context const *b) {
    ORU_ASSERT(a);
    ORU_ASSERT(b);
    ScopedContextWrapper const restoreCurrent;
    try {
        a->makeCurrent();
        GLuint const id = ::glGenLists(1);
        b->makeCurrent();
        if (!::glIsList(id))
            return false;
        a->makeCurrent();
        ::glDeleteLists(id, 1);
        b->makeCurrent();
        return !::glIsList(id);
    } catch (InternalException const &) {
        // A context that cannot be made current here, being in use elsewhere, tells nothing.
        return false;
    }
}

} // namespace

bool Context::sThrowTestException_ = false;

Context::Context(HGLRC renderContext)
    : initOptions_(ExtensionManager::CurrentInitOptions()), renderContext_(renderContext) {}

Context::Context(DisplayDeviceKey const &key)
    : displayDeviceKey_(key), initOptions_(ExtensionManager::CurrentInitOptions()) {}

Context::~Context() = default;

void Context::addShareContext(Context const *sibling) const {
    ORU_ASSERT(sibling != this);
    ContextVectors &groups = ShareGroups();
    if (!sibling) {
        groups.emplace_back(1, this);
        return;
    }
    auto const outerIter = std::find_if(groups.begin(), groups.end(), [=](ContextVector const &g) {
        return std::find(g.begin(), g.end(), sibling) != g.end();
    });
    ORU_ASSERT(outerIter != gVectorOfContextVectors->end());
    outerIter->push_back(this);
}

void Context::registerSharedContext(Context const *sibling) {
    addShareContext(sibling);
}

void Context::unregisterSharedContext() {
    if (renderContext_)
        UnregisterShareContext(this);
}

void Context::UnregisterShareContext(Context const *context) {
    ContextVectors &groups = ShareGroups();
    for (auto group = groups.begin(); group != groups.end(); ++group) {
        auto const member = std::find(group->begin(), group->end(), context);
        if (member == group->end())
            continue;
        group->erase(member);
        if (group->empty())
            groups.erase(group);
        break;
    }
    if (groups.empty()) {
        ORUDeleter<ContextVectors>()(gVectorOfContextVectors);
        gVectorOfContextVectors = nullptr;
    }
}

void Context::RegisterContextWrapped(Context const *context) {
    for (ContextVector &group : ShareGroups())
        if (SharesLists(group.front(), context)) {
            group.push_back(context);
            return;
        }
    ShareGroups().emplace_back(1, context);
}

bool Context::isSharingWithCurrentContext() const {
    ContextVectors const &groups = ShareGroups();
    HGLRC const current = ORU_WGL0(GetCurrentContext);
    if (!current)
        return false;

    std::size_t indexSource = LARGE_INDEX - 1; // differs from indexQuery while neither is found
    std::size_t indexQuery = LARGE_INDEX;
    for (std::size_t g = 0; g < groups.size(); ++g) {
        std::size_t index = 0;
        for (Context const *member : groups[g]) {
            if (member == this)
                indexSource = g;
            if (member->renderContext() == current)
                indexQuery = g;
            if (indexSource == indexQuery)
                return true;
            ++index;
            // The checks' own texts are their messages.
            // clang-format off
            ORU_ASSERT(index< LARGE_INDEX-1);
        }
    }
    ORU_ASSERT(indexSource < LARGE_INDEX-1);
    ORU_ASSERT(indexQuery < LARGE_INDEX-1);
    // clang-format on
    return false;
}

} // namespace ORU::OGL
