// SPDX-License-Identifier: MIT
#pragma once

#include <string>
#include <string_view>

namespace quarzel::sweep {

/// The SHA-256 digest of some bytes, in 64 lower-case hexadecimal digits.
std::string sha256(std::string_view bytes);

}  // namespace quarzel::sweep
