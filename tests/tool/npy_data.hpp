// SPDX-License-Identifier: MIT
#pragma once

#include <cstdint>
#include <string>
#include <xtensor/xarray.hpp>
#include <xtensor/xnpy.hpp>

namespace quarzel::test {

/// The path of a capture that the project ships: soft values, what was sent, what the core decides.
inline std::string shipped(const std::string& name) {
    return std::string(QUARZEL_CAPTURES) + '/' + name;
}

/// The soft values of a shipped capture.
inline xt::xarray<std::int8_t> shippedSoft(const std::string& name) {
    return xt::load_npy<std::int8_t>(shipped(name));
}

/// An npy file with a header as given, be it well-formed or not.
inline std::string rawNpy(const std::string& header, const std::string& data = "", char version = 1) {
    std::string file = "\x93NUMPY";
    file += version;
    file += '\0';
    for (int byte = 0; byte < (version == 1 ? 2 : 4); ++byte) {
        file += static_cast<char>(header.size() >> 8 * byte & 0xff);
    }
    return file + header + data;
}

/// The usual header of an npy file.
inline std::string npyHeader(const std::string& type, const std::string& shape,
                             const char* fortranOrder = "False") {
    return "{'descr': '" + type + "', 'fortran_order': " + fortranOrder + ", 'shape': " + shape + ", }\n";
}

}  // namespace quarzel::test
