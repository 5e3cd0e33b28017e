// The codec bridges at any size, from and to rows laid out in any way.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/ImageMemory.h"
#include "support/Switches.h"

#include <PixelKiln/CodecBridges.h>

#include <cstdlib>
#include <vector>

namespace {

using namespace PKFuzz;

constexpr int32_t kWidestRow = 134217727; // as documented

struct Size {
    int32_t width, height;
};

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

PK_Result ExpectedResult(Size size, bool hasNull) {
    if (size.height < 1 || size.width == 0) return PK_Success;
    return size.width < 0 || size.width > kWidestRow || hasNull ? PK_ErrFailed : PK_Success;
}

RowsLayout DrawLayout(ByteStream& stream, size_t rowLength, int32_t rows) {
    const auto count = static_cast<size_t>(rows);
    return {rowLength, count, DrawRowBytes(stream, rowLength, count, static_cast<int32_t>(rowLength + 64))};
}

std::vector<uint8_t> FillImage(ByteStream& stream, ImageMemory& image) {
    std::vector<uint8_t> content(image.Layout().rows * image.Layout().rowLength);
    stream.Fill(content.data(), content.size());
    image.SetRows(content);
    return content;
}

std::string WordsOfCall(const char* name, Size size, int32_t rowBytes) {
    return std::string(name) + " of " + std::to_string(size.width) + " x " + std::to_string(size.height) +
           ", row bytes " + std::to_string(rowBytes);
}

/// Calls twice over different contents of the destination and holds the bytes to be the same, or in
/// \p mayLeaveBytes to be left both times.
template <class Function>
void CheckDestination(ImageMemory& destination, uint32_t state, PK_Result expected, bool mayLeaveBytes,
                      Function call) {
    const size_t bytes = destination.Layout().rows * destination.Layout().rowLength;
    const auto convert = [&](uint8_t before) {
        destination.SetRows(std::vector<uint8_t>(bytes, before));
        Check(CallIn(state, call) == expected, "the arguments decide the result");
        Check(destination.IsPaddingIntact(), "bytes outside the rows stay");
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
    const Size rows = HasRows(size) ? size : Size{0, 0};
    const bool hasNull = stream.OneIn(32);
    const auto layout = [&](int32_t pixelBytes) {
        const size_t length = RowLength(pixelBytes, rows.width);
        return bridge.isOneRun ? RowsLayout{length * static_cast<size_t>(rows.height), 1, 0}
                               : DrawLayout(stream, length, rows.height);
    };
    ImageMemory source(layout(bridge.sourcePixel), stream);
    ImageMemory destination(layout(bridge.destinationPixel), stream);
    const std::vector<uint8_t> content = FillImage(stream, source);
    SetCall(WordsOfCall(bridge.name, size, destination.Layout().rowBytes));

    const bool reportsNothing = bridge.call == XRGB;
    const bool mayLeaveBytes =
        bridge.leavesBytes || (bridge.destinationPixel == kV210 && MayLeaveBytes(destination.Layout()));
    CheckDestination(destination, state, reportsNothing ? PK_Success : ExpectedResult(size, hasNull),
                     mayLeaveBytes || (reportsNothing && hasNull), [&] {
                         return bridge.call(hasNull ? nullptr : source.Pixels(), source.Layout().rowBytes,
                                            destination.Pixels(), destination.Layout().rowBytes, size.width,
                                            size.height);
                     });
    CheckSame(content, source.Rows(), "the source stays");
}

void FuzzInPlace(ByteStream& stream, uint32_t state, Size size) {
    const uint32_t which = stream.Below(4);
    const Size rows = HasRows(size) ? size : Size{0, 0};
    const bool isNull = stream.OneIn(32);
    ImageMemory image(DrawLayout(stream, RowLength(which == 0 ? 16 : 8, rows.width), rows.height), stream);
    FillImage(stream, image);
    SetCall(WordsOfCall("bridge in place", size, image.Layout().rowBytes));
    const int32_t rowBytes = image.Layout().rowBytes;
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
    Check(result == ExpectedResult(size, isNull), "the arguments decide the result");
    Check(image.IsPaddingIntact(), "bytes outside the rows stay");
}

void FuzzPlanes(ByteStream& stream, uint32_t state, Size size) {
    const uint32_t which = stream.Below(4);
    const int32_t field = stream.AnyI32();
    const Size rows = HasRows(size) ? size : Size{0, 0};
    const auto plane = [&](int32_t samples) {
        return DrawLayout(stream, RowLength(2, samples), rows.height);
    };
    ImageMemory y(plane(rows.width), stream), u(plane((rows.width + 1) / 2), stream),
        v(plane((rows.width + 1) / 2), stream);
    for (ImageMemory* image : {&y, &u, &v}) FillImage(stream, *image);
    const bool isHalf = which >= 2;
    const RowsLayout layout =
        DrawLayout(stream, RowLength(which == 3 ? 4 : kV210, rows.width / (isHalf ? 2 : 1)),
                   isHalf ? rows.height / 2 : rows.height * (which == 1 ? 2 : 1));
    ImageMemory destination(layout, stream);
    SetCall(WordsOfCall("W210 bridge", size, layout.rowBytes));

    const int32_t missing = stream.OneIn(32) ? stream.Between(0, 2) : 3;
    const void* planes[] = {y.Pixels(), u.Pixels(), v.Pixels(), nullptr};
    planes[missing] = nullptr;
    const int32_t rowBytes[] = {y.Layout().rowBytes, u.Layout().rowBytes, v.Layout().rowBytes};
    CheckDestination(
        destination, state, ExpectedResult(size, missing < 3), which != 3 && MayLeaveBytes(layout), [&] {
            if (which == 3)
                return PK_ConvertW210toQuarterResVUYX_8u(planes, rowBytes, size.width, size.height,
                                                         destination.Pixels(), layout.rowBytes, field);
            constexpr decltype(&PK_ConvertW210toV210) calls[] = {
                PK_ConvertW210toV210, PK_TempConvertW210toV210ToReplacePanasonicLTDebayering,
                PK_QuarterScaleConvertW210toV210};
            return calls[which](planes, rowBytes, size.width, size.height, destination.Pixels(),
                                layout.rowBytes);
        });
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
