// SPDX-License-Identifier: MIT
#include "sweep/sha256.hpp"

#include <fmt/format.h>
#include <openssl/evp.h>

#include <array>
#include <stdexcept>

namespace quarzel::sweep {

std::string sha256(std::string_view bytes) {
    std::array<unsigned char, EVP_MAX_MD_SIZE> digest{};
    unsigned size = 0;
    if (EVP_Digest(bytes.data(), bytes.size(), digest.data(), &size, EVP_sha256(), nullptr) != 1) {
        throw std::runtime_error("SHA-256 is not available");
    }
    std::string text;
    for (unsigned i = 0; i < size; ++i) {
        text += fmt::format("{:02x}", digest[i]);
    }
    return text;
}

}  // namespace quarzel::sweep
