// SPDX-License-Identifier: MIT
#include "sweeps/sweep_table.hpp"

#include <fmt/format.h>

#include "sweep/statistics.hpp"

namespace quarzel::tool {

namespace {

using sweep::Curve;
using sweep::PointState;
using sweep::Rates;

double rate(std::uint64_t part, std::uint64_t whole) {
    return static_cast<double>(part) / static_cast<double>(whole);
}

/// Call a function for each point: what it is of, and whether it is the first of its curve.
template <class Function>
void forEachPoint(const sweep::Result& result, Function function) {
    std::size_t next = 0;
    for (const Curve& curve : result.configuration.curves()) {
        for (std::size_t i = 0; i < result.configuration.ebN0.size(); ++i) {
            function(curve, result.configuration.ebN0[i], result.points.at(next++), i == 0);
        }
    }
}

void printIterations(std::ostream& stream, const PointState& point, const Curve& curve) {
    for (std::size_t i = 0; i < point.counts.size(); ++i) {
        stream << fmt::format("  after {:2}{:>14}{:>10}{:>10.2e}{:>10.2e}\n", i + 1,
                              point.counts[i].bitErrors, point.counts[i].blockErrors,
                              rate(point.counts[i].bitErrors, point.blocks * curve.blockSize),
                              rate(point.counts[i].blockErrors, point.blocks));
    }
}

}  // namespace

const char* const sweepHeadings = "  Eb/N0    blocks bit errors  block e.       BER      BLER  95 % of BLER";

std::string curveText(const Curve& curve) {
    return fmt::format("K {}, {} units, algorithm {}, {} iteration{}", curve.blockSize, curve.units,
                       curve.algorithm, curve.iterations, curve.iterations == 1 ? "" : "s");
}

std::string rowText(const PointState& point, link::Decibels ebN0, const Curve& curve) {
    const Rates rates = sweep::ratesOf(point, curve.blockSize);
    return fmt::format("{:>7}{:>10}{:>11}{:>10}{:>10.2e}{:>10.2e}  {:.2e} {:.2e}", ebN0.value(), point.blocks,
                       point.last().bitErrors, point.last().blockErrors, rates.ber, rates.bler,
                       rates.blerInterval.low, rates.blerInterval.high);
}

void printTable(std::ostream& stream, const sweep::Result& result) {
    forEachPoint(result, [&](const Curve& curve, link::Decibels ebN0, const PointState& point, bool isFirst) {
        if (isFirst) {
            stream << curveText(curve) << '\n' << sweepHeadings << '\n';
        }
        stream << rowText(point, ebN0, curve) << '\n';
        if (result.configuration.perIteration) {
            printIterations(stream, point, curve);
        }
    });
}

void printCsv(std::ostream& stream, const sweep::Result& result) {
    stream << "block_size,units,algorithm,iterations,ebn0_db,iteration,blocks,bits,bit_errors,block_errors,"
              "ber,bler,"
              "ber_low,ber_high,bler_low,bler_high,stopped_by\n";
    forEachPoint(result, [&](const Curve& curve, link::Decibels ebN0, const PointState& point, bool) {
        const Rates rates = sweep::ratesOf(point, curve.blockSize);
        const std::uint64_t bits = point.blocks * curve.blockSize;
        for (std::size_t i = 0; i < point.counts.size(); ++i) {
            const sweep::ErrorCount& count = point.counts[i];
            const bool isLast = i + 1 == point.counts.size();
            const std::size_t iteration =
                static_cast<std::size_t>(curve.iterations) - point.counts.size() + i + 1;
            stream << fmt::format("{},{},{},{},{},{},{},{},{},{},{},{},", curve.blockSize, curve.units,
                                  curve.algorithm, curve.iterations, ebN0.value(), iteration, point.blocks,
                                  bits, count.bitErrors, count.blockErrors, rate(count.bitErrors, bits),
                                  rate(count.blockErrors, point.blocks));
            stream << (isLast ? fmt::format("{},{},{},{}", rates.berInterval.low, rates.berInterval.high,
                                            rates.blerInterval.low, rates.blerInterval.high)
                              : ",,,")
                   << ',' << sweep::nameOf(point.stoppedBy.value()) << '\n';
        }
    });
}

void printSweep(std::ostream& stream, const sweep::Result& result, SweepForm form) {
    switch (form) {
        case SweepForm::table:
            return printTable(stream, result);
        case SweepForm::csv:
            return printCsv(stream, result);
        case SweepForm::json:
            stream << sweep::resultText(result);
    }
}

void addFormOptions(CLI::App& command, SweepForm& form) {
    CLI::Option* const json = command.add_flag_callback(
        "--json", [&form] { form = SweepForm::json; }, "Print the result file instead of a table");
    command
        .add_flag_callback(
            "--csv", [&form] { form = SweepForm::csv; }, "Print CSV instead of a table")
        ->excludes(json);
}

}  // namespace quarzel::tool
