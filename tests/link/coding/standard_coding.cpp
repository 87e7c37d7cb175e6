// SPDX-License-Identifier: MIT
#include "link/coding/standard_coding.hpp"

#include <algorithm>
#include <fstream>
#include <map>
#include <set>
#include <string>
#include <utility>

namespace quarzel::test::standard {

namespace {

constexpr int columns = 32;
constexpr int permutation[columns] = {0, 16, 8, 24, 4, 20, 12, 28, 2, 18, 10, 26, 6, 22, 14, 30,
                                      1, 17, 9, 25, 5, 21, 13, 29, 3, 19, 11, 27, 7, 23, 15, 31};

int rowsOf(int D) {
    int rows = 0;
    while (rows * columns < D) {
        ++rows;
    }
    return rows;
}

std::size_t at(int index) {
    return static_cast<std::size_t>(index);
}

/// f1 and f2 of table 5.1.3-3.
std::pair<int, int> factors(int K) {
    static const std::map<int, std::pair<int, int>> table = [] {
        std::map<int, std::pair<int, int>> rows;
        std::ifstream file(std::string(QUARZEL_TEST_DATA) + "/qpp_table.csv");
        std::string line;
        std::getline(file, line);
        int size = 0;
        int f1 = 0;
        int f2 = 0;
        char comma = 0;
        while (file >> size >> comma >> f1 >> comma >> f2) {
            rows[size] = {f1, f2};
        }
        return rows;
    }();
    return table.at(K);
}

/// One constituent code: z, and the tails of x and z.
struct Constituent {
    Bits z, tailX, tailZ;

