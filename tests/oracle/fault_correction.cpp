// SPDX-License-Identifier: MIT
// Faults of corrections of maxima.
#include "oracle/fault.hpp"

namespace quarzel::oracle {
namespace {

/// Change the one table that every maximum reads.
void setEntry(Design& d, std::size_t entry, int value) {
    d.alpha.correction.table[entry] = d.beta.correction.table[entry] = value;
    for (Correction& correction : d.likelihood.correction) {
        correction.table[entry] = value;
    }
}

constexpr Fault faults[] = {
    {"alpha-uncorrected", "the forward recursion misses the correction",
     [](Design& d) { d.alpha.correction.timing = Timing::never; }, starType},
    {"alpha-corrected-at-once", "the forward recursion corrects a step early",
     [](Design& d) { d.alpha.correction.timing = Timing::atOnce; }, starType},
    {"alpha-pending-kept", "corrections of the forward recursion go on to the next part of the trellis",
     [](Design& d) { d.alpha.keepsPending = true; }, starType},
    {"alpha-pending-swapped", "the forward recursion adds the correction of the candidate not taken",
     [](Design& d) { d.alpha.correction.swapsPending = true; }, starType},
    {"alpha-magnitude", "the forward recursion looks up the negative of a negative difference",
     [](Design& d) { d.alpha.correction.complements = false; }, starType},
    {"alpha-table-fine", "the forward recursion looks up with a bit too few ignored",
     [](Design& d) { d.alpha.correction.ignoredBits = 1; }, starType},
    {"alpha-table-coarse", "the forward recursion looks up with a bit too many ignored",
     [](Design& d) { d.alpha.correction.ignoredBits = 3; }, starType},
    {"beta-uncorrected", "the backward recursion misses the correction",
     [](Design& d) { d.beta.correction.timing = Timing::never; }, starType},
    {"beta-corrected-at-once", "the backward recursion corrects a step early",
     [](Design& d) { d.beta.correction.timing = Timing::atOnce; }, starType},
    {"beta-pending-kept", "corrections of the backward recursion go on to the next part of the trellis",
     [](Design& d) { d.beta.keepsPending = true; }, starType},
    {"beta-pending-swapped", "the backward recursion adds the correction of the candidate not taken",
     [](Design& d) { d.beta.correction.swapsPending = true; }, starType},
    {"beta-magnitude", "the backward recursion looks up the negative of a negative difference",
     [](Design& d) { d.beta.correction.complements = false; }, starType},
    {"beta-table-fine", "the backward recursion looks up with a bit too few ignored",
     [](Design& d) { d.beta.correction.ignoredBits = 1; }, starType},
    {"beta-table-coarse", "the backward recursion looks up with a bit too many ignored",
     [](Design& d) { d.beta.correction.ignoredBits = 3; }, starType},
    {"entry0-5", "entry 0 of the correction table is 5, not 6", [](Design& d) { setEntry(d, 0, 5); },
     starType},
    {"entry1-3", "entry 1 of the correction table is 3, not 4", [](Design& d) { setEntry(d, 1, 3); },
     starType},
    {"entry2-2", "entry 2 of the correction table is 2, not 3", [](Design& d) { setEntry(d, 2, 2); },
     starType},
    {"entry3-1", "entry 3 of the correction table is 1, not 2", [](Design& d) { setEntry(d, 3, 1); },
     starType},
    {"entry4-0", "entry 4 of the correction table is 0, not 1", [](Design& d) { setEntry(d, 4, 0); },
     starType},
    {"entry5-0", "entry 5 of the correction table is 0, not 1", [](Design& d) { setEntry(d, 5, 0); },
     starType},
    {"entry6-1", "entry 6 of the correction table is 1, not 0", [](Design& d) { setEntry(d, 6, 1); },
     starType},
    {"entry0-7", "entry 0 of the correction table is 7, not 6", [](Design& d) { setEntry(d, 0, 7); },
     starType},
    {"table-short", "the correction table ends after four entries",
     [](Design& d) {
         setEntry(d, 4, 0);
         setEntry(d, 5, 0);
     },
     starType},
    {"table-cut", "the entries of the correction table are cut, not rounded",
     [](Design& d) {
         setEntry(d, 0, 5);
         setEntry(d, 1, 3);
         setEntry(d, 2, 2);
         setEntry(d, 3, 1);
         setEntry(d, 5, 0);
     },
     starType},
    {"level1-uncorrected", "level 1 of the likelihood tree misses its correction",
     [](Design& d) { d.likelihood.correction[0].timing = Timing::never; }, starType},
    {"level2-uncorrected", "level 2 of the likelihood tree misses its correction",
     [](Design& d) { d.likelihood.correction[1].timing = Timing::never; }, starType},
    {"level3-uncorrected", "level 3 of the likelihood tree misses its correction",
     [](Design& d) { d.likelihood.correction[2].timing = Timing::never; }, starType},
    {"level1-at-once", "level 1 of the likelihood tree corrects a level early",
     [](Design& d) { d.likelihood.correction[0].timing = Timing::atOnce; }, starType},
    {"level2-pending-swapped",
     "level 2 of the likelihood tree adds the correction of the candidate not taken",
     [](Design& d) { d.likelihood.correction[1].swapsPending = true; }, starType},
    {"level2-at-once", "level 2 of the likelihood tree corrects a level early",
     [](Design& d) { d.likelihood.correction[1].timing = Timing::atOnce; }, starType},
    {"level3-pending-swapped",
     "level 3 of the likelihood tree adds the correction of the candidate not taken",
     [](Design& d) { d.likelihood.correction[2].swapsPending = true; }, starType},
    {"last-correction-lost", "the correction of the last level of the likelihood tree is lost",
     [](Design& d) { d.likelihood.lastPending = false; }, starType},
    {"tree-magnitude", "the likelihood tree looks up the negative of a negative difference",
     [](Design& d) {
         for (Correction& correction : d.likelihood.correction) {
             correction.complements = false;
         }
     },
     starType},
    {"tree-table-fine", "the likelihood tree looks up with a bit too few ignored",
     [](Design& d) {
         for (Correction& correction : d.likelihood.correction) {
             correction.ignoredBits = 1;
         }
     },
     starType},
};

}  // namespace

std::span<const Fault> correctionFaults() {
    return faults;
}

}  // namespace quarzel::oracle
