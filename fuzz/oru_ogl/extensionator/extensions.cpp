// Lists of extensions that drivers report.
#include "fuzz/harness.h"

#include "oru/core/utility/tokenize.h"
#include "oru/oru_ogl/extensionator/internal/findextension.h"

namespace {

using namespace ORU::OGL;

/// The same by looking at every name.
template<std::size_t Count>
OpenGLExtension Search(NamedExtension const (&extensions)[Count], std::string const &name) {
    for (NamedExtension const &extension : extensions)
        if (extension.name == name)
            return extension.value;
    return UNKNOWN_OPENGL_EXTENSION;
}

/// Splits a list at the separators, which must lose nothing else.
std::vector<std::string> Words(std::string const &text, std::string const &separators) {
    std::vector<std::string> words;
    ORU::Tokenize(text, separators.c_str(), words);
    std::size_t begin = 0;
    for (std::string const &word : words) {
        begin = text.find_first_not_of(separators, begin);
        HOLDS(!word.empty() && text.compare(begin, word.size(), word) == 0);
        begin += word.size();
        HOLDS(begin == text.size() || separators.find(text[begin]) != std::string::npos);
    }
    HOLDS(text.find_first_not_of(separators, begin) == std::string::npos);
    return words;
}

} // namespace

int LLVMFuzzerTestOneInput(std::uint8_t const *data, std::size_t size) {
    std::string const text = fuzz::Text(data, size);
    Words(text, " \t");
    for (std::string const &word : Words(text, " ")) {
        std::string const name = word.c_str(); // which the library reads up to a zero
        HOLDS(FindExtension(kGLExtensions, name.c_str()) == Search(kGLExtensions, name));
        HOLDS(FindExtension(kWGLExtensions, name.c_str()) == Search(kWGLExtensions, name));
    }
    return 0;
}
