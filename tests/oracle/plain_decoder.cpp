// SPDX-License-Identifier: MIT
#include "oracle/plain_decoder.hpp"

#include <algorithm>

#include "oracle/plain_qpp_rows.hpp"

namespace quarzel::oracle {
namespace {

int lowBits(int value, int bits) {
    return value & ((1 << bits) - 1);
}

/// The soft value that the core's input register holds.
int inputOf(const Inputs& inputs, const Streams& streams, std::size_t stream, int position) {
    const int delayed = std::max(0, position - inputs.delay[stream]);
    const int value = streams[stream][static_cast<std::size_t>(delayed)] * inputs.sign[stream];
    const int limited =
        inputs.wraps ? held(Register{8, false}, value) : std::clamp(value, inputs.least, inputs.greatest);
    return held(Register{8, false}, (limited | inputs.stuckAt1) & ~inputs.stuckAt0);
}

}  // namespace

void PlainDecoder::setPermutation() {
    const Permutation& p = itsDesign.permutation;
    const auto found =
        std::find_if(qppRows.begin(), qppRows.end(), [this](const QppRow& row) { return row.K == itsK; });
    const auto place = std::clamp<std::ptrdiff_t>(found - qppRows.begin() + p.rowShift, 0, 187);
    const QppRow& row = qppRows[static_cast<std::size_t>(place)];
    const long long f1 = row.f1 + p.f1Added, f2 = row.f2 + p.f2Added;
    itsForward.resize(static_cast<std::size_t>(itsK));
    itsBack.assign(static_cast<std::size_t>(itsK), 0);
    for (int i = 0; i < itsK; ++i) {
        const long long square = (1LL * i * i) & ((1LL << p.squareBits) - 1);
        const long long product = (f1 * i + f2 * square + p.added) & ((1LL << p.productBits) - 1);
        const int address =
            lowBits(static_cast<int>(product % (itsK + p.modulusAdded)), p.addressBits) % itsK;
        itsForward[static_cast<std::size_t>(i)] = address;
        itsBack[static_cast<std::size_t>(address)] = i;
    }
}

void PlainDecoder::setCode(int code, const Streams& streams) {
    const Permutation& p = itsDesign.permutation;
    const auto& order = p.systematicInverse ? itsBack : itsForward;
    const auto c = static_cast<std::size_t>(code);
    const auto parity = static_cast<std::size_t>(itsDesign.inputs.parity[c]);
    for (int j = 0; j < itsK; ++j) {
        const auto i = static_cast<std::size_t>(j);
        const int place = code == 0 || p.systematicStraight ? j : order[i];
        itsSystematic[c][i] = inputOf(itsDesign.inputs, streams, 0, place);
        itsParity[c][i] = inputOf(itsDesign.inputs, streams, parity, j);
    }
    for (std::size_t step = 0; step < 3; ++step) {
        const auto& places = itsDesign.inputs.tail[c][step];
        const auto tail = [&](int place) {
            return inputOf(itsDesign.inputs, streams, static_cast<std::size_t>(place % 3), itsK + place / 3);
        };
        itsSystematic[c][static_cast<std::size_t>(itsK) + step] = tail(places[0]);
        itsParity[c][static_cast<std::size_t>(itsK) + step] = tail(places[1]);
    }
}

void PlainDecoder::cut() {
    const Cut& c = itsDesign.cut;
    itsSegments = 1;
    while (itsSegments < std::min(c.units * c.threads, c.most) &&
           c.leastSegment * itsSegments + (c.strictly ? 1 : 0) <= itsK) {
        itsSegments *= 2;
    }
    itsSegmentSteps = itsK / itsSegments;
    itsWindows.clear();
    for (int offset = 0; offset < itsSegmentSteps;) {
        const int rest = itsSegmentSteps - offset;
        int length = std::min(rest, c.window);
        if (rest > c.window && rest < c.halvedBelow) {
            length = (rest + c.halfRounding) / 2;
        }
        const int bottom = c.restFirst ? rest - length : offset;
        for (int i = 0; i < itsSegments; ++i) {
            const int first = i * itsSegmentSteps + bottom;
            itsWindows.push_back({first + length - 1, std::max(0, first - 1)});
        }
        offset += length;
    }
}

void PlainDecoder::load(const Streams& streams) {
    const int K = static_cast<int>(streams[0].size()) - 4;
    const auto steps = static_cast<std::size_t>(K) + 3;
    if (K != itsK) {
        itsK = K;
        setPermutation();
        cut();
        itsSignals = {};
        itsSignals.alpha.assign(steps, {});
        itsSignals.beta.assign(steps, {});
        itsSignals.gamma.assign(steps, {});
        itsSignals.llr.assign(steps, 0);
        itsSignals.extrinsic.assign(steps, 0);
        itsSignals.intrinsic.assign(steps, 0);
    }
    for (int code = 0; code < 2; ++code) {
        const auto c = static_cast<std::size_t>(code);
        itsSystematic[c].resize(steps);
        itsParity[c].resize(steps);
        setCode(code, streams);
        itsAlphaStarts[c].assign(static_cast<std::size_t>(itsSegments), {});
        itsBetaStarts[c].assign(itsWindows.size(), {});
    }
    if (itsDesign.exchange.firstIsZero) {
        std::fill(itsSignals.extrinsic.begin(), itsSignals.extrinsic.end(), 0);
    }
    itsAlphaPending = itsBetaPending = {};
    itsBefore.clear();
}

int PlainDecoder::aPriori(int code, int j) const {
    const Permutation& p = itsDesign.permutation;
    const bool straight = code == 1 ? p.forwardStraight : p.backStraight;
    const bool forward = code == 1 ? !p.forwardInverse : p.backForward;
    const auto i = static_cast<std::size_t>(j);
    const int place = straight ? j : (forward ? itsForward : itsBack)[i];
    return itsDesign.exchange.aPrioriSign * shiftRight(itsSignals.extrinsic[static_cast<std::size_t>(place)],
                                                       itsDesign.exchange.aPrioriBits,
                                                       itsDesign.exchange.aPrioriRounding);
}

void PlainDecoder::runIntrinsic(int code) {
    const Exchange& x = itsDesign.exchange;
    const auto c = static_cast<std::size_t>(code);
    for (int j = 0; j < itsK + 3; ++j) {
        const auto i = static_cast<std::size_t>(j);
        const int sum = itsSystematic[c][i] + (j < itsK ? aPriori(code, j) : 0);
        itsSignals.intrinsic[i] = std::clamp(sum, x.intrinsicLeast, x.intrinsicGreatest);
        if (j < itsK) {
            const int parity = itsParity[c][i] >> x.parityShift;
            for (std::size_t m = 0; m < 4; ++m) {
                const int metric = itsSignals.intrinsic[i] + x.paritySign[m] * parity;
                itsSignals.gamma[i][m] = std::clamp(held(x.gamma, metric), x.gammaLeast, x.gammaGreatest);
            }
        }
    }
}

void PlainDecoder::runExtrinsic(int pass) {
    const Exchange& x = itsDesign.exchange;
    const bool scaled = pass < x.scaledPasses;
    const auto c = static_cast<std::size_t>(codeOf(pass));
    for (std::size_t i = 0; i < static_cast<std::size_t>(itsK) + 3; ++i) {
        const int channel = itsSystematic[c][i];
        int value =
            itsSignals.llr[i] - x.channelPart * channel - x.aPrioriPart * (itsSignals.intrinsic[i] - channel);
        if (x.saturatesFirst) {
            value = std::clamp(value, x.leastExtrinsic, x.greatestExtrinsic);
        }
        value = scaled ? shiftRight(value * x.numerator, x.denominatorBits, x.scaleRounding) : value;
        itsSignals.extrinsic[i] = x.extrinsicWraps ? held(Register{8, false}, value)
                                                   : std::clamp(value, x.leastExtrinsic, x.greatestExtrinsic);
        if (static_cast<int>(i % 8) == x.lostBank) {
            itsSignals.extrinsic[i] = 0;
        }
    }
}

void PlainDecoder::runPass(int pass) {
    const int code = codeOf(pass);
    runIntrinsic(code);
    runAlpha(pass, code);
    runBeta(pass, code);
    runLikelihood(itsK);
    runExtrinsic(pass);
}

std::vector<std::uint8_t> PlainDecoder::decisions() const {
    const Outcome& o = itsDesign.outcome;
    const auto& soft = o.fromExtrinsic ? itsSignals.extrinsic : itsSignals.llr;
    std::vector<std::uint8_t> bits(static_cast<std::size_t>(itsK));
    for (int j = 0; j < itsK; ++j) {
        const int delayed = (j + itsK - o.delay) % itsK;
        const int value = soft[static_cast<std::size_t>(
            o.interleaved ? itsForward[static_cast<std::size_t>(delayed)] : delayed)];
        const bool one = value > 0 || (value == 0 && o.zeroDecides == 1);
        bits[static_cast<std::size_t>(j)] = one != o.inverted && j < itsK - o.lost ? 1 : 0;
    }
    return bits;
}

Answer PlainDecoder::decode(const Streams& streams, int iterations, unsigned tag) {
    const Outcome& o = itsDesign.outcome;
    load(streams);
    const int run = std::min(lowBits(iterations, o.iterationBits) + o.iterationsAdded, o.mostIterations);
    for (int pass = 0; pass < 2 * run + o.passesAdded; ++pass) {
        runPass(pass);
        if (o.stopsWhenAgreed && pass % 2 == 1) {
            auto now = decisions();
            if (now == itsBefore) {
                break;
            }
            itsBefore = std::move(now);
        }
    }
    const unsigned given = o.previousTag ? itsLastTag : tag;
    itsLastTag = tag;
    const unsigned kept = given & ((1U << o.tagBits) - 1);
    return {decisions(), (kept | o.tagStuckAt1) & ~o.tagStuckAt0};
}

}  // namespace quarzel::oracle
