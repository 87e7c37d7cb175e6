// SPDX-License-Identifier: MIT
#include "sweep/natural_log.hpp"

namespace quarzel::sweep {

double naturalLog(double x) {
    constexpr double ofTwo = 0.6931471805599453;
    constexpr int terms = 20;
    double powers = 0;  // of two
    for (; x > 1.5; x /= 2) {
        ++powers;
    }
    for (; x < 0.75; x *= 2) {
        --powers;
    }
    // ln x = 2 artanh y, and |y| is at most 1/5.
    const double y = (x - 1) / (x + 1);
    double sum = 0;
    for (int i = terms - 1; i >= 0; --i) {
        sum = sum * y * y + 1.0 / (2 * i + 1);
    }
    return powers * ofTwo + 2 * y * sum;
}

}  // namespace quarzel::sweep
