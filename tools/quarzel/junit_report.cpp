// SPDX-License-Identifier: MIT
#include "junit_report.hpp"

#include <fmt/format.h>

#include <algorithm>
#include <string_view>

#include "files/input_file.hpp"
#include "files/output_file.hpp"
#include "tool_error.hpp"
#include "valid_text.hpp"

namespace quarzel::tool {

namespace {

/// A text as XML has it, in an attribute in double quotes as well as between tags.
std::string escaped(const std::string& text) {
    constexpr std::string_view replacement = "\xef\xbf\xbd";
    std::string xml;
    for (const char c : validText(text)) {
        switch (c) {
            case '&':
                xml += "&amp;";
                break;
            case '<':
                xml += "&lt;";
                break;
            case '>':
                xml += "&gt;";
                break;
            case '"':
                xml += "&quot;";
                break;
            case '\n':
            case '\r':
            case '\t':
                xml += fmt::format("&#{};", int{c});
                break;
            default:
                if (static_cast<unsigned char>(c) < ' ') {
                    xml += replacement;
                } else {
                    xml += c;
                }
        }
    }
    return xml;
}

}  // namespace

std::string junitText(const std::string& suite, const std::vector<JunitCase>& cases) {
    const auto failures = std::count_if(cases.begin(), cases.end(),
                                        [](const JunitCase& test) { return test.failure.has_value(); });
    const std::string counts = fmt::format("name=\"{}\" tests=\"{}\" failures=\"{}\" errors=\"0\"",
                                           escaped(suite), cases.size(), failures);
    std::string xml = fmt::format(
        "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<testsuites {0}>\n <testsuite {0} skipped=\"0\">\n",
        counts);
    for (const JunitCase& test : cases) {
        xml += fmt::format("  <testcase classname=\"{}\" name=\"{}\"", escaped(test.className),
                           escaped(test.name));
        if (test.failure) {
            xml +=
                fmt::format(">\n   <failure message=\"{}\" type=\"difference\">{}</failure>\n  </testcase>\n",
                            escaped(test.failure->message), escaped(test.failure->details));
        } else {
            xml += "/>\n";
        }
    }
    return xml + " </testsuite>\n</testsuites>\n";
}

void checkJunitFile(const std::string& file, const std::vector<std::string>& inputs) {
    if (file.empty() || isStandardStream(file)) {
        throw ToolError(ExitCode::usage, "--junit", "the report needs a file of its own", "name one");
    }
    if (std::any_of(inputs.begin(), inputs.end(),
                    [&file](const std::string& input) { return isSameFile(file, input); })) {
        throw ToolError(ExitCode::usage, "--junit", fmt::format("{} is also read", file),
                        "give another name");
    }
    probeOutput(file);
}

}  // namespace quarzel::tool
