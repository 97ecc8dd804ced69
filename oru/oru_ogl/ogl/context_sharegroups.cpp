// Share groups: which contexts share their objects.
#include "oru/oru_ogl/ogl/context.h"

#include "oru/core/exceptions/checks.h"
#include "oru/core/utility/scopedptr.h"
#include "oru/oru_ogl/extensionator/internal/contextprofile.h"
#include "oru/oru_ogl/extensionator/wgl/wglcall.h"
#include "oru/oru_ogl/ogl/internal/objects/ending.h"
#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"
#include "oru/oru_ogl/platformgl.h"

#include <algorithm>
#include <cstddef>
#include <vector>

namespace ORU::OGL {

namespace {

using ShareGroup = std::vector<Context const *>;
using ShareGroups = std::vector<ShareGroup>;

/// Made when first asked for; goes with the last group.
ShareGroups *gShareGroups = nullptr;

/// The group index of a context that was not found (yet); no index comes near it.
constexpr std::size_t kLargeIndex = 0x0FFFFFFF;

ShareGroups &Groups() {
    if (!gShareGroups)
        gShareGroups = ORU_NEW ShareGroups();
    return *gShareGroups;
}

/// What a probe of two contexts leaves in one of them and looks for in the other: OpenGL's own
/// functions, plain ones that every version has.
struct ProbedObject {
    GLuint (*make)();
    GLboolean(ORU_APIENTRY *exists)(GLuint name);
    void (*remove)(GLuint name);
    bool isAlwaysRemoved;
};

/// An empty display list. Where it does not appear it stays: deleting it would make its context
/// current once more for each group that is asked.
ProbedObject const kDisplayList = {
    [] { return ::glGenLists(1); },
    &::glIsList,
    [](GLuint name) { ::glDeleteLists(name, 1); },
    false,
};

/// A texture without images, as core contexts have no lists.
ProbedObject const kTexture = {
    [] {
        GLint bound = 0;
        ::glGetIntegerv(GL_TEXTURE_BINDING_2D, &bound);
        GLuint name = 0;
        ::glGenTextures(1, &name);
        ::glBindTexture(GL_TEXTURE_2D, name); // it exists from here on
        ::glBindTexture(GL_TEXTURE_2D, static_cast<GLuint>(bound));
        return name;
    },
    &::glIsTexture,
    [](GLuint name) { ::glDeleteTextures(1, &name); },
    true,
};

/// Whether an object made in `a` appears in `b`, and disappears there when deleted in `a`.
bool SharesObjects(Context const *a, Context const *b) {
    ORU_ASSERT(a);
    ORU_ASSERT(b);
    ScopedContextWrapper const restoreCurrent;
    try {
        bool const isCore = internal::IsCoreContext(a->deviceContext(), a->renderContext()) ||
                            internal::IsCoreContext(b->deviceContext(), b->renderContext());
        ProbedObject const &object = isCore ? kTexture : kDisplayList;
        a->makeCurrent();
        GLuint const id = object.make();
        bool isToBeRemoved = object.isAlwaysRemoved;
        internal::Ending removal([&] {
            if (!isToBeRemoved)
                return;
            a->makeCurrent();
            object.remove(id);
        });
        b->makeCurrent();
        if (!object.exists(id))
            return false;
        isToBeRemoved = true;
        removal.now();
        b->makeCurrent();
        return !object.exists(id);
    } catch (InternalException const &) {
        // A context that cannot be made current here, being in use elsewhere, tells nothing.
        return false;
    }
}

} // namespace

void Context::addShareContext(Context const *sibling) const {
    ORU_ASSERT(sibling != this);
    ShareGroups &groups = Groups();
    if (!sibling) {
        groups.emplace_back(1, this);
        return;
    }
    auto const group = std::find_if(groups.begin(), groups.end(), [=](ShareGroup const &g) {
        return std::find(g.begin(), g.end(), sibling) != g.end();
    });
    ORU_ASSERT_TEXT("outerIter != gVectorOfContextVectors->end()", group != groups.end());
    group->push_back(this);
}

void Context::registerSharedContext(Context const *sibling) {
    addShareContext(sibling);
}

void Context::unregisterSharedContext() {
    if (renderContext_)
        UnregisterShareContext(this);
}

void Context::UnregisterShareContext(Context const *context) {
    ShareGroups &groups = Groups();
    for (auto group = groups.begin(); group != groups.end(); ++group) {
        auto const member = std::find(group->begin(), group->end(), context);
        if (member == group->end())
            continue;
        group->erase(member);
        if (group->empty())
            groups.erase(group);
        if (groups.empty()) {
            ORUDeleter<ShareGroups>()(gShareGroups);
            gShareGroups = nullptr;
        }
        return;
    }
}

void Context::RegisterContextWrapped(Context const *context) {
    for (ShareGroup &group : Groups()) {
        if (SharesObjects(group.front(), context)) {
            group.push_back(context);
            return;
        }
    }
    Groups().emplace_back(1, context);
}

bool Context::isSharingWithCurrentContext() const {
    ShareGroups const &groups = Groups();
    HGLRC const current = ORU_WGL0(GetCurrentContext);
    if (!current)
        return false;

    std::size_t indexSource = kLargeIndex - 1; // differs from indexQuery while neither is found
    std::size_t indexQuery = kLargeIndex;
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
            ORU_ASSERT_TEXT("index< LARGE_INDEX-1", index < kLargeIndex - 1);
        }
    }
    ORU_ASSERT_TEXT("indexSource < LARGE_INDEX-1", indexSource < kLargeIndex - 1);
    ORU_ASSERT_TEXT("indexQuery < LARGE_INDEX-1", indexQuery < kLargeIndex - 1);
    return false;
}

} // namespace ORU::OGL
