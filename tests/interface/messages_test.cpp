// SPDX-License-Identifier: MIT
// Every line of a model reaches its receiver, and those of one without a receiver the standard streams.
#include <gtest/gtest.h>

#include <iostream>
#include <string>
#include <utility>
#include <vector>

#include "decoder/decoder.hpp"
#include "interface/state.hpp"
#include "support/capture.hpp"
#include "support/model.hpp"

namespace quarzel::test {
namespace {

using Lines = std::vector<std::pair<int, std::string>>;

void keep(void* cookie, int kind, const char* text) {
    static_cast<Lines*>(cookie)->emplace_back(kind, text);
}

State makeListening(Lines& lines, const vardel_ip_quarzel_generics& generics = defaultGenerics()) {
    return State(vardel_ip_quarzel_create_state_with_messages(&generics, keep, &lines));
}

TEST(MessagePort, TakesTheErrorOfACreateInPlaceOfTheStream) {
    Lines lines;
    const Output output = capture([&] { EXPECT_EQ(makeListening(lines, genericsOf(3, 8, 1)), nullptr); });
    EXPECT_EQ(lines, (Lines{{VARDEL_IP_QUARZEL_ERROR, "ERROR:decoder:C_NUM_PU must be either 2, 4 or 8"}}));
    EXPECT_EQ(output.out + output.err, "");
}

TEST(MessagePort, TakesErrorsAndWarningsOfCallsAndComponentsInTheirOrder) {
    Lines lines;
    const Output output = capture([&] {
        const State state = makeListening(lines);
        Block block(44, 300);
        block.tag = 0x1FF;
        EXPECT_EQ(simulate(state.get(), block.inputs()).status, 0);
        EXPECT_EQ(simulate(state.get(), Block(45).inputs()).status, 2);
        EXPECT_EQ(simulate(state.get(), block.inputs(), 39).status, 1);
    });
    EXPECT_EQ(
        lines,
        (Lines{{VARDEL_IP_QUARZEL_WARNING,
                "WARNING:decoder:RSC1 systematic value in position 0 saturated positively, further "
                "saturation will not be reported"},
               {VARDEL_IP_QUARZEL_WARNING,
                "WARNING:decoder:Input block tag has been truncated to 8 bits, further truncation will "
                "not be reported"},
               {VARDEL_IP_QUARZEL_ERROR, "ERROR:TDecoder3G:The interleaver has no block size of 41 bits"},
               {VARDEL_IP_QUARZEL_ERROR, "ERROR:decoder:Insufficient allocated space for output array"}}));
    EXPECT_EQ(output.out + output.err, "");
}

TEST(MessagePort, TakesTheTraceLineByLine) {
    const Block block(44);
    const auto trace = [&](vardel_ip_quarzel_state* state) {
        vardel_ip_quarzel_bitacc_dump_config(state, 2);
        state->decoder->setVerbosity(9);
        EXPECT_EQ(simulate(state, block.inputs()).status, 0);
    };
    const Output output = capture([&] { trace(makeState().get()); });
    Lines lines;
    const Output silence = capture([&] { trace(makeListening(lines).get()); });
    std::string text;
    for (const auto& [kind, line] : lines) {
        EXPECT_EQ(kind, VARDEL_IP_QUARZEL_TRACE) << line;
        text += line + '\n';
    }
    EXPECT_GT(lines.size(), 100U);
    EXPECT_EQ(text, output.out);
    EXPECT_EQ(silence.out + silence.err, "");
}

/// A decoder of a program's own. Its trace comes character by character, and then its stream may fail.
struct OwnDecoder : TDecoder {
    bool fails = false;

