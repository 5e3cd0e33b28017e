// Copies and quarter-resolution reductions of planar images, in planes that end where the arguments say.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/ImageMemory.h"
#include "support/Planes.h"
#include "support/Size.h"
#include "support/Switches.h"

#include "frame/Capabilities.h"

#include <PixelKiln/Planar.h>
#include <PixelKiln/QuarterScale.h>

#include <string>

namespace {

using namespace PKFuzz;

Size DrawSize(ByteStream& stream) {
    return {stream.Between(0, stream.OneIn(8) ? 1499 : 139), stream.Between(0, 11)};
}

std::string WordsOfCall(const char* call, Size size, int32_t field) {
    return std::string(call) + " of " + Words(size) + ", field " + std::to_string(field);
}

/// Sizes beyond 32 signed bits are refused without a look at memory.
void RefuseSizes(ByteStream& stream, uint32_t state) {
    const uint32_t most = stream.U32() | 0x80000000u, other = stream.U32();
    const int32_t field = stream.Between(1, 2);
    SetCall("reductions of " + std::to_string(most) + " and " + std::to_string(other) + " samples");
    Planes planes({{}, {}, {}}, stream);
    Check(CallIn(state,
                 [&] {
                     return PK_QuarterScalePlanar420_8u(planes.sources, planes.rowBytes, planes.pointers,
                                                        planes.rowBytes, most, other, field);
                 }) == PK_ErrFailed,
          "a width beyond 31 bits is refused");
    Check(CallIn(state,
                 [&] {
                     return PK_QuarterScalePlanar_8uAndConvertTo422_8u(planes.sources, planes.rowBytes,
                                                                       planes.pointers[0], 0, other | 1u,
                                                                       most, true, field);
                 }) == PK_ErrFailed,
          "a height beyond 31 bits is refused");
}

void CopyPlanes(ByteStream& stream, uint32_t state) {
    const Size size = DrawSize(stream);
    const auto width = static_cast<size_t>(size.width), height = static_cast<size_t>(size.height);
    SetCall(WordsOfCall("PK_CopyPlanar_8u", size, 0));
    const RowsLayout extents[3] = {{width, height}, {width / 2, height / 2}, {width / 2, height / 2}};
    const Planes from(extents, stream), to(extents, stream);
    const PK_Result result = CallIn(state, [&] {
        return PK_CopyPlanar_8u(from.sources, from.rowBytes, to.pointers, to.rowBytes, size.width,
                                size.height);
    });
    CheckResult(ResultOfRows(size, from.hasNull || to.hasNull), result);
    to.CheckPadding();
    from.CheckStay();
    if (result != PK_Success) return;
    for (int i = 0; i < 3; ++i)
        CheckSame(from.memory[i].Content(), to.memory[i].Rows(), "the copy is the original");
}

size_t WrittenSamples(size_t width) {
    return PK::sCPUHasSSE2 && width >= 32 ? width & ~size_t{31} : width / 2;
}

void ReducePlanes(ByteStream& stream, uint32_t state) {
    const Size size = DrawSize(stream);
    const int32_t field = stream.BetweenOrAny(1, 2, 8);
    SetCall(WordsOfCall("PK_QuarterScalePlanar420_8u", size, field));
    const auto width = static_cast<size_t>(size.width), height = static_cast<size_t>(size.height);
    const size_t luma = WrittenSamples(width), chroma = WrittenSamples(width / 2);
    const size_t half = height / 2, quarter = height / 4;
    const Planes from({{2 * luma, 2 * half}, {2 * chroma, 2 * quarter}, {2 * chroma, 2 * quarter}}, stream);
    const Planes to({{luma, half}, {chroma, quarter}, {chroma, quarter}}, stream);
    const PK_Result result = CallIn(state, [&] {
        return PK_QuarterScalePlanar420_8u(from.sources, from.rowBytes, to.pointers, to.rowBytes, size.width,
                                           size.height, field);
    });
    to.CheckPadding();
    from.CheckStay();
    if (field != 1 && field != 2) {
        Check(result == PK_ErrBadFieldType, "other fields are refused");
        return;
    }
    CheckResult(from.hasNull || to.hasNull ? PK_ErrFailed : PK_Success, result);
    if (result != PK_Success) return;
    for (int i = 0; i < 3; ++i) {
        const std::vector<uint8_t>& source = from.memory[i].Content();
        const size_t samples = i == 0 ? luma : chroma, firstRow = i == 0 && field == 2 ? 1 : 0;
        std::vector<uint8_t> expected;
        for (size_t row = firstRow; row < 2 * (i == 0 ? half : quarter); row += 2)
            for (size_t k = 0; k < samples; ++k) expected.push_back(source[row * 2 * samples + 2 * k]);
        CheckSame(expected, to.memory[i].Rows(), "every other sample of every other row");
    }
}

void PackPlanes(ByteStream& stream, uint32_t state) {
    const Size size = DrawSize(stream);
    const int32_t field = stream.BetweenOrAny(0, 2, 8);
    const bool yuyv = stream.Bool();
    SetCall(WordsOfCall("PK_QuarterScalePlanar_8uAndConvertTo422_8u", size, field));
    const auto width = static_cast<size_t>(size.width), rows = static_cast<size_t>(size.height / 2);
    const size_t pairs = (width + 1) / 2;
    const Planes from({{width, 2 * rows}, {pairs, rows}, {pairs, rows}}, stream);
    const size_t packedRows = width == 0 ? 0 : rows;
    ImageMemory packed(DrawLayout(stream, 4 * pairs, packedRows), stream);
    const PK_Result result = CallIn(state, [&] {
        return PK_QuarterScalePlanar_8uAndConvertTo422_8u(from.sources, from.rowBytes, packed.Pixels(),
                                                          packed.RowBytes(), size.width, size.height, yuyv,
                                                          field);
    });
    packed.CheckPadding();
    from.CheckStay();
    CheckResult(from.hasNull ? PK_ErrFailed : PK_Success, result);
    if (from.hasNull) return;
    const std::vector<uint8_t>& luma = from.memory[0].Content();
    const std::vector<uint8_t>* chroma[2] = {&from.memory[1].Content(), &from.memory[2].Content()};
    std::vector<uint8_t> expected;
    for (size_t row = 0; row < packedRows; ++row)
        for (size_t column = 0; column < 2 * pairs; ++column) {
            const size_t lumaRow = 2 * row + (field == 2 ? 1 : 0);
            const uint8_t y = column < width ? luma[lumaRow * width + column] : uint8_t{0};
            const uint8_t c = (*chroma[column % 2])[row * pairs + column / 2];
            expected.push_back(yuyv ? y : c);
            expected.push_back(yuyv ? c : y);
        }
    CheckSame(expected, packed.Rows(), "luma of the field and all chroma, interleaved");
}

void FuzzQuarterScale(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream);
    switch (stream.Below(8)) {
    case 0:
        return RefuseSizes(stream, state);
    case 1:
    case 2:
        return CopyPlanes(stream, state);
    case 3:
    case 4:
        return PackPlanes(stream, state);
    default:
        return ReducePlanes(stream, state);
    }
}

const Family sFamily('q', "quarter", FuzzQuarterScale);

} // namespace
