// SPDX-FileCopyrightText: 2026 The tallowfen developers
// SPDX-License-Identifier: MIT

#include "real_hives.h"

#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <sstream>

namespace testkit {

std::vector<RealHive> real_hives() {
    std::vector<RealHive> hives;
    const char* variable = std::getenv("TALLOWFEN_HIVES");
    const std::string directory = variable == nullptr ? "" : variable;
    std::ifstream index(directory + "/INDEX.tsv");
    std::string line;
    std::getline(index, line);  // the heading
    while (!directory.empty() && std::getline(index, line)) {
        std::vector<std::string> fields;
        std::istringstream row(line);
        for (std::string field; std::getline(row, field, '\t');)
            fields.push_back(field);
        if (fields.size() < 5 || fields[3] == "-")
            continue;
        hives.push_back({fields[0], directory + "/" + fields[0], std::stoul(fields[3]), std::stoul(fields[4])});
    }
    if (hives.empty())
        printf("[ LEFT OUT ] 1 check of real hives: TALLOWFEN_HIVES names no directory with them\n");
    return hives;
}

}  // namespace testkit
