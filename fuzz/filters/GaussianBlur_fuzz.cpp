// PK_GaussianBlur of any formats, sizes and sigmas.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/Input.h"
#include "support/Size.h"
#include "support/Switches.h"

#include "convert/RasterFormats.h"

#include <PixelKiln/GaussianBlur.h>

#include <optional>
#include <string>

namespace {

using namespace PKFuzz;

Size DrawSize(ByteStream& stream) {
    if (stream.OneIn(16)) return {stream.AnyI32(), stream.Between(-3, 0)};
    if (stream.OneIn(64)) return {stream.Between(900, 1100), 4}; // about where lines no longer fit the stack
    if (stream.OneIn(64)) return {4, stream.Between(900, 1100)};
    return {stream.Between(-1, 70), stream.Between(-1, 70)};
}

int32_t DrawLength(ByteStream& stream, int32_t source) {
    if (stream.OneIn(32)) return stream.AnyI32();
    return source < INT32_MAX - 20 ? source + stream.Between(-1, 20) : source;
}

double DrawSigma(ByteStream& stream) {
    if (stream.OneIn(8)) return stream.AnyDouble();
    return stream.Between(-10, 1000) / 10.0;
}

/// Destinations of many pixels by chance of their sizes are not made.
bool IsSmall(Size size) {
    constexpr int64_t kMany = 1 << 20;
    return !size.HasPixels() || int64_t{size.width} * size.height <= kMany;
}

bool CanBeBlurred(PK_PixelFormat format) {
    return PK::IsRasterFormat(format) && (format & 0x30) == 0 && (format & 0xc) != 0;
}

struct Request {
    Size from, to;
    PK_PixelFormat source, destination;
    double sigmaX, sigmaY;
    int32_t direction;

    bool IsNone() const { return !(sigmaX > 0) && !(sigmaY > 0); }
    bool BlursRows() const { return (direction == 1 || direction == 3) && sigmaX > 0; }
    bool BlursColumns() const { return (direction == 2 || direction == 3) && sigmaY > 0; }

    /// The result where the formats and sizes decide.
    std::optional<PK_Result> Refusal() const {
        if (from.width > to.width) return PK_ErrBadWidth;
        if (from.height > to.height) return PK_ErrBadHeight;
        if (!CanBeBlurred(source)) return PK_ErrBadSrcFormat;
        if (!CanBeBlurred(destination)) return PK_ErrBadDstFormat;
        if (((source & 0x1c0) == 0) != ((destination & 0x1c0) == 0)) return PK_ErrBadSrcFormat;
        if (from.width < 0 || from.height < 0 || to.height > kWidestRow) return PK_ErrFailed;
        return std::nullopt;
    }

    PK_Result Result(bool hasNullSource, bool hasNullDestination) const {
        if (const auto refusal = Refusal()) return *refusal;
        const PK_Result ofDestination = ResultOfPixels(to, hasNullDestination);
        if (ofDestination != PK_Success || !to.HasPixels()) return ofDestination;
        return ResultOfPixels(from, hasNullSource);
    }
};

/// Rows behind those of the source stay where rows alone are blurred.
void CheckRowsBehind(const Request& request, const SourceImage& image) {
    const size_t length = image.Layout().rowLength, first = static_cast<size_t>(request.from.height);
    const std::vector<uint8_t> rows = image.Rows();
    for (size_t i = first * length; i < rows.size(); ++i)
        Check(rows[i] == image.Content()[i], "rows behind those of the source stay");
}

void FuzzGaussianBlur(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    Request request = {};
    request.from = DrawSize(stream);
    request.to = {DrawLength(stream, request.from.width), DrawLength(stream, request.from.height)};
    if (!IsSmall(request.to)) return;
    request.source = DrawFormat(stream);
    request.destination = stream.Bool() ? request.source : DrawFormat(stream);
    request.sigmaX = DrawSigma(stream);
    request.sigmaY = DrawSigma(stream);
    request.direction = stream.BetweenOrAny(1, 3, 8);
    const bool repeatEdge = stream.Bool(), linear = stream.Bool();
    const int32_t quality = stream.BetweenOrAny(0, 5, 8);
    const Input source(stream, request.source, request.from), image(stream, request.destination, request.to);
    SetCall("PK_GaussianBlur of " + Words(request.source) + ", " + Words(request.from) + ", to " +
            Words(request.destination) + ", " + Words(request.to) + ", sigmas " +
            std::to_string(request.sigmaX) + " and " + std::to_string(request.sigmaY) + ", direction " +
            std::to_string(request.direction));

    const PK_Result result = CallIn(state, [&] {
        return PK_GaussianBlur(source.Pixels(), source.RowBytes(), request.from.width, request.from.height,
                               request.source, image.Pixels(), image.RowBytes(), request.to.width,
                               request.to.height, request.destination, request.sigmaX, request.sigmaY,
                               repeatEdge, linear, request.direction, quality);
    });
    CheckResult(request.Result(source.isNull, image.isNull), result);
    image.memory.CheckPadding();
    source.memory.CheckStays();
    if (result != PK_Success || !request.to.HasPixels()) {
        image.memory.CheckStays("a refused call writes nothing");
        return;
    }
    if (request.IsNone()) return;
    if (!request.from.HasPixels() || (!request.BlursRows() && !request.BlursColumns()))
        image.memory.CheckStays("without a direction nothing is written");
    else if (!request.BlursColumns())
        CheckRowsBehind(request, image.memory);
}

const Family sFamily('n', "gaussianblur", FuzzGaussianBlur);

} // namespace
