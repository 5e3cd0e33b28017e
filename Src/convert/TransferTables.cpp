#include "convert/TransferTables.h"

#include <bit>
#include <cmath>

namespace PK {
namespace {

float LinearOf(double code) {
    return static_cast<float>(std::pow(code / 255, 2.4));
}

TransferTables MakeTables() {
    TransferTables tables;
    for (int code = 0; code < 256; ++code) tables.linear[code] = LinearOf(code);
    for (int k = 0; k < 255; ++k) tables.thresholds[k] = LinearOf(k + 0.5);

    uint32_t below = 0;
    for (uint32_t cell = 0; cell < kGammaCells; ++cell) {
        tables.gammaCells[cell] = below << 16;
        if (below == 255) continue;
        const auto threshold = std::bit_cast<uint32_t>(tables.thresholds[below]);
        if (threshold >> 16 != kFirstGammaCell + cell) continue;
        tables.gammaCells[cell] += 0x10000 - (threshold & 0xffff);
        ++below;
    }
    return tables;
}

} // namespace

const TransferTables kTransferTables = MakeTables();

} // namespace PK
