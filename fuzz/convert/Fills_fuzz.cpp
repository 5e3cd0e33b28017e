// Fills of any format at any size, into rows laid out in any way: what the result code promises, and that
// rows which hold nothing but one pixel come out.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/ImageMemory.h"
#include "support/Size.h"
#include "support/Switches.h"

#include "convert/RasterFormats.h"
#include "frame/PixelFormat.h"

#include <PixelKiln/Buffers.h>
#include <PixelKiln/Fills.h>

#include <algorithm>
#include <iterator>
#include <string>
#include <vector>

namespace {

using namespace PKFuzz;

constexpr size_t kLargestImage = size_t{8} << 20;

struct Request {
    uint32_t fill; // one of the named ones, or by colour
    PK_PixelFormat format;
    Size size;
    bool isNull;
    PK_PixelFormat pixelFormat;
    uint8_t pixel[16];
};

constexpr decltype(&PK_FillWithOpaqueBlack) kNamed[] = {
    PK_FillWithOpaqueBlack, PK_FillWithOpaqueWhite, PK_FillWithTransparentBlack, PK_FillWithTransparentWhite};
constexpr uint32_t kColour = std::size(kNamed);

Request DrawRequest(ByteStream& stream) {
    Request request{};
    request.fill = stream.Below(kColour + 2);
    request.format = DrawFormat(stream);
    request.size.width = stream.OneIn(16) ? stream.AnyI32() : stream.Between(0, stream.OneIn(8) ? 3000 : 90);
    request.size.height = stream.OneIn(16) ? stream.AnyI32() : stream.Between(0, stream.OneIn(8) ? 300 : 5);
    request.isNull = stream.OneIn(32);
    request.pixelFormat = DrawFormat(stream);
    stream.Fill(request.pixel, sizeof request.pixel);
    return request;
}

std::string WordsOfCall(const Request& request, int32_t rowBytes) {
    return "fill " + std::to_string(request.fill) + " of " + Words(request.format) + ", row bytes " +
           std::to_string(rowBytes) + ", " + Words(request.size) + ", pixel of " +
           Words(request.pixelFormat) + (request.isNull ? ", null buffer" : "");
}

/// A frame is filled whole, whatever the size.
bool IsDV25(PK_PixelFormat format) {
    return format == PK_PixelFormat_NTSCDV25 || format == PK_PixelFormat_PALDV25;
}

/// Memory for as much as a fill may touch; none where it may touch nothing.
RowsLayout DrawImage(ByteStream& stream, const Request& request) {
    if (IsDV25(request.format))
        return {static_cast<size_t>(PK_PixelFormatSize(request.format, 0, 0)), 1, stream.AnyI32()};
    if (!request.size.HasPixels()) return {0, 0, stream.AnyI32()};
    const auto [width, height] = request.size;
    if (PK::Is420Planar(request.format)) {
        const int64_t bytes = PK_PixelFormatSize(request.format, width, height);
        return {static_cast<size_t>(std::max<int64_t>(bytes, 0)), 1, stream.AnyI32()};
    }
    if (PK::IsStream(request.format)) return {0, 0, stream.AnyI32()};
    const auto rowLength = static_cast<size_t>(PK_PixelFormatPackedRowBytes(request.format, width));
    const auto rows = static_cast<size_t>(height);
    if (rowLength > kLargestImage || rows > kLargestImage) return {kLargestImage + 1, 1, 0};
    return DrawLayout(stream, rowLength, rows);
}

PK_Result Call(const Request& request, void* buffer, int32_t rowBytes) {
    if (request.fill < kColour)
        return kNamed[request.fill](buffer, rowBytes, request.size.width, request.size.height,
                                    request.format);
    return PK_FillWithColor(buffer, rowBytes, request.size.width, request.size.height, request.format,
                            request.pixel, request.pixelFormat);
}

/// Every unit of a row is the first one; the bytes of an incomplete pair stay.
void CheckRepeats(const Request& request, const std::vector<uint8_t>& rows, size_t rowLength,
                  uint8_t before) {
    const bool isPair = PK::Is422(request.format);
    const size_t depth = static_cast<size_t>(PK::BytesPerPixel(request.format));
    const size_t unit = isPair ? 2 * depth : depth;
    const size_t filled = static_cast<size_t>(isPair ? request.size.width / 2 : request.size.width) * unit;
    for (size_t row = 0; row < rows.size(); row += rowLength)
        for (size_t i = 0; i < rowLength; ++i)
            Check(rows[row + i] == (i < filled ? rows[i % unit] : before), "a row repeats one unit");
}

/// Formats whose rows consist of pixels or pairs, and which every fill that succeeds has filled.
bool IsOfUnits(PK_PixelFormat format) {
    return PK::IsRasterFormat(format) && !PK::IsV210(format) && format != PK_PixelFormat_RGB_444_10u;
}

void FuzzFills(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream);
    const Request request = DrawRequest(stream);
    const RowsLayout layout = DrawImage(stream, request);
    if (layout.rows != 0 && layout.Extent() > kLargestImage) return;
    SetCall(WordsOfCall(request, layout.rowBytes));

    ImageMemory image(layout, stream);
    const uint8_t before = stream.Byte();
    const std::vector<uint8_t> untouched(layout.Bytes(), before);
    image.SetRows(untouched);
    const PK_Result result = CallIn(
        state, [&] { return Call(request, request.isNull ? nullptr : image.Pixels(), layout.rowBytes); });
    CheckIsNamed(result);
    image.CheckPadding();
    const std::vector<uint8_t> rows = image.Rows();
    const bool isPossible = request.size.IsPossible() || IsDV25(request.format);
    if (!isPossible || request.isNull)
        CheckSame(untouched, rows, "what is impossible writes nothing");
    else if (result == PK_Success && IsOfUnits(request.format))
        CheckRepeats(request, rows, layout.rowLength, before);
    else if (result != PK_Success && !PK::IsV210(request.format))
        CheckSame(untouched, rows, "a refused fill writes nothing");
}

const Family sFamily('F', "fills", FuzzFills);

} // namespace
