// Copies, component order and forced alpha, by hand: every sample is found again at its new place.

#include "support/KernelRows.h"

namespace {

using namespace PKTest;
using enum PK::Kernel;

TEST(CopyRow, TakesTheWholeLastPair) {
    ExpectRow(CopyRow_422_8u, 1, Bytes{1, 2, 3, 4, 9}, Bytes{1, 2, 3, 4});
}

TEST(ForceOpaqueRow, WritesFullScaleToAlpha) {
    ExpectRow(ForceOpaqueRow_BGRA_8u, 1, Bytes{1, 2, 3, 4}, Bytes{1, 2, 3, 255});
    ExpectRow(ForceOpaqueRow_ARGB_8u, 1, Bytes{1, 2, 3, 4}, Bytes{255, 2, 3, 4});
    ExpectRow(ForceOpaqueRow_BGRA_15u, 1, Words{1, 2, 3, 4}, Words{1, 2, 3, 32768});
    ExpectRow(ForceOpaqueRow_ARGB_15u, 1, Words{1, 2, 3, 4}, Words{32768, 2, 3, 4});
    ExpectRow(ForceOpaqueRow_ARGB_32f, 1, Floats{5, 2, 3, 4}, Floats{1, 2, 3, 4});
}

TEST(ForceOpaqueRow, KeepsSpecialFloatsInTheColour) {
    ExpectRow(ForceOpaqueRow_BGRA_32f, 1, DoubleWords{0x7fa00000, 0xff800000, 0x80000000, 0x7fc00000},
              DoubleWords{0x7fa00000, 0xff800000, 0x80000000, 0x3f800000}); // signalling not-a-number first
}

TEST(SwapOrderRow, ReversesTheSamplesOfAPixel) {
    ExpectRow(SwapOrderRow_4444_8u, 2, Bytes{1, 2, 3, 4, 5, 6, 7, 8}, Bytes{4, 3, 2, 1, 8, 7, 6, 5});
    ExpectRow(SwapOrderRow_4444_15u, 1, Words{1, 2, 3, 4}, Words{4, 3, 2, 1});
    ExpectRow(SwapOrderRow_4444_32f, 1, DoubleWords{1, 2, 3, 0x7fa00000}, DoubleWords{0x7fa00000, 3, 2, 1});
}

TEST(SwapOrderRow, SwapsLumaAndChromaOfAPairToTheEndOfTheLastPair) {
    ExpectRow(SwapOrderRow_422_8u, 3, Bytes{1, 2, 3, 4, 5, 6, 7, 8}, Bytes{2, 1, 4, 3, 6, 5, 8, 7});
    ExpectRow(SwapOrderRow_422_32f, 1, DoubleWords{1, 2, 3, 0x7fa00000}, DoubleWords{2, 1, 0x7fa00000, 3});
}

} // namespace
