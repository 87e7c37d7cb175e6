// SPDX-License-Identifier: MIT
#include "engine/engine_dump.hpp"

#include <ostream>
#include <string>
#include <string_view>

#include "engine/dump_columns.hpp"

using quarzel::appendBranchMetrics;
using quarzel::appendMarkedReal;
using quarzel::appendReal;
using quarzel::appendStateMetrics;

namespace {

constexpr std::string_view gap = "  ";

constexpr std::string_view gammaHeader =
    "n    intrinsic   parity0     parity1   "
    "     g1[0]        g1[1]        g1[2]        g1[3]     "
    "     g2[0]        g2[1]        g2[2]        g2[3]";

constexpr std::string_view alphaBetaHeader =
    "n    g4          g5          g6          g7          "
    "   ab1[0]       ab1[1]       ab1[2]       ab1[3]       ab1[4]       ab1[5]       ab1[6]       ab1[7]    "
    "  "
    "   ab2[0]       ab2[1]       ab2[2]       ab2[3]       ab2[4]       ab2[5]       ab2[6]       ab2[7]";

constexpr std::string_view extrinsicHeader =
    "n    a[0]        a[1]        a[2]        a[3]        a[4]        a[5]        a[6]        a[7]        "
    "  b[0]        b[1]        b[2]        b[3]        b[4]        b[5]        b[6]        b[7]        "
    "  g[4]        g[5]        g[6]        g[7]        "
    "   e1           e2";

/// The first `count` elements of a record, each marked against the other record.
void appendMarkedReals(std::string& row, std::size_t count, const T8& words, const T8& partners,
                       const TNumberFormat& format) {
    for (std::size_t i = 0; i < count; ++i) {
        appendMarkedReal(row, words[i], partners[i], format);
    }
}

/// Write the headings and a row for each of n steps, whose columns after the step number `appendColumns`
/// appends. The writes are unformatted ones.
template <class AppendColumns>
std::ostream& writeTable(std::ostream& stream, std::string_view header, unsigned n,
                         AppendColumns appendColumns) {
    std::string row(header);
    row += '\n';
    stream.write(row.data(), static_cast<std::streamsize>(row.size()));
    for (unsigned step = 0; step < n; ++step) {
        row.clear();
        quarzel::appendStep(row, step);
        appendColumns(row, step);
        row += '\n';
        stream.write(row.data(), static_cast<std::streamsize>(row.size()));
    }
    return stream;
}

}  // namespace

std::ostream& dumpGamma(std::ostream& stream, unsigned n, const short* intrinsic, const short* parity0,
                        const short* parity1, const T8* g1, const T8* g2, const TNumberFormat* format) {
    return writeTable(stream, gammaHeader, n, [=](std::string& row, unsigned step) {
        appendReal(row, intrinsic[step], *format);
        appendReal(row, parity0[step], *format);
        appendReal(row, parity1[step], *format);
        row += gap;
        appendMarkedReals(row, 4, g1[step], g2[step], *format);
        row += gap;
        appendMarkedReals(row, 4, g2[step], g1[step], *format);
    });
}

std::ostream& dumpAlphaBeta(std::ostream& stream, unsigned n, const T8* gamma, const T8* ab1, const T8* ab2,
                            const TNumberFormat* format) {
    return writeTable(stream, alphaBetaHeader, n, [=](std::string& row, unsigned step) {
        appendBranchMetrics(row, gamma[step], *format);
        row += gap;
        appendMarkedReals(row, 8, ab1[step], ab2[step], *format);
        row += gap;
        appendMarkedReals(row, 8, ab2[step], ab1[step], *format);
    });
}

std::ostream& dumpExtrinsic(std::ostream& stream, unsigned n, const T8* alpha, const T8* beta,
                            const T8* gamma, const short* e1, const short* e2, const TNumberFormat* format) {
    return writeTable(stream, extrinsicHeader, n, [=](std::string& row, unsigned step) {
        appendStateMetrics(row, alpha[step], *format);
        row += gap;
        appendStateMetrics(row, beta[step], *format);
        row += gap;
        appendBranchMetrics(row, gamma[step], *format);
        row += gap;
        appendMarkedReal(row, e1[step], e2[step], *format);
        row += gap;
        appendMarkedReal(row, e2[step], e1[step], *format);
    });
}
