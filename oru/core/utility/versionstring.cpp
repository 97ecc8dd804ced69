// Reading of OpenGL version texts.
#include "oru/core/utility/versionstring.h"

#include <locale>
#include <sstream>

namespace ORU {

namespace {

template<class Number>
void Read(std::string const &text, Number &number) {
    number = 0; // a stream that is at its end before it reads leaves the number alone
    std::istringstream stream(text);
    stream.imbue(std::locale::classic()); // a host's locale may group digits
    stream >> number;
}

} // namespace

void TokenizeVersionString(std::string const &version, unsigned &major, unsigned &minor,
                           int &release, std::string &vendor) {
    auto const npos = std::string::npos;
    release = -1;
    vendor.clear();
    auto const p1 = version.find('.');
    Read(version.substr(0, p1), major);
    auto const minorBegin = p1 == npos ? 0 : p1 + 1;
    auto p2 = version.find_first_of(" .", minorBegin);
    Read(version.substr(minorBegin, p2 == npos ? npos : p2 - minorBegin), minor);
    if (p2 != npos && version[p2] == '.') {
        auto const p3 = version.find(' ', p2);
        Read(version.substr(p2 + 1, p3 == npos ? npos : p3 - p2 - 1), release);
        p2 = p3;
    }
    if (p2 != npos)
        vendor = version.substr(p2 + 1);
}

} // namespace ORU
