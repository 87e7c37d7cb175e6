// SPDX-License-Identifier: MIT
#pragma once

#include <iosfwd>

#include "engine/t8.hpp"
#include "fixed/number_format.hpp"

/// Tables of an engine's working arrays, one row for every trellis step, so that two runs, or two arrays that
/// should agree, can be compared line by line. In a pair of arrays a "*" stands before every value that
/// differs from its partner.
///
/// Each function writes a line of headings and then n rows: the step number and the values, as the real
/// numbers that they stand for in `format`. The text depends on the values alone: settings of the
/// stream (flags, width, fill, locale) neither change it nor are changed. Each returns the stream.

/// Inputs of the branch metrics, and two arrays of branch metrics (elements 0 to 3).
std::ostream& dumpGamma(std::ostream& stream, unsigned n, const short* intrinsic, const short* parity0,
                        const short* parity1, const T8* g1, const T8* g2, const TNumberFormat* format);

/// Branch metrics, and two arrays of forward or backward state metrics.
///
/// The columns g4 to g7 hold elements 2, 1, 3 and 0 of a branch-metric record.
std::ostream& dumpAlphaBeta(std::ostream& stream, unsigned n, const T8* gamma, const T8* ab1, const T8* ab2,
                            const TNumberFormat* format);

/// All metrics, and two arrays of extrinsic values.
///
/// The columns g[4] to g[7] hold elements 2, 1, 3 and 0 of a branch-metric record.
std::ostream& dumpExtrinsic(std::ostream& stream, unsigned n, const T8* alpha, const T8* beta,
                            const T8* gamma, const short* e1, const short* e2, const TNumberFormat* format);
