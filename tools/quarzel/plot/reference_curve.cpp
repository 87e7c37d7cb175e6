// SPDX-License-Identifier: MIT
#include "plot/reference_curve.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <filesystem>
#include <set>
#include <string_view>

#include "files/input_file.hpp"
#include "plot/reference_rows.hpp"
#include "tool_error.hpp"

namespace quarzel::tool {

namespace {

using Setup = decltype(ReferenceRow::setup);

/// The curves of a file and what each was measured with.
struct Curves {
    std::vector<Setup> setups;
    std::vector<ReferenceCurve> curves;
};

int bitsOf(std::string_view modulation, const std::string& file) {
    constexpr std::array<std::pair<std::string_view, int>, 6> known = {
        {{"", 1}, {"BPSK", 1}, {"QPSK", 2}, {"16QAM", 4}, {"64QAM", 6}, {"256QAM", 8}}};
    const auto* const found = std::find_if(known.begin(), known.end(),
                                           [&](const auto& entry) { return entry.first == modulation; });
    if (found == known.end()) {
        throw fileError(file, fmt::format("'{:.20}' is not a modulation", modulation),
                        "give BPSK, QPSK, 16QAM, 64QAM or 256QAM");
    }
    return found->second;
}

ReferenceCurve curveOf(const Setup& setup, const std::string& file) {
    ReferenceCurve curve;
    if (!setup[referenceK].empty()) {
        curve.blockSize = countFrom(setup[referenceK], file);
    }
    if (curve.blockSize && !setup[referenceCodeBits].empty()) {
        curve.bitsPerSymbol = static_cast<double>(*curve.blockSize) /
                              static_cast<double>(countFrom(setup[referenceCodeBits], file)) *
                              bitsOf(setup[referenceModulation], file);
    }
    return curve;
}

Curves curvesOf(const std::vector<ReferenceRow>& rows, const std::string& file) {
    Curves result;
    for (const ReferenceRow& row : rows) {
        const auto same = std::find(result.setups.begin(), result.setups.end(), row.setup);
        const auto index = static_cast<std::size_t>(same - result.setups.begin());
        if (same == result.setups.end()) {
            result.setups.push_back(row.setup);
            result.curves.push_back(curveOf(row.setup, file));
        }
        ReferenceCurve& curve = result.curves[index];
        if (row.ber) {
            curve.ber.emplace_back(row.ebN0, *row.ber);
        }
        if (row.bler) {
            curve.bler.emplace_back(row.ebN0, *row.bler);
        }
    }
    return result;
}

std::string textOf(std::size_t column, const std::string& field) {
    switch (column) {
        case referenceK:
            return "K = " + field;
        case referenceIterations:
            return field + " iterations";
        case referenceCodeBits:
            return field + " code bits";
        default:
            return field;
    }
}

/// Tell the curves of a file apart by as few columns as are enough.
void addLabels(Curves& file) {
    std::set<std::string> labels;
    for (std::size_t column = 0; column < referenceColumns && labels.size() < file.curves.size(); ++column) {
        const auto isShared = [&](const Setup& setup) { return setup[column] == file.setups[0][column]; };
        if (std::all_of(file.setups.begin(), file.setups.end(), isShared)) {
            continue;
        }
        labels.clear();
        for (std::size_t i = 0; i < file.curves.size(); ++i) {
            file.curves[i].label += ", " + textOf(column, file.setups[i][column]);
            labels.insert(file.curves[i].label);
        }
    }
}

}  // namespace

std::vector<ReferenceCurve> readReferenceCurves(std::istream& stream, const std::string& label,
                                                const std::string& file) {
    Curves result = curvesOf(readReferenceRows(stream, file), file);
    for (ReferenceCurve& curve : result.curves) {
        curve.label = label;
    }
    addLabels(result);
    std::erase_if(result.curves,
                  [](const ReferenceCurve& curve) { return curve.ber.empty() && curve.bler.empty(); });
    if (result.curves.empty()) {
        throw fileError(file, "holds no point", referenceRemedy);
    }
    return result.curves;
}

std::vector<ReferenceCurve> readReferenceCurves(const std::string& argument) {
    const std::size_t equals = argument.find('=');
    std::error_code ignored;  // a long label is not a file name
    const bool hasLabel = equals != std::string::npos && !std::filesystem::exists(argument, ignored);
    const std::string file = hasLabel ? argument.substr(equals + 1) : argument;
    std::ifstream stream = openInput(file);
    return readReferenceCurves(
        stream, hasLabel ? argument.substr(0, equals) : std::filesystem::path(file).stem().string(), file);
}

}  // namespace quarzel::tool
