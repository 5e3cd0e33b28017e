// The bodies of PQ.

#include "colour/ColourKernels.h"
#include "colour/HDRCurves.h"
#include "colour/HubLanes.h"
#include "primitives/simd/Power.h"

namespace PK {
namespace PK_TARGET {
namespace {

void ToRec709(const void* source, void* destination, ptrdiff_t count, const SignalDecoding& decoding) {
    const float* const table = decoding.table;
    const MatrixLanes lanes(decoding.matrix);
    ForPixelGroups(source, destination, count, [=](F32(&colour)[3]) {
        LookUpSignals(colour, table, 4095);
        EncodeHub(colour, lanes);
    });
}

// The last power magnifies errors by its exponent, and so is an accurate one.
void FromRec709(const void* source, void* destination, ptrdiff_t count, const PQEncoding& encoding) {
    const F32 m1 = Floats(PQ::kM1), outScale = Floats(encoding.outScale);
    const F32 c1 = Floats(PQ::kC1), c2 = Floats(PQ::kC2), c3 = Floats(PQ::kC3);
    const MatrixLanes lanes(encoding.matrix);
    ForPixelGroups(source, destination, count, [=](F32(&colour)[3]) {
        const Signs signs = DecodeHub(colour, lanes);
        for (F32& c : colour) c = c * Floats(PQ::kLinearScale);
        ApproxPow(colour, m1);
        for (F32& c : colour) c = MultiplyAdd(c2, c, c1) * Reciprocal(MultiplyAdd(c3, c, Floats(1)));
        Power(colour, Doubles(PQ::kM2));
        for (F32& c : colour) c = c * outScale;
        PutSigns(colour, signs);
    });
}

constexpr PQKernels kKernels = {ToRec709, FromRec709};

} // namespace
} // namespace PK_TARGET

template <>
const PQKernels& PQKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::kKernels;
}

} // namespace PK
