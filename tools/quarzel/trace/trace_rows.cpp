// SPDX-License-Identifier: MIT
#include "trace/trace_rows.hpp"

#include <fmt/format.h>

#include <utility>

#include "trace/trace_signals.hpp"
#include "trace/trace_value.hpp"

namespace quarzel::tool {

const TraceRowForm csvRows = {
    "block,pass,step,signal,state,raw,real\n", "", "\n", ",", ",", ",", ",", ",", ",", "\n", ""};
const TraceRowForm jsonRows = {
    "[\n",           "{\"block\":", "},\n{\"block\":", ",\"pass\":", ",\"step\":", ",\"signal\":\"",
    "\",\"state\":", ",\"raw\":",   ",\"real\":",      "}\n]\n",     "null"};

TraceRows::TraceRows(const TraceRowForm& form, Write write) : itsForm(form), itsWrite(std::move(write)) {
    for (const TraceColumn& column : traceColumns()) {
        itsColumns.push_back(fmt::format("{}{}{}{}{}", form.signal, column.signal, form.state,
                                         column.number ? std::to_string(*column.number) : form.nothing,
                                         form.raw));
    }
    for (int raw = TraceValue::lowest; raw <= TraceValue::highest; ++raw) {
        itsValues.push_back(fmt::format("{}{}{:.6f}", raw, form.real, raw / 8.0));
    }
    itsWrite(itsForm.start);
}

void TraceRows::add(const vardel_ip_quarzel_pass& pass) {
    if (pass.pass == 0) {
        addInputs(pass);
    }
    startTable(pass.block, pass.pass);
    forEachValue(
        pass, [this](std::uint32_t step, unsigned column, std::int16_t word) { append(step, column, word); });
    write();
}

void TraceRows::addInputs(const vardel_ip_quarzel_pass& pass) {
    startTable(pass.block, std::nullopt);
    for (unsigned stream = 0; stream < traceStreams.size(); ++stream) {
        for (std::uint32_t step = 0; step < pass.steps; ++step) {
            append(step, static_cast<unsigned>(passColumns().size()) + stream,
                   pass.inputs[stream / 3][stream % 3][step]);
        }
    }
}

/// Begin the rows of a pass, or of soft inputs.
void TraceRows::startTable(unsigned long long block, std::optional<unsigned> pass) {
    itsBefore = fmt::format("{}{}{}{}", block, itsForm.pass, pass ? std::to_string(*pass) : itsForm.nothing,
                            itsForm.step);
}

void TraceRows::append(std::uint32_t step, unsigned column, std::int16_t word) {
    constexpr std::size_t enough = 1 << 16;
    itsText += std::exchange(itsHasRows, true) ? itsForm.next : itsForm.first;
    itsText += itsBefore;
    const fmt::format_int digits(step);
    itsText.append(digits.data(), digits.size());
    itsText += itsColumns[column];
    itsText += itsValues[static_cast<std::size_t>(rawOf(word) - TraceValue::lowest)];
    if (itsText.size() > enough) {
        write();
    }
}

void TraceRows::end() {
    itsText += itsForm.end;
    write();
}

void TraceRows::write() {
    itsWrite(itsText);
    itsText.clear();
}

}  // namespace quarzel::tool
