// SPDX-License-Identifier: MIT
#include "plot/curve_labels.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <filesystem>
#include <functional>

#include "report_text.hpp"

namespace quarzel::tool {

namespace {

constexpr std::array<const char*, 3> algorithms = {"max-log", "scaled max-log", "max-star"};

using Field = std::function<std::string(const SweepCurve&)>;

/// What may differ, in the order in which it is told.
const std::array<Field, 6> fields = {
    [](const SweepCurve& curve) {
        return fmt::format("{} = {}", curve.isTransportBlock ? "A" : "K", curve.blockSize);
    },
    [](const SweepCurve& curve) { return fmt::format("{} units", curve.units); },
    [](const SweepCurve& curve) {
        return std::string(algorithms.at(static_cast<std::size_t>(curve.algorithm)));
    },
    [](const SweepCurve& curve) {
        return counted(static_cast<std::size_t>(curve.iterations), "iteration", "iterations");
    },
    [](const SweepCurve& curve) {
        return fmt::format("{} \u00d7 {}",
                           curve.quantiser.kind == link::Quantiser::Kind::llr ? "LLR" : "amplitude",
                           curve.quantiser.scale);
    },
    [](const SweepCurve& curve) { return curve.sending; },
};

std::string seedOf(const SweepCurve& curve) {
    return fmt::format("seed {}", curve.seed);
}

std::string fileOf(const SweepCurve& curve) {
    return std::filesystem::path(curve.file).stem().string();
}

void append(std::string& text, const std::string& part) {
    text += (text.empty() || part.empty() ? "" : ", ") + part;
}

bool isShared(const std::vector<SweepCurve>& curves, const Field& field) {
    return std::all_of(curves.begin(), curves.end(),
                       [&](const SweepCurve& curve) { return field(curve) == field(curves.front()); });
}

bool areUnique(std::vector<std::string> labels) {
    std::sort(labels.begin(), labels.end());
    return std::adjacent_find(labels.begin(), labels.end()) == labels.end();
}

}  // namespace

CurveLabels labelsOf(const std::vector<SweepCurve>& curves) {
    CurveLabels result{"", std::vector<std::string>(curves.size())};
    const auto appendToAll = [&](const Field& field) {
        for (std::size_t i = 0; i < curves.size(); ++i) {
            append(result.labels[i], field(curves[i]));
        }
    };
    for (const Field& field : fields) {
        if (isShared(curves, field)) {
            append(result.title, field(curves.front()));
        } else {
            appendToAll(field);
        }
    }
    // The seed and the file are told only where nothing else tells the curves apart.
    for (const Field& field : {Field(seedOf), Field(fileOf)}) {
        if (!areUnique(result.labels) && !isShared(curves, field)) {
            appendToAll(field);
        }
    }
    if (curves.size() == 1) {
        result.labels.front() = "quarzel";
    }
    return result;
}

}  // namespace quarzel::tool
