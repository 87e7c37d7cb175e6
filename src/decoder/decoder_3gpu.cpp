// SPDX-License-Identifier: MIT
#include "decoder/decoder_3gpu.hpp"

#include <algorithm>
#include <locale>
#include <optional>
#include <sstream>

#include "decoder/segment_trace.hpp"
#include "engine/tail_metrics.hpp"
#include "fixed/wrap16.hpp"

namespace {

/// Metrics as they are kept between segments.
T8 toBoundary(T8 metrics) {
    for (std::int16_t& metric : metrics.element) {
        metric = static_cast<std::int16_t>(metric & quarzel::boundaryMask);
    }
    return metrics;
}

}  // namespace

TDecoder3GPU::TDecoder3GPU(bool is3GPP2, unsigned numPU, unsigned numThreads)
    : TDecoder3G(is3GPP2), itsNumPU(numPU), itsNumThreads(numThreads) {}

TDecoder3GPU* TDecoder3GPU::create(bool is3GPP2, const std::string& properties) {
    unsigned numPU = 4;
    unsigned numThreads = defaultThreads;
    if (!properties.empty()) {
        std::istringstream stream(properties);
        stream.imbue(std::locale::classic());
        if (!(stream >> numPU) || numPU == 0) {
            quarzel::standardStreams.error(
                {"ERROR:TDecoder3GPU:Illegal number of processing units:", quarzel::Decimal(numPU)});
            return nullptr;
        }
        if (stream.peek() == ',') {
            stream.get();
            if (!(stream >> numThreads) || numThreads == 0) {
                quarzel::standardStreams.error(
                    {"ERROR:TDecoder3GPU:Illegal number of threads per processing unit:",
                     quarzel::Decimal(numThreads)});
                return nullptr;
            }
        }
    }
    return new TDecoder3GPU(is3GPP2, numPU, numThreads);
}

std::string TDecoder3GPU::getProperties() const {
    std::string properties = (its3GPP2 ? "3GPP2PU:" : "3GPPPU:") + std::to_string(itsNumPU);
    if (itsNumThreads != defaultThreads) {
        properties += "," + std::to_string(itsNumThreads);
    }
    return properties;
}

bool TDecoder3GPU::allocate(unsigned blockSize) {
    if (!TDecoder3G::allocate(blockSize)) {
        return false;
    }
    if (itsCutSize == 0 || blockSize != itsCutSize) {
        itsCutSize = 0;
        const std::uint32_t K = blockSize > tailSteps ? blockSize - tailSteps : 0;
        itsNT = quarzel::threadSegments(K, itsNumPU * itsNumThreads);
        if (itsVerbosity >= 1) {
            itsMessages.trace({"itsNT=", quarzel::Decimal(itsNT)});
        }
        if (K / itsNT * itsNT + tailSteps != blockSize) {
            itsMessages.error({"ERROR:TDecoder3GPU:Block size not supported"});
            return false;
        }
        quarzel::cutSegments(K, itsNT, itsAlphaSegment, itsBetaSegment);
        itsCutSize = blockSize;
        if (itsVerbosity >= 2) {
            quarzel::traceSegments(itsMessages, itsAlphaSegment, itsBetaSegment);
        }
    }
    for (unsigned set = 0; set < 2; ++set) {
        itsAlphaInit[set].assign(itsAlphaSegment.size(), T8{});
        itsBetaInit[set].assign(itsBetaSegment.size(), T8{});
    }
    return true;
}

bool TDecoder3GPU::calcGamma(unsigned siso) {
    return calcGamma(siso, 0, itsBlockSize - tailSteps - 1);
}

bool TDecoder3GPU::preCalcAlpha(unsigned /*siso*/, unsigned /*step*/, T8* out) {
    setUnknownState(out);
    *out = toBoundary(*out);
    return true;
}

bool TDecoder3GPU::preCalcBeta(unsigned siso, unsigned step, T8* out) {
    return preCalcAlpha(siso, step, out);
}

