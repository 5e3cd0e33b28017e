// What the colour spaces make at first need, for the process and for each object.

#include "stress/first_uses/FirstUse.h"

#include "colour/DecodeTables.h"
#include "colour/FloatKernelTable.h"
#include "colour/Rec2020Matrices.h"
#include "primitives/CpuFeatures.h"

#include <PixelKiln/ColorSpace.h>

#include <memory>

namespace {

using namespace PKStress;
using namespace PK;

constexpr int kObjects = 60;
constexpr int32_t kFloats = 32; // whole groups of all kernels

Answer Floats(const float* first, int count) {
    return Answer(first, first + count);
}

Answer Matrix(const CSMatrix& matrix) {
    return Floats(matrix.m, 9);
}

const FirstUse sCpuFeatures("cpu-features",
                            Once([] { return Answer{static_cast<float>(CpuFeatures::Flags().sse2)}; }));
const FirstUse sPQTable("pq-table", Once([] { return Floats(PQDecodeTable(), kPQDecodeEntries); }));
const FirstUse sHLGTable("hlg-table", Once([] { return Floats(HLGDecodeTable(), kHLGDecodeEntries); }));
const FirstUse sToRec2020("to-rec2020-matrix", Once([] { return Matrix(Rec709ToRec2020()); }));
const FirstUse sToRec709("to-rec709-matrix", Once([] { return Matrix(Rec2020ToRec709()); }));

/// The kernel of a slot on 32 floats. What it needs is made beforehand, the slot's alone is bound by the threads.
template <class Slot, class... Parameters>
std::function<Meeting()> Slotted(int32_t count, Parameters... parameters) {
    return [=] {
        CpuFeatures::Flags();
        return [=](size_t) {
            const Answer source(kFloats, 0.25f);
            Answer destination(kFloats);
            Slot::Call(source.data(), destination.data(), count, parameters...);
            return destination;
        };
    };
}

constexpr int32_t kPixels = kFloats / 4;
constexpr float kIdentity[9] = {1, 0, 0, 0, 1, 0, 0, 0, 1};
constexpr float kNoTable[kPQDecodeEntries] = {};
constexpr SignalDecoding kDecoding = {kIdentity, kNoTable};
constexpr GammaConversion kGamma = {kIdentity, 2.4f, 0.45f, {0.2f, 0.7f, 0.1f}, true, true};

const FirstUse sFromPQ("slot-from-pq", Slotted<FloatKernelTable::PQToRec709Kernel>(kPixels, kDecoding));
const FirstUse sToPQ("slot-to-pq",
                     Slotted<FloatKernelTable::Rec709ToPQKernel>(kPixels, PQEncoding{kIdentity, 1}));
const FirstUse sFromHLG("slot-from-hlg", Slotted<FloatKernelTable::HLGToRec709Kernel>(kPixels, kDecoding));
const FirstUse sToHLG("slot-to-hlg",
                      Slotted<FloatKernelTable::Rec709ToHLGKernel>(kPixels, HLGEncoding{kIdentity}));
const FirstUse sClamp("slot-clamp", Slotted<FloatKernelTable::ClampFloats>(kFloats, FloatRange{0, 1}));
const FirstUse sFromYUV("slot-from-yuv", Slotted<FloatKernelTable::YUVToRGBKernel>(kPixels));
const FirstUse sToYUV("slot-to-yuv", Slotted<FloatKernelTable::RGBToYUVKernel>(kPixels));
const FirstUse sGamma("slot-gamma", Slotted<FloatKernelTable::ConvertGammaKernel>(kPixels, kGamma));

constexpr float kPrimaries[6] = {0.713f, 0.293f, 0.165f, 0.83f, 0.128f, 0.044f};

/// A space of its own for each meeting.
template <class Space, class... Arguments, class Use>
std::function<Meeting()> OnFresh(Use use, Arguments... arguments) {
    return [=] {
        return [=, space = std::make_shared<const Space>(arguments...)](size_t thread) {
            return use(*space, thread);
        };
    };
}

Answer FromHub(const ColorSpace& space, size_t) {
    Answer pixel(4, 0.25f); // one pixel, which no vector kernel treats
    space.ConvertPixelsFromRec709(pixel.data(), pixel.data(), 1, false);
    return pixel;
}

Answer ToHub(const ColorSpace& space, size_t) {
    Answer pixel(4, 0.25f);
    space.ConvertPixelsToRec709(pixel.data(), pixel.data(), 1, true);
    return pixel;
}

Answer Luminance(const ColorSpace& space, size_t) {
    return Floats(space.LuminanceCoeffs(), 3);
}

Answer XYZ(const ColorSpace& space, size_t) {
    return Matrix(space.RGBtoXYZ());
}

Answer AllOf(const ColorSpace& space) {
    Answer answer;
    for (const auto part : {Luminance, XYZ, FromHub, ToHub}) {
        const Answer more = part(space, 0);
        answer.insert(answer.end(), more.begin(), more.end());
    }
    return answer;
}

/// Half of the threads use the space, and half a copy that they make meanwhile.
template <class Space>
Answer OfCopies(const Space& space, size_t thread) {
    if (thread % 2 == 0) return AllOf(space);
    const Space copy(space);
    Space assigned(copy);
    assigned = space;
    return AllOf(assigned);
}

const FirstUse sP3From("p3-from-hub", OnFresh<DCIP3ColorSpace>(FromHub, kIlluminantD50), kObjects);
const FirstUse sP3To("p3-to-hub", OnFresh<DCIP3ColorSpace>(ToHub, kIlluminantD50), kObjects);
const FirstUse sP3Luminance("p3-luminance", OnFresh<DCIP3ColorSpace>(Luminance, kIlluminantD50), kObjects);
const FirstUse sP3Copies("p3-copies", OnFresh<DCIP3ColorSpace>(OfCopies<DCIP3ColorSpace>, kIlluminantD50),
                         kObjects);
const FirstUse sPQFrom("pq-from-hub", OnFresh<PQColorSpace>(FromHub, kPrimaries, true), kObjects);
const FirstUse sPQTo("pq-to-hub", OnFresh<PQColorSpace>(ToHub, kPrimaries, true), kObjects);
const FirstUse sPQLuminance("pq-luminance", OnFresh<PQColorSpace>(Luminance, kPrimaries, true), kObjects);
const FirstUse sPQCopies("pq-copies", OnFresh<PQColorSpace>(OfCopies<PQColorSpace>, kPrimaries, true),
                         kObjects);
const FirstUse sXYZ("xyz-matrices", OnFresh<SRGBColorSpace>(XYZ), kObjects);
const FirstUse sCopies("plain-copies", OnFresh<GammaColorSpace>(OfCopies<GammaColorSpace>), kObjects);

Answer OfWorkingSpaces() {
    Answer answer;
    for (uint32_t which = 0; which <= kWorkingSpaceSRGB; ++which) {
        const Answer more = AllOf(ColorSpace::WorkingSpace(static_cast<PK_WorkingSpace>(which)));
        answer.insert(answer.end(), more.begin(), more.end());
    }
    return answer;
}

const FirstUse sWorkingSpaces("working-spaces", Once(OfWorkingSpaces));

} // namespace
