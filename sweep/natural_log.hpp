// SPDX-License-Identifier: MIT
#pragma once

namespace quarzel::sweep {

/// The natural logarithm to about 15 digits, with + - * / in double alone: that of the C library differs in
/// its last digit from one machine to the next.
/// @param x  above 0
double naturalLog(double x);

}  // namespace quarzel::sweep
