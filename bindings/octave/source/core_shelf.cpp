// SPDX-License-Identifier: MIT
#include "core_shelf.hpp"

#include <algorithm>

namespace quarzel::octave {

bindings::HostCore& CoreShelf::take(const CoreSettings& settings) {
    constexpr std::size_t maxPlaces = 8;
    const auto found = std::find_if(itsPlaces.begin(), itsPlaces.end(), [&](const Place& place) {
        return place.settings.units == settings.units && place.settings.algorithm == settings.algorithm &&
               place.settings.tagWidth == settings.tagWidth;
    });
    if (found != itsPlaces.end()) {
        itsPlaces.splice(itsPlaces.begin(), itsPlaces, found);
        return itsPlaces.front().core;
    }
    Place& place = itsPlaces.emplace_front();
    place.settings = settings;
    const bindings::Outcome outcome = place.core.open(settings);
    if (!outcome.done()) {
        drop();
    }
    requireDone(outcome);
    if (itsPlaces.size() > maxPlaces) {
        itsPlaces.pop_back();
    }
    return place.core;
}

}  // namespace quarzel::octave
