// Frames of DV, whole and damaged, decoded at every size to every format.

#include "support/DVFrames.h"

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/Input.h"
#include "support/Switches.h"

#include "frame/PixelFormat.h"

#include <PixelKiln/Convert.h>
#include <PixelKiln/ScaleConvert.h>

namespace {

using namespace PKFuzz;

/// What decoders give by themselves, most of the time.
PK_PixelFormat DrawDestination(ByteStream& stream) {
    constexpr PK_PixelFormat kOwn[] = {PK_PixelFormat_UYVY_422_8u,     PK_PixelFormat_YUYV_422_8u,
                                       PK_PixelFormat_BGRA_4444_8u,    PK_PixelFormat_VUYA_4444_8u,
                                       PK_PixelFormat_BGRP_4444_8u,    PK_PixelFormat_VUYX_4444_8u,
                                       PK_PixelFormat_YUYV_422_8u_709, PK_PixelFormat_VUYA_4444_8u_709};
    return stream.OneIn(4) ? DrawRasterFormat(stream) : kOwn[stream.Below(std::size(kOwn))];
}

/// The whole picture, a field, what decoders give reduced, or any size.
Size DrawSize(ByteStream& stream, Size whole) {
    switch (stream.Below(8)) {
    case 0:
        return whole;
    case 1:
        return {whole.width, whole.height / 2};
    case 2:
    case 3:
        return {whole.width / 2, whole.height / 2};
    case 4:
        return {whole.width / 4, whole.height / 4};
    case 5:
    case 6:
        return {whole.width / 8, whole.height / 8};
    default:
        return {stream.Between(1, whole.width), stream.Between(1, whole.height / 4)};
    }
}

constexpr size_t kLargestImage = size_t{8} << 20;

void FuzzDecode(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream);
    const DVFrame frame = DrawDVFrame(stream, DrawDVFormat(stream));
    const PK_PixelFormat to = DrawDestination(stream);
    const Size size = DrawSize(stream, frame.size);
    const bool isWhole = size.width == frame.size.width && size.height == frame.size.height;
    const bool scales = !isWhole || stream.OneIn(4);
    // Between images of different earlier fields the picture moves by a row, and leaves one as it was.
    const int32_t field = stream.Between(0, 2), fields[] = {field, stream.Bool() ? field : 0};
    const int32_t quality = stream.BetweenOrAny(0, 5, 16);
    SetCall((scales ? "PK_ScaleConvert of " : "PK_Convert of ") + Words(frame.format) + ", field " +
            std::to_string(fields[0]) + " to " + Words(to) + ", " + Words(size) + ", field " +
            std::to_string(fields[1]) + ", quality " + std::to_string(quality));
    const RowsLayout layout = DrawRaster(stream, to, size);
    if (layout.Extent() > kLargestImage) return;

    ImageMemory source({frame.bytes.size(), 1, stream.AnyI32()}, stream), destination(layout, stream);
    source.SetRows(frame.bytes);
    std::vector<uint8_t> rows[2];
    for (const uint8_t before : {uint8_t{0x55}, uint8_t{0xaa}}) {
        const std::vector<uint8_t> untouched(layout.Bytes(), before);
        destination.SetRows(untouched);
        const PK_Result result = CallIn(state, [&] {
            if (!scales)
                return PK_Convert(source.Pixels(), source.RowBytes(), frame.format, destination.Pixels(),
                                  destination.RowBytes(), to, size.width, size.height, quality);
            return PK_ScaleConvert(source.Pixels(), source.RowBytes(), frame.size.width, frame.size.height,
                                   frame.format, fields[0], destination.Pixels(), destination.RowBytes(),
                                   size.width, size.height, to, fields[1], quality);
        });
        CheckResult(HasGoodHeader(frame) ? PK_Success : PK_ErrBadDVFormat, result);
        source.CheckPadding();
        CheckSame(frame.bytes, source.Rows(), "the frame stays");
        destination.CheckPadding();
        if (result != PK_Success) CheckSame(untouched, destination.Rows(), "a refused frame writes nothing");
        rows[before == 0xaa] = result == PK_Success ? destination.Rows() : std::vector<uint8_t>();
    }
    CheckSame(rows[0], rows[1], "a frame is the same whatever was there");
}

const Family sFamily('V', "decode-dv", FuzzDecode);

} // namespace
