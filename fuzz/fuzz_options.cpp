// SPDX-License-Identifier: MIT
// Texts of options: numbers and lists of Eb/N0.
#include "input_bytes.hpp"
#include "options/text_items.hpp"
#include "options/whole_number.hpp"
#include "reading.hpp"
#include "require.hpp"
#include "sweeps/ebn0_list.hpp"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    using namespace quarzel;
    const std::string text = fuzz::InputBytes(data, size).rest();
    if (const auto number = tool::readWholeNumber(text)) {
        fuzz::require(tool::readWholeNumber(std::to_string(*number)) == number, "a number is its text");
    }
    fuzz::require(!tool::itemsOf(text, ',').empty(), "there is an item");
    fuzz::readText(text, [&](std::istream&) {
        const auto list = tool::readEbN0List("--ebn0", text);
        fuzz::require(!list.empty(), "a list has values");
        for (std::size_t i = 1; i < list.size(); ++i) {
            fuzz::require(list[i - 1] < list[i], "they ascend");
        }
    });
    return 0;
}
