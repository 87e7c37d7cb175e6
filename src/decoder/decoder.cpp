// SPDX-License-Identifier: MIT
#include "decoder/decoder.hpp"

#include <algorithm>

#include "decoder/decoder_3gpu.hpp"
#include "decoder/error_count.hpp"
#include "fixed/properties.hpp"

TDecoder::TDecoder() = default;
TDecoder::~TDecoder() = default;

TDecoder* TDecoder::create(const std::string& properties) {
    const auto [type, rest] = splitString(properties, ":");
    if (type == "3GPPPU") {
        return TDecoder3GPU::create(false, rest);
    }
    quarzel::standardStreams.error({"ERROR:TDecoder:Unrecognised type:", type});
    return nullptr;
}

std::vector<std::string> TDecoder::getNames() {
    return {"3GPPPU"};
}

void TDecoder::growMetricStore(unsigned blockSize) {
    constexpr std::size_t alignment = 16;
    const std::size_t steps = (std::size_t{blockSize} + 63) / 64 * 64;
    const std::size_t size = 3 * steps * sizeof(T8) + alignment;
    if (size > itsMetricBufferSize) {
        itsMetricBuffer.reset();
        itsMetricBufferSize = 0;
        itsAlpha = itsBeta = itsGamma = nullptr;
        itsMetricBuffer = std::make_unique<unsigned char[]>(size);
        itsMetricBufferSize = static_cast<std::uint32_t>(size);
        void* first = itsMetricBuffer.get();
        std::size_t space = size;
        itsAlpha = static_cast<T8*>(std::align(alignment, size - alignment, first, space));
        itsBeta = itsAlpha + steps;
        itsGamma = itsBeta + steps;
    }
}

bool TDecoder::allocate(unsigned blockSize) {
    itsBlockSize = 0;  // until there is memory for all of the block
    growMetricStore(blockSize);
    itsIntrinsic.assign(blockSize, 0);
    itsLLR.assign(blockSize, 0);
    itsExtrinsic.assign(blockSize, 0);
    itsBlockSize = blockSize;
    return true;
}

bool TDecoder::decode(const std::vector<short>& soft, const std::vector<unsigned char>& reference,
                      std::vector<unsigned long long>& bitErrors,
                      std::vector<unsigned long long>& blockErrors) {
    std::vector<unsigned char> hard;
    if (!decode(soft, hard, static_cast<unsigned>(bitErrors.size()))) {
        return false;
    }
    const unsigned long long errors =
        quarzel::countErrors(reference, hard, [](unsigned char bit) { return bit != 0; });
    bitErrors.back() += errors;
    blockErrors.back() += errors != 0 ? 1 : 0;
    return true;
}

void TDecoder::dump(std::ostream& /*stream*/) {}

void TDecoder::dumpFull(std::ostream& /*stream*/, unsigned /*siso*/) {}

bool TDecoder::checkDump(unsigned siso) {
    if (itsDumpCount == 0) {
        return true;
    }
    itsMessages.traceText([&](std::ostream& stream) { dumpFull(stream, siso); });
    --itsDumpCount;
    if (itsDumpCount == 0 && itsDumpStop) {
        itsMessages.error({"STOP:Dump complete"});
        return false;
    }
    return true;
}
