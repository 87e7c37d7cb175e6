// SPDX-License-Identifier: MIT
// What the tool reads: files of every kind, and texts of options. The first byte of an input chooses.
#include <array>
#include <nlohmann/json.hpp>
#include <optional>
#include <sstream>

#include "captures/bits_file.hpp"
#include "captures/capture_file.hpp"
#include "input_bytes.hpp"
#include "options/text_items.hpp"
#include "options/whole_number.hpp"
#include "plot/reference_curve.hpp"
#include "require.hpp"
#include "sweep/document.hpp"
#include "sweep/error.hpp"
#include "sweep/json_text.hpp"
#include "sweep/merge.hpp"
#include "sweeps/ebn0_list.hpp"
#include "tool_error.hpp"
#include "trace/trace_cause.hpp"
#include "trace/trace_comparison.hpp"
#include "vectors/decision_hint.hpp"
#include "vectors/manifest.hpp"

namespace {

using namespace quarzel;

void readOptions(fuzz::InputBytes& bytes) {
    const std::string text = bytes.rest();
    if (const auto number = tool::readWholeNumber(text)) {
        fuzz::require(tool::readWholeNumber(std::to_string(*number)) == number, "a number is its text");
    }
    fuzz::require(!tool::itemsOf(text, ',').empty(), "there is an item");
    const auto list = tool::readEbN0List("--ebn0", text);
    fuzz::require(!list.empty(), "a list has values");
    for (std::size_t i = 1; i < list.size(); ++i) {
        fuzz::require(list[i - 1] < list[i], "they ascend");
    }
}

void readCaptures(fuzz::InputBytes& bytes) {
    const auto scale = bytes.takeBool() ? std::optional(4.0) : std::nullopt;
    std::istringstream stream(bytes.rest());
    const tool::Capture capture = tool::readCapture(stream, "soft", scale);
    fuzz::require(capture.blocks() > 0, "a capture has blocks");
    fuzz::require(capture.soft.size() == 3 * capture.positions() * capture.blocks(), "they are whole");
}

/// The bits that a capture is compared with, and those that a simulation is.
void readBits(fuzz::InputBytes& bytes) {
    const auto blocks = static_cast<std::size_t>(bytes.takeFrom(0, 4));
    std::istringstream stream(bytes.rest());
    if (blocks == 0) {
        const tool::ExpectedDecisions expected = tool::readPacked(stream, "bits.npy");
        fuzz::require(expected.bits.size() == expected.blocks.size() * 8 * expected.packedSize(),
                      "blocks are whole");
        return;
    }
    const tool::PackedBits bits = tool::readBits(stream, "bits.npy", blocks, 5);
    std::istringstream again(tool::npyOf(bits));
    fuzz::require(tool::readBits(again, "bits.npy", blocks, 5).bytes == bits.bytes,
                  "what is written is read");
}

/// What a simulation gives, compared with blocks of 8 bits that are drawn from the number of the bit.
void readMemories(fuzz::InputBytes& bytes) {
    const bool isText = bytes.takeBool();
    const auto blocks = static_cast<std::size_t>(bytes.takeFrom(0, 31));
    tool::ExpectedDecisions expected;
    for (std::size_t b = 0; b < blocks; ++b) {
        expected.blocks.push_back({8, 8 * b, 1, "", ""});
    }
    for (std::size_t i = 0; i < 8 * blocks; ++i) {
        expected.bits.push_back(i * i % 11 % 2);
    }
    std::istringstream stream(bytes.rest());
    const tool::MemoryImage image = isText ? tool::readMemoryText(stream, 8 * blocks, "memory.hex")
                                           : tool::readMemoryNpy(stream, 8 * blocks, 1, "memory.npy");
    fuzz::require(image.words.size() <= 8 * blocks, "no more words than asked for");
    tool::hintOf(expected, image, tool::compareDecisions(expected, image));
}

void readReferences(fuzz::InputBytes& bytes) {
    std::istringstream stream(bytes.rest());
    fuzz::require(!tool::readReferenceCurves(stream, "curves", "curves.csv").empty(), "there is a curve");
}

/// A trace, compared with what it is after the change of a byte.
void readTraces(fuzz::InputBytes& bytes) {
    using tool::TraceUnits;
    constexpr std::array<std::optional<TraceUnits>, 3> units = {std::nullopt, TraceUnits::raw,
                                                                TraceUnits::real};
    const auto chosen = units.at(static_cast<std::size_t>(bytes.takeFrom(0, 2)));
    const std::size_t place = bytes.take<std::uint16_t>();
    std::string text = bytes.rest();
    std::istringstream streamA(text);
    if (!text.empty()) {
        text[place % text.size()] ^= 1;
    }
    std::istringstream streamB(text);
    tool::TraceBlockReader a(tool::makeTraceReader(streamA, "a", chosen));
    tool::TraceBlockReader b(tool::makeTraceReader(streamB, "b", chosen));
    const tool::TraceComparison comparison = tool::compareTraces(a, b, {});
    if (comparison.first) {
        tool::causeOf(*comparison.first);
    }
}

/// Results, parts and checkpoints of sweeps. Their checksum is made to fit, so that it hides nothing.
void readResults(fuzz::InputBytes& bytes) {
    std::string text = bytes.rest();
    sweep::Json document = sweep::parseJson(text);
    if (document.is_object()) {
        document.erase("checksum");
        try {
            text = sweep::textOf(document);
        } catch (const sweep::Json::exception&) {  // a text that is not UTF-8 is not written
        }
    }
    const sweep::Result result = sweep::readResultOrPart(text);
    const std::string written = sweep::resultText(result);
    fuzz::require(sweep::resultText(sweep::readResultOrPart(written)) == written, "what is written is read");
    sweep::merge({{"one", result}, {"another", result}});
}

void readManifests(fuzz::InputBytes& bytes) {
    const tool::VectorContent content = tool::contentOf(bytes.rest(), "manifest.json");
    const std::string written = tool::manifestText({}, {}, content);
    fuzz::require(tool::manifestText({}, {}, tool::contentOf(written, "manifest.json")) == written,
                  "what is written is read");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    constexpr std::array readers = {&readOptions,    &readCaptures, &readBits,    &readMemories,
                                    &readReferences, &readTraces,   &readResults, &readManifests};
    fuzz::InputBytes bytes(data, size);
    try {
        readers.at(static_cast<std::size_t>(bytes.takeFrom(0, readers.size() - 1)))(bytes);
    } catch (const tool::ToolError&) {
    } catch (const sweep::Error&) {
    }
    return 0;
}
