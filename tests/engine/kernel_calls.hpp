// SPDX-License-Identifier: MIT
#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <functional>
#include <random>
#include <vector>

#include "engine/t8.hpp"
#include "support/random.hpp"
#include "support/rows.hpp"

/// Calls of a kernel on arrays of just the size it needs. The kernel is a member of the engine: a dispatcher
/// or one of the kernels behind it.
namespace quarzel::test {

/// Branch metrics of all steps, and the state metrics before (alpha) and after (beta) each.
struct Steps {
    std::vector<T8> gamma;
    std::vector<T8> alpha;
    std::vector<T8> beta;
};

inline Steps randomSteps(std::mt19937& random, std::size_t n) {
    return {randomRecords(random, n), randomRecords(random, n), randomRecords(random, n)};
}

/// Steps whose metrics are so close to each other that most differences have a correction.
inline Steps closeSteps(std::mt19937& random, std::size_t n) {
    Steps steps = randomSteps(random, n);
    for (std::vector<T8>* records : {&steps.gamma, &steps.alpha, &steps.beta}) {
        for (T8& record : *records) {
            for (std::int16_t& metric : record.element) {
                metric = static_cast<std::int16_t>(metric / 128);
            }
        }
    }
    return steps;
}

inline unsigned length(const std::vector<T8>& records) {
    return static_cast<unsigned>(records.size());
}

/// Forward metrics of all steps from those of the first one.
template <class Engine, class Kernel>
std::vector<T8> forward(Engine& engine, Kernel kernel, const std::vector<T8>& gamma, const T8& first) {
    std::vector<T8> alpha(gamma.size());
    alpha.front() = first;
    T8* const end = std::invoke(kernel, engine, length(gamma), gamma.data(), alpha.data());
    EXPECT_EQ(end, alpha.data() + alpha.size());
    return alpha;
}

/// Backward metrics of all steps, in the order of the steps, from those of the last one.
template <class Engine, class Kernel>
std::vector<T8> backward(Engine& engine, Kernel kernel, const std::vector<T8>& gamma, const T8& last) {
    std::vector<T8> beta(gamma.size() + 1);  // one below the first step, to which the kernel's result points
    beta.back() = last;
    T8* const end = std::invoke(kernel, engine, length(gamma), &gamma.back(), &beta.back());
    EXPECT_EQ(end, beta.data());
    beta.erase(beta.begin());
    return beta;
}

/// Log-likelihood ratios of all steps.
template <class Engine, class Kernel>
std::vector<short> ratios(Engine& engine, Kernel kernel, const Steps& steps) {
    std::vector<short> llr(steps.gamma.size());
    short* const end = std::invoke(kernel, engine, length(steps.gamma), steps.alpha.data(), steps.beta.data(),
                                   steps.gamma.data(), llr.data());
    EXPECT_EQ(end, llr.data() + llr.size());
    return llr;
}

}  // namespace quarzel::test
