// Share groups: who shares with whom, and how adopted contexts find their group.
#include "tests/support/testwindow.h"

#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/contextwrapped_win.h"
#include "oru/oru_ogl/ogl/scopedcontextwrapper_win.h"

#include <gtest/gtest.h>

#include <memory>
#include <thread>

using namespace ORU::OGL;
using oru_test::MessageOf;

namespace {

/// Opens the protected operations of a context, which is in no group until told.
class Bare : public Context {
public:
    Bare() : Context(DisplayDeviceKey()) {}
    using Context::addShareContext;
    using Context::UnregisterShareContext;
};

/// A rendering context that the host makes on the window of another, current for its lifetime.
class HostSibling {
public:
    HostSibling(Context const &context, bool share)
        : rc_(::wglCreateContext(context.deviceContext())) {
        EXPECT_TRUE(!share || ::wglShareLists(context.renderContext(), rc_));
        ::wglMakeCurrent(context.deviceContext(), rc_);
    }
    ~HostSibling() {
        ::wglMakeCurrent(nullptr, nullptr);
        ::wglDeleteContext(rc_);
    }

private:
    HGLRC rc_;
};

} // namespace

TEST(ShareGroups, TellWhoShares) {
    AutoInitializer library;
    ContextOffscreen const before;
    auto parent = std::make_unique<ContextOffscreen>(),
         alone = std::make_unique<ContextOffscreen>();
    ContextOffscreen const child(parent.get()), grandchild(&child), stranger;
    alone.reset(); // the groups behind it move up
    EXPECT_FALSE(child.isSharingWithCurrentContext()) << "no context is current";
    Context const *const members[] = {parent.get(), &child, &grandchild};
    for (Context const *current : members) {
        current->makeCurrent();
        for (Context const *member : members)
            EXPECT_TRUE(member->isSharingWithCurrentContext());
        EXPECT_FALSE(stranger.isSharingWithCurrentContext());
        EXPECT_FALSE(before.isSharingWithCurrentContext());
    }
    // Objects are really shared, also after the parent's end.
    parent->makeCurrent();
    GLuint texture = 0;
    ::glGenTextures(1, &texture);
    ::glBindTexture(GL_TEXTURE_2D, texture);
    parent.reset();
    child.makeCurrent();
    EXPECT_TRUE(::glIsTexture(texture));
    EXPECT_TRUE(grandchild.isSharingWithCurrentContext());
}

TEST(ShareGroups, CheckTheirMembers) {
    AutoInitializer library;
    Bare loner;
    {
        ContextOffscreen const context;
        context.makeCurrent();
        EXPECT_EQ("sibling != this", MessageOf([&] { loner.addShareContext(&loner); }));
        EXPECT_EQ("indexSource < LARGE_INDEX-1",
                  MessageOf([&] { loner.isSharingWithCurrentContext(); }));
        Bare::UnregisterShareContext(&context);
        EXPECT_EQ("indexSource < LARGE_INDEX-1",
                  MessageOf([&] { context.isSharingWithCurrentContext(); }))
            << "no groups at all";
        loner.addShareContext(nullptr);
        EXPECT_EQ("indexQuery < LARGE_INDEX-1",
                  MessageOf([&] { loner.isSharingWithCurrentContext(); }));
    }
    Bare::UnregisterShareContext(&loner);
    Bare::UnregisterShareContext(&loner); // nobody is not an error
}

TEST(ShareGroups, AreFoundForAdoptedContexts) {
    AutoInitializer library;
    ContextOffscreen const unrelated, parent;
    for (bool share : {true, false}) {
        HostSibling const sibling(parent, share);
        ContextWrapped const adopted;
        EXPECT_TRUE(adopted.isSharingWithCurrentContext());
        EXPECT_EQ(share, parent.isSharingWithCurrentContext());
        EXPECT_FALSE(unrelated.isSharingWithCurrentContext());
    }
    // A group whose first context another thread uses cannot be probed, which is no failure.
    unrelated.makeCurrent();
    std::thread([&] {
        HostSibling const sharing(parent, true);
        ContextWrapped const adopted;
        EXPECT_TRUE(parent.isSharingWithCurrentContext());
    }).join();
}
