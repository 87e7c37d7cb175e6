// SPDX-License-Identifier: MIT
#pragma once

#include <mpfr.h>

#include <cstdint>

namespace quarzel::link {

/// A number of 128 bits. Operations of MPFR on it round correctly, to the nearest, so a table made with them
/// is the same on every machine.
class Number {
  public:
    explicit Number(double value = 0) {
        mpfr_init2(itsValue, 128);
        mpfr_set_d(itsValue, value, MPFR_RNDN);
    }
    Number(const Number& other) {
        mpfr_init2(itsValue, 128);
        mpfr_set(itsValue, other.itsValue, MPFR_RNDN);
    }
    Number& operator=(const Number& other) {
        mpfr_set(itsValue, other.itsValue, MPFR_RNDN);
        return *this;
    }
    ~Number() { mpfr_clear(itsValue); }

    mpfr_ptr get() { return itsValue; }
    mpfr_srcptr get() const { return itsValue; }

    /// The double nearest to it.
    double value() const { return mpfr_get_d(itsValue, MPFR_RNDN); }

    friend Number operator+(const Number& a, const Number& b) { return joined(mpfr_add, a, b); }
    friend Number operator-(const Number& a, const Number& b) { return joined(mpfr_sub, a, b); }
    friend Number operator*(const Number& a, const Number& b) { return joined(mpfr_mul, a, b); }
    friend Number operator/(const Number& a, const Number& b) { return joined(mpfr_div, a, b); }
    friend bool operator<(const Number& a, const Number& b) { return mpfr_less_p(a.get(), b.get()) != 0; }

  private:
    template <class Join>
    static Number joined(Join join, const Number& a, const Number& b) {
        Number result;
        join(result.itsValue, a.itsValue, b.itsValue, MPFR_RNDN);
        return result;
    }

    mpfr_t itsValue;
};

/// A function of one number, such as mpfr_exp.
template <class Function>
Number applied(Function function, const Number& x) {
    Number result;
    function(result.get(), x.get(), MPFR_RNDN);
    return result;
}

/// Frees the constants that the library keeps for a thread when the function ends: threads come and go.
class FreedCache {
  public:
    FreedCache() = default;
    FreedCache(const FreedCache&) = delete;
    FreedCache& operator=(const FreedCache&) = delete;
    ~FreedCache() { mpfr_free_cache(); }
};

}  // namespace quarzel::link
