// SPDX-License-Identifier: MIT
#pragma once

#include <gtest/gtest.h>

#include <ostream>
#include <string>
#include <vector>

#include "link/chain/coded_link.hpp"
#include "temporary_directory.hpp"

namespace quarzel::test {

/// A link as options of the tool and as the tool should understand them.
struct LinkCase {
    const char* name;
    std::vector<std::string> options;
    link::LinkSetup setup;
};

inline void PrintTo(const LinkCase& linkCase, std::ostream* stream) {
    *stream << linkCase.name;
}

std::vector<LinkCase> linkCases();

/// The words of a memory, in their order.
class Words {
  public:
    explicit Words(const std::string& file);

    /// The next words. <NULL> becomes what the standard's functions of the tests take for it.
    std::vector<int> bits(std::size_t count);

    /// The next words, bytes in two's complement.
    std::vector<int> soft(std::size_t count);

    bool isAtEnd() const { return itsNext == itsWords.size(); }

  private:
    std::vector<int> next(std::size_t count);

    std::vector<int> itsWords;
    std::size_t itsNext = 0;
};

/// A vector set of three blocks of a link, for a core with 4 units and 2 iterations.
class LinkSet : public testing::TestWithParam<LinkCase> {
  protected:
    static constexpr std::size_t blocks = 3;
    static constexpr std::uint64_t seed = 5;

    LinkSet();

    std::string path(const std::string& file) const { return itsDirectory.path("set/" + file); }
    Words words(const std::string& file) const { return Words(path(file)); }

    /// The memories of the core's three inputs, and the values of the next code block in them.
    std::vector<Words> inputs() const;
    static std::vector<int> nextInput(std::vector<Words>& inputs, std::size_t K);

    const link::LinkSetup& setup() const { return GetParam().setup; }
    bool hasCrc() const { return setup().transportBlock != 0; }
    std::size_t transmissions() const { return setup().redundancyVersions.size(); }

  private:
    TemporaryDirectory itsDirectory;
};

}  // namespace quarzel::test
