// SPDX-License-Identifier: MIT
// The literal decoder against another implementation, and the batch and the array call against single calls.
#include <memory>
#include <string>
#include <vector>

#include "input_bytes.hpp"
#include "require.hpp"
#include "support/model.hpp"

namespace {

using namespace quarzel;
using test::State;

/// Blocks of one size and how they are decoded.
struct Work {
    int units, algorithm, tagWidth;
    std::size_t K;
    int iterations;
    std::vector<test::Block> blocks;
    std::vector<unsigned> tags;
};

/// All that a model gives back.
struct Answer {
    std::vector<int> statuses;
    std::vector<unsigned char> bits;
    std::vector<unsigned> tags;
    std::string messages;

    explicit Answer(const Work& work)
        : statuses(work.blocks.size(), -77),
          bits(work.blocks.size() * work.K, 0xEE),
          tags(work.blocks.size(), 0xEE) {}
    bool operator==(const Answer&) const = default;
};

void takeMessage(void* cookie, int, const char* text) {
    *static_cast<std::string*>(cookie) += std::string(text) + '\n';
}

State makeState(const Work& work, const char* implementation, Answer& answer) {
    const auto generics = test::genericsOf(work.units, work.tagWidth, work.algorithm);
    State state(vardel_ip_quarzel_create_state_with_messages(&generics, takeMessage, &answer.messages));
    vardel_ip_quarzel_set_implementation(state.get(), implementation);
    return state;
}

Answer decodeSingly(const Work& work, const char* implementation) {
    Answer answer(work);
    const State state = makeState(work, implementation, answer);
    for (std::size_t b = 0; b < work.blocks.size(); ++b) {
        vardel_ip_quarzel_outputs outputs{answer.bits.data() + b * work.K, static_cast<int>(work.K), 0, 0};
        answer.statuses[b] =
            vardel_ip_quarzel_bitacc_simulate(state.get(), &outputs, work.blocks[b].inputs());
        answer.tags[b] = outputs.tag;
    }
    return answer;
}

Answer decodeBatch(const Work& work, const char* implementation) {
    Answer answer(work);
    const State state = makeState(work, implementation, answer);
    std::vector<vardel_ip_quarzel_inputs> inputs;
    std::vector<vardel_ip_quarzel_outputs> outputs;
    for (std::size_t b = 0; b < work.blocks.size(); ++b) {
        inputs.push_back(work.blocks[b].inputs());
        outputs.push_back({answer.bits.data() + b * work.K, static_cast<int>(work.K), 0, 0});
    }
    vardel_ip_quarzel_bitacc_simulate_batch(state.get(), outputs.data(), inputs.data(),
                                            static_cast<int>(inputs.size()), answer.statuses.data());
    for (std::size_t b = 0; b < outputs.size(); ++b) {
        answer.tags[b] = outputs[b].tag;
    }
    return answer;
}

Answer decodeArray(const Work& work, const char* implementation) {
    Answer answer(work);
    const State state = makeState(work, implementation, answer);
    const std::size_t positions = work.K + 4;
    std::vector<std::int32_t> soft;
    for (const test::Block& block : work.blocks) {
        for (const std::vector<int>* stream : {&block.systematic, &block.parity1, &block.parity2}) {
            soft.insert(soft.end(), stream->begin(), stream->end());
        }
    }
    const vardel_ip_quarzel_array_inputs inputs{soft.data(),
                                                soft.data() + positions,
                                                soft.data() + 2 * positions,
                                                static_cast<std::ptrdiff_t>(3 * positions),
                                                1,
                                                VARDEL_IP_QUARZEL_INT32,
                                                static_cast<int>(positions),
                                                static_cast<int>(work.blocks.size()),
                                                work.iterations,
                                                work.tags.data()};
    const vardel_ip_quarzel_array_outputs outputs{answer.bits.data(), static_cast<std::ptrdiff_t>(work.K), 0,
                                                  answer.tags.data()};
    vardel_ip_quarzel_bitacc_simulate_array(state.get(), &outputs, &inputs, answer.statuses.data());
    return answer;
}

Work workOf(fuzz::InputBytes& bytes) {
    Work work{2 << bytes.takeFrom(0, 2), bytes.takeFrom(0, 2), bytes.takeFrom(0, 32), 0, 0, {}, {}};
    work.K = 40 + 8 * static_cast<std::size_t>(bytes.takeFrom(0, 24));
    work.iterations = bytes.takeFrom(1, 2);
    const int count = bytes.takeFrom(1, 3);
    const int factor = bytes.takeFrom(0, 9) == 0 ? 3 : 1;
    const std::string values = bytes.rest();
    std::size_t at = 0;
    const auto next = [&] {
        return values.empty() ? 0 : factor * static_cast<signed char>(values[at++ % values.size()]);
    };
    for (int b = 0; b < count; ++b) {
        test::Block block(work.K + 4);
        for (std::vector<int>* stream : {&block.systematic, &block.parity1, &block.parity2}) {
            for (int& value : *stream) {
                value = next();
            }
        }
        block.iterations = work.iterations;
        block.tag = static_cast<unsigned>(next());
        work.tags.push_back(block.tag);
        work.blocks.push_back(std::move(block));
    }
    return work;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzz::InputBytes bytes(data, size);
    std::vector<const char*> names;
    while (const char* const name =
               vardel_ip_quarzel_get_implementation_name(static_cast<int>(names.size()))) {
        names.push_back(name);
    }
    const char* const name = names[bytes.take<std::uint8_t>() % names.size()];
    const Work work = workOf(bytes);
    const Answer literal = decodeSingly(work, "literal");
    fuzz::require(literal.statuses == std::vector<int>(work.blocks.size()), "every block is decoded");
    fuzz::require(decodeSingly(work, name) == literal, "single calls are as if decoded literally");
    fuzz::require(decodeBatch(work, name) == literal, "a batch is as if decoded literally");
    fuzz::require(decodeArray(work, name) == literal, "an array is as if decoded literally");
    return 0;
}
