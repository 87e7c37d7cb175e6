// SPDX-License-Identifier: MIT
#pragma once

#include <string>

namespace quarzel::tool {

/// A text in UTF-8 that XML can hold: what is neither becomes U+FFFD. Control characters stay.
std::string validText(const std::string& text);

}  // namespace quarzel::tool
