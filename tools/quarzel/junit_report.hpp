// SPDX-License-Identifier: MIT
#pragma once

#include <optional>
#include <string>
#include <vector>

namespace quarzel::tool {

/// A test in a report for continuous integration.
struct JunitCase {
    /// Why a test has failed.
    struct Failure {
        std::string message;  ///< one line
        std::string details;  ///< further lines; may be empty
    };

    std::string className;  ///< what the test belongs to
    std::string name;
    std::optional<Failure> failure;  ///< none: it has passed
};

/// The tests of a suite as JUnit XML. Any text may be given: what XML cannot hold becomes U+FFFD.
std::string junitText(const std::string& suite, const std::vector<JunitCase>& cases);

/// Throw when the file of a report is one that is read, or could not be written.
/// @param inputs  files that are read
void checkJunitFile(const std::string& file, const std::vector<std::string>& inputs);

}  // namespace quarzel::tool
