// PK_Convert between any two formats, at any size, from and to rows laid out in any way.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/ImageMemory.h"
#include "support/Size.h"
#include "support/Switches.h"

#include "convert/RasterFormats.h"
#include "frame/PixelFormat.h"

#include <PixelKiln/Convert.h>

#include <algorithm>
#include <optional>
#include <vector>

namespace {

using namespace PKFuzz;

constexpr size_t kLargestImage = size_t{4} << 20;

struct Request {
    PK_PixelFormat sourceFormat, destinationFormat;
    Size size;
    int32_t quality;
    bool nullSource, nullDestination;
};

constexpr bool IsKnown(PK_PixelFormat format) {
    return PK::IsStream(format) || PK::IsRasterFormat(format);
}

Size DrawSize(ByteStream& stream) {
    constexpr Size kDVFrames[] = {{720, 480}, {720, 576}, {960, 720}, {1280, 1080}, {1440, 1080}};
    switch (stream.Below(64)) {
    case 63:
        return {stream.AnyI32(), stream.AnyI32()};
    case 62:
        return {stream.Between(-3, 3), stream.AnyI32()};
    case 61: // about where the scratch of a row no longer fits the stack
        return {stream.Between(16370, 16400), stream.Between(1, 2)};
    case 60:
        return kDVFrames[stream.Below(std::size(kDVFrames))];
    case 59:
    case 58:
        return {stream.Between(0, 1200), stream.Between(0, 3)};
    default:
        return {stream.Between(0, 70), stream.Between(0, 6)};
    }
}

Request DrawRequest(ByteStream& stream) {
    Request request{};
    request.sourceFormat = DrawFormat(stream);
    request.destinationFormat = stream.OneIn(8) ? request.sourceFormat : DrawFormat(stream);
    request.size = DrawSize(stream);
    request.quality = stream.BetweenOrAny(0, 5, 8);
    request.nullSource = stream.OneIn(64);
    request.nullDestination = stream.OneIn(64);
    return request;
}

std::string WordsOfCall(const Request& request, const RowsLayout& source, const RowsLayout& destination) {
    return "PK_Convert of " + Words(request.sourceFormat) + ", row bytes " + std::to_string(source.rowBytes) +
           " to " + Words(request.destinationFormat) + ", row bytes " + std::to_string(destination.rowBytes) +
           ", " + Words(request.size) + ", quality " + std::to_string(request.quality) +
           (request.nullSource ? ", null source" : "") +
           (request.nullDestination ? ", null destination" : "");
}

/// The bytes that a call may touch of a raster image; none where it must be refused or does nothing.
RowsLayout DrawRaster(ByteStream& stream, PK_PixelFormat format, Size size) {
    if (!PK::IsRasterFormat(format)) return {0, 0, stream.AnyI32()};
    return DrawLayout(stream, int64_t{PK_PixelFormatPackedRowBytes(format, size.width)}, size);
}

/// A stream that only its row bytes tell the length of: the number says neither DV nor planar 4:2:0.
bool IsUnknownStream(PK_PixelFormat format) {
    return PK::StreamKind(format) > PK::kStreamLastDV && !PK::Is420Planar(format);
}

/// A stream is one block.
RowsLayout DrawStream(ByteStream& stream, PK_PixelFormat format, Size size) {
    if (IsUnknownStream(format)) {
        const int32_t bytes = stream.Between(-2, 3000);
        return {static_cast<size_t>(std::max(bytes, 0)), 1, bytes};
    }
    const int64_t bytes = PK_PixelFormatSize(format, size.width, size.height);
    return {static_cast<size_t>(std::max<int64_t>(bytes, 0)), 1, stream.AnyI32()};
}

RowsLayout DrawImage(ByteStream& stream, PK_PixelFormat format, Size size) {
    return PK::IsStream(format) ? DrawStream(stream, format, size) : DrawRaster(stream, format, size);
}

bool IsAffordable(const RowsLayout& layout) {
    return layout.rows == 0 || (layout.rowLength <= kLargestImage && layout.rows <= kLargestImage &&
                                layout.Extent() <= kLargestImage);
}

/// The result, where the arguments alone decide it.
std::optional<PK_Result> ExpectedResult(const Request& request) {
    if (!IsKnown(request.sourceFormat)) return PK_ErrBadSrcFormat;
    if (!IsKnown(request.destinationFormat)) return PK_ErrBadDstFormat;
    if (PK::IsStream(request.sourceFormat) || PK::IsStream(request.destinationFormat)) return std::nullopt;
    return ResultOfRows(request.size, request.nullSource || request.nullDestination);
}

/// Words of 15 bits that come from bytes are deliberately truncated up to the first 16-byte boundary of a row
/// and rounded from there: they are the same only in the same place.
bool DependsOnPlace(PK_PixelFormat destination) {
    return (destination & PK::kDepthMask) == PK::kDepth15u;
}

struct Outcome {
    PK_Result result;
    std::vector<uint8_t> rows;
};

/// One call into a destination that holds nothing but one byte before.
Outcome Convert(const Request& request, uint32_t state, const ImageMemory& source, ImageMemory& destination,
                uint8_t before) {
    const RowsLayout& layout = destination.Layout();
    const std::vector<uint8_t> untouched(layout.Bytes(), before);
    destination.SetRows(untouched);
    const PK_Result result = CallIn(state, [&] {
        return PK_Convert(request.nullSource ? nullptr : source.Pixels(), source.RowBytes(),
                          request.sourceFormat, request.nullDestination ? nullptr : destination.Pixels(),
                          layout.rowBytes, request.destinationFormat, request.size.width, request.size.height,
                          request.quality);
    });
    CheckIsNamed(result);
    const std::optional<PK_Result> expected = ExpectedResult(request);
    if (expected) CheckResult(*expected, result);
    destination.CheckPadding();
    Outcome outcome{result, destination.Rows()};
    if (expected && result != PK_Success) CheckSame(untouched, outcome.rows, "a refused call writes nothing");
    return outcome;
}

/// Blocks of an unknown kind are as long as their row bytes say, and must be equally long.
bool MustShareLayout(const Request& request) {
    return request.sourceFormat == request.destinationFormat && IsUnknownStream(request.sourceFormat);
}

void FuzzConvert(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream);
    const Request request = DrawRequest(stream);
    const RowsLayout sourceLayout = DrawImage(stream, request.sourceFormat, request.size);
    const auto drawDestination = [&] {
        if (request.sourceFormat == request.destinationFormat && (MustShareLayout(request) || stream.Bool()))
            return sourceLayout;
        return DrawImage(stream, request.destinationFormat, request.size);
    };
    const RowsLayout firstLayout = drawDestination();
    const RowsLayout secondLayout = drawDestination();
    if (!IsAffordable(sourceLayout) || !IsAffordable(firstLayout) || !IsAffordable(secondLayout)) return;
    SetCall(WordsOfCall(request, sourceLayout, firstLayout));

    const SourceImage source(sourceLayout, stream);
    ImageMemory first(firstLayout, stream);
    ImageMemory second(secondLayout, stream);
    const bool isPlaceFree = !MustShareLayout(request) && !DependsOnPlace(request.destinationFormat);
    const Outcome once = Convert(request, state, source, first, 0x55);
    const Outcome again = Convert(request, state, source, isPlaceFree ? second : first, 0xaa);

    Check(once.result == again.result, "the same call has the same result");
    // A block of planes has bytes beside its samples, which stay.
    const bool hasPlanes = PK::Is420Planar(request.destinationFormat);
    if (once.result == PK_Success && (!hasPlanes || request.sourceFormat == request.destinationFormat))
        CheckSame(once.rows, again.rows, "every byte of the rows is written, and the same wherever they lie");
    source.CheckStays();
}

const Family sFamily('c', "convert", FuzzConvert);

} // namespace
