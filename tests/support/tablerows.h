// The tables of the catalogue, read by the tests themselves.
#pragma once

#include <fstream>
#include <sstream>
#include <string>
#include <vector>

namespace oru_test {

/// The cells of each row of a table that is no comment.
inline std::vector<std::vector<std::string>> TableRows(char const *path) {
    std::vector<std::vector<std::string>> rows;
    std::ifstream table(path);
    for (std::string line; std::getline(table, line);) {
        std::istringstream cells(line);
        if (line[0] != '#')
            rows.emplace_back();
        for (std::string cell; line[0] != '#' && std::getline(cells, cell, '\t');)
            rows.back().push_back(cell);
    }
    return rows;
}

} // namespace oru_test
