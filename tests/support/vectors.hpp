// SPDX-License-Identifier: MIT
#pragma once

#include <fstream>
#include <nlohmann/json.hpp>
#include <stdexcept>
#include <string>
#include <vector>

namespace quarzel::test {

/// The cases of a file in the test data, one JSON object a line.
inline std::vector<nlohmann::json> readCases(const std::string& file) {
    std::ifstream stream(std::string(QUARZEL_TEST_DATA) + "/" + file);
    if (!stream) {
        throw std::runtime_error("cannot open test data " + file);
    }
    std::vector<nlohmann::json> cases;
    for (std::string line; std::getline(stream, line);) {
        cases.push_back(nlohmann::json::parse(line));
    }
    return cases;
}

}  // namespace quarzel::test
