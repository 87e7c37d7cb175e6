// SPDX-License-Identifier: MIT
#include "trace/trace_vcd.hpp"

#include <fmt/format.h>

#include <iterator>
#include <utility>

#include "trace/trace_value.hpp"
#include "trace/vcd_variables.hpp"

namespace quarzel::tool {

namespace {

constexpr unsigned stepTime = 10;

/// The code of a variable: a printable character.
char codeOf(std::size_t variable) {
    return static_cast<char>('!' + variable);
}

}  // namespace

TraceVcd::TraceVcd(Write write) : itsWrite(std::move(write)), itsValues(vcdNames().size()) {
    for (int raw = TraceValue::lowest; raw <= TraceValue::highest; ++raw) {
        itsBits.push_back(fmt::format("b{:012b} ", static_cast<unsigned>(raw) & 0xFFFU));
    }
    itsText = "$timescale 1ns $end\n$scope module quarzel $end\n";
    for (std::size_t variable = 0; variable < vcdNames().size(); ++variable) {
        const bool isPlace = variable < vcdPlaces.size();
        fmt::format_to(std::back_inserter(itsText), "$var integer {} {} {} $end\n", isPlace ? 32 : 12,
                       codeOf(variable), vcdNames()[variable]);
    }
    itsText += "$upscope $end\n$enddefinitions $end\n";
}

void TraceVcd::add(const vardel_ip_quarzel_pass& pass) {
    std::uint32_t step = pass.steps;
    forEachValue(pass, [&](std::uint32_t at, unsigned column, std::int16_t word) {
        if (at != step) {
            step = at;
            startStep();
            change(0, static_cast<std::int64_t>(pass.block));
            change(1, pass.pass);
            change(2, pass.code);
            change(3, step);
            for (std::size_t input = 0; input < vcdInputs.size(); ++input) {
                change(vcdPlaces.size() + input, rawOf(pass.inputs[pass.code - 1][input][step]));
            }
        }
        change(vcdPlaces.size() + vcdInputs.size() + column, rawOf(word));
    });
    itsWrite(itsText);
    itsText.clear();
}

void TraceVcd::startStep() {
    fmt::format_to(std::back_inserter(itsText), "#{}\n", itsTime);
    itsTime += stepTime;
}

void TraceVcd::change(std::size_t variable, std::int64_t value) {
    if (itsValues[variable] == value) {
        return;
    }
    itsValues[variable] = value;
    if (variable < vcdPlaces.size()) {
        fmt::format_to(std::back_inserter(itsText), "b{:b} ", value);
    } else {
        itsText += itsBits[static_cast<std::size_t>(value - TraceValue::lowest)];
    }
    itsText += codeOf(variable);
    itsText += '\n';
}

void TraceVcd::end() {
    startStep();
    itsWrite(itsText);
}

}  // namespace quarzel::tool
