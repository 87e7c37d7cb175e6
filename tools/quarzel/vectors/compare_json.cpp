// SPDX-License-Identifier: MIT
#include <nlohmann/json.hpp>

#include "vectors/compare_report.hpp"

namespace quarzel::tool {

namespace {

using Json = nlohmann::ordered_json;

Json orNull(const std::string& text) {
    return text.empty() ? Json() : Json(text);
}

Json valueJson(const MemoryWord& word) {
    switch (word.kind) {
        case MemoryWord::Kind::missing:
            return {};
        case MemoryWord::Kind::x:
            return "x";
        case MemoryWord::Kind::z:
            return "z";
        case MemoryWord::Kind::known:
            break;
    }
    return word.value;
}

Json firstJson(const CompareReport& report) {
    if (report.comparison.failing.empty()) {
        return {};
    }
    const BlockDifference& first = report.comparison.failing.front();
    const ExpectedBlock& block = report.expected.blocks[first.block];
    const std::size_t address = report.firstAddress(first);
    const MemoryWord& word = report.actual.words[address];
    return {{"block", first.block},
            {"block_size", block.blockSize},
            {"about", orNull(block.about())},
            {"bit", first.firstBit},
            {"value_expected", report.expected.bits[address]},
            {"value_actual", valueJson(word)},
            {"address", address},
            {"line", word.line == 0 ? Json() : Json(word.line)},
            {"trace_command", orNull(block.traceCommand)}};
}

Json failingJson(const CompareReport& report) {
    Json list = Json::array();
    for (const BlockDifference& difference : report.comparison.failing) {
        const ExpectedBlock& block = report.expected.blocks[difference.block];
        list.push_back({{"block", difference.block},
                        {"block_size", block.blockSize},
                        {"iterations", block.iterations == 0 ? Json() : Json(block.iterations)},
                        {"stimulus", orNull(block.stimulus)},
                        {"first_bit", difference.firstBit},
                        {"bits_differing", difference.bits.count()},
                        {"wrong", difference.bits.wrong},
                        {"undefined", difference.bits.undefined},
                        {"undriven", difference.bits.undriven},
                        {"missing", difference.bits.missing},
                        {"trace_command", orNull(block.traceCommand)}});
    }
    return list;
}

Json hintJson(const std::optional<DecisionHint>& hint) {
    return hint ? Json{{"kind", hint->kind}, {"text", hint->text}} : Json();
}

}  // namespace

void printJson(std::ostream& stream, const CompareReport& report) {
    const DecisionComparison& comparison = report.comparison;
    const Json object = {{"expected", report.expected.name},
                         {"actual", report.actualName},
                         {"equal", comparison.isEqual()},
                         {"blocks", report.expected.blocks.size()},
                         {"blocks_differing", comparison.failing.size()},
                         {"bits", report.expected.bits.size()},
                         {"bits_differing", comparison.bits.count()},
                         {"wrong", comparison.bits.wrong},
                         {"undefined", comparison.bits.undefined},
                         {"undriven", comparison.bits.undriven},
                         {"missing", comparison.bits.missing},
                         {"too_many", comparison.beyond},
                         {"bits_by_eighth", comparison.eighths},
                         {"hint", hintJson(report.hint)},
                         {"first", firstJson(report)},
                         {"failing", failingJson(report)}};
    // A file name need not be UTF-8; what is not becomes U+FFFD.
    stream << object.dump(-1, ' ', false, Json::error_handler_t::replace) << '\n';
}

}  // namespace quarzel::tool
