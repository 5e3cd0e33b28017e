// Copies and quarter-resolution reductions of planar images, in planes that end where the arguments say.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/ImageMemory.h"
#include "support/Switches.h"

#include "frame/Capabilities.h"

#include <PixelKiln/Planar.h>
#include <PixelKiln/QuarterScale.h>

#include <algorithm>
#include <memory>
#include <string>

namespace {

using namespace PKFuzz;

/// Three planes and how a call gets them; now and then one of them as null.
struct Planes {
    std::unique_ptr<ImageMemory> memory[3];
    void* pointers[3];
    const void* sources[3];
    int32_t rowBytes[3];
    bool hasNull = false; // where there are samples

    Planes(const RowsLayout (&extents)[3], ByteStream& stream) {
        for (int i = 0; i < 3; ++i) {
            RowsLayout layout = extents[i];
            if (layout.rowLength == 0) layout.rows = 0;
            layout.rowBytes = DrawRowBytes(stream, layout.rowLength, layout.rows, 0);
            memory[i] = std::make_unique<ImageMemory>(layout, stream);
            std::vector<uint8_t> content(layout.rowLength * layout.rows);
            stream.Fill(content.data(), content.size());
            memory[i]->SetRows(content);
            const bool isNull = stream.OneIn(64);
            hasNull = hasNull || (isNull && layout.rows != 0);
            sources[i] = pointers[i] = isNull ? nullptr : memory[i]->Pixels();
            rowBytes[i] = layout.rowBytes;
        }
    }

