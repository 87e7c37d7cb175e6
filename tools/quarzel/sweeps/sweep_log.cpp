// SPDX-License-Identifier: MIT
#include "sweeps/sweep_log.hpp"

#include <fmt/format.h>

#include "sweep/statistics.hpp"

namespace quarzel::tool {

void SweepLog::tellPoints(const sweep::Dispatcher& dispatcher) {
    for (const std::size_t end = dispatcher.firstUnfinished(); itsPointsTold < end; ++itsPointsTold) {
        if (dispatcher.isLeftOut(itsPointsTold)) {
            continue;
        }
        const sweep::Setup& setup = dispatcher.plan().points[itsPointsTold].setup;
        const sweep::PointState point = dispatcher.stateOf(itsPointsTold);
        itsStream << fmt::format("quarzel: {}: {} blocks, {} block errors, BLER {:.2e}\n",
                                 sweep::setupText(setup), point.blocks, point.last().blockErrors,
                                 sweep::ratesOf(point, setup.informationBits()).bler);
    }
    itsStream << std::flush;
}

void SweepLog::update(const sweep::Dispatcher& dispatcher, Clock::time_point now) {
    if (!itsHasBegun) {
        itsMeter.measure(dispatcher, now);
        itsHasBegun = true;
    }
    if (now < itsFirstTime) {
        return;
    }
    itsIsSilent = false;
    tellPoints(dispatcher);
    if (now >= itsNextMinute) {
        itsStream << fmt::format("quarzel: {}\n", itsMeter.measure(dispatcher, now).text()) << std::flush;
        itsNextMinute = now + std::chrono::minutes(1);
    }
}

bool SweepLog::finish(const sweep::Dispatcher& dispatcher) {
    if (!itsIsSilent) {
        tellPoints(dispatcher);
    }
    return false;
}

}  // namespace quarzel::tool
