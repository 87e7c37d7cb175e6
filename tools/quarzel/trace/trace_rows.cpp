// SPDX-License-Identifier: MIT
#include "trace/trace_rows.hpp"

#include <fmt/format.h>

#include <iterator>

#include "fixed/text_output.hpp"
#include "trace/trace_table.hpp"

namespace quarzel::tool {

namespace {

std::string numberOr(const char* nothing, const std::optional<unsigned>& number) {
    return number ? std::to_string(*number) : nothing;
}

std::optional<unsigned> stateOf(const TraceColumn& column) {
    return column.index < 0 ? std::nullopt : std::optional(static_cast<unsigned>(column.index));
}

void appendCsv(std::string& text, const TraceValue& value) {
    fmt::format_to(std::back_inserter(text), "{},{},{},{},{},{},{:.6f}\n", value.block,
                   numberOr("", value.pass), value.step, value.column.signal,
                   numberOr("", stateOf(value.column)), value.raw, value.real);
}

void appendJson(std::string& text, const TraceValue& value) {
    fmt::format_to(std::back_inserter(text),
                   R"({{"block":{},"pass":{},"step":{},"signal":"{}","state":{},"raw":{},"real":{:.6f}}})",
                   value.block, numberOr("null", value.pass), value.step, value.column.signal,
                   numberOr("null", stateOf(value.column)), value.raw, value.real);
}

}  // namespace

const TraceRowForm csvRows = {"block,pass,step,signal,state,raw,real\n", "", "", appendCsv};
const TraceRowForm jsonRows = {"[\n", ",\n", "\n]\n", appendJson};

TraceRowWriter::TraceRowWriter(std::ostream& stream, const TraceRowForm& form)
    : itsStream(stream), itsForm(form), itsSeparator("") {
    itsText = itsForm.start;
    write();
}

void TraceRowWriter::writeInputs(const TraceDecoder& decoder) {
    for (std::size_t number = 0; number < traceStreams.size(); ++number) {
        const TraceColumn column{traceStreams[number].signal, -1, false};
        std::uint32_t step = 0;
        for (const std::int16_t word : decoder.stream(number)) {
            append(decoder, std::nullopt, step++, column, word);
            write();
        }
    }
}

void TraceRowWriter::writePass(TraceDecoder& decoder, unsigned siso) {
    const auto steps = static_cast<std::uint32_t>(decoder.llr().size());
    for (std::uint32_t step = 0; step < steps; ++step) {
        const TraceRow row = decoder.traceRow(step);
        for (std::size_t column = 0; column < row.size(); ++column) {
            append(decoder, siso, step, traceColumns[column], row[column]);
        }
        write();
    }
}

void TraceRowWriter::end() {
    itsText = itsForm.end;
    write();
}

void TraceRowWriter::append(const TraceDecoder& decoder, std::optional<unsigned> pass, std::uint32_t step,
                            const TraceColumn& column, std::int16_t word) {
    itsText += itsSeparator;
    itsSeparator = itsForm.separator;
    const TNumberFormat& format = decoder.format();
    itsForm.append(itsText, {decoder.decodeCount() + 1, pass, step, column, format.toInteger(word),
                             format.toReal(word)});
}

void TraceRowWriter::write() {
    writeText(itsStream, itsText);
    itsText.clear();
}

}  // namespace quarzel::tool
