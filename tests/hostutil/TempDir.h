#ifndef PLOTAID_TESTS_HOSTUTIL_TEMPDIR_H
#define PLOTAID_TESTS_HOSTUTIL_TEMPDIR_H

#include "support/TestSupport.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <optional>
#include <string>
#include <vector>

inline std::vector<std::string> readLines(const std::string& path) {
    std::vector<std::string> lines;
    std::ifstream in(path, std::ios::binary);
    for (std::string line; std::getline(in, line);)
        lines.push_back(line);
    return lines;
}

#endif
