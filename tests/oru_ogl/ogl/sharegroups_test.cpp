// Share groups: who shares with whom, and how adopted contexts find their group.
#include "tests/support/contexts.h"

#include <thread>

using namespace oru_test;

TEST(ShareGroups, TellWhoShares) {
    AutoInitializer library;
    ContextOffscreen const before;
    auto parent = std::make_unique<ContextOffscreen>(),
         alone = std::make_unique<ContextOffscreen>();
    parent->makeCurrent();
    GLuint texture = 0;
    ::glGenTextures(1, &texture);
    ::glBindTexture(GL_TEXTURE_2D, texture);
    ContextOffscreen const child(parent.get()), grandchild(&child), stranger;
    alone.reset(); // the groups behind it move up
    for (Context const *current : std::vector<Context const *>{parent.get(), &child, &grandchild}) {
        current->makeCurrent();
        EXPECT_TRUE(::glIsTexture(texture)) << "the objects are really shared";
        EXPECT_TRUE(child.isSharingWithCurrentContext());
        EXPECT_FALSE(stranger.isSharingWithCurrentContext());
        EXPECT_FALSE(before.isSharingWithCurrentContext());
    }
    parent.reset();
    child.makeCurrent();
    EXPECT_TRUE(::glIsTexture(texture)) << "they outlive the context that made them";
    EXPECT_TRUE(grandchild.isSharingWithCurrentContext());
}

TEST(ShareGroups, CheckTheirMembers) {
    AutoInitializer library;
    using Bare = Exposed<Context>; // in no group until told
    Bare const loner(DisplayDeviceKey{});
    ContextOffscreen const context;
    context.makeCurrent();
    EXPECT_FAILURE("sibling != this", loner.addShareContext(&loner));
    EXPECT_FAILURE("indexSource < LARGE_INDEX-1", loner.isSharingWithCurrentContext());
    Bare::UnregisterShareContext(&context);
    loner.addShareContext(nullptr);
    EXPECT_FAILURE("indexQuery < LARGE_INDEX-1", loner.isSharingWithCurrentContext());
    Bare::UnregisterShareContext(&loner);
    Bare::UnregisterShareContext(&loner); // nobody is not an error
}

TEST(ShareGroups, AreFoundForAdoptedContexts) {
    AutoInitializer library;
    ContextOffscreen const unrelated, parent;
    {
        HostContext const stranger;
        ::glGenLists(64); // the names that the others use, for lists of its own
        ContextWrapped const adopted;
        EXPECT_TRUE(adopted.isSharingWithCurrentContext());
        EXPECT_FALSE(parent.isSharingWithCurrentContext());
        EXPECT_FALSE(unrelated.isSharingWithCurrentContext());
    }
    // A group whose first context another thread uses cannot be probed, which is no failure.
    unrelated.makeCurrent();
    std::thread([&] {
        HostContext const sharing(parent.renderContext());
        ContextWrapped const adopted;
        EXPECT_TRUE(parent.isSharingWithCurrentContext());
    }).join();
}
