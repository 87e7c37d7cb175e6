// SPDX-License-Identifier: MIT
// What the library reads as text: property strings, parameter files and the utilities beside them.
#include <algorithm>
#include <cmath>
#include <memory>
#include <sstream>

#include "decoder/decoder.hpp"
#include "engine/engine.hpp"
#include "fixed/number_format.hpp"
#include "fixed/parameter_file.hpp"
#include "fixed/properties.hpp"
#include "fixed/string_utilities.hpp"
#include "fixed/units_text.hpp"
#include "input_bytes.hpp"
#include "interleaver/interleaver.hpp"
#include "require.hpp"

namespace {

using namespace quarzel;

/// What a factory makes tells the text that it is made of.
template <class Component>
void create(const std::string& text) {
    const std::unique_ptr<Component> made(Component::create(text));
    if (made != nullptr) {
        const std::unique_ptr<Component> again(Component::create(made->getProperties()));
        fuzz::require(again != nullptr && again->getProperties() == made->getProperties(),
                      "a component is made of its properties");
    }
}

void readParameters(const std::string& text, bool addKeys) {
    std::istringstream stream(text);
    std::map<std::string, std::string> parameters = {{"size", "40"}};
    parse(stream, parameters, addKeys);
    fuzz::require(stream.eof() && (addKeys || parameters.size() == 1), "it is read to its end");
    for (const auto& [key, value] : parameters) {
        fuzz::require(stripws(key) == key && stripws(value) == value, "white space is normalised");
    }
}

void useTexts(fuzz::InputBytes& bytes) {
    const std::string separators = bytes.takeText(3);
    const std::string kept = bytes.takeText(2);
    std::vector<unsigned> tabs = {bytes.take<std::uint8_t>(), bytes.take<std::uint8_t>()};
    std::sort(tabs.begin(), tabs.end());
    const std::string text = bytes.rest();
    fuzz::require(stripws(stripws(text)) == stripws(text), "normalised white space stays");
    for (const std::string& token : stringtok(text, separators, kept)) {
        fuzz::require(!token.empty(), "no token is empty");
    }
    fuzz::require(toFilename(text).size() == text.size(), "a character becomes one");
    fuzz::require(expandTabs(text, tabs).find('\t') == std::string::npos, "no tab is left");
    fuzz::require(nocase_compare(text, text), "a text is itself");
    const auto [type, rest] = splitString(text, separators.c_str());
    fuzz::require(type.size() + rest.size() <= text.size(), "a split adds nothing");
}

void useNumbers(fuzz::InputBytes& bytes) {
    const auto number = bytes.take<double>();
    const unsigned precision = bytes.take<std::uint16_t>();
    fuzz::require(!toSIString(number, precision).empty(), "a number has a text");
    fuzz::require(!timeToString(number).empty(), "a duration has a text");
    toSIString(bytes.take<std::uint64_t>(), precision);
    stringToTime(bytes.rest());
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzz::InputBytes bytes(data, size);
    switch (bytes.takeFrom(0, 7)) {
        case 0:
            create<TDecoder>(bytes.rest());
            break;
        case 1:
            create<TCalculationEngine>(bytes.rest());
            break;
        case 2:
            create<TInterleaver>(bytes.rest());
            break;
        case 3:
            create<TNumberFormat>(bytes.rest());
            break;
        case 4:
            readParameters(bytes.rest(), true);
            break;
        case 5:
            readParameters(bytes.rest(), false);
            break;
        case 6:
            useTexts(bytes);
            break;
        default:
            useNumbers(bytes);
    }
    return 0;
}
