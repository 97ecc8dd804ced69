// Picture files of kinds that the programs read but do not write, made by other programs.
#pragma once

#include <fstream>
#include <iterator>
#include <string>
#include <vector>

namespace apps_test {

using Bytes = std::vector<unsigned char>;

/// A file of data/.
inline Bytes Foreign(std::string const &name) {
    std::ifstream file(ORU_FOREIGN_FILES "/" + name, std::ios::binary);
    return Bytes(std::istreambuf_iterator<char>(file), {});
}

} // namespace apps_test
