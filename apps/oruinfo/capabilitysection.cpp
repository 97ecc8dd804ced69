// The capabilities that the library knows: which are there, and why the others are not.
#include "apps/oruinfo/drivers.h"
#include "apps/oruinfo/report.h"
#include "apps/oruinfo/sections.h"

#include <algorithm>

namespace OruInfo {

using namespace ORU::OGL;

namespace {

/// Why a capability is not there, for people.
std::string Reason(ExtensionManager const &record, OpenGLExtension e, bool isReported,
                   Names const &missing) {
    if (e == GL_VERSION_1_2_1)
        return "never counted: it adds nothing to OpenGL 1.2";
    if (!isReported)
        return e <= GL_VERSION_4_1
                   ? "the driver's OpenGL is " + std::to_string(record.majorVersion()) + "." +
                         std::to_string(record.minorVersion())
                   : "not reported by the driver";
    std::string text = "reported, but " + missing.front() + " is absent";
    if (missing.size() > 1)
        text += ", and " + std::to_string(missing.size() - 1) + " more";
    return text;
}

/// What the library answers from the capabilities.
void AddAnswers(ExtensionManager const &record, Group &section) {
    struct Question {
        char const *id;
        bool (ExtensionManager::*ask)() const;
    };
    Question const questions[] = {
        {"supportsClampToEdge", &ExtensionManager::supportsClampToEdge},
        {"supportsTexture3D", &ExtensionManager::supportsTexture3D},
        {"supportsMultiTexture", &ExtensionManager::supportsMultiTexture},
        {"supportsDrawBuffers", &ExtensionManager::supportsDrawBuffers},
        {"supportsFloatingPointTextures", &ExtensionManager::supportsFloatingPointTextures},
        {"supports16BitFloat", &ExtensionManager::supports16BitFloat},
        {"supportsPixelBuffers", &ExtensionManager::supportsPixelBuffers},
        {"supportsRenderToTexture", &ExtensionManager::supportsRenderToTexture},
        {"supportsRenderToTextureRectangle", &ExtensionManager::supportsRenderToTextureRectangle},
        {"supportsNonPowerOfTwoTextures", &ExtensionManager::supportsNonPowerOfTwoTextures}};
    Table answers{{{"question", "Question"}, {"answer", "Answer"}}, {}};
    for (Question const &question : questions)
        answers.rows.push_back({std::string(question.id), (record.*question.ask)()});
    section.add("answers", "What the library answers", answers);
}

} // namespace

void GatherCapabilities(Drivers &drivers, Group &section) {
    drivers.openGL();
    ExtensionManager &record = *ExtensionManager::Instance();
    Names supported;
    Table missing{{{"name", "Capability"},
                   {"is_reported", "Reported", true},
                   {"missing_entry_points", "Missing entry points", true},
                   {"reason", "Reason"}},
                  {}};
    for (unsigned int value = 0; value < UNKNOWN_OPENGL_EXTENSION; ++value) {
        auto const e = static_cast<OpenGLExtension>(value);
        std::string const name = ExtensionManager::ExtensionEnumToString(e);
        if (record.isSupported(e)) {
            supported.push_back(name);
            continue;
        }
        bool const isReported = record.isReported(e);
        Names const absent = isReported ? record.missingEntryPoints(e) : Names();
        missing.rows.push_back({name, isReported, absent, Reason(record, e, isReported, absent)});
    }
    Names others = record.supportedExtensionNames();
    others.erase(std::remove_if(others.begin(), others.end(),
                                [&record](std::string const &name) {
                                    return record.nameToEnumGL(name.c_str()) !=
                                               UNKNOWN_OPENGL_EXTENSION ||
                                           name.rfind("WGL_", 0) == 0;
                                }),
                 others.end());
    section.add("supported", "Supported", supported);
    section.add("missing", "Missing", missing);
    AddAnswers(record, section);
    section.addDetail("others", "Other extensions of the driver", Value(others));
}

} // namespace OruInfo
