// Fields rebuilt in place and beside, in any format and size.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/Input.h"
#include "support/Size.h"
#include "support/Switches.h"

#include "convert/RasterFormats.h"

#include <PixelKiln/Deinterlace.h>

#include <algorithm>
#include <string>

namespace {

using namespace PKFuzz;

Size DrawSize(ByteStream& stream) {
    if (stream.OneIn(16)) return {stream.AnyI32(), stream.Between(-3, 0)};
    if (stream.OneIn(64)) return {stream.Between(5450, 5470), 4}; // about where rows no longer fit the stack
    return {stream.Between(-1, 100), stream.Between(-1, 20)};
}

bool IsTaken(PK_PixelFormat format) {
    return PK::IsRasterFormat(format) && format != PK_PixelFormat_RGB_444_10u;
}

struct Request {
    Size size;
    int32_t field, quality;

    /// Whether a row is rebuilt, counted from the top.
    bool Rebuilds(size_t row) const {
        const bool evenRows = quality < 4 ? field != 0 : field == 1;
        const auto height = static_cast<size_t>(size.height);
        const bool isReached = !evenRows || row + 1 < height || height % 2 == 0;
        return height >= 2 && (row % 2 == 0) == evenRows && isReached;
    }
};

/// Rows of the kept field are as they were.
void CheckKept(const Request& request, const SourceImage& image, PK_PixelFormat format) {
    if (!request.size.HasPixels()) return;
    const std::vector<uint8_t> rows = image.Rows();
    const size_t length = image.Layout().rowLength, height = image.Layout().rows;
    for (size_t row = 0; row < height; ++row) {
        const size_t fromTop = PK_IsOriginBottomLeft(format) ? height - 1 - row : row;
        if (request.Rebuilds(fromTop)) continue;
        Check(std::equal(rows.begin() + static_cast<ptrdiff_t>(row * length),
                         rows.begin() + static_cast<ptrdiff_t>((row + 1) * length),
                         image.Content().begin() + static_cast<ptrdiff_t>(row * length)),
              "rows of the kept field stay");
    }
}

void FuzzDeinterlace(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    const Request request = {DrawSize(stream), stream.BetweenOrAny(0, 2, 8), stream.BetweenOrAny(0, 5, 8)};
    const Size size = request.size;
    const PK_PixelFormat format = DrawFormat(stream);
    const bool isInPlace = stream.Bool();
    const PK_PixelFormat from = isInPlace || stream.Bool() ? format : DrawFormat(stream);
    const SourceImage source(DrawRaster(stream, from, request.size), stream);
    const SourceImage image(DrawRaster(stream, format, request.size), stream);
    const bool isNull = stream.OneIn(64);
    uint8_t* const pixels = isNull ? nullptr : image.Pixels();
    SetCall("PK_Deinterlace" + std::string(isInPlace ? " of " : "Copy of " + Words(from) + " to ") +
            Words(format) + ", " + Words(request.size) + ", field " + std::to_string(request.field) +
            ", quality " + std::to_string(request.quality));

    const PK_Result result = CallIn(state, [&] {
        if (isInPlace)
            return PK_Deinterlace(pixels, image.RowBytes(), format, size.width, size.height, request.field,
                                  request.quality);
        return PK_DeinterlaceCopy(source.Pixels(), source.RowBytes(), from, pixels, image.RowBytes(), format,
                                  size.width, size.height, request.field, request.quality);
    });
    PK_Result expected = ResultOfPixels(request.size, isNull);
    if (!IsTaken(format)) expected = PK_ErrBadDstFormat;
    if (!IsTaken(from)) expected = PK_ErrBadSrcFormat;
    CheckResult(expected, result);
    image.CheckPadding();
    source.CheckStays();
    if (result == PK_Success)
        CheckKept(request, image, format);
    else
        image.CheckStays("a refused call writes nothing");
}

const Family sFamily('i', "deinterlace", FuzzDeinterlace);

} // namespace
