// SPDX-License-Identifier: MIT
#include "sweeps/sweep_table.hpp"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <algorithm>

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
                              rate(point.counts[i].bitErrors, point.blocks * setup.informationBits()),
                              rate(point.counts[i].blockErrors, point.blocks));
    }
}

/// What a point has beside the rates when its blocks are coded.
void printSending(std::ostream& stream, const Setup& setup, const PointState& point) {
    if (setup.transmissions() == 1) {
        stream << fmt::format("        throughput {:.4f}\n",
                              sweep::throughput(setup, point, point.counts.size() - 1));
    }
    for (std::size_t t = 0; t < setup.transmissions() && setup.transmissions() > 1; ++t) {
        const sweep::ErrorCount& count = point.counts[t];
        stream << fmt::format("   sent {:2}{:>8}{:>11}{:>10}{:>10.2e}{:>10.2e}  throughput {:.4f}\n", t + 1,
                              sweep::blocksSent(point, t), count.bitErrors, count.blockErrors,
                              rate(count.bitErrors, point.blocks * setup.informationBits()),
                              rate(count.blockErrors, point.blocks), sweep::throughput(setup, point, t));
    }
    if (setup.sending.transportBlock != 0) {
        stream << fmt::format("        undetected errors {}\n", point.last().undetected);
    }
    if (!point.iterationsUsed.empty()) {
        stream << fmt::format("        iterations used {:.3f}: {}\n", sweep::meanIterations(point),
                              fmt::join(point.iterationsUsed, " "));
    }
}

template <class Value>
std::string fieldText(const Value& value) {
    return fmt::format("{}", value);
}

std::string fieldText(link::Quantiser::Kind kind) {
    return std::string(sweep::nameOf(kind));
}

std::string fieldText(link::Modulation modulation) {
    return std::string(nameOf(modulation));
}

std::string fieldText(link::Fading fading) {
    return std::string(link::channelNames.at(static_cast<std::size_t>(fading)));
}

std::string fieldText(link::Demapping demapping) {
    return std::string(link::demappingNames.at(static_cast<std::size_t>(demapping)));
}

std::string fieldText(sweep::Stop stop) {
    return std::string(nameOf(stop));
}

std::string fieldText(const std::vector<unsigned>& versions) {
    return fmt::format("{}", fmt::join(versions, " "));
}

constexpr const char* sendingNames =
    ",transmission,blocks_sent,undetected_errors,throughput,mean_iterations,iterations_used";

/// The columns of CSV under these names. Iterations stand at the last count alone.
std::string sendingFields(const Setup& setup, const PointState& point, std::size_t count) {
    const std::size_t t = setup.transmissions() > 1 ? count : 0;
    const bool hasIterations = count + 1 == point.counts.size() && !point.iterationsUsed.empty();
    return fmt::format(
        ",{},{},{},{},{}", t + 1, sweep::blocksSent(point, t),
        setup.sending.transportBlock != 0 ? fmt::format("{}", point.counts[count].undetected) : "",
        sweep::throughput(setup, point, count),
        hasIterations
            ? fmt::format("{},{}", sweep::meanIterations(point), fmt::join(point.iterationsUsed, " "))
            : ",");
}

std::string reasonText(const PointState& point) {
    return point.stoppedBy ? std::string(sweep::nameOf(*point.stoppedBy)) : "";
}

}  // namespace

std::string rowText(const Setup& setup, const PointState& point) {
    const Rates rates = sweep::ratesOf(point, setup.informationBits());
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
    if (point.counts.size() > setup.transmissions()) {
        printIterations(stream, setup, point);
    }
    if (!setup.sending.isPlain()) {
        printSending(stream, setup, point);
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
    const bool isCoded = std::any_of(result.points.begin(), result.points.end(),
                                     [](const auto& point) { return !point.first.sending.isPlain(); });
    printFieldNames(stream);
    if (isCoded) {
        const sweep::Sending any;
        sweep::forEachSendingField(any, [&stream](const char* name, const auto&) { stream << name << ','; });
    }
    stream << "ebn0_db,iteration,blocks,bits,bit_errors,block_errors,ber,bler,ber_low,ber_high,bler_low,"
              "bler_high,stopped_by"
           << (isCoded ? sendingNames : "") << '\n';
    for (const auto& [setup, point] : result.points) {
        const Rates rates = sweep::ratesOf(point, setup.informationBits());
        const std::uint64_t bits = point.blocks * setup.informationBits();
        for (std::size_t i = 0; i < point.counts.size(); ++i) {
            const sweep::ErrorCount& count = point.counts[i];
            const bool isLast = i + 1 == point.counts.size();
            const auto all = static_cast<std::size_t>(setup.iterations);
            const std::size_t iteration = setup.transmissions() > 1 ? all : all - point.counts.size() + i + 1;
            printFields(stream, setup);
            if (isCoded) {
                sweep::forEachSendingField(setup.sending, [&stream](const char*, const auto& value) {
                    stream << fieldText(value) << ',';
                });
            }
            stream << fmt::format("{},{},{},{},{},{},{},{},", setup.ebN0.value(), iteration, point.blocks,
                                  bits, count.bitErrors, count.blockErrors, rate(count.bitErrors, bits),
                                  rate(count.blockErrors, point.blocks))
                   << (isLast ? fmt::format("{},{},{},{}", rates.berInterval.low, rates.berInterval.high,
                                            rates.blerInterval.low, rates.blerInterval.high)
                              : ",,,")
                   << ',' << reasonText(point) << (isCoded ? sendingFields(setup, point, i) : "") << '\n';
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
