// The bodies of HLG.

#include "colour/ColourKernels.h"
#include "colour/HDRCurves.h"
#include "colour/HubLanes.h"

namespace PK {
namespace PK_TARGET {
namespace {

void ToRec709(const void* source, void* destination, ptrdiff_t count, const SignalDecoding& decoding) {
    const float* const table = decoding.table;
    const F32 ootfExponent = Floats(HLG::kOOTFExponent);
    const Weights luma(HLG::kLuma);
    const MatrixLanes lanes(decoding.matrix);
    ForPixelGroups(source, destination, count, [=](F32(&colour)[3]) {
        LookUpSignals(colour, table, 2047);
        F32 gain[1] = {luma.Sum(colour)};
        ApproxPow(gain, ootfExponent);
        gain[0] = gain[0] * Floats(HLG::kPeak);
        for (F32& c : colour) c = c * gain[0];
        EncodeHub(colour, lanes);
    });
}

/// The signal of scene light E.
inline F32 Encode(F32 E) {
    constexpr float kSmallestNormal = 0x1p-126f;
    const F32 root = SquareRoot(Floats(3) * E);
    const I32 isRoot = Less(E, Floats(HLG::kSquareRootEnd));
    if (!AnyNegative(isRoot ^ Ints(-1))) return root;
    const F32 logarithm = ApproxLn(Max(E - Floats(HLG::kB12), Floats(kSmallestNormal)));
    return Select(isRoot, root, MultiplyAdd(logarithm, Floats(HLG::kA), Floats(HLG::kC)));
}

void FromRec709(const void* source, void* destination, ptrdiff_t count, const HLGEncoding& encoding) {
    const F32 ootfExponent = Floats(HLG::kInverseOOTFExponent);
    const Weights luma(HLG::kLuma);
    const MatrixLanes lanes(encoding.matrix);
    ForPixelGroups(source, destination, count, [=](F32(&colour)[3]) {
        const Signs signs = DecodeHub(colour, lanes);
        for (F32& c : colour) c = c * Floats(HLG::kLinearScale);
        F32 power[1] = {luma.Sum(colour)};
        ApproxPow(power, ootfExponent);
        const F32 gain = Reciprocal(Max(power[0], Floats(HLG::kLeastLuminancePower)));
        for (F32& c : colour) c = Encode(c * gain);
        PutSigns(colour, signs);
    });
}

constexpr HLGKernels kKernels = {ToRec709, FromRec709};

} // namespace
} // namespace PK_TARGET

template <>
const HLGKernels& HLGKernels::For<Target::PK_TARGET>() {
    return PK_TARGET::kKernels;
}

} // namespace PK
