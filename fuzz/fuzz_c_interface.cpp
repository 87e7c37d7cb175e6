// SPDX-License-Identifier: MIT
// The C interface with hostile arguments, in any order of calls. The caller lies about no pointer: what it
// says is there is there, and not a byte more.
#include <algorithm>
#include <array>
#include <climits>
#include <cstdint>
#include <cstring>

#include "input_bytes.hpp"
#include "require.hpp"
#include "support/model.hpp"

namespace {

using namespace quarzel;

constexpr int mostPositions = 92;  // of a stream; small blocks show as much as others, sooner
constexpr int mostBlocks = 4;      // of a call

class HostileCaller {
  public:
    HostileCaller(const std::uint8_t* data, std::size_t size) : itsBytes(data, size) {}

    /// Make calls until the input is used up.
    void run() {
        for (int calls = 0; calls < 12 && !itsBytes.empty(); ++calls) {
            call();
        }
    }

  private:
    /// A block and what its arguments point to.
    struct Block {
        std::array<std::vector<int>, 3> streams;
        std::vector<unsigned char> bits;
        vardel_ip_quarzel_inputs inputs;
        vardel_ip_quarzel_outputs outputs;
    };

    /// The places that strides reach, and how far the first one is from the lowest.
    struct Extent {
        std::ptrdiff_t size = 1, first = 0;

        void stretch(std::ptrdiff_t stride, int count) {
            const std::ptrdiff_t reach = stride * (std::max(count, 1) - 1);
            size += std::abs(reach);
            first -= std::min<std::ptrdiff_t>(reach, 0);
        }
    };

    static void takeMessage(void* sum, int kind, const char* text) {
        fuzz::require(kind >= VARDEL_IP_QUARZEL_ERROR && kind <= VARDEL_IP_QUARZEL_TRACE,
                      "a line has a kind");
        *static_cast<std::int64_t*>(sum) += static_cast<std::int64_t>(std::strlen(text));
    }

    static void takePass(void* sum, const vardel_ip_quarzel_pass* pass) {
        for (std::size_t step = 0; step < pass->steps; ++step) {
            *static_cast<std::int64_t*>(sum) += pass->inputs[1][2][step] + pass->intrinsic[step] +
                                                pass->alpha[8 * step + 7] + pass->beta[8 * step + 7] +
                                                pass->gamma[4 * step + 3] + pass->llr[step] +
                                                pass->extrinsic[step];
        }
    }

    int upTo(int most) { return itsBytes.takeFrom(0, most); }
    bool isRare() { return upTo(31) == 31; }

    template <class Pointer>
    Pointer rarelyNull(Pointer pointer) {
        return isRare() ? nullptr : pointer;
    }

    /// The usual number, or now and then another one.
    int anyNumber(int usual) {
        switch (upTo(31)) {
            case 28:
                return itsBytes.take<int>();
            case 29:
                return INT_MAX;
            case 30:
                return INT_MIN;
            case 31:
                return itsBytes.takeFrom(-2, 40);
            default:
                return usual;
        }
    }

    void requireStatus(int status) const {
        fuzz::require(status == 0 || status == 1 || status == (itHasDecoder ? 2 : 99), "a call has a status");
    }

    void create() {
        vardel_ip_quarzel_generics generics =
            test::genericsOf(anyNumber(2 << upTo(2)), anyNumber(upTo(32)), anyNumber(upTo(2)));
        generics.C_STATE_INT_WIDTH = anyNumber(9);
        generics.C_INPUT_FRAC_WIDTH = anyNumber(3);
        generics.C_PATH = rarelyNull(generics.C_PATH);
        const bool isSound = vardel_ip_quarzel_check_generics(&generics) == nullptr;
        itHasDecoder = !isRare();
        if (itHasDecoder) {
            itsState.reset(vardel_ip_quarzel_create_state_with_messages(&generics, takeMessage, &itsSum));
            fuzz::require((itsState != nullptr) == isSound, "a state is made of sound generics alone");
        } else {
            itsState.reset(create_default_state(generics));
            vardel_ip_quarzel_set_messages(itsState.get(), takeMessage, &itsSum);
        }
    }

