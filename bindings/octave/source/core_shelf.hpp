// SPDX-License-Identifier: MIT
#pragma once

#include <list>

#include "common/host_core.hpp"

namespace quarzel::octave {

/// Keeps cores from call to call: to make one takes longer than to decode a small block.
class CoreShelf {
  public:
    /// A core that has reported nothing yet, made if there is none. It stays the shelf's.
    /// @throws bindings::BindingError when the settings are wrong
    bindings::HostCore& take(const CoreSettings& settings);

    /// Forget the core that was taken last, for instance because it has reported a saturation, which a core
    /// does but once.
    void drop() { itsPlaces.pop_front(); }

  private:
    struct Place {
        CoreSettings settings;
        bindings::HostCore core;
    };

    std::list<Place> itsPlaces;  ///< the last one taken is the first
};

}  // namespace quarzel::octave
