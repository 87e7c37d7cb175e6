// SPDX-License-Identifier: MIT
#include "decode_options.hpp"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>
#include <string_view>

#include "common/host_core.hpp"

namespace quarzel::octave {

using bindings::BindingError;
using bindings::Fault;

namespace {

constexpr const char* optionNames = "units, algorithm, tag_width, tags, trace, trace_file";

template <class Number>
double elementOf(const mxArray* array, std::size_t index) {
    return static_cast<double>(static_cast<const Number*>(mxGetData(array))[index]);
}

/// A number in a real and full array of any numeric class.
double numberIn(const mxArray* array, std::size_t index) {
    switch (mxGetClassID(array)) {
        case mxINT8_CLASS:
            return elementOf<std::int8_t>(array, index);
        case mxUINT8_CLASS:
            return elementOf<std::uint8_t>(array, index);
        case mxINT16_CLASS:
            return elementOf<std::int16_t>(array, index);
        case mxUINT16_CLASS:
            return elementOf<std::uint16_t>(array, index);
        case mxINT32_CLASS:
            return elementOf<std::int32_t>(array, index);
        case mxUINT32_CLASS:
            return elementOf<std::uint32_t>(array, index);
        case mxINT64_CLASS:
            return elementOf<std::int64_t>(array, index);
        case mxUINT64_CLASS:
            return elementOf<std::uint64_t>(array, index);
        case mxSINGLE_CLASS:
            return elementOf<float>(array, index);
        default:
            return elementOf<double>(array, index);
    }
}

bool isRealNumeric(const mxArray* array) {
    return mxIsNumeric(array) && !mxIsComplex(array) && !mxIsSparse(array);
}

std::vector<unsigned> tagsIn(const mxArray* array) {
    const bool isNumeric = isRealNumeric(array);
    std::vector<unsigned> tags(isNumeric ? mxGetNumberOfElements(array) : 0);
    for (std::size_t i = 0; i < tags.size(); ++i) {
        const double value = numberIn(array, i);
        // A NaN fails the comparisons.
        if (!(value >= 0 && value <= std::numeric_limits<std::uint32_t>::max() &&
              value == std::trunc(value))) {
            throw BindingError(Fault::value, "tags must be whole numbers from 0 to 4294967295");
        }
        tags[i] = static_cast<unsigned>(value);
    }
    if (!isNumeric) {
        throw BindingError(Fault::value, "tags must be whole numbers from 0 to 4294967295");
    }
    return tags;
}

unsigned passesIn(const mxArray* array) {
    if (mxGetNumberOfElements(array) == 0) {
        return 0;
    }
    const int passes = wholeNumber(array, "trace");
    if (passes < 1) {
        throw BindingError(Fault::value, "trace must be 1 pass or more; there are two an iteration");
    }
    return static_cast<unsigned>(passes);
}

void setOption(DecodeOptions& options, std::string_view name, const mxArray* value) {
    if (name == "units") {
        options.settings.units = wholeNumber(value, "units");
    } else if (name == "algorithm") {
        options.settings.algorithm = algorithmIn(value);
    } else if (name == "tag_width") {
        options.settings.tagWidth = wholeNumber(value, "tag_width");
    } else if (name == "tags") {
        options.tags = tagsIn(value);
    } else if (name == "trace") {
        options.passes = passesIn(value);
    } else if (name == "trace_file") {
        if (!mxIsChar(value) && mxGetNumberOfElements(value) != 0) {
            throw BindingError(Fault::type, "trace_file must be the name of a file");
        }
        options.traceFile = mxIsChar(value) ? textOf(value) : "";
    } else {
        throw BindingError(Fault::value,
                           "there is no option '" + std::string(name) + "'; choose from " + optionNames);
    }
}

void setOptions(DecodeOptions& options, const mxArray* fields) {
    for (int i = 0; i < mxGetNumberOfFields(fields); ++i) {
        // A field that was never set is null.
        if (const mxArray* const value = mxGetFieldByNumber(fields, 0, i)) {
            setOption(options, mxGetFieldNameByNumber(fields, i), value);
        }
    }
}

}  // namespace

int wholeNumber(const mxArray* array, const char* name) {
    const bool isNumber = isRealNumeric(array) && mxGetNumberOfElements(array) == 1;
    const double value = isNumber ? numberIn(array, 0) : 0.5;
    if (value != std::trunc(value) || std::abs(value) > std::numeric_limits<int>::max()) {
        throw BindingError(Fault::value, std::string(name) + " must be a whole number");
    }
    return static_cast<int>(value);
}

int algorithmIn(const mxArray* array) {
    return mxIsChar(array) ? bindings::algorithmOf(textOf(array)) : wholeNumber(array, "algorithm");
}

std::string textOf(const mxArray* array) {
    if (!mxIsChar(array)) {
        return {};
    }
    std::vector<char> text(mxGetNumberOfElements(array) + 1);
    mxGetString(array, text.data(), static_cast<mwSize>(text.size()));
    return text.data();
}

DecodeOptions decodeOptions(std::span<const mxArray* const> arguments) {
    DecodeOptions options;
    if (!arguments.empty() && !mxIsChar(arguments[0]) && !mxIsStruct(arguments[0])) {
        if (mxGetNumberOfElements(arguments[0]) != 0) {
            options.iterations = wholeNumber(arguments[0], "iterations");
        }
        arguments = arguments.subspan(1);
    }
    if (arguments.size() == 1 && mxIsStruct(arguments[0]) && mxGetNumberOfElements(arguments[0]) == 1) {
        setOptions(options, arguments[0]);
        arguments = {};
    }
    while (!arguments.empty()) {
        if (!mxIsChar(arguments[0])) {
            throw BindingError(
                Fault::type,
                std::string("options must be names with values, or a struct; the names are ") + optionNames);
        }
        const std::string name = textOf(arguments[0]);
        if (arguments.size() == 1) {
            throw BindingError(Fault::value, "the option '" + name + "' needs a value");
        }
        setOption(options, name, arguments[1]);
        arguments = arguments.subspan(2);
    }
    if (options.passes == 0 && !options.traceFile.empty()) {
        options.passes = 30;  // all of the most iterations
    }
    return options;
}

}  // namespace quarzel::octave
