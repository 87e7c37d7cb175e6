// SPDX-License-Identifier: MIT
#include "interface/lane_history.hpp"

#include <algorithm>
#include <memory>
#include <utility>

#include "decoder/decoder_3gpu.hpp"
#include "engine/engine.hpp"
#include "interface/wiring.hpp"
#include "interleaver/interleaver_3gpplte.hpp"

namespace quarzel {

namespace {

constexpr Messages silence([](void*, int, const char*) {}, nullptr);

/// While it lives, a decoder is wired and set as its creation left it, and silent.
class AsCreated {
  public:
    AsCreated(TDecoder3GPU& decoder, int algorithm)
        : itsDecoder(decoder),
          itsEngine(TCalculationEngine::create(engineProperties(algorithm))),
          itsDumpCount(decoder.dumpCount()),
          itsDumpStop(decoder.dumpStop()),
          itsVerbosity(decoder.verbosity()),
          itsExtrinsicIn(decoder.extrinsicIn()),
          itsScale(decoder.extrinsicScale()),
          itsMessages(decoder.messages()),
          itsDecodes(decoder.decodeCount()),
          itsPasses(decoder.sisoCount()),
          itsFormerInterleaver(decoder.interleaver()),
          itsFormerEngine(decoder.engine()) {
        itsEngine->setFormats(&itsBranchFormat, &itsStateFormat, &itsBranchFormat);
        itsEngine->initialise();
        decoder.setDump(0);
        decoder.setVerbosity(0);
        decoder.setExtrinsicIn({});
        decoder.setExtrinsicScale(quarzel::extrinsicScale(algorithm));
        decoder.setMessages(silence);
        decoder.connect(&itsInterleaver, itsEngine.get());
    }
    AsCreated(const AsCreated&) = delete;
    AsCreated& operator=(const AsCreated&) = delete;
    ~AsCreated() {
        itsDecoder.setDump(itsDumpCount, itsDumpStop);
        itsDecoder.setVerbosity(itsVerbosity);
        itsDecoder.setExtrinsicIn(std::move(itsExtrinsicIn));
        itsDecoder.setExtrinsicScale(itsScale);
        itsDecoder.setMessages(itsMessages);
        itsDecoder.setCounts(itsDecodes, itsPasses);
        itsDecoder.connect(itsFormerInterleaver, itsFormerEngine);
    }

  private:
    TDecoder3GPU& itsDecoder;
    TNumberFormat itsStateFormat{12, 3};
    TNumberFormat itsBranchFormat{8, 3};
    TInterleaver3GPPLTE itsInterleaver;
    std::unique_ptr<TCalculationEngine> itsEngine;
    unsigned itsDumpCount;
    bool itsDumpStop;
    unsigned itsVerbosity;
    std::vector<short> itsExtrinsicIn;
    double itsScale;
    Messages itsMessages;
    std::uint64_t itsDecodes;
    std::uint64_t itsPasses;
    TInterleaver* itsFormerInterleaver;
    TCalculationEngine* itsFormerEngine;
};

}  // namespace

void LaneHistory::keep(const LaneDecoder& lanes, std::uint32_t next) {
    const std::uint32_t K = lanes.lastSize();
    if (K > next) {
        Record& record = itsRecords[K];
        lanes.keepLast(record.rows);
        record.live = true;
    }
    for (auto covered = itsRecords.lower_bound(next); covered != itsRecords.end(); ++covered) {
        covered->second.live = false;
    }
}

void LaneHistory::replay(TDecoder3GPU& decoder, const LaneDecoder& lanes, int algorithm) {
    const auto isLive = [](const auto& record) { return record.second.live; };
    if (std::none_of(itsRecords.begin(), itsRecords.end(), isLive)) {
        return;
    }
    const AsCreated wired(decoder, algorithm);
    std::vector<unsigned char> ignored;
    for (const auto& [K, record] : itsRecords) {
        if (record.live) {
            decoder.decode(lanes.softValues(record.rows), ignored, record.rows.iterations);
        }
    }
    forget();
}

void LaneHistory::forget() {
    for (auto& [K, record] : itsRecords) {
        record.live = false;
    }
}

}  // namespace quarzel
