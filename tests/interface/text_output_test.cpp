// SPDX-License-Identifier: MIT
#include "fixed/messages.hpp"

#include <gtest/gtest.h>

#include <iomanip>
#include <iostream>
#include <locale>
#include <sstream>

#include "support/capture.hpp"
#include "support/model.hpp"

namespace quarzel::test {
namespace {

struct Grouping : std::numpunct<char> {
    char do_decimal_point() const override { return ','; }
    char do_thousands_sep() const override { return '.'; }
    std::string do_grouping() const override { return "\1"; }
};

/// Everything that a decode can say: warnings, an error, input dump and pass tables.
void talk() {
    const State state = makeState();
    vardel_ip_quarzel_bitacc_dump_config(state.get(), 2);
    Block block(44, 1000);
    block.tag = 0xABCDE;
    simulate(state.get(), block.inputs());
    simulate(state.get(), Block(6152 + 4).inputs());
}

TEST(TextOutput, NothingTheProgramSetOnItsStreamsChangesATextOrIsChanged) {
    const Output plain = capture(talk);
    ASSERT_NE(plain.out, "");
    ASSERT_NE(plain.err, "");

    const std::locale before = std::locale::global(std::locale(std::locale::classic(), new Grouping));
    std::ostringstream defaults;
    Output disturbed;
    for (std::ostream* stream : {&std::cout, &std::cerr}) {
        stream->imbue(std::locale());
        *stream << std::hex << std::showbase << std::uppercase << std::scientific << std::right;
        stream->fill('*');
        stream->precision(2);
    }
    const auto flags = std::cout.flags();
    disturbed = capture([] {
        std::cout << std::setw(17);
        talk();
        EXPECT_EQ(std::cout.width(), 17);
        std::cout.width(0);
    });
    EXPECT_EQ(std::cout.flags(), flags);
    EXPECT_EQ(std::cout.fill(), '*');
    EXPECT_EQ(std::cout.precision(), 2);
    for (std::ostream* stream : {&std::cout, &std::cerr}) {
        stream->copyfmt(defaults);
        stream->imbue(std::locale::classic());
        stream->fill(' ');
    }
    std::locale::global(before);

    EXPECT_EQ(disturbed.out, plain.out);
    EXPECT_EQ(disturbed.err, plain.err);
}

TEST(TextOutput, AStreamInErrorWithAnExceptionMaskStillGetsTheText) {
    const Output plain = capture(talk);
    Output disturbed;
    disturbed = capture([] {
        std::cout.setstate(std::ios::failbit);
        std::cerr.setstate(std::ios::failbit);
        talk();
        EXPECT_EQ(std::cout.rdstate(), std::ios::failbit);
        std::cout.clear();
        std::cerr.clear();
        std::cout.exceptions(std::ios::badbit | std::ios::failbit);
        talk();
        EXPECT_EQ(std::cout.exceptions(), std::ios::badbit | std::ios::failbit);
        std::cout.exceptions(std::ios::goodbit);
    });
    EXPECT_EQ(disturbed.out, plain.out + plain.out);
    EXPECT_EQ(disturbed.err, plain.err + plain.err);
}

/// Counts the writes that reach a stream, and flushes them or does not.
struct CountingBuffer : std::streambuf {
    std::string text;
    int writes = 0;
    int flushes = 0;
    bool canFlush = true;
    std::streamsize xsputn(const char* written, std::streamsize size) override {
        ++writes;
        text.append(written, static_cast<std::size_t>(size));
        return size;
    }
    int overflow(int c) override {
        ++writes;
        text += static_cast<char>(c);
        return c;
    }
    int sync() override {
        ++flushes;
        return canFlush ? 0 : -1;
    }
};

TEST(TextOutput, AMessageIsOneWrite) {
    CountingBuffer buffer;
    std::streambuf* before = std::cerr.rdbuf(&buffer);
    const State state = makeState(genericsOf(3, 8, 1));
    std::cerr.rdbuf(before);
    EXPECT_EQ(state, nullptr);
    EXPECT_EQ(buffer.text, "ERROR:decoder:C_NUM_PU must be either 2, 4 or 8\n");
    EXPECT_EQ(buffer.writes, 1);
}

TEST(TextOutput, AMessageIsFlushedAndOneThatCannotBeIsLost) {
    CountingBuffer buffer;
    std::streambuf* before = std::cout.rdbuf(&buffer);
    EXPECT_TRUE(standardStreams.warning({"text"}));
    EXPECT_EQ(buffer.flushes, 1);
    buffer.canFlush = false;
    EXPECT_FALSE(standardStreams.warning({"text"}));
    EXPECT_EQ(buffer.flushes, 2);
    std::cout.rdbuf(before);
}

struct ThrowingBuffer : std::streambuf {
    std::streamsize xsputn(const char*, std::streamsize) override { throw std::runtime_error("no room"); }
};

TEST(TextOutput, ABufferThatThrowsLosesTheTextAndNothingElse) {
    ThrowingBuffer buffer;
    std::streambuf* before = std::cout.rdbuf(&buffer);
    const State state = makeState();
    Block block(44, 1000);
    const Result result = simulate(state.get(), block.inputs());
    std::cout.rdbuf(before);
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.outputs.dout_size, 40);
}

TEST(TextOutput, AStreamWithoutABufferTakesNothing) {
    std::streambuf* before = std::cout.rdbuf(nullptr);
    std::cout.clear();
    EXPECT_FALSE(standardStreams.warning({"text"}));
    std::cout.rdbuf(before);
}

}  // namespace
}  // namespace quarzel::test