    bool ArePaddingsIntact() const {
        return std::all_of(memory, memory + 3, [](const auto& plane) { return plane->IsPaddingIntact(); });
    }
};

struct Size {
    uint32_t width, height;
};

Size DrawSize(ByteStream& stream) {
    return {stream.Below(stream.OneIn(8) ? 1500 : 140), stream.Below(12)};
}

std::string Words(const char* call, Size size, int32_t field) {
    return std::string(call) + " of " + std::to_string(size.width) + " x " + std::to_string(size.height) +
           ", field " + std::to_string(field);
}

/// Sizes beyond 32 signed bits are refused without a look at memory.
void RefuseSizes(ByteStream& stream, uint32_t state) {
    const Size size = {stream.U32() | 0x80000000u, stream.U32()};
    const int32_t field = stream.Between(1, 2);
    SetCall(Words("reductions", size, field));
    Planes planes({{}, {}, {}}, stream);
    Check(CallIn(state,
                 [&] {
                     return PK_QuarterScalePlanar420_8u(planes.sources, planes.rowBytes, planes.pointers,
                                                        planes.rowBytes, size.width, size.height, field);
                 }) == PK_ErrFailed,
          "a width beyond 31 bits is refused");
    Check(CallIn(state,
                 [&] {
                     return PK_QuarterScalePlanar_8uAndConvertTo422_8u(
                         planes.sources, planes.rowBytes, planes.pointers[0], 0, size.height | 1u, size.width,
                         true, field);
                 }) == PK_ErrFailed,
          "a height beyond 31 bits is refused");
}

void CopyPlanes(ByteStream& stream, uint32_t state) {
    const Size size = DrawSize(stream);
    const size_t width = size.width, height = size.height;
    SetCall(Words("PK_CopyPlanar_8u", size, 0));
    const RowsLayout extents[3] = {{width, height}, {width / 2, height / 2}, {width / 2, height / 2}};
    const Planes from(extents, stream), to(extents, stream);
    const PK_Result result = CallIn(state, [&] {
        return PK_CopyPlanar_8u(from.sources, from.rowBytes, to.pointers, to.rowBytes,
                                static_cast<int32_t>(width), static_cast<int32_t>(height));
    });
    const bool doesNothing = width == 0 || height == 0;
    const bool isRefused = !doesNothing && (from.hasNull || to.hasNull);
    Check(result == (isRefused ? PK_ErrFailed : PK_Success), "only null planes fail");
    Check(to.ArePaddingsIntact(), "bytes outside the rows stay");
    if (isRefused) return;
    for (int i = 0; i < 3; ++i)
        CheckSame(from.memory[i]->Rows(), to.memory[i]->Rows(), "the copy is the original");
}

size_t WrittenSamples(size_t width) {
    return PK::sCPUHasSSE2 && width >= 32 ? width & ~size_t{31} : width / 2;
}

void ReducePlanes(ByteStream& stream, uint32_t state) {
    const Size size = DrawSize(stream);
    const int32_t field = stream.OneIn(8) ? stream.AnyI32() : stream.Between(1, 2);
    SetCall(Words("PK_QuarterScalePlanar420_8u", size, field));
    const size_t luma = WrittenSamples(size.width), chroma = WrittenSamples(size.width / 2);
    const size_t half = size.height / 2, quarter = size.height / 4;
    const Planes from({{2 * luma, 2 * half}, {2 * chroma, 2 * quarter}, {2 * chroma, 2 * quarter}}, stream);
    const Planes to({{luma, half}, {chroma, quarter}, {chroma, quarter}}, stream);
    const PK_Result result = CallIn(state, [&] {
        return PK_QuarterScalePlanar420_8u(from.sources, from.rowBytes, to.pointers, to.rowBytes, size.width,
                                           size.height, field);
    });
    Check(to.ArePaddingsIntact(), "bytes outside the rows stay");
    if (field != 1 && field != 2) {
        Check(result == PK_ErrBadFieldType, "other fields are refused");
        return;
    }
    const bool isRefused = from.hasNull || to.hasNull;
    Check(result == (isRefused ? PK_ErrFailed : PK_Success), "only null planes fail");
    if (isRefused) return;
    for (int i = 0; i < 3; ++i) {
        const std::vector<uint8_t> source = from.memory[i]->Rows();
        const size_t samples = i == 0 ? luma : chroma, firstRow = i == 0 && field == 2 ? 1 : 0;
        std::vector<uint8_t> expected;
        for (size_t row = firstRow; row < 2 * (i == 0 ? half : quarter); row += 2)
            for (size_t k = 0; k < samples; ++k) expected.push_back(source[row * 2 * samples + 2 * k]);
        CheckSame(expected, to.memory[i]->Rows(), "every other sample of every other row");
    }
}

void PackPlanes(ByteStream& stream, uint32_t state) {
    const Size size = DrawSize(stream);
    const int32_t field = stream.OneIn(8) ? stream.AnyI32() : stream.Between(0, 2);
    const bool yuyv = stream.Bool();
    SetCall(Words("PK_QuarterScalePlanar_8uAndConvertTo422_8u", size, field));
    const size_t width = size.width, pairs = (width + 1) / 2, rows = size.height / 2;
    const Planes from({{width, 2 * rows}, {pairs, rows}, {pairs, rows}}, stream);
    const size_t packedRows = width == 0 ? 0 : rows;
    ImageMemory packed({4 * pairs, packedRows, DrawRowBytes(stream, 4 * pairs, packedRows, 0)}, stream);
    const PK_Result result = CallIn(state, [&] {
        return PK_QuarterScalePlanar_8uAndConvertTo422_8u(from.sources, from.rowBytes, packed.Pixels(),
                                                          packed.Layout().rowBytes, size.width, size.height,
                                                          yuyv, field);
    });
    Check(packed.IsPaddingIntact(), "bytes outside the rows stay");
    Check(result == (from.hasNull ? PK_ErrFailed : PK_Success), "only null planes fail");
    if (from.hasNull) return;
    const std::vector<uint8_t> luma = from.memory[0]->Rows();
    const std::vector<uint8_t> chroma[2] = {from.memory[1]->Rows(), from.memory[2]->Rows()};
    std::vector<uint8_t> expected;
    for (size_t row = 0; row < packedRows; ++row)
        for (size_t column = 0; column < 2 * pairs; ++column) {
            const size_t lumaRow = 2 * row + (field == 2 ? 1 : 0);
            const uint8_t y = column < width ? luma[lumaRow * width + column] : uint8_t{0};
            const uint8_t c = chroma[column % 2][row * pairs + column / 2];
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
