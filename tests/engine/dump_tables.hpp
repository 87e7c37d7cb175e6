// SPDX-License-Identifier: MIT
#pragma once

#include <gtest/gtest.h>

#include <cstddef>
#include <sstream>
#include <string>
#include <vector>

#include "engine/engine_dump.hpp"
#include "support/random.hpp"

/// The tables of an engine's arrays, for tests that look at them as text.
namespace quarzel::test {

inline const std::string gammaHeader =
    "n    intrinsic   parity0     parity1        "
    "g1[0]        g1[1]        g1[2]        g1[3]          "
    "g2[0]        g2[1]        g2[2]        g2[3]\n";

inline const std::string alphaBetaHeader =
    "n    g4          g5          g6          g7             "
    "ab1[0]       ab1[1]       ab1[2]       ab1[3]       ab1[4]       ab1[5]       ab1[6]       ab1[7]       "
    "  ab2[0]       ab2[1]       ab2[2]       ab2[3]       ab2[4]       ab2[5]       ab2[6]       ab2[7]\n";

inline const std::string extrinsicHeader =
    "n    a[0]        a[1]        a[2]        a[3]        a[4]        a[5]        a[6]        a[7]          "
    "b[0]        b[1]        b[2]        b[3]        b[4]        b[5]        b[6]        b[7]          "
    "g[4]        g[5]        g[6]        g[7]           "
    "e1           e2\n";

/// A format whose integer unit, 1/8, is 16 in a word.
inline const TNumberFormat stateFormat(12, 3);

/// The working arrays of an engine, everything zero at first.
struct Arrays {
    explicit Arrays(std::size_t n)
        : alpha(n),
          beta(n),
          gamma(n),
          gamma2(n),
          intrinsic(n),
          parity0(n),
          parity1(n),
          extrinsic(n),
          extrinsic2(n) {}

    std::vector<T8> alpha;
    std::vector<T8> beta;  ///< also the second array of a pair with alpha
    std::vector<T8> gamma;
    std::vector<T8> gamma2;
    std::vector<short> intrinsic;
    std::vector<short> parity0;
    std::vector<short> parity1;
    std::vector<short> extrinsic;
    std::vector<short> extrinsic2;
};

inline Arrays randomArrays(std::mt19937& random, std::size_t n) {
    Arrays arrays(n);
    arrays.alpha = randomRecords(random, n);
    arrays.beta = randomRecords(random, n);
    arrays.gamma = randomRecords(random, n);
    arrays.gamma2 = randomRecords(random, n);
    arrays.intrinsic = randomWords(random, n);
    arrays.parity0 = randomWords(random, n);
    arrays.parity1 = randomWords(random, n);
    arrays.extrinsic = randomWords(random, n);
    arrays.extrinsic2 = randomWords(random, n);
    return arrays;
}

/// One of the three tables, in a form common to all.
using Table = std::ostream& (*)(std::ostream&, const Arrays&, const TNumberFormat&);

inline std::ostream& gammaTable(std::ostream& stream, const Arrays& arrays, const TNumberFormat& format) {
    return dumpGamma(stream, static_cast<unsigned>(arrays.gamma.size()), arrays.intrinsic.data(),
                     arrays.parity0.data(), arrays.parity1.data(), arrays.gamma.data(), arrays.gamma2.data(),
                     &format);
}

inline std::ostream& alphaBetaTable(std::ostream& stream, const Arrays& arrays, const TNumberFormat& format) {
    return dumpAlphaBeta(stream, static_cast<unsigned>(arrays.gamma.size()), arrays.gamma.data(),
                         arrays.alpha.data(), arrays.beta.data(), &format);
}

inline std::ostream& extrinsicTable(std::ostream& stream, const Arrays& arrays, const TNumberFormat& format) {
    return dumpExtrinsic(stream, static_cast<unsigned>(arrays.gamma.size()), arrays.alpha.data(),
                         arrays.beta.data(), arrays.gamma.data(), arrays.extrinsic.data(),
                         arrays.extrinsic2.data(), &format);
}

inline constexpr Table tables[] = {gammaTable, alphaBetaTable, extrinsicTable};

/// A table as text.
inline std::string text(Table table, const Arrays& arrays, const TNumberFormat& format = stateFormat) {
    std::ostringstream stream;
    EXPECT_EQ(&table(stream, arrays, format), &stream);
    return stream.str();
}

/// The lines of a text, without their line feeds.
inline std::vector<std::string> lines(const std::string& text) {
    std::vector<std::string> result;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);) {
        result.push_back(line);
    }
    return result;
}

}  // namespace quarzel::test
