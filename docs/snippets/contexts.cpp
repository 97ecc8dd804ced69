// The code of the chapter on contexts.
#include "oru/core/exceptions/logicalexception.h"
#include "oru/oru_ogl/libraryogl.h"
#include "oru/oru_ogl/ogl/contextoffscreen_win.h"
#include "oru/oru_ogl/ogl/contextwrapped_win.h"
#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <string>

using namespace ORU::OGL;

TEST(ContextsGuide, AsksForAContext) {
    AutoInitializer library;
    // [attributes]
    ExtensionManager::InitOptions options;
    options.setContextAttributes(
        ContextAttributes().setVersion(3, 3).setProfile(OPENGLPROFILE_CORE).setDebug());
    ExtensionManager::ScopedInitOptions const scope(options);
    ContextOffscreen context;
    context.makeCurrent();
    // [attributes]
    GLint profile = 0, flags = 0;
    ::glGetIntegerv(GL_CONTEXT_PROFILE_MASK, &profile);
    ::glGetIntegerv(GL_CONTEXT_FLAGS, &flags);
    EXPECT_EQ(GL_CONTEXT_CORE_PROFILE_BIT, profile);
    EXPECT_EQ(GL_CONTEXT_FLAG_DEBUG_BIT, flags);

    // [adopt]
    ContextWrapped const adopted; // the host's, current here
    ContextOffscreen worker(&adopted);
    // [adopt]
    worker.makeCurrent();
    EXPECT_TRUE(context.isSharingWithCurrentContext());

    std::string told;
    // [refused]
    options.setContextAttributes(ContextAttributes().setVersion(9, 9).setDebug());
    ExtensionManager::SetInitOptions(options);
    try {
        ContextOffscreen impossible;
    } catch (ORU::LogicalException const &e) {
        told = e.message(); // "No context of OpenGL 9.9, debug: the driver refuses OpenGL 9.9 …"
    }
    // [refused]
    EXPECT_EQ(0u, told.find("No context of OpenGL 9.9, debug: the driver refuses OpenGL 9.9 "));
}
