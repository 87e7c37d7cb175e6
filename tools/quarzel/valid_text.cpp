// SPDX-License-Identifier: MIT
#include "valid_text.hpp"

#include <nlohmann/json.hpp>
#include <string_view>

namespace quarzel::tool {

std::string validText(const std::string& text) {
    using Json = nlohmann::json;
    constexpr std::string_view replacement = "\xef\xbf\xbd";
    std::string valid =
        Json::parse(Json(text).dump(-1, ' ', false, Json::error_handler_t::replace)).get<std::string>();
    for (const std::string_view none :
         {"\xef\xbf\xbe", "\xef\xbf\xbf"}) {  // U+FFFE and U+FFFF, which XML forbids
        for (std::size_t at = 0; (at = valid.find(none, at)) != std::string::npos;) {
            valid.replace(at, none.size(), replacement);
        }
    }
    return valid;
}

}  // namespace quarzel::tool
