// Running tests of GL objects in core contexts: ORU_TEST_PROFILE=core asks for that.
#pragma once

#include "oru/oru_ogl/extensionator/openglforwarder.h"
#include "oru/oru_ogl/ogl/context.h"
#include "oru/oru_ogl/platformgl.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

namespace oru_test {

inline bool IsCoreRun() {
    char const *const profile = std::getenv("ORU_TEST_PROFILE");
    return profile && std::string(profile) == "core";
}

/// What the contexts of this run are asked for.
inline ORU::OGL::ExtensionManager::InitOptions RunOptions() {
    ORU::OGL::ExtensionManager::InitOptions options;
    if (IsCoreRun())
        options.setContextAttributes(ORU::OGL::ContextAttributes().setVersion(4, 1).setProfile(
            ORU::OGL::OPENGLPROFILE_CORE));
    return options;
}

/// Hands shaders of GLSL 1.10 and 1.20 on as core contexts know them.
class CoreShaders : public ORU::OGL::OpenGLForwarder {
public:
    void cgmShaderSource(char const *file, unsigned int line, GLuint shader, GLsizei count,
                         GLchar const *const *strings, GLint const *lengths) override {
        std::string text;
        for (GLsizei i = 0; i < count; ++i)
            text += lengths && lengths[i] >= 0
                        ? std::string(strings[i], static_cast<std::size_t>(lengths[i]))
                        : std::string(strings[i]);
        char const kVersion[] = "#version ";
        if (text.find(kVersion) == 0 && std::stoi(text.substr(sizeof kVersion - 1)) > 120)
            return OpenGLForwarder::cgmShaderSource(file, line, shader, count, strings, lengths);
        while (text.find('#') == 0) // a version, or an extension that is no longer one
            text.erase(0, text.find('\n') + 1);
        GLint type = 0;
        OpenGLForwarder::cgmGetShaderiv(file, line, shader, GL_SHADER_TYPE, &type);
        if (!text.empty())
            text.insert(0, type == GL_VERTEX_SHADER ? kVertexPrefix : kFragmentPrefix);
        GLchar const *const source = text.c_str();
        OpenGLForwarder::cgmShaderSource(file, line, shader, 1, &source, nullptr);
    }

private:
    static constexpr char kVertexPrefix[] =
        "#version 150\n#define texture2D texture\n#define attribute in\n#define varying out\n";
    static constexpr char kFragmentPrefix[] =
        "#version 150\n#define texture2D texture\n#define varying in\n"
        "#define gl_FragColor theColour\nout vec4 theColour;\n";
};

} // namespace oru_test
