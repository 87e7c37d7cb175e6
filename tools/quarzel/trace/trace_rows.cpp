// SPDX-License-Identifier: MIT
#include "trace/trace_rows.hpp"

#include <fmt/format.h>

#include <array>
#include <iterator>
#include <utility>

namespace quarzel::tool {

namespace {

std::string textOr(const char* nothing, const std::optional<unsigned>& number) {
    return number ? std::to_string(*number) : nothing;
}

}  // namespace

const TraceRowForm csvRows = {"block,pass,step,signal,state,raw,real\n", "", "", "{},{},{},{},{},{},{:.6f}\n",
                              ""};
const TraceRowForm jsonRows = {
    "[\n", ",\n", "\n]\n",
    R"({{"block":{},"pass":{},"step":{},"signal":"{}","state":{},"raw":{},"real":{:.6f}}})", "null"};

TraceRows::TraceRows(const TraceRowForm& form, Write write) : itsForm(form), itsWrite(std::move(write)) {
    itsWrite(itsForm.start);
}

void TraceRows::add(const vardel_ip_quarzel_pass& pass) {
    if (pass.pass == 0) {
        addInputs(pass);
    }
    const std::array<const std::int16_t*, 6> signalWords = {pass.intrinsic, pass.alpha, pass.beta,
                                                            pass.gamma,     pass.llr,   pass.extrinsic};
    const std::vector<Signal> all = signals();
    for (std::uint32_t step = 0; step < pass.steps; ++step) {
        auto column = passColumns().begin();
        for (std::size_t signal = 0; signal < signalWords.size(); ++signal) {
            const std::int16_t* words = signalWords[signal] + std::size_t{step} * all[signal].width;
            for (unsigned i = 0; i < all[signal].width; ++i) {
                append({pass.block + 1, pass.pass, step}, *column++, words[i]);
            }
        }
        write();
    }
}

void TraceRows::addInputs(const vardel_ip_quarzel_pass& pass) {
    for (std::size_t i = 0; i < traceStreams.size(); ++i) {
        const TraceColumn column{traceStreams[i].signal, traceStreams[i].description, std::nullopt};
        for (std::uint32_t step = 0; step < pass.steps; ++step) {
            append({pass.block + 1, std::nullopt, step}, column, pass.inputs[i / 3][i % 3][step]);
        }
        write();
    }
}

void TraceRows::append(const Place& place, const TraceColumn& column, std::int16_t word) {
    itsText += std::exchange(itsSeparator, itsForm.separator);
    fmt::format_to(std::back_inserter(itsText), fmt::runtime(itsForm.row), place.block,
                   textOr(itsForm.nothing, place.pass), place.step, column.signal,
                   textOr(itsForm.nothing, column.number), rawOf(word), realOf(word));
}

void TraceRows::write() {
    itsWrite(itsText);
    itsText.clear();
}

}  // namespace quarzel::tool
