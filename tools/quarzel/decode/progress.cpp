// SPDX-License-Identifier: MIT
#include "decode/progress.hpp"

#include <fmt/format.h>

#include "report_text.hpp"

namespace quarzel::tool {

namespace {

constexpr std::chrono::seconds patience{1};
constexpr std::chrono::milliseconds drawingPeriod{100};
constexpr std::chrono::minutes logPeriod{1};
constexpr std::size_t width = 30;
constexpr const char* wipe = "\x1b[K";  // from the cursor to the end of the line

}  // namespace

Progress::Progress(std::ostream& stream, bool isTerminal, std::size_t total, Clock::time_point start)
    : itsStream(stream),
      itsIsTerminal(isTerminal),
      itsTotal(total),
      itsStart(start),
      itsNextTime(isTerminal ? start + patience : start + logPeriod) {}

Progress::~Progress() {
    if (itsIsDrawn) {
        itsStream << wipe << std::flush;
    }
}

void Progress::draw(std::size_t done) {
    const std::size_t filled = width * done / itsTotal;
    // The cursor rests at the start of the line, so that a warning of the library, which is longer than the
    // bar, takes its place.
    itsStream << fmt::format("[{:#<{}}{:.<{}}] {:3} %  {} of {} blocks{}\r", "", filled, "", width - filled,
                             100 * done / itsTotal, done, itsTotal, wipe)
              << std::flush;
    itsIsDrawn = true;
}

void Progress::log(std::size_t done, double seconds) {
    itsStream << fmt::format("quarzel: {} of {} blocks", done, itsTotal);
    if (done > 0) {
        const double left = seconds * static_cast<double>(itsTotal - done) / static_cast<double>(done);
        itsStream << fmt::format(", {} left", durationText(left));
    }
    itsStream << std::endl;
}

void Progress::update(std::size_t done, Clock::time_point now) {
    if (now < itsNextTime) {
        return;
    }
    if (itsIsTerminal) {
        draw(done);
        itsNextTime = now + drawingPeriod;
    } else {
        log(done, std::chrono::duration<double>(now - itsStart).count());
        itsNextTime = now + logPeriod;
    }
}

}  // namespace quarzel::tool
