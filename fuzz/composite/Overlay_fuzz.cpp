// The one-bit mask and the numbers, on images of any format and size.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/Input.h"
#include "support/Size.h"
#include "support/Switches.h"

#include "convert/RasterFormats.h"
#include "frame/PixelFormat.h"

#include <PixelKiln/Overlay.h>

#include <cmath>
#include <string>

namespace {

using namespace PKFuzz;

Size DrawSize(ByteStream& stream) {
    if (stream.OneIn(16)) return {stream.AnyI32(), stream.Between(-3, 0)};
    if (stream.OneIn(64))
        return {stream.Between(16380, 16390), 1}; // about where rows no longer fit the stack
    return {stream.Between(-1, 120), stream.Between(0, 40)};
}

struct MaskCall {
    const Input &first, &second, &mask, &destination;
    Size size;
    size_t bit;
};

PK_Result ExpectedResult(const MaskCall& call) {
    if (!PK::IsRasterFormat(call.destination.format) || PK::Is422(call.destination.format))
        return PK_ErrBadDstFormat;
    if (!PK::IsRasterFormat(call.first.format) || !PK::IsRasterFormat(call.second.format))
        return PK_ErrBadSrcFormat;
    if (!call.size.IsPossible()) return PK_ErrFailed;
    if (!call.size.HasPixels()) return PK_Success;
    const bool hasNull =
        call.first.isNull || call.second.isNull || call.mask.isNull || call.destination.isNull;
    return hasNull ? PK_ErrFailed : PK_Success;
}

/// Where neither image is converted, each pixel is that of one of them.
void CheckPixels(const MaskCall& call) {
    const PK_PixelFormat format = call.destination.format;
    if (call.first.format != format || call.second.format != format || !call.size.HasPixels()) return;
    const std::vector<uint8_t>&ones = call.first.memory.Content(), &zeros = call.second.memory.Content(),
          &bits = call.mask.memory.Content();
    const size_t maskRow = call.mask.memory.Layout().rowLength;
    const size_t row = call.destination.memory.Layout().rowLength;
    const size_t pixelBytes = row / static_cast<size_t>(call.size.width);
    std::vector<uint8_t> expected(ones.size());
    for (size_t i = 0; i < expected.size(); ++i) {
        const size_t place = call.bit + i % row / pixelBytes;
        const bool isSet = (bits[i / row * maskRow + place / 8] >> (7 - place % 8) & 1) != 0;
        expected[i] = (isSet ? ones : zeros)[i];
    }
    CheckSame(expected, call.destination.memory.Rows(), "the pixel is that of the image which the bit names");
}

void FuzzMask(ByteStream& stream, uint32_t state) {
    const Size size = DrawSize(stream);
    const PK_PixelFormat format = DrawFormat(stream);
    const uint8_t offset = stream.Byte();
    const size_t bit = offset % 8;
    const auto drawOther = [&] { return stream.Bool() ? format : DrawFormat(stream); };
    const Input first(stream, drawOther(), size), second(stream, drawOther(), size);
    const Input destination(stream, format, size);
    const int64_t maskBytes = (static_cast<int64_t>(bit) + size.width + 7) / 8;
    const Input mask(stream, PK_PixelFormat_Invalid, DrawLayout(stream, maskBytes, size));
    SetCall("PK_OneBitMaskComposite of " + Words(first.format) + " and " + Words(second.format) + " to " +
            Words(format) + ", " + Words(size) + ", bit " + std::to_string(offset));

    const int32_t quality = stream.BetweenOrAny(0, 5, 8);
    const PK_Result result = CallIn(state, [&] {
        return PK_OneBitMaskComposite(first.Pixels(), first.RowBytes(), first.format, second.Pixels(),
                                      second.RowBytes(), second.format, mask.Pixels(), mask.RowBytes(),
                                      offset, destination.Pixels(), destination.RowBytes(), format,
                                      size.width, size.height, quality);
    });
    const MaskCall call = {first, second, mask, destination, size, bit};
    CheckResult(ExpectedResult(call), result);
    destination.memory.CheckPadding();
    for (const Input* source : {&first, &second, &mask}) source->memory.CheckStays();
    if (result == PK_Success) CheckPixels(call);
}

float DrawFraction(ByteStream& stream) {
    if (stream.OneIn(16)) {
        const float any = stream.AnyFloat();
        return std::fpclassify(any) == FP_SUBNORMAL ? 0.0f
                                                    : any; // which MXCSR may say to be 0, whatever its sign
    }
    return static_cast<float>(stream.Below(257)) / 256.0f;
}

bool IsFraction(float value) {
    return value >= 0 && value <= 1;
}

/// Formats that have ink: the catalogue without 15 bits, also in reversed order, and the planes of 4:2:0.
bool HasInk(PK_PixelFormat format) {
    if ((format & PK::kDepthMask) == PK::kDepth15u) return false;
    return PK::IsStream(format) ? PK::Is420Planar(format) : PK::IsRasterFormat(format & ~PK::kOrderMask);
}

RowsLayout DrawImage(ByteStream& stream, PK_PixelFormat format, Size size) {
    if (!PK::IsStream(format)) return DrawRaster(stream, format, size);
    const int64_t bytes = size.HasPixels() ? PK_PixelFormatSize(format, size.width, size.height) : 0;
    return {static_cast<size_t>(bytes), bytes > 0 ? size_t{1} : 0, stream.AnyI32()};
}

void FuzzNumber(ByteStream& stream, uint32_t state) {
    const Size size = DrawSize(stream);
    const PK_PixelFormat format = stream.OneIn(4) ? DrawStreamFormat(stream) : DrawFormat(stream);
    const float fraction = DrawFraction(stream);
    const PK_Point position = {DrawFraction(stream), DrawFraction(stream)};
    const int32_t number = stream.AnyI32();
    const bool decimal = stream.Bool();
    const Input image(stream, format, DrawImage(stream, format, size));
    SetCall("PK_PrintNum of " + std::to_string(number) + " on " + Words(format) + ", " + Words(size) +
            ", size " + std::to_string(fraction) + " at " + std::to_string(position.x) + ", " +
            std::to_string(position.y));

    const PK_Result result = CallIn(state, [&] {
        return PK_PrintNum(image.Pixels(), image.RowBytes(), format, size.width, size.height, number,
                           fraction, position, decimal);
    });
    PK_Result expected = PK_Success;
    if (!HasInk(format))
        expected = PK_ErrBadDstFormat;
    else if (size.width < 0)
        expected = PK_ErrBadPosX;
    else if (size.height < 0)
        expected = PK_ErrBadPosY;
    else if (!IsFraction(fraction) || !IsFraction(position.x) || !IsFraction(position.y))
        expected = PK_ErrFailed;
    else if (size.HasPixels() && image.isNull)
        expected = PK_ErrFailed;
    CheckResult(expected, result);
    image.memory.CheckPadding();
    if (result != PK_Success) image.memory.CheckStays("a refused call writes nothing");
}

void FuzzOverlay(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    stream.Bool() ? FuzzMask(stream, state) : FuzzNumber(stream, state);
}

const Family sFamily('o', "overlay", FuzzOverlay);

} // namespace