bool TDecoder3GPU::preCalcBetaTail(unsigned siso, T8* out) const {
    const unsigned set = inputSet(siso);
    quarzel::TailValues<std::int16_t> tail{};
    for (unsigned step = 0; step < tailSteps; ++step) {
        const unsigned at = itsBlockSize - tailSteps + step;
        tail.systematic[step] = itsSys[set][at];
        tail.parity0[step] = itsPar0[set][at];
        tail.parity1[step] = itsPar1[set][at];
    }
    T8 sums;
    std::ranges::copy(quarzel::tailMetrics(tail), sums.element);
    *out = toBoundary(sums);
    return true;
}

bool TDecoder3GPU::calcAlpha(unsigned siso) {
    const bool traced = itsVerbosity > 8;
    std::vector<T8>& init = itsAlphaInit[inputSet(siso)];
    if (traced) {
        itsMessages.trace({"TDecoder3GPU::calcAlpha(", quarzel::Decimal(siso), ")"});
    }
    if (siso <= 1) {
        setInitialState(&init[0]);
        for (std::size_t i = 1; i < init.size(); ++i) {
            preCalcAlpha(siso, itsAlphaSegment[i].from, &init[i]);
        }
    }
    T8 carry = init[0];
    for (std::size_t i = 0; i < init.size(); ++i) {
        const ABSegment& segment = itsAlphaSegment[i];
        itsAlpha[segment.from] = init[i];
        init[i] = toBoundary(carry);
        if (traced) {
            quarzel::traceAlphaSegment(itsMessages, segment, itsAlpha[segment.from], carry);
        }
        if (!calcAlpha(siso, segment.from, segment.to)) {
            return false;
        }
        carry = itsAlpha[segment.to];
    }
    if (traced) {
        quarzel::traceBoundaries(itsMessages, "itsAlphaInit", inputSet(siso), init);
    }
    return true;
}

bool TDecoder3GPU::calcBeta(unsigned siso) {
    const bool traced = itsVerbosity > 8;
    std::vector<T8>& init = itsBetaInit[inputSet(siso)];
    if (traced) {
        itsMessages.trace({"TDecoder3GPU::calcBeta(", quarzel::Decimal(siso), ")"});
    }
    if (siso <= 1) {
        for (std::size_t j = 0; j < init.size(); ++j) {
            if (j + 1 == init.size()) {
                preCalcBetaTail(siso, &init[j]);
            } else {
                preCalcBeta(siso, itsBetaSegment[j].from, &init[j]);
            }
        }
    }
    // A thread's next start is read before its window runs, so a boundary that the first windows store
    // reaches the last ones in this pass only when a thread has three windows or more.
    const std::size_t threads = itsNT;
    itsBetaWork.assign(init.begin(),
                       init.begin() + static_cast<std::ptrdiff_t>(std::min(threads, init.size())));
    for (std::size_t j = 0; j < init.size(); ++j) {
        const ABSegment& window = itsBetaSegment[j];
        T8& start = itsBetaWork[j % threads];
        const T8 saved = itsBeta[window.to];
        itsBeta[window.from] = start;
        if (siso <= 1 && j + 1 != init.size()) {
            setUnknownState(&itsBeta[window.from]);
        }
        if (j + threads < init.size()) {
            start = init[j + threads];
        }
        if (!calcBeta(siso, window.from, window.to)) {
            return false;
        }
        // The window just below: of the same thread, or the last one of the thread before.
        std::optional<std::size_t> below;
        if (j != 0) {
            below = j >= threads ? j - threads : init.size() - threads + j - 1;
        }
        if (traced) {
            quarzel::traceBetaWindow(itsMessages, window, itsBeta[window.from], itsBeta[window.to], below);
        }
        if (below) {
            init[*below] = toBoundary(itsBeta[window.to]);
            itsBeta[window.to] = saved;
        }
    }
    if (traced) {
        quarzel::traceBoundaries(itsMessages, "itsBetaInit", inputSet(siso), init);
    }
    return true;
}
