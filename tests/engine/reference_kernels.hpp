// SPDX-License-Identifier: MIT
#pragma once

#include <array>
#include <cstddef>
#include <vector>

#include "engine/kernel_calls.hpp"
#include "engine/t8.hpp"
#include "engine/tables.hpp"

/// The recursions and the tree of the log-likelihood ratio, written a second time from the tables of
/// candidates, in integers that are wrapped after every operation. Nothing here is shared with the model.
namespace quarzel::test::reference {

/// A value modulo 2^16, as a signed word.
inline int wrapped(int value) {
    return (value + 8 * 65536 + 32768) % 65536 - 32768;
}

/// How a new metric is chosen: metric x plus branch metric g, the first candidate, against metric y minus
/// branch metric g.
struct Candidates {
    std::size_t x;
    std::size_t y;
    std::size_t g;
};

inline constexpr std::array<Candidates, 8> forwardCandidates = {
    {{1, 0, 0}, {2, 3, 1}, {5, 4, 2}, {6, 7, 3}, {0, 1, 0}, {3, 2, 1}, {4, 5, 2}, {7, 6, 3}}};
inline constexpr std::array<Candidates, 8> backwardCandidates = {
    {{4, 0, 0}, {0, 4, 0}, {1, 5, 1}, {5, 1, 1}, {6, 2, 2}, {2, 6, 2}, {3, 7, 3}, {7, 3, 3}}};

/// First-level pairs of the tree: alpha of state ax with beta of state bx, the first candidate, against alpha
/// of state ay with beta of state by.
struct Paths {
    std::size_t ax;
    std::size_t bx;
    std::size_t ay;
    std::size_t by;
};

inline constexpr std::array<Paths, 4> plusPaths = {{{1, 0, 0, 4}, {3, 5, 2, 1}, {5, 2, 4, 6}, {7, 7, 6, 3}}};
inline constexpr std::array<Paths, 4> minusPaths = {{{1, 4, 0, 0}, {3, 1, 2, 5}, {5, 6, 4, 2}, {7, 3, 6, 7}}};

/// The correction of a signed difference.
inline int correction(const Table& table, int difference) {
    return table[static_cast<std::size_t>(difference + 32768)];
}

/// Maximum with its correction at once.
inline int maxStar(const Table& table, int x, int y) {
    const int d = wrapped(x - y);
    return wrapped((d < 0 ? y : x) + correction(table, d));
}

/// All metrics of a recursion in the order in which it walks; branch metrics in that order too.
inline std::vector<Row> maxStarWalk(const Table& table, const std::array<Candidates, 8>& candidates,
                                    const std::vector<T8>& gamma, const T8& start) {
    std::vector<Row> metrics = {row(start)};
    for (std::size_t k = 0; k + 1 < gamma.size(); ++k) {
        const Row& now = metrics.back();
        Row next{};
        for (std::size_t s = 0; s < 8; ++s) {
            const auto [x, y, g] = candidates[s];
            next[s] = static_cast<std::int16_t>(
                maxStar(table, wrapped(now[x] + gamma[k][g]), wrapped(now[y] - gamma[k][g])));
        }
        metrics.push_back(next);
    }
    return metrics;
}

inline int maxStarRatio(const Table& table, const T8& a, const T8& b, const T8& g) {
    int p[4];
    int q[4];
    for (std::size_t i = 0; i < 4; ++i) {
        const Paths& plus = plusPaths[i];
        const Paths& minus = minusPaths[i];
        p[i] = maxStar(table, wrapped(a[plus.ax] + b[plus.bx]), wrapped(a[plus.ay] + b[plus.by]));
        q[i] = maxStar(table, wrapped(a[minus.ax] + b[minus.bx]), wrapped(a[minus.ay] + b[minus.by]));
    }
    const int r0 = maxStar(table, wrapped(p[0] + g[0]), wrapped(p[1] + g[1]));
    const int r1 = maxStar(table, wrapped(p[2] + g[2]), wrapped(p[3] + g[3]));
    const int s0 = maxStar(table, wrapped(q[0] - g[0]), wrapped(q[1] - g[1]));
    const int s1 = maxStar(table, wrapped(q[2] - g[2]), wrapped(q[3] - g[3]));
    return wrapped(maxStar(table, r0, r1) - maxStar(table, s0, s1));
}

/// As maxStarWalk, with each correction added one step later.
inline std::vector<Row> deferredWalk(const Table& table, const std::array<Candidates, 8>& candidates,
                                     const std::vector<T8>& gamma, const T8& start) {
    std::vector<Row> metrics = {row(start)};
    std::array<int, 8> pending{};
    for (std::size_t k = 0; k + 1 < gamma.size(); ++k) {
        const Row& now = metrics.back();
        Row next{};
        std::array<int, 8> found{};
        for (std::size_t s = 0; s < 8; ++s) {
            const auto [x, y, g] = candidates[s];
            const int first = wrapped(now[x] + gamma[k][g]);
            const int second = wrapped(now[y] - gamma[k][g]);
            const int d = wrapped(first - second);
            next[s] = static_cast<std::int16_t>(wrapped(d >= 0 ? first + pending[x] : second + pending[y]));
            found[s] = correction(table, d);
        }
        pending = found;
        metrics.push_back(next);
    }
    return metrics;
}

inline int deferredRatio(const Table& table, const T8& a, const T8& b, const T8& g) {
    int p[4];
    int q[4];
    int cp[4];
    int cq[4];
    for (std::size_t i = 0; i < 4; ++i) {
        const Paths& plus = plusPaths[i];
        const int px = wrapped(a[plus.ax] + b[plus.bx]);
        const int py = wrapped(a[plus.ay] + b[plus.by]);
        const int dp = wrapped(px - py);
        p[i] = dp >= 0 ? px : py;
        cp[i] = correction(table, dp);
        const Paths& minus = minusPaths[i];
        const int qx = wrapped(a[minus.ax] + b[minus.bx]);
        const int qy = wrapped(a[minus.ay] + b[minus.by]);
        const int dq = wrapped(qx - qy);
        q[i] = dq >= 0 ? qx : qy;
        cq[i] = correction(table, dq);
    }
    // Second and third level for one value of the bit: (v, c) are its first-level values and their pending
    // corrections, sign is +1 for p and -1 for q.
    const auto best = [&](const int(&v)[4], const int(&c)[4], int sign) {
        int m[2];
        int cm[2];
        for (std::size_t i = 0; i < 2; ++i) {
            const int x = wrapped(v[2 * i] + sign * g[2 * i]);
            const int y = wrapped(v[2 * i + 1] + sign * g[2 * i + 1]);
            const int d = wrapped(x - y);
            m[i] = wrapped(d >= 0 ? x + c[2 * i] : y + c[2 * i + 1]);
            cm[i] = correction(table, d);
        }
        const int d = wrapped(m[0] - m[1]);
        return wrapped((d >= 0 ? m[0] + cm[0] : m[1] + cm[1]) + correction(table, d));
    };
    return wrapped(best(p, cp, 1) - best(q, cq, -1));
}

}  // namespace quarzel::test::reference
