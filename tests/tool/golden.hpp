// SPDX-License-Identifier: MIT
#pragma once

#include <string>

namespace quarzel::test {

/// Compare a text with the one in golden/. With QUARZEL_RENEW_GOLDEN=1 in the environment the stored one is
/// renewed instead.
void expectGolden(const std::string& text, const std::string& name);

}  // namespace quarzel::test
