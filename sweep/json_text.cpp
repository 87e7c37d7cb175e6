// SPDX-License-Identifier: MIT
#include "sweep/json_text.hpp"

namespace quarzel::sweep {

namespace {

constexpr int deepest = 100;

bool isTooDeep(std::string_view text) {
    int depth = 0;
    bool isInString = false;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const char c = text[i];
        if (c == '"') {
            isInString = !isInString;
        } else if (isInString) {
            i += c == '\\' ? 1 : 0;
        } else if (c == '[' || c == '{') {
            if (++depth > deepest) {
                return true;
            }
        } else if (c == ']' || c == '}') {
            --depth;
        }
    }
    return false;
}

}  // namespace

nlohmann::ordered_json parseJson(std::string_view text) {
    return isTooDeep(text) ? nlohmann::ordered_json(nlohmann::ordered_json::value_t::discarded)
                           : nlohmann::ordered_json::parse(text, nullptr, false);
}

}  // namespace quarzel::sweep