    std::string getProperties() const override { return "OWN"; }
    bool decode(const std::vector<short>& soft, std::vector<unsigned char>& hard, unsigned) override {
        hard.assign(soft.size() / 3 - 4, 1);
        return checkDump(0);
    }
    void dumpFull(std::ostream& stream, unsigned siso) override {
        TDecoder::dumpFull(stream, siso);
        stream.put('o').put('w').put('n').put('\n').flush();
        stream.setstate(fails ? std::ios::failbit : std::ios::goodbit);
    }
};

TEST(MessagePort, TakesTheTraceOfADecoderOfTheProgramsOwn) {
    Lines lines;
    const State state = makeListening(lines);
    auto* const own = new OwnDecoder;
    own->connect(state->interleaver, state->engine);
    delete state->decoder;
    state->decoder = own;
    own->setDump(2);
    const Block block(44);
    EXPECT_EQ(simulate(state.get(), block.inputs()).status, 0);
    EXPECT_EQ(lines, (Lines{{VARDEL_IP_QUARZEL_TRACE, "own"}}));
    // A text that is not whole ends the call; and so does the wish for what this decoder does not show.
    own->fails = true;
    EXPECT_EQ(simulate(state.get(), block.inputs()).status, 99);
    own->setDump(0);
    std::vector<unsigned char> bits(2 * 40);
    const vardel_ip_quarzel_inputs inputs = block.inputs();
    const vardel_ip_quarzel_array_inputs arrayInputs{
        inputs.rsc1_sys, inputs.rsc1_par, inputs.rsc2_par, 44, 1, VARDEL_IP_QUARZEL_INT32, 44, 1, 2, nullptr};
    const vardel_ip_quarzel_array_outputs arrayOutputs{bits.data(), 80, 40, nullptr};
    EXPECT_EQ(vardel_ip_quarzel_bitacc_simulate_array(state.get(), &arrayOutputs, &arrayInputs, nullptr), 99);
}

TEST(MessagePort, MayBeChangedAtAnyTimeAndGivenUp) {
    const State state = makeState();
    Lines lines;
    vardel_ip_quarzel_set_messages(state.get(), keep, &lines);
    EXPECT_EQ(simulate(state.get(), Block(5).inputs()).status, 2);
    ASSERT_EQ(lines.size(), 1U);
    vardel_ip_quarzel_set_messages(state.get(), nullptr, nullptr);
    const Output output = capture([&] { simulate(state.get(), Block(3).inputs()); });
    EXPECT_EQ(lines.size(), 1U);
    EXPECT_EQ(output.err,
              "ERROR:TDecoder3G:Number of soft inputs does not match rate and number of tail bits\n");
}

TEST(MessagePort, AReceiverThatThrowsLosesTheLineAndTheWarningIsWrittenNextTime) {
    const State state = makeState();
    vardel_ip_quarzel_set_messages(
        state.get(), [](void*, int, const char*) { throw std::runtime_error("no"); }, nullptr);
    const Block block(44, 200);
    EXPECT_EQ(simulate(state.get(), block.inputs()).status, 0);
    Lines lines;
    vardel_ip_quarzel_set_messages(state.get(), keep, &lines);
    EXPECT_EQ(simulate(state.get(), block.inputs()).status, 0);
    EXPECT_EQ(simulate(state.get(), block.inputs()).status, 0);
    EXPECT_EQ(lines.size(), 1U);
}

TEST(MessagePort, GenericsAreCheckedWithoutAWord) {
    const Output output = capture([] {
        const vardel_ip_quarzel_generics right = defaultGenerics();
        EXPECT_EQ(vardel_ip_quarzel_check_generics(&right), nullptr);
        vardel_ip_quarzel_generics wrong = genericsOf(2, 33, 3);
        EXPECT_STREQ(vardel_ip_quarzel_check_generics(&wrong), "C_TAG_WIDTH must be in range 0 to 32");
        EXPECT_STREQ(vardel_ip_quarzel_check_generics(nullptr), "Generics must not be a null pointer");
    });
    EXPECT_EQ(output.out + output.err, "");
}

/// A buffer that keeps what is written to it until it is flushed.
struct SlowBuffer : std::streambuf {
    std::string& log;
    std::string waiting;

    explicit SlowBuffer(std::string& target) : log(target) {}

    std::streamsize xsputn(const char* text, std::streamsize size) override {
        waiting.append(text, static_cast<std::size_t>(size));
        return size;
    }
    int sync() override {
        log += std::exchange(waiting, "");
        return 0;
    }
};

TEST(MessageOrder, AnErrorComesAfterWhatTheProgramHasWrittenBefore) {
    std::string log;
    SlowBuffer out(log);
    SlowBuffer err(log);
    std::streambuf* const outBefore = std::cout.rdbuf(&out);
    std::streambuf* const errBefore = std::cerr.rdbuf(&err);
    std::cout << "first, ";
    const State state = makeState(genericsOf(3, 8, 1));
    std::cout.rdbuf(outBefore);
    std::cerr.rdbuf(errBefore);
    EXPECT_EQ(log, "first, ERROR:decoder:C_NUM_PU must be either 2, 4 or 8\n");
}

/// A buffer without room.
struct FullBuffer : std::streambuf {
    std::streamsize xsputn(const char*, std::streamsize) override { return 0; }
    int overflow(int) override { return traits_type::eof(); }
};

TEST(MessageOrder, ATraceThatFindsNoRoomLeavesTheStreamBad) {
    FullBuffer buffer;
    std::streambuf* const before = std::cout.rdbuf(&buffer);
    const State state = makeState();
    vardel_ip_quarzel_bitacc_dump_config(state.get(), 1);
    const int status = simulate(state.get(), Block(44).inputs()).status;
    const bool bad = std::cout.bad();
    std::cout.clear();
    // Nor does a stream throw that is to throw when it fails.
    std::cout.exceptions(std::ios::badbit);
    vardel_ip_quarzel_bitacc_dump_config(state.get(), 1);
    const int later = simulate(state.get(), Block(44).inputs()).status;
    const bool badAgain = std::cout.bad();
    std::cout.exceptions(std::ios::goodbit);
    std::cout.rdbuf(before);
    std::cout.clear();
    EXPECT_EQ(status, 0);
    EXPECT_TRUE(bad);
    EXPECT_EQ(later, 0);
    EXPECT_TRUE(badAgain);
}

TEST(MessageOrder, AWarningThatFindsNoRoomIsWrittenNextTime) {
    FullBuffer buffer;
    std::streambuf* const before = std::cout.rdbuf(&buffer);
    const State state = makeState();
    Block block(44, 200);
    block.tag = 0x1FF;
    simulate(state.get(), block.inputs());
    std::cout.rdbuf(before);
    const Output output = capture([&] { simulate(state.get(), block.inputs()); });
    EXPECT_EQ(output.out,
              "WARNING:decoder:RSC1 systematic value in position 0 saturated positively, further saturation "
              "will not be reported\n"
              "WARNING:decoder:Input block tag has been truncated to 8 bits, further truncation will not be "
              "reported\n");
}

}  // namespace
}  // namespace quarzel::test