    explicit Constituent(const Bits& c) {
        int s1 = 0;
        int s2 = 0;
        int s3 = 0;
        for (const int bit : c) {
            const int a = (bit + s2 + s3) % 2;
            z.push_back((a + s1 + s3) % 2);
            s3 = s2;
            s2 = s1;
            s1 = a;
        }
        for (int k = 0; k < 3; ++k) {
            tailX.push_back((s2 + s3) % 2);
            tailZ.push_back((s1 + s3) % 2);
            s3 = s2;
            s2 = s1;
            s1 = 0;
        }
    }
};

}  // namespace

const std::vector<int>& blockSizes() {
    static const std::vector<int> table = [] {
        std::vector<int> sizes;
        for (int K = 40; K <= 6144; K += K < 512 ? 8 : K < 1024 ? 16 : K < 2048 ? 32 : 64) {
            sizes.push_back(K);
        }
        return sizes;
    }();
    return table;
}

const std::vector<int>& powersOfCrc24A() {
    static const std::vector<int> powers = {24, 23, 18, 17, 14, 11, 10, 7, 6, 5, 4, 3, 1, 0};
    return powers;
}

const std::vector<int>& powersOfCrc24B() {
    static const std::vector<int> powers = {24, 23, 6, 5, 1, 0};
    return powers;
}

const std::vector<int>& powersOfCrc16() {
    static const std::vector<int> powers = {16, 12, 5, 0};
    return powers;
}

const std::vector<int>& powersOfCrc8() {
    static const std::vector<int> powers = {8, 7, 4, 3, 1, 0};
    return powers;
}

Bits parity(const Bits& a, const std::vector<int>& powers) {
    const int L = powers.front();
    Bits rest = a;
    std::replace(rest.begin(), rest.end(), null, 0);
    rest.resize(a.size() + at(L));
    for (std::size_t i = 0; i < a.size(); ++i) {
        if (rest[i] == 1) {
            for (const int power : powers) {
                rest[i + at(L - power)] ^= 1;
            }
        }
    }
    return {rest.end() - L, rest.end()};
}

Sizes sizes(int B) {
    const int Z = 6144;
    int L = 0;
    int C = 1;
    if (B > Z) {
        L = 24;
        C = (B + (Z - L) - 1) / (Z - L);
    }
    const int withCrcs = B + C * L;
    Sizes result{C, 0, 0, 1, 0, 0};
    for (const int K : blockSizes()) {
        if (C * K >= withCrcs) {
            result.Kplus = K;
            break;
        }
    }
    if (C > 1) {
        for (const int K : blockSizes()) {
            result.Kminus = K < result.Kplus ? K : result.Kminus;
        }
        result.Cminus = (C * result.Kplus - withCrcs) / (result.Kplus - result.Kminus);
        result.Cplus = C - result.Cminus;
    }
    result.F = result.Cplus * result.Kplus + result.Cminus * result.Kminus - withCrcs;
    return result;
}

std::vector<Bits> segments(const Bits& b) {
    const Sizes size = sizes(static_cast<int>(b.size()));
    const int L = size.C > 1 ? 24 : 0;
    std::vector<Bits> c(at(size.C));
    std::size_t s = 0;
    for (int k = 0; k < size.F; ++k) {
        c[0].push_back(null);
    }
    for (int r = 0; r < size.C; ++r) {
        Bits& block = c[at(r)];
        const int K = r < size.Cminus ? size.Kminus : size.Kplus;
        while (static_cast<int>(block.size()) < K - L) {
            block.push_back(b[s++]);
        }
        if (size.C > 1) {
            const Bits p = parity(block, powersOfCrc24B());
            block.insert(block.end(), p.begin(), p.end());
        }
    }
    return c;
}

const std::vector<std::vector<int>>& fillers() {
    static const std::vector<std::vector<int>> table = [] {
        std::map<int, std::set<int>> found;
        for (int B = 1; sizes(B).C <= 13; ++B) {
            const Sizes size = sizes(B);
            found[size.Cminus > 0 ? size.Kminus : size.Kplus].insert(size.F);
        }
        std::vector<std::vector<int>> lists;
        for (const int K : blockSizes()) {
            lists.emplace_back(found[K].begin(), found[K].end());
        }
        return lists;
    }();
    return table;
}

Streams turboCode(const Bits& c) {
    const int K = static_cast<int>(c.size());
    const int F = static_cast<int>(std::count(c.begin(), c.end(), null));
    Bits bits = c;
    std::replace(bits.begin(), bits.end(), null, 0);
    const auto [f1, f2] = factors(K);
    Bits interleaved;
    for (long long i = 0; i < K; ++i) {
        interleaved.push_back(bits[static_cast<std::size_t>((f1 * i + f2 * i * i) % K)]);
    }
    const Constituent first(bits);
    const Constituent second(interleaved);
    Streams d = {bits, first.z, second.z};
    for (int k = 0; k < F; ++k) {
        d[0][at(k)] = null;
        d[1][at(k)] = null;
    }
    const Bits &x = first.tailX, &z = first.tailZ, &x2 = second.tailX, &z2 = second.tailZ;
    const Streams tails = {
        Bits{x[0], z[1], x2[0], z2[1]}, {z[0], x[2], z2[0], x2[2]}, {x[1], z[2], x2[1], z2[2]}};
    for (std::size_t i = 0; i < 3; ++i) {
        d[i].insert(d[i].end(), tails[i].begin(), tails[i].end());
    }
    return d;
}

Bits subBlock(const Bits& d, int stream) {
    const int D = static_cast<int>(d.size());
    const int rows = rowsOf(D);
    const int size = rows * columns;
    Bits y(at(size - D), null);
    y.insert(y.end(), d.begin(), d.end());
    Bits v;
    if (stream < 2) {
        std::vector<Bits> matrix;
        for (int row = 0; row < rows; ++row) {
            matrix.emplace_back(y.begin() + row * columns, y.begin() + (row + 1) * columns);
        }
        for (const int column : permutation) {
            for (int row = 0; row < rows; ++row) {
                v.push_back(matrix[at(row)][at(column)]);
            }
        }
    } else {
        for (int k = 0; k < size; ++k) {
            v.push_back(y[at((permutation[k / rows] + columns * (k % rows) + 1) % size)]);
        }
    }
    return v;
}

Bits circularBuffer(const Streams& d) {
    const Bits v0 = subBlock(d[0], 0);
    const Bits v1 = subBlock(d[1], 1);
    const Bits v2 = subBlock(d[2], 2);
    const std::size_t size = v0.size();
    Bits w(3 * size);
    for (std::size_t k = 0; k < size; ++k) {
        w[k] = v0[k];
        w[size + 2 * k] = v1[k];
        w[size + 2 * k + 1] = v2[k];
    }
    return w;
}

std::vector<int> selection(const Bits& w, int D, int Ncb, int rv, int E) {
    const int R = rowsOf(D);
    int eighths = 0;
    while (eighths * 8 * R < Ncb) {
        ++eighths;
    }
    const int k0 = R * (2 * eighths * rv + 2);
    std::vector<int> indices;
    int k = 0;
    int j = 0;
    while (k < E) {
        const int index = (k0 + j) % Ncb;
        if (w[at(index)] != null) {
            indices.push_back(index);
            ++k;
        }
        ++j;
    }
    return indices;
}

int codedSize(int r, int C, int G, int layers, int Qm) {
    const int symbols = G / (layers * Qm);
    const int gamma = symbols % C;
    return r <= C - gamma - 1 ? layers * Qm * (symbols / C) : layers * Qm * ((symbols + C - 1) / C);
}

Bits encode(const Bits& a, int G, int layers, int Qm, int rv) {
    Bits b = a;
    const Bits p = parity(a, powersOfCrc24A());
    b.insert(b.end(), p.begin(), p.end());
    const std::vector<Bits> c = segments(b);
    Bits f;
    for (std::size_t r = 0; r < c.size(); ++r) {
        const Bits w = circularBuffer(turboCode(c[r]));
        const int E = codedSize(static_cast<int>(r), static_cast<int>(c.size()), G, layers, Qm);
        const int D = static_cast<int>(c[r].size()) + 4;
        for (const int index : selection(w, D, static_cast<int>(w.size()), rv, E)) {
            f.push_back(w[at(index)]);
        }
    }
    return f;
}

}  // namespace quarzel::test::standard
