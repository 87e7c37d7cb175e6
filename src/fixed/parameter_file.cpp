// SPDX-License-Identifier: MIT
#include "fixed/parameter_file.hpp"

#include <algorithm>
#include <fstream>

#include "fixed/messages.hpp"
#include "fixed/properties.hpp"
#include "fixed/string_utilities.hpp"

namespace {

/// Read the next line. A stream that has none is left at its end, but has not failed.
/// @return whether there was one
bool readLine(std::istream& stream, std::string& line) {
    return stream.good() && stream.peek() != std::istream::traits_type::eof() && std::getline(stream, line);
}

}  // namespace

bool parse(std::istream& stream, std::map<std::string, std::string>& parameters, bool addKeys) {
    bool allGood = true;
    std::size_t lineNumber = 0;
    for (std::string line; readLine(stream, line);) {
        ++lineNumber;
        line.resize(std::min({line.find("//"), line.find('#'), line.size()}));
        if (line.find('=') == std::string::npos) {
            continue;
        }
        const auto [left, right] = splitString(line, "=");
        const std::string key = stripws(left);
        if (addKeys || parameters.contains(key)) {
            parameters[key] = stripws(right);
        } else {
            quarzel::standardStreams.error(
                {"ERROR:", quarzel::Decimal(lineNumber), ":Parameter name '", key, "' is invalid"});
            allGood = false;
        }
    }
    return allGood;
}

bool parse(const std::string& fileName, std::map<std::string, std::string>& parameters, bool addKeys) {
    std::ifstream file(fileName);
    file.peek();  // A directory opens as a file does and fails when it is read.
    if (!file) {
        quarzel::standardStreams.error({"ERROR:Could not open input file '", fileName, "'"});
        return false;
    }
    return parse(file, parameters, addKeys);
}
