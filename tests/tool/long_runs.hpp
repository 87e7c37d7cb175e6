// SPDX-License-Identifier: MIT
#pragma once

namespace quarzel::test {

/// Whether a run of the tool takes long: under the address sanitizer and emulated.
#if defined(__SANITIZE_ADDRESS__) || defined(QUARZEL_EMULATED)
constexpr bool runsTakeLong = true;
#else
constexpr bool runsTakeLong = false;
#endif

/// Tests that run the tool hundreds of times make every Nth run only.
constexpr int everyNthRun = runsTakeLong ? 10 : 1;

}  // namespace quarzel::test