    Block makeBlock() {
        Block block{};
        const int K = 40 + 8 * upTo(6);
        const int size = std::min(anyNumber(K + 4), mostPositions);
        const int factor = isRare() ? 1 << 24 : 1;
        for (std::vector<int>& stream : block.streams) {
            stream.assign(static_cast<std::size_t>(std::max(size, 0)), itsBytes.take<signed char>() * factor);
            if (size > 0) {
                stream[static_cast<std::size_t>(upTo(size - 1))] = itsBytes.take<signed char>();
            }
        }
        const int allocated = std::min(anyNumber(K), mostPositions);
        block.bits.resize(static_cast<std::size_t>(allocated < 0 ? mostPositions : allocated));
        block.inputs = {rarelyNull(block.streams[0].data()),
                        rarelyNull(block.streams[1].data()),
                        rarelyNull(block.streams[2].data()),
                        size,
                        anyNumber(1 + upTo(2)),
                        itsBytes.take<unsigned>()};
        block.outputs = {rarelyNull(block.bits.data()), allocated, 0, 0};
        return block;
    }

    void simulate() {
        Block block = makeBlock();
        requireStatus(
            vardel_ip_quarzel_bitacc_simulate(itsState.get(), rarelyNull(&block.outputs), block.inputs));
    }

    void simulateBatch() {
        const int blocks = upTo(mostBlocks);
        std::vector<Block> kept;
        std::vector<vardel_ip_quarzel_inputs> inputs;
        std::vector<vardel_ip_quarzel_outputs> outputs;
        for (int b = 0; b < blocks; ++b) {
            kept.push_back(makeBlock());
            inputs.push_back(kept.back().inputs);
            outputs.push_back(kept.back().outputs);
        }
        std::vector<int> statuses(inputs.size());
        requireStatus(vardel_ip_quarzel_bitacc_simulate_batch(
            itsState.get(), rarelyNull(outputs.data()), rarelyNull(inputs.data()),
            std::min(anyNumber(blocks), blocks), rarelyNull(statuses.data())));
    }

    void simulateArray() {
        const int type = anyNumber(1 << upTo(2));
        const int size = std::min(anyNumber(44 + 8 * upTo(6)), mostPositions);
        const int count = std::min(anyNumber(upTo(mostBlocks)), mostBlocks);
        const std::ptrdiff_t positionStride = isRare() ? itsBytes.takeFrom(-3, 3) : 1;
        const std::ptrdiff_t blockStride = isRare() ? itsBytes.takeFrom(-127, 127) : std::max(size, 0);
        Extent read;
        read.stretch(positionStride, size);
        read.stretch(blockStride, count);
        std::array<std::vector<char>, 3> streams;
        std::array<const void*, 3> first{};
        for (std::size_t i = 0; i < streams.size(); ++i) {
            streams[i].assign(static_cast<std::size_t>(4 * read.size), itsBytes.take<char>());
            streams[i].front() = itsBytes.take<char>();
            first[i] = rarelyNull(streams[i].data() + 4 * read.first);
        }
        std::array<unsigned, mostBlocks> tags{};
        const vardel_ip_quarzel_array_inputs inputs{first[0],
                                                    first[1],
                                                    first[2],
                                                    blockStride,
                                                    positionStride,
                                                    type,
                                                    size,
                                                    count,
                                                    anyNumber(1 + upTo(2)),
                                                    rarelyNull(tags.data())};
        const std::ptrdiff_t iterationStride = upTo(1) * mostPositions;
        Extent written;
        written.stretch(1, mostPositions);
        written.stretch(iterationStride, 15);
        const std::ptrdiff_t stride = isRare() ? -written.size : written.size;
        written.stretch(stride, mostBlocks);
        std::vector<unsigned char> bits(static_cast<std::size_t>(written.size));
        const vardel_ip_quarzel_array_outputs outputs{rarelyNull(bits.data() + written.first), stride,
                                                      iterationStride, rarelyNull(tags.data())};
        std::array<int, mostBlocks> statuses{};
        requireStatus(vardel_ip_quarzel_bitacc_simulate_array(
            itsState.get(), rarelyNull(&outputs), rarelyNull(&inputs), rarelyNull(statuses.data())));
    }

