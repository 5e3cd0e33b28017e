// PK_Convert between any two formats, at any size, from and to rows laid out in any way.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/ImageMemory.h"
#include "support/Switches.h"

#include "convert/RasterFormats.h"
#include "frame/PixelFormat.h"

#include <PixelKiln/Convert.h>

#include <algorithm>
#include <optional>
#include <vector>

namespace {

using namespace PKFuzz;

constexpr int32_t kWidestRow = INT32_MAX / 16; // as documented
constexpr size_t kLargestImage = size_t{4} << 20;

struct Size {
    int32_t width, height;
};

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
    request.quality = stream.OneIn(8) ? stream.AnyI32() : stream.Between(0, 5);
    request.nullSource = stream.OneIn(64);
    request.nullDestination = stream.OneIn(64);
    return request;
}

std::string WordsOfCall(const Request& request, const RowsLayout& source, const RowsLayout& destination) {
    return "PK_Convert of " + Words(request.sourceFormat) + ", row bytes " + std::to_string(source.rowBytes) +
           " to " + Words(request.destinationFormat) + ", row bytes " + std::to_string(destination.rowBytes) +
           ", " + std::to_string(request.size.width) + " x " + std::to_string(request.size.height) +
           ", quality " + std::to_string(request.quality) + (request.nullSource ? ", null source" : "") +
           (request.nullDestination ? ", null destination" : "");
}

/// The bytes that a call may touch of a raster image; none where it must be refused or does nothing.
RowsLayout DrawRaster(ByteStream& stream, PK_PixelFormat format, Size size) {
    if (!PK::IsRasterFormat(format) || size.height < 1 || size.width < 1 || size.width > kWidestRow)
        return {0, 0, stream.AnyI32()};
    const size_t rowLength = static_cast<size_t>(PK_PixelFormatPackedRowBytes(format, size.width));
    const size_t rows = static_cast<size_t>(size.height);
    const int32_t usual = PK_PixelFormatRowBytes(format, size.width);
    return {rowLength, rows, DrawRowBytes(stream, rowLength, rows, usual)};
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

RowsLayout DrawLayout(ByteStream& stream, PK_PixelFormat format, Size size) {
    return PK::IsStream(format) ? DrawStream(stream, format, size) : DrawRaster(stream, format, size);
}

bool IsAffordable(const RowsLayout& layout) {
    return layout.rows == 0 || (layout.rowLength <= kLargestImage && layout.rows <= kLargestImage &&
                                layout.Extent() <= kLargestImage);
}

/// The result, where the arguments alone decide it.
std::optional<PK_Result> ExpectedResult(const Request& request) {
    const auto [width, height] = request.size;
    if (!IsKnown(request.sourceFormat)) return PK_ErrBadSrcFormat;
    if (!IsKnown(request.destinationFormat)) return PK_ErrBadDstFormat;
    if (PK::IsStream(request.sourceFormat) || PK::IsStream(request.destinationFormat)) return std::nullopt;
    if (height < 1 || width == 0) return PK_Success;
    if (width < 0 || width > kWidestRow) return PK_ErrFailed;
    return request.nullSource || request.nullDestination ? PK_ErrFailed : PK_Success;
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
    const std::vector<uint8_t> untouched(layout.rows * layout.rowLength, before);
    destination.SetRows(untouched);
    const PK_Result result = CallIn(state, [&] {
        return PK_Convert(request.nullSource ? nullptr : source.Pixels(), source.Layout().rowBytes,
                          request.sourceFormat, request.nullDestination ? nullptr : destination.Pixels(),
                          layout.rowBytes, request.destinationFormat, request.size.width, request.size.height,
                          request.quality);
    });
    CheckIsNamed(result);
    const std::optional<PK_Result> expected = ExpectedResult(request);
    Check(!expected || result == *expected, "the arguments decide the result");
    Check(destination.IsPaddingIntact(), "bytes outside the rows stay");
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
    const RowsLayout sourceLayout = DrawLayout(stream, request.sourceFormat, request.size);
    const auto drawDestination = [&] {
        if (request.sourceFormat == request.destinationFormat && (MustShareLayout(request) || stream.Bool()))
            return sourceLayout;
        return DrawLayout(stream, request.destinationFormat, request.size);
    };
    const RowsLayout firstLayout = drawDestination();
    const RowsLayout secondLayout = drawDestination();
    if (!IsAffordable(sourceLayout) || !IsAffordable(firstLayout) || !IsAffordable(secondLayout)) return;
    SetCall(WordsOfCall(request, sourceLayout, firstLayout));

    ImageMemory source(sourceLayout, stream);
    std::vector<uint8_t> content(sourceLayout.rows * sourceLayout.rowLength);
    stream.Fill(content.data(), content.size());
    source.SetRows(content);
    ImageMemory first(firstLayout, stream);
    ImageMemory second(secondLayout, stream);
    const bool isPlaceFree = !MustShareLayout(request) && !DependsOnPlace(request.destinationFormat);
    const Outcome once = Convert(request, state, source, first, 0x55);
    const Outcome again = Convert(request, state, source, isPlaceFree ? second : first, 0xaa);

    Check(once.result == again.result, "the same call has the same result");
    if (once.result == PK_Success)
        CheckSame(once.rows, again.rows, "every byte of the rows is written, and the same wherever they lie");
    CheckSame(content, source.Rows(), "the source stays");
    Check(source.IsPaddingIntact(), "what lies between the rows of the source stays");
}

const Family sFamily('c', "convert", FuzzConvert);

} // namespace
