// SPDX-License-Identifier: MIT
#include "sweeps/sweep_table.hpp"

#include <fmt/format.h>

#include "sweep/statistics.hpp"

namespace quarzel::tool {

namespace {

using sweep::PointState;
using sweep::Rates;
using sweep::Setup;

constexpr const char* headings = "  Eb/N0    blocks bit errors  block e.       BER      BLER  95 % of BLER";

double rate(std::uint64_t part, std::uint64_t whole) {
    return static_cast<double>(part) / static_cast<double>(whole);
}

void printIterations(std::ostream& stream, const Setup& setup, const PointState& point) {
    for (std::size_t i = 0; i < point.counts.size(); ++i) {
        stream << fmt::format("  after {:2}{:>14}{:>10}{:>10.2e}{:>10.2e}\n", i + 1,
                              point.counts[i].bitErrors, point.counts[i].blockErrors,
                              rate(point.counts[i].bitErrors, point.blocks * setup.blockSize),
                              rate(point.counts[i].blockErrors, point.blocks));
    }
}

template <class Value>
std::string fieldText(const Value& value) {
    return fmt::format("{}", value);
}

std::string fieldText(link::Quantiser::Kind kind) {
    return std::string(sweep::nameOf(kind));
}

std::string reasonText(const PointState& point) {
    return point.stoppedBy ? std::string(sweep::nameOf(*point.stoppedBy)) : "";
}

}  // namespace

std::string rowText(const Setup& setup, const PointState& point) {
    const Rates rates = sweep::ratesOf(point, setup.blockSize);
    return fmt::format("{:>7}{:>10}{:>11}{:>10}{:>10.2e}{:>10.2e}  {:.2e} {:.2e}", setup.ebN0.value(),
                       point.blocks, point.last().bitErrors, point.last().blockErrors, rates.ber, rates.bler,
                       rates.blerInterval.low, rates.blerInterval.high);
}

void printFieldNames(std::ostream& stream) {
    const Setup any;
    sweep::forEachField(any, [&stream](const char* name, const auto&) { stream << name << ','; });
}

void printFields(std::ostream& stream, const Setup& curve) {
    sweep::forEachField(curve,
                        [&stream](const char*, const auto& value) { stream << fieldText(value) << ','; });
}

void printPoint(std::ostream& stream, const Setup& setup, const PointState& point, bool isFirst) {
    if (isFirst) {
        stream << sweep::curveText(setup) << '\n' << headings << '\n';
    }
    stream << rowText(setup, point) << '\n';
    if (point.counts.size() > 1) {
        printIterations(stream, setup, point);
    }
}

void printTable(std::ostream& stream, const sweep::Result& result) {
    const Setup* last = nullptr;
    for (const auto& [setup, point] : result.points) {
        printPoint(stream, setup, point, last == nullptr || !sweep::isSameCurve(setup, *last));
        last = &setup;
    }
}

void printCsv(std::ostream& stream, const sweep::Result& result) {
    printFieldNames(stream);
    stream << "ebn0_db,iteration,blocks,bits,bit_errors,block_errors,ber,bler,ber_low,ber_high,bler_low,"
              "bler_high,stopped_by\n";
    for (const auto& [setup, point] : result.points) {
        const Rates rates = sweep::ratesOf(point, setup.blockSize);
        const std::uint64_t bits = point.blocks * setup.blockSize;
        for (std::size_t i = 0; i < point.counts.size(); ++i) {
            const sweep::ErrorCount& count = point.counts[i];
            const bool isLast = i + 1 == point.counts.size();
            const std::size_t iteration =
                static_cast<std::size_t>(setup.iterations) - point.counts.size() + i + 1;
            printFields(stream, setup);
            stream << fmt::format("{},{},{},{},{},{},{},{},", setup.ebN0.value(), iteration, point.blocks,
                                  bits, count.bitErrors, count.blockErrors, rate(count.bitErrors, bits),
                                  rate(count.blockErrors, point.blocks))
                   << (isLast ? fmt::format("{},{},{},{}", rates.berInterval.low, rates.berInterval.high,
                                            rates.blerInterval.low, rates.blerInterval.high)
                              : ",,,")
                   << ',' << reasonText(point) << '\n';
        }
    }
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
