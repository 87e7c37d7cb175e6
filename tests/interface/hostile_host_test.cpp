// SPDX-License-Identifier: MIT
// Programs that treat a model badly: streams that are closed or full, forks, small stacks, many threads.
#include <fcntl.h>
#include <gtest/gtest.h>
#include <pthread.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <functional>
#include <sstream>
#include <thread>

#include "support/capture.hpp"
#include "support/model.hpp"

namespace quarzel::test {
namespace {

/// Blocks that are decoded with a warning, refused, and decoded with a trace.
std::vector<int> statusesOfTalkativeCalls() {
    const State state = makeState();
    std::vector<int> statuses = {simulate(state.get(), Block(44, 1000).inputs()).status};
    statuses.push_back(simulate(state.get(), Block(45).inputs()).status);
    vardel_ip_quarzel_bitacc_dump_config(state.get(), 4);
    statuses.push_back(simulate(state.get(), Block(44).inputs()).status);
    statuses.push_back(makeState(genericsOf(3, 8, 1)) == nullptr ? 1 : 0);
    return statuses;
}

/// What a process of its own ends with.
int exitCodeOf(const std::function<int()>& work) {
    const pid_t child = fork();
    if (child == 0) {
        _exit(work());
    }
    int status = 0;
    waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

TEST(HostileHost, MayHaveClosedItsStreams) {
    EXPECT_EQ(exitCodeOf([] {
                  close(STDOUT_FILENO);
                  close(STDERR_FILENO);
                  return statusesOfTalkativeCalls() == std::vector<int>{0, 2, 0, 1} ? 0 : 1;
              }),
              0);
}

TEST(HostileHost, MayHaveStreamsWithoutRoom) {
    EXPECT_EQ(exitCodeOf([] {
                  const int full = open("/dev/full", O_WRONLY);
                  dup2(full, STDOUT_FILENO);
                  dup2(full, STDERR_FILENO);
                  return statusesOfTalkativeCalls() == std::vector<int>{0, 2, 0, 1} ? 0 : 1;
              }),
              0);
}

TEST(HostileHost, MayForkBetweenCalls) {
    const State state = makeState(genericsOf(8, 8, 2));
    const Block large(1024 + 4, 3);
    const Block small(40 + 4, -3);
    const Result first = simulate(state.get(), large.inputs());
    const auto decodesOn = [&] {
        const Result one = simulate(state.get(), small.inputs());
        const Result two = simulate(state.get(), large.inputs());
        return one.status == 0 && two.bits == first.bits ? 0 : 1;
    };
    EXPECT_EQ(exitCodeOf(decodesOn), 0) << "in the child";
    EXPECT_EQ(decodesOn(), 0) << "in the parent";
    EXPECT_EQ(exitCodeOf(decodesOn), 0) << "in a second child";
}

#if defined(NDEBUG)  // without an optimiser, or with sanitizers, functions need larger frames
void* decodeEverything(void* failures) {
    for (int i = 0; const char* name = vardel_ip_quarzel_get_implementation_name(i); ++i) {
        for (const int algorithm : {0, 1, 2}) {
            const State state = makeState(genericsOf(8, 8, algorithm));
            vardel_ip_quarzel_set_implementation(state.get(), name);
            for (const std::size_t size : {6144U + 4, 40U + 4}) {
                std::vector<unsigned char> bits(2 * size);
                const Block block(size);
                const vardel_ip_quarzel_inputs inputs[] = {block.inputs(), block.inputs()};
                vardel_ip_quarzel_outputs outputs[] = {{bits.data(), static_cast<int>(size), 0, 0},
                                                       {bits.data() + size, static_cast<int>(size), 0, 0}};
                *static_cast<int*>(failures) +=
                    vardel_ip_quarzel_bitacc_simulate_batch(state.get(), outputs, inputs, 2, nullptr);
                *static_cast<int*>(failures) +=
                    vardel_ip_quarzel_bitacc_simulate(state.get(), outputs, inputs[0]);
            }
        }
    }
    return nullptr;
}

TEST(HostileHost, MayDecodeOnAThreadWithAStackOf64KiB) {
    pthread_attr_t attributes;
    pthread_attr_init(&attributes);
    ASSERT_EQ(pthread_attr_setstacksize(&attributes, 64 << 10), 0);
    pthread_t thread{};
    int failures = 0;
    ASSERT_EQ(pthread_create(&thread, &attributes, decodeEverything, &failures), 0);
    pthread_join(thread, nullptr);
    pthread_attr_destroy(&attributes);
    EXPECT_EQ(failures, 0);
}
#endif

TEST(HostileHost, MayCreateAndDestroyOn32ThreadsAndNoLineIsTorn) {
    constexpr int threads = 32;
    constexpr int rounds = 20;
    std::vector<int> failures(threads);
    const auto work = [&](int& failed) {
        for (int round = 0; round < rounds; ++round) {
            const State state = makeState(genericsOf(2 << round % 3, 8, round % 3));
            failed += simulate(state.get(), Block(40 + 4, 1000).inputs()).status != 0 ? 1 : 0;
            failed += simulate(state.get(), Block(40 + 5).inputs()).status != 2 ? 1 : 0;
        }
    };
    const Output output = capture([&] {
        std::vector<std::jthread> running;
        for (int& failed : failures) {
            running.emplace_back(work, std::ref(failed));
        }
    });
    EXPECT_EQ(std::count(failures.begin(), failures.end(), 0), threads);
    const auto expectLines = [](const std::string& text, const std::string& line) {
        std::istringstream stream(text);
        int lines = 0;
        for (std::string read; std::getline(stream, read); ++lines) {
            EXPECT_EQ(read, line);
        }
        EXPECT_EQ(lines, threads * rounds);
    };
    expectLines(output.out,
                "WARNING:decoder:RSC1 systematic value in position 0 saturated positively, further "
                "saturation will not be reported");
    const Output refusal = capture([] { simulate(makeState().get(), Block(40 + 5).inputs()); });
    expectLines(output.err, refusal.err.substr(0, refusal.err.find('\n')));
}

}  // namespace
}  // namespace quarzel::test
