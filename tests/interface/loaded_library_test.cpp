// SPDX-License-Identifier: MIT
// The shared library, loaded and unloaded by a program that runs.
#include <dlfcn.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <string>
#include <vector>

#include "vardel_ip_quarzel.h"

namespace quarzel::test {
namespace {

/// A copy of the library while it is loaded.
class Library {
  public:
    explicit Library(const std::string& file) : itsHandle(dlopen(file.c_str(), RTLD_NOW | RTLD_LOCAL)) {
        if (itsHandle == nullptr) {
            throw std::runtime_error(dlerror());
        }
    }
    Library(const Library&) = delete;
    Library& operator=(const Library&) = delete;
    ~Library() { dlclose(itsHandle); }

    template <class Function>
    Function* find(const char* name) const {
        return reinterpret_cast<Function*>(dlsym(itsHandle, name));
    }

  private:
    void* itsHandle;
};

/// A model of a library.
class LoadedModel {
  public:
    LoadedModel(const Library& library, int algorithm)
        : itsSimulate(
              library.find<decltype(vardel_ip_quarzel_bitacc_simulate)>("vardel_ip_quarzel_bitacc_simulate")),
          itsDestroy(
              library.find<decltype(vardel_ip_quarzel_destroy_state)>("vardel_ip_quarzel_destroy_state")) {
        vardel_ip_quarzel_generics generics;
        library.find<decltype(vardel_ip_quarzel_get_default_generics)>(
            "vardel_ip_quarzel_get_default_generics")(&generics);
        generics.C_ALGORITHM_TYPE = algorithm;
        itsState = library.find<decltype(vardel_ip_quarzel_create_state)>("vardel_ip_quarzel_create_state")(
            generics);
    }
    LoadedModel(const LoadedModel&) = delete;
    LoadedModel& operator=(const LoadedModel&) = delete;
    ~LoadedModel() { itsDestroy(itsState); }

    std::vector<unsigned char> decode(int seed) const {
        std::vector<int> soft(128 + 4);
        for (std::size_t i = 0; i < soft.size(); ++i) {
            soft[i] = static_cast<int>((i * 37 + static_cast<std::size_t>(seed) * 101) % 41) - 20;
        }
        std::vector<unsigned char> bits(128, 0xEE);
        vardel_ip_quarzel_outputs outputs{bits.data(), 128, 0, 0};
        const auto size = static_cast<int>(soft.size());
        EXPECT_EQ(itsSimulate(itsState, &outputs, {soft.data(), soft.data(), soft.data(), size, 3, 0}), 0);
        return bits;
    }

  private:
    decltype(vardel_ip_quarzel_bitacc_simulate)* itsSimulate;
    decltype(vardel_ip_quarzel_destroy_state)* itsDestroy;
    vardel_ip_quarzel_state* itsState = nullptr;
};

/// Whether the program has a file mapped.
bool isMapped(const std::string& file) {
    std::ifstream maps("/proc/self/maps");
    for (std::string line; std::getline(maps, line);) {
        if (line.ends_with(file)) {
            return true;
        }
    }
    return false;
}

/// Pages of memory that the program has to itself.
long privatePages() {
    long size = 0;
    long resident = 0;
    long shared = 0;
    std::ifstream("/proc/self/statm") >> size >> resident >> shared;
    return resident - shared;
}

const std::string libraryFile = std::filesystem::canonical(QUARZEL_LIBRARY);

/// Sanitizers and emulators keep memory of their own and take long to load a library. Sanitizers look for
/// leaks themselves.
#if defined(NDEBUG) && !defined(QUARZEL_EMULATED)
constexpr bool canCountPages = true;
#else
constexpr bool canCountPages = false;
#endif

TEST(LoadedLibrary, MayBeLoadedUsedAndUnloadedManyTimes) {
    constexpr int rounds = canCountPages ? 1000 : 50;
    std::vector<unsigned char> first;
    long pages = 0;
    for (int round = 0; round < rounds; ++round) {
        {
            const Library library(libraryFile);
            ASSERT_TRUE(isMapped(libraryFile));
            const std::vector<unsigned char> bits = LoadedModel(library, 1).decode(1);
            first = round == 0 ? bits : first;
            ASSERT_EQ(bits, first) << "round " << round;
        }
        pages = round == 100 ? privatePages() : pages;
    }
    if (canCountPages) {
        EXPECT_FALSE(isMapped(libraryFile));
        // A leak of one page a round would be 900.
        EXPECT_LT(privatePages() - pages, 300);
    }
}

TEST(LoadedLibrary, TwoCopiesInAProgramDoNotDisturbEachOther) {
    const std::filesystem::path copy =
        std::filesystem::path(testing::TempDir()) / ("copy_of_library_" + std::to_string(getpid()) + ".so");
    std::filesystem::copy_file(libraryFile, copy);
    {
        const Library one(libraryFile);
        const Library other(copy);
        ASSERT_NE(one.find<void>("vardel_ip_quarzel_create_state"),
                  other.find<void>("vardel_ip_quarzel_create_state"));
        for (const int algorithm : {0, 1, 2}) {
            const LoadedModel alone(one, algorithm);
            const std::vector<unsigned char> expected = alone.decode(5);
            const LoadedModel left(one, algorithm);
            const LoadedModel right(other, algorithm);
            for (int round = 0; round < 3; ++round) {
                EXPECT_EQ(left.decode(5), expected);
                EXPECT_EQ(right.decode(5), expected);
            }
        }
    }
    std::filesystem::remove(copy);
}

}  // namespace
}  // namespace quarzel::test
