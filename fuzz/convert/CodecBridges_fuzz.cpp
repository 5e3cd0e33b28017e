// The codec bridges at any size, from and to rows laid out in any way.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/ImageMemory.h"
#include "support/Planes.h"
#include "support/Size.h"
#include "support/Switches.h"

#include <PixelKiln/CodecBridges.h>

#include <cstdlib>
#include <vector>

namespace {

using namespace PKFuzz;

/// A bridge as the others are called; those without row bytes ignore them.
using Call = PK_Result (*)(const void* source, int32_t sourceRowBytes, void* destination,
                           int32_t destinationRowBytes, int32_t width, int32_t height) noexcept;

constexpr int32_t kV210 = 0; // in place of the bytes of a pixel

struct Bridge {
    const char* name;
    Call call;
    int32_t sourcePixel, destinationPixel; ///< bytes
    bool isOneRun;                         ///< rows without padding
    bool leavesBytes;                      ///< some bytes of the destination are not written
};

PK_Result XRGB(const void* source, int32_t, void* destination, int32_t, int32_t width,
               int32_t height) noexcept {
    PK_ConvertRGB_444_16u_To_XRGB_4444_15u(source, destination, width, height);
    return PK_Success;
}

template <PK_Result (*kCall)(const void*, void*, int32_t, int32_t) noexcept>
PK_Result WithoutRowBytes(const void* source, int32_t, void* destination, int32_t, int32_t width,
                          int32_t height) noexcept {
    return kCall(source, destination, width, height);
}

constexpr Bridge kBridges[] = {
    {"PK_ConvertRGB_444_8uToBGRA_4444_8u", PK_ConvertRGB_444_8uToBGRA_4444_8u, 3, 4, false, false},
    {"PK_Convert_DNxHD16u_To_RGB_444_10u", WithoutRowBytes<PK_Convert_DNxHD16u_To_RGB_444_10u>, 8, 4, true,
     false},
    {"PK_Convert_RGB_444_10u_To_DNxHD16u", WithoutRowBytes<PK_Convert_RGB_444_10u_To_DNxHD16u>, 4, 8, true,
     true},
    {"PK_ConvertUYVY_422_10uToV210_422_10u", PK_ConvertUYVY_422_10uToV210_422_10u, 4, kV210, false, false},
    {"PK_Convert_j2k_BGR16u_To_RGB_444_10u", PK_Convert_j2k_BGR16u_To_RGB_444_10u, 6, 4, false, false},
    {"PK_Convert_j2k_RGB_444_10u_To_10_Bits_Within_BGR16u",
     PK_Convert_j2k_RGB_444_10u_To_10_Bits_Within_BGR16u, 4, 6, false, false},
    {"PK_Convert_j2k_V210_To_10_Bits_Within_UYVY16u", PK_Convert_j2k_V210_To_10_Bits_Within_UYVY16u, kV210, 4,
     false, false},
    {"PK_ConvertRGB_444_16u_To_XRGB_4444_15u", XRGB, 6, 8, true, false},
};

size_t RowLength(int32_t pixelBytes, int32_t width) {
    const auto pixels = static_cast<size_t>(width);
    return pixelBytes == kV210 ? (pixels + 5) / 6 * 16 : pixels * static_cast<size_t>(pixelBytes);
}

Size DrawSize(ByteStream& stream) {
    if (stream.OneIn(32)) return {stream.AnyI32(), stream.AnyI32()};
    if (stream.OneIn(16)) return {stream.Between(0, 2100), stream.Between(0, 3)};
    return {stream.Between(0, 90), stream.Between(0, 6)};
}

/// Whether a call of that size has rows to read, and few enough of them for a run.
bool HasRows(Size size) {
    return size.width >= 1 && size.height >= 1 && size.width <= 4096 && size.height <= 8;
}

bool IsAffordable(Size size) {
    return HasRows(size) || size.width < 1 || size.height < 1 || size.width > kWidestRow;
}

/// The size in memory: what must be refused or does nothing touches none.
Size SizeInMemory(Size size) {
    return HasRows(size) ? size : Size{0, 0};
}

RowsLayout DrawImage(ByteStream& stream, int32_t pixelBytes, Size size) {
    return DrawLayout(stream, RowLength(pixelBytes, size.width), static_cast<size_t>(size.height));
}

std::string WordsOfCall(const char* name, Size size, int32_t rowBytes) {
    return std::string(name) + " of " + Words(size) + ", row bytes " + std::to_string(rowBytes);
}

/// Calls twice over different contents of the destination and holds the bytes to be the same, or in
/// \p mayLeaveBytes to be left both times.
template <class Function>
void CheckDestination(ImageMemory& destination, uint32_t state, PK_Result expected, bool mayLeaveBytes,
                      Function call) {
    const size_t bytes = destination.Layout().Bytes();
    const auto convert = [&](uint8_t before) {
        destination.SetRows(std::vector<uint8_t>(bytes, before));
        CheckResult(expected, CallIn(state, call));
        destination.CheckPadding();
        return destination.Rows();
    };
    const std::vector<uint8_t> once = convert(0x55), again = convert(0xaa);
    for (size_t i = 0; i < bytes; ++i) {
        const bool isLeft = once[i] == 0x55 && again[i] == 0xaa;
        Check(isLeft ? mayLeaveBytes || expected != PK_Success : once[i] == again[i],
              "a byte is written from the source alone");
    }
}

/// A group that finds no room in the row is left or cut.
bool MayLeaveBytes(const RowsLayout& destination) {
    return std::abs(int64_t{destination.rowBytes}) < static_cast<int64_t>(destination.rowLength);
}

void FuzzBetweenImages(ByteStream& stream, uint32_t state, Size size) {
    const Bridge& bridge = kBridges[stream.Below(std::size(kBridges))];
    const Size rows = SizeInMemory(size);
    const bool hasNull = stream.OneIn(32);
    const auto layout = [&](int32_t pixelBytes) {
        return bridge.isOneRun
                   ? RowsLayout{RowLength(pixelBytes, rows.width) * static_cast<size_t>(rows.height), 1, 0}
                   : DrawImage(stream, pixelBytes, rows);
    };
    const SourceImage source(layout(bridge.sourcePixel), stream);
    ImageMemory destination(layout(bridge.destinationPixel), stream);
    SetCall(WordsOfCall(bridge.name, size, destination.RowBytes()));

    const bool reportsNothing = bridge.call == XRGB;
    const bool mayLeaveBytes =
        bridge.leavesBytes || (bridge.destinationPixel == kV210 && MayLeaveBytes(destination.Layout()));
    CheckDestination(destination, state, reportsNothing ? PK_Success : ResultOfRows(size, hasNull),
                     mayLeaveBytes || (reportsNothing && hasNull), [&] {
                         return bridge.call(hasNull ? nullptr : source.Pixels(), source.RowBytes(),
                                            destination.Pixels(), destination.RowBytes(), size.width,
                                            size.height);
                     });
    source.CheckStays();
}

void FuzzInPlace(ByteStream& stream, uint32_t state, Size size) {
    const uint32_t which = stream.Below(4);
    const bool isNull = stream.OneIn(32);
    const SourceImage image(DrawImage(stream, which == 0 ? 16 : 8, SizeInMemory(size)), stream);
    const int32_t rowBytes = image.RowBytes();
    SetCall(WordsOfCall("bridge in place", size, rowBytes));
    void* const buffer = isNull ? nullptr : image.Pixels();
    const PK_Result result = CallIn(state, [&] {
        switch (which) {
        case 0:
            return PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place(buffer, rowBytes, size.width, size.height);
        case 1:
            return PK_Convert_j2k_UYVY_422_32f_Offset_In_Place(buffer, rowBytes, size.width, size.height);
        default:
            return PK_Scale16uBufferTo15uSIMD(buffer, rowBytes, size.width, size.height, which == 2);
        }
    });
    CheckResult(ResultOfRows(size, isNull), result);
    image.CheckPadding();
}

void FuzzPlanes(ByteStream& stream, uint32_t state, Size size) {
    const uint32_t which = stream.Below(4);
    const int32_t field = stream.AnyI32();
    const Size rows = SizeInMemory(size);
    const RowsLayout luma = {RowLength(2, rows.width), static_cast<size_t>(rows.height)};
    const RowsLayout chroma = {RowLength(2, (rows.width + 1) / 2), static_cast<size_t>(rows.height)};
    const Planes source({luma, chroma, chroma}, stream);
    const bool isHalf = which >= 2;
    const Size written = {rows.width / (isHalf ? 2 : 1),
                          isHalf ? rows.height / 2 : rows.height * (which == 1 ? 2 : 1)};
    const RowsLayout layout = DrawImage(stream, which == 3 ? 4 : kV210, written);
    ImageMemory destination(layout, stream);
    SetCall(WordsOfCall("W210 bridge", size, layout.rowBytes));

    CheckDestination(
        destination, state, ResultOfRows(size, source.hasNull), which != 3 && MayLeaveBytes(layout), [&] {
            if (which == 3)
                return PK_ConvertW210toQuarterResVUYX_8u(source.sources, source.rowBytes, size.width,
                                                         size.height, destination.Pixels(), layout.rowBytes,
                                                         field);
            constexpr decltype(&PK_ConvertW210toV210) calls[] = {
                PK_ConvertW210toV210, PK_TempConvertW210toV210ToReplacePanasonicLTDebayering,
                PK_QuarterScaleConvertW210toV210};
            return calls[which](source.sources, source.rowBytes, size.width, size.height,
                                destination.Pixels(), layout.rowBytes);
        });
    source.CheckStay();
}

void FuzzCodecBridges(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    const Size size = DrawSize(stream);
    if (!IsAffordable(size)) return;
    switch (stream.Below(4)) {
    case 0:
        return FuzzInPlace(stream, state, size);
    case 1:
        return FuzzPlanes(stream, state, size);
    default:
        return FuzzBetweenImages(stream, state, size);
    }
}

const Family sFamily('g', "codec-bridges", FuzzCodecBridges);

} // namespace
