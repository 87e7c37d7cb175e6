// SPDX-License-Identifier: MIT
#include "link/draw/draw.hpp"

namespace quarzel::link {

extern const DrawFunctions baselineDraw;

#if defined(__x86_64__)
extern const DrawFunctions avx2Draw;
extern const DrawFunctions avx512Draw;
#endif

namespace {

struct List {
    const DrawFunctions* functions[3];
    std::size_t size;
};

List makeList() {
    List list{};
#if defined(__x86_64__)
    if (__builtin_cpu_supports("avx512bw") != 0 && __builtin_cpu_supports("avx512vl") != 0 &&
        __builtin_cpu_supports("avx512dq") != 0) {
        list.functions[list.size++] = &avx512Draw;
    }
    if (__builtin_cpu_supports("avx2") != 0) {
        list.functions[list.size++] = &avx2Draw;
    }
#endif
    list.functions[list.size++] = &baselineDraw;
    return list;
}

}  // namespace

DrawFunctionsList supportedDrawFunctions() {
    static const List list = makeList();
    return {list.functions, list.size};
}

const DrawFunctions& drawFunctions() {
    return *supportedDrawFunctions().first[0];
}

}  // namespace quarzel::link
