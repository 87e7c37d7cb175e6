// SPDX-License-Identifier: MIT
#include "sweeps/threshold_table.hpp"

#include <fmt/format.h>

#include <string>

#include "sweep/point_json.hpp"

namespace quarzel::tool {

namespace {

using sweep::Json;

/// The curve as it is looked at: after the iterations that are counted.
sweep::Setup countedCurve(const sweep::Target& target) {
    sweep::Setup curve = target.curve;
    curve.iterations = target.iterations;
    return curve;
}

std::string decibels(double value) {
    return fmt::format("{:.3f}", value);
}

void printTable(std::ostream& stream, const std::vector<FoundThreshold>& found) {
    const FoundThreshold* last = nullptr;
    for (const FoundThreshold& row : found) {
        const sweep::Setup curve = countedCurve(row.target);
        if (last == nullptr || curve != countedCurve(last->target)) {
            stream << sweep::curveText(curve) << "\n     BLER    Eb/N0  95 % of Eb/N0\n";
        }
        stream << fmt::format("{:>9}", row.target.rate)
               << (row.threshold ? fmt::format("{:>9}  {} {}", decibels(row.threshold->ebN0),
                                               decibels(row.threshold->low), decibels(row.threshold->high))
                                 : "  not reached from -20 to 40 dB")
               << '\n';
        last = &row;
    }
}

void printCsv(std::ostream& stream, const std::vector<FoundThreshold>& found) {
    printFieldNames(stream);
    stream << "bler,ebn0_db,ebn0_low,ebn0_high\n";
    for (const auto& [target, threshold] : found) {
        printFields(stream, countedCurve(target));
        stream << target.rate << ','
               << (threshold ? fmt::format("{},{},{}", decibels(threshold->ebN0), decibels(threshold->low),
                                           decibels(threshold->high))
                             : ",,")
               << '\n';
    }
}

/// The number that three decimals stand for.
Json rounded(double value) {
    return std::stod(decibels(value));
}

void printJson(std::ostream& stream, std::uint64_t seed, const std::vector<FoundThreshold>& found) {
    Json thresholds = Json::array();
    for (const auto& [target, threshold] : found) {
        Json& json = thresholds.emplace_back(sweep::curveJson(countedCurve(target)));
        json["bler"] = target.rate;
        json["ebn0_db"] = threshold ? rounded(threshold->ebN0) : Json();
        json["ebn0_interval"] =
            threshold ? Json::array({rounded(threshold->low), rounded(threshold->high)}) : Json();
    }
    stream << Json{{"seed", seed}, {"thresholds", std::move(thresholds)}}.dump(1) << '\n';
}

}  // namespace

void printThresholds(std::ostream& stream, std::uint64_t seed, const std::vector<FoundThreshold>& found,
                     SweepForm form) {
    switch (form) {
        case SweepForm::table:
            return printTable(stream, found);
        case SweepForm::csv:
            return printCsv(stream, found);
        case SweepForm::json:
            return printJson(stream, seed, found);
    }
}

}  // namespace quarzel::tool