    void configure() {
        vardel_ip_quarzel_bitacc_dump_config(itsState.get(), itsBytes.take<std::uint8_t>() % 4);
        vardel_ip_quarzel_set_passes(itsState.get(), itsBytes.take<std::uint8_t>(), rarelyNull(takePass),
                                     &itsSum);
        vardel_ip_quarzel_set_implementation(itsState.get(), itsBytes.takeText(12).c_str());
        if (const char* const name = vardel_ip_quarzel_get_implementation_name(upTo(5))) {
            const bool isChosen = vardel_ip_quarzel_set_implementation(itsState.get(), name) == 0;
            fuzz::require(isChosen || !itHasDecoder, "what is offered can be chosen");
            fuzz::require(
                !isChosen || std::strcmp(vardel_ip_quarzel_get_implementation(itsState.get()), name) == 0,
                "and is chosen");
        }
    }

    void askForFacts() {
        const auto number = itsBytes.take<int>();
        vardel_ip_quarzel_block_size size{};
        const bool exists = vardel_ip_quarzel_get_block_size(itsBytes.take<signed char>(), &size) == 0;
        const unsigned K = exists ? size.K : static_cast<unsigned>(number);
        std::vector<unsigned> permutation(exists ? K : 6144);
        fuzz::require(vardel_ip_quarzel_get_permutation(K, permutation.data()) == 0 || !exists,
                      "a size has a permutation");
        vardel_ip_quarzel_layout layout{};
        fuzz::require(
            vardel_ip_quarzel_get_layout(K, static_cast<unsigned>(anyNumber(2 << upTo(2))), &layout) != 0 ||
                layout.segments * layout.segment_steps == K,
            "segments are the whole block");
        vardel_ip_quarzel_signal signal{};
        vardel_ip_quarzel_get_signal(anyNumber(upTo(6)), &signal);
        vardel_ip_quarzel_branch branch{};
        vardel_ip_quarzel_get_branch(static_cast<unsigned>(anyNumber(upTo(8))), static_cast<unsigned>(number),
                                     &branch);
    }

    void quantise() {
        const auto scale = upTo(1) == 0 ? VARDEL_IP_QUARZEL_LLR_SCALE : itsBytes.take<double>();
        std::vector<double> values(static_cast<std::size_t>(upTo(10)));
        for (double& value : values) {
            value = itsBytes.take<double>();
        }
        std::vector<std::int8_t> soft(values.size());
        vardel_ip_quarzel_bitacc_quantise(values.data(), values.size(), scale, soft.data());
        const std::vector<float> floats(values.size(), itsBytes.take<float>());
        vardel_ip_quarzel_bitacc_quantise_float(floats.data(), floats.size(), scale, soft.data());
    }

    void call() {
        static constexpr std::array onAnything = {
            &HostileCaller::create,        &HostileCaller::simulate,    &HostileCaller::simulateBatch,
            &HostileCaller::simulateArray, &HostileCaller::askForFacts, &HostileCaller::quantise};
        const auto choice = static_cast<std::size_t>(upTo(onAnything.size()));
        if (choice < onAnything.size()) {
            (this->*onAnything.at(choice))();
        } else if (itsState != nullptr) {
            configure();
        }
    }

    fuzz::InputBytes itsBytes;
    test::State itsState;
    bool itHasDecoder = true;
    std::int64_t itsSum = 0;  ///< of all that is told, so that it is read
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    HostileCaller(data, size).run();
    return 0;
}
