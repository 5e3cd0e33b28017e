// Planes of 4:2:0 decoded to any format and size, in memory that ends where the arguments say.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/Planes.h"
#include "support/Size.h"
#include "support/Switches.h"

#include "convert/RasterFormats.h"

#include <PixelKiln/Planar.h>

#include <algorithm>
#include <string>

namespace {

using namespace PKFuzz;

Size DrawSource(ByteStream& stream) {
    if (stream.OneIn(16)) return {stream.AnyI32(), stream.Between(-3, 0)};
    if (stream.OneIn(16)) return {stream.Between(-3, 0), stream.AnyI32()};
    if (stream.OneIn(3)) return {(stream.Bool() ? 16 : 96) * stream.Between(1, 3), stream.Between(1, 20)};
    return {stream.Between(0, 70), stream.Between(0, 24)};
}

/// Mostly one that is offered.
Size DrawDestination(ByteStream& stream, Size source) {
    const bool isSmall =
        source.width >= 0 && source.width < 1000 && source.height >= 0 && source.height < 1000;
    if (!isSmall || stream.OneIn(8)) return {stream.Between(-2, 70), stream.Between(-2, 30)};
    const int32_t widths[] = {source.width,         source.width / 2,     source.width / 4, source.width / 8,
                              source.width * 3 / 2, source.width * 4 / 3, source.width / 3};
    const int32_t heights[] = {source.height, source.height / 2, source.height / 4, source.height / 6};
    return {widths[stream.Below(7)], heights[stream.Below(4)]};
}

PK_PixelFormat DrawSourceFormat(ByteStream& stream) {
    constexpr uint32_t kBits[] = {0x831, 0x31, 0xa31, 0x231};
    if (stream.OneIn(32)) return DrawFormat(stream);
    return static_cast<uint32_t>(stream.Between(9, 12)) << PK::kStreamShift | kBits[stream.Below(4)];
}

void FuzzPlanar420(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    const Size from = DrawSource(stream), to = DrawDestination(stream, from);
    const PK_PixelFormat source = DrawSourceFormat(stream), destination = DrawFormat(stream);
    const int32_t field = stream.BetweenOrAny(0, 2, 16), quality = stream.BetweenOrAny(0, 5, 16);
    SetCall("PK::DecompressYUV_420_8u of " + Words(source) + ", " + Words(from) + " to " +
            Words(destination) + ", " + Words(to) + ", field " + std::to_string(field) + ", quality " +
            std::to_string(quality));

    const bool hasPixels = from.HasPixels();
    const auto width = static_cast<size_t>(hasPixels ? from.width : 0);
    const auto height = static_cast<size_t>(hasPixels ? from.height : 0);
    const Planes planes({{width, height}, {width / 2, height / 2}, {width / 2, height / 2}}, stream);
    const bool isRaster = PK::IsRasterFormat(destination);
    const RowsLayout layout =
        isRaster ? DrawLayout(stream, int64_t{PK_PixelFormatPackedRowBytes(destination, to.width)}, to)
                 : RowsLayout{};
    const SourceImage image(layout, stream);
    const bool isNull = stream.OneIn(64);
    const PK_Result result = CallIn(state, [&] {
        return PK::DecompressYUV_420_8u(planes.sources, planes.rowBytes, from.width, from.height, source,
                                        isNull ? nullptr : image.Pixels(), image.RowBytes(), to.width,
                                        to.height, destination, field, quality);
    });
    CheckIsNamed(result);
    planes.CheckStay();
    image.CheckPadding();
    if (!PK::Is420Planar(source))
        CheckResult(PK_ErrBadSrcFormat, result);
    else if (!isRaster)
        CheckResult(PK_ErrBadDstFormat, result);
    else if (std::min({from.width, from.height, to.width, to.height}) < 0)
        CheckResult(PK_ErrFailed, result);
    else if (!to.HasPixels())
        CheckResult(PK_Success, result);
    else if (isNull || planes.hasNull)
        CheckResult(PK_ErrFailed, result);
    if (result != PK_Success || !to.HasPixels())
        CheckSame(image.Content(), image.Rows(), "a refusal writes nothing");
}

const Family sFamily('P', "planar420", FuzzPlanar420);

} // namespace
