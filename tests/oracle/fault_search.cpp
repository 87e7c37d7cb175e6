// SPDX-License-Identifier: MIT
// Finds a small set of blocks whose answers give away the faults of the catalogue, for one core:
//   fault_search UNITS TYPE CANDIDATES SEED BLOCKS SCORES
// Rows go to the end of the tables BLOCKS and SCORES. What is printed: the score of the set on the catalogue,
// which it was chosen for, and on the faults held out, which it was not; and the faults that the set misses.
#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <iostream>
#include <numeric>
#include <string>

#include "oracle/fault_finder.hpp"

namespace quarzel::oracle {
namespace {

std::uint32_t workOf(const tool::CoveringBlock& block) {
    return block.planned.blockSize * static_cast<std::uint32_t>(block.planned.iterations);
}

/// Again and again the candidate that finds most of what has not been found; of equals the smallest.
std::vector<std::size_t> chooseGreedily(const std::vector<Subject>& subjects,
                                        const std::vector<tool::CoveringBlock>& candidates) {
    std::vector<std::size_t> chosen;
    std::vector<bool> found(subjects.size());
    while (true) {
        std::vector<int> gains(candidates.size());
        for (std::size_t i = 0; i < subjects.size(); ++i) {
            for (const std::size_t finder : subjects[i].finders) {
                gains[finder] += found[i] ? 0 : 1;
            }
        }
        std::vector<std::size_t> order(candidates.size());
        std::iota(order.begin(), order.end(), 0);
        const auto work = [&](std::size_t i) { return workOf(candidates[i]); };
        const std::size_t best =
            *std::min_element(order.begin(), order.end(), [&](std::size_t a, std::size_t b) {
                return gains[a] != gains[b] ? gains[a] > gains[b] : work(a) < work(b);
            });
        if (gains[best] == 0) {
            return chosen;
        }
        chosen.push_back(best);
        for (std::size_t i = 0; i < subjects.size(); ++i) {
            const auto& finders = subjects[i].finders;
            found[i] = found[i] || std::find(finders.begin(), finders.end(), best) != finders.end();
        }
    }
}

long foundOf(const std::vector<Subject>& subjects) {
    return std::count_if(subjects.begin(), subjects.end(),
                         [](const Subject& subject) { return !subject.finders.empty(); });
}

/// The chosen blocks as a bench runs them. One comes twice in a row, since some faults show in the second of
/// two blocks of a size: the one with the least work by which most of them do.
std::vector<tool::CoveringBlock> setOf(const FaultFinder& finder, const std::vector<std::size_t>& chosen,
                                       const std::vector<tool::CoveringBlock>& candidates) {
    std::vector<Subject> subjects = finder.subjectsOf(catalogue());
    std::erase_if(subjects, [](const Subject& subject) { return !subject.fault.twice; });
    std::vector<tool::CoveringBlock> blocks;
    for (const std::size_t candidate : chosen) {
        blocks.push_back(candidates[candidate]);
    }
    std::vector<std::size_t> places(blocks.size());
    std::iota(places.begin(), places.end(), 0);
    std::stable_sort(places.begin(), places.end(),
                     [&](std::size_t a, std::size_t b) { return workOf(blocks[a]) < workOf(blocks[b]); });
    std::vector<tool::CoveringBlock> best;
    long most = -1;
    for (const std::size_t place : places) {
        std::vector<tool::CoveringBlock> set = blocks;
        set.insert(set.begin() + static_cast<std::ptrdiff_t>(place), blocks[place]);
        std::vector<Subject> tried = subjects;
        finder.runSet(set, tried);
        const long found = foundOf(tried);
        if (found > most) {
            most = found;
            best = std::move(set);
        }
    }
    return best;
}

/// Print what a set finds of some faults; the cells of a table of scores.
std::string score(const char* name, const std::vector<Subject>& subjects, int type, bool isHeldOut) {
    const long found = foundOf(subjects);
    const auto equivalent = std::count_if(subjects.begin(), subjects.end(), [type](const Subject& subject) {
        return isEquivalent(subject.fault, type);
    });
    const auto of = static_cast<long>(subjects.size()) - equivalent;
    std::cout << name << ": " << found << " of " << of << " found, " << equivalent << " equivalent\n";
    for (const Subject& subject : subjects) {
        if (subject.finders.empty() && !isEquivalent(subject.fault, type)) {
            std::cout << "  not found: " << subject.fault.name << '\n';
        }
    }
    const std::string cells = ',' + std::to_string(found) + ',' + std::to_string(of);
    return isHeldOut ? cells : cells + ',' + std::to_string(equivalent);
}

}  // namespace

int run(int units, int type, int count, unsigned seed, const char* blocksTable, const char* scoresTable) {
    constexpr std::size_t enough = 6;  // candidates that find a fault; it is not tried on more of them
    const FaultFinder finder(units, type);
    std::vector<tool::CoveringBlock> candidates;
    std::vector<Subject> subjects = finder.subjectsOf(catalogue());
    std::mt19937 random(seed);
    for (int i = 0; i < count; ++i) {
        candidates.push_back(drawBlock(random));
        finder.tryOn(candidates.back(), static_cast<std::size_t>(i), subjects, enough);
    }
    const std::vector<tool::CoveringBlock> blocks =
        setOf(finder, chooseGreedily(subjects, candidates), candidates);

    std::ofstream rows(blocksTable, std::ios::app);
    std::uint32_t bits = 0;
    for (const tool::CoveringBlock& block : blocks) {
        rows << rowOf(block, units, type) << '\n';
        bits += block.planned.blockSize;
    }
    std::cout << units << " units, type " << type << ": " << blocks.size() << " blocks of " << count
              << " candidates, " << bits << " bits, seed " << seed << '\n';
    std::ofstream scores(scoresTable, std::ios::app);
    scores << units << ',' << type;
    for (const bool isHeldOut : {false, true}) {
        std::vector<Subject> scored =
            isHeldOut ? finder.subjectsOf(heldOutFaults()) : finder.subjectsOf(catalogue());
        finder.runSet(blocks, scored);
        scores << score(isHeldOut ? "held out" : "catalogue", scored, type, isHeldOut);
    }
    scores << '\n';
    return rows.flush() && scores.flush() ? EXIT_SUCCESS : EXIT_FAILURE;
}

}  // namespace quarzel::oracle

int main(int count, char** arguments) {
    if (count != 7) {
        std::cerr << "fault_search UNITS TYPE CANDIDATES SEED BLOCKS SCORES\n";
        return EXIT_FAILURE;
    }
    return quarzel::oracle::run(std::atoi(arguments[1]), std::atoi(arguments[2]), std::atoi(arguments[3]),
                                static_cast<unsigned>(std::atoi(arguments[4])), arguments[5], arguments[6]);
}
