// Float filtering where the extensions that it is asked for are missing, under an override of Mesa.
#include "../glfixture.h"

#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"

using namespace ORU::OGL;

class FilteringMissingTest : public oru_test::OffscreenTest {};

TEST_F(FilteringMissingTest, AnswersNoWithoutAnyCall) {
    ExtensionManager &record = *ExtensionManager::Instance();
    ASSERT_FALSE(record.supportsFloatingPointTextures());
    ASSERT_FALSE(record.isSupported(GL_EXT_GPU_SHADER4));
    oru_test::Pushed<oru_test::CountingForwarder> calls;
    for (int i = 0; i < 2; ++i) {
        EXPECT_FALSE(record.supportsFloatFiltering());
        EXPECT_FALSE(record.supportsHalfFiltering());
    }
    EXPECT_EQ(0, calls->total());
}
