#include "colour/DecodeTables.h"

#include "colour/HDRCurves.h"
#include "primitives/FirstUse.h"
#include "primitives/VectorMath.h"

#include <algorithm>
#include <xmmintrin.h>

namespace PK {

namespace {

template <int kEntries>
struct Table {
    alignas(16) float entries[kEntries];
};

/// x^exponent for each entry.
template <int kEntries>
void RaiseEntries(Table<kEntries>& table, float exponent) {
    float exponents[kEntries];
    std::ranges::fill(exponents, exponent);
    VectorPow(table.entries, exponents, table.entries, kEntries);
}

/// 1 / x by the processor's estimate and one step of Newton's method, as in the vector kernels.
float RefinedReciprocal(float x) {
    const float r = _mm_cvtss_f32(_mm_rcp_ss(_mm_set_ss(x)));
    return (r + r) - x * (r * r);
}

Table<kPQDecodeEntries> MakePQTable() {
    Table<kPQDecodeEntries> table;
    for (int i = 0; i < kPQDecodeEntries; ++i) table.entries[i] = static_cast<float>(i) * 0.00024420026f;
    RaiseEntries(table, PQ::kInverseM2);
    for (float& p : table.entries)
        p = std::max(0.0f, (p - PQ::kC1) * RefinedReciprocal(PQ::kC2 - PQ::kC3 * p));
    RaiseEntries(table, PQ::kInverseM1);
    for (float& linear : table.entries) linear *= 100;
    return table;
}

Table<kHLGDecodeEntries> MakeHLGTable() {
    constexpr float kThird = 1.0f / 3;
    Table<kHLGDecodeEntries> table, exponentials;
    int32_t isExponential[kHLGDecodeEntries];
    for (int i = 0; i < kHLGDecodeEntries; ++i) {
        const float signal = static_cast<float>(i) * 0.00048851978f;
        isExponential[i] = signal < 0.5f ? 0 : -1;
        table.entries[i] = kThird * (signal * signal);
        exponentials.entries[i] = (signal - HLG::kC) * HLG::kInverseA;
    }
    VectorExp(isExponential, exponentials.entries, kHLGDecodeEntries);
    for (int i = 0; i < kHLGDecodeEntries; ++i)
        if (isExponential[i]) table.entries[i] = exponentials.entries[i] + HLG::kB12;
    return table;
}

} // namespace

const float* PQDecodeTable() {
    static constinit FirstUse<Table<kPQDecodeEntries>> sTable;
    return sTable.Get(MakePQTable).entries;
}

const float* HLGDecodeTable() {
    static constinit FirstUse<Table<kHLGDecodeEntries>> sTable;
    return sTable.Get(MakeHLGTable).entries;
}

} // namespace PK
