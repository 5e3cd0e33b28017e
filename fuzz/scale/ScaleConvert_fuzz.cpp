// Images made others of any size, format and field, from raster images, streams and planes.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/Input.h"
#include "support/Planes.h"
#include "support/Size.h"
#include "support/Switches.h"

#include "scale/ScaleArguments.h"
#include "scale/ScaleRoute.h"

#include <PixelKiln/ScaleConvert.h>

#include <algorithm>
#include <optional>
#include <string>

namespace {

using namespace PKFuzz;

Size DrawSize(ByteStream& stream) {
    if (stream.OneIn(32)) return {stream.AnyI32(), stream.Between(-3, 0)};
    if (stream.OneIn(32)) return {stream.Between(-3, 0), stream.AnyI32()};
    if (stream.OneIn(4)) return {stream.Between(1, 70), stream.Between(1, 70)};
    return {stream.Between(0, 40), stream.Between(0, 32)};
}

/// Often one of the ratios that have a way of their own.
Size DrawSourceSize(ByteStream& stream, Size to) {
    if (!to.HasPixels() || stream.Bool()) return DrawSize(stream);
    const int32_t height = stream.Between(1, 2) * to.height + (stream.OneIn(8) ? 1 : 0);
    return {stream.Between(1, 2) * to.width, height};
}

PK_PixelFormat DrawPlanarFormat(ByteStream& stream) {
    constexpr uint32_t kBits[] = {0x831, 0x31, 0xa31, 0x231};
    return static_cast<uint32_t>(stream.Between(9, 12)) << PK::kStreamShift | kBits[stream.Below(4)];
}

struct Request {
    explicit Request(ByteStream& stream)
        : isPlanar(stream.OneIn(4)), to(DrawSize(stream)), from(DrawSourceSize(stream, to)),
          source(isPlanar && !stream.OneIn(16) ? DrawPlanarFormat(stream) : DrawFormat(stream)),
          destination(stream.OneIn(8) ? source : DrawFormat(stream)),
          sourceField(stream.BetweenOrAny(0, 2, 16)), destinationField(stream.BetweenOrAny(0, 2, 16)),
          renderField(isPlanar || stream.Bool() ? 0 : stream.BetweenOrAny(0, 2, 16)),
          quality(stream.BetweenOrAny(0, 5, 16)) {}

    PK::ScaleCall Call() const {
        return {{source, from.width, from.height, sourceField},
                {destination, to.width, to.height, destinationField},
                renderField,
                quality};
    }

    std::optional<PK_Result> ResultOfSizes() const {
        const bool isPossible = std::min({from.width, from.height, to.width, to.height}) >= 0 &&
                                std::max(from.width, to.width) <= kWidestRow;
        if (!isPossible) return PK_ErrFailed;
        if (!from.HasPixels() || !to.HasPixels()) return PK_Success;
        return std::nullopt;
    }

    /// The result where arguments alone decide, and nothing is written.
    std::optional<PK_Result> Answer(bool hasNullSource, bool hasNullDestination) const {
        if (hasNullSource) return PK_ErrNullSource;
        if (hasNullDestination) return PK_ErrNullDestination;
        if (PK::IsConversionAlone(Call())) return std::nullopt;
        if (!PK::IsScalable(source)) return PK_ErrBadSrcFormat;
        if (!PK::IsScalable(destination)) return PK_ErrBadDstFormat;
        return ResultOfSizes();
    }

    std::optional<PK_Result> AnswerOfPlanes(bool hasNullPlane, bool hasNullDestination) const {
        if (!PK::Is420Planar(source)) return PK_ErrBadSrcFormat;
        if (PK::Is420Planar(destination) || !PK::IsScalable(destination)) return PK_ErrBadDstFormat;
        if (const auto result = ResultOfSizes()) return result;
        if (hasNullPlane) return PK_ErrFailed;
        if (hasNullDestination) return PK_ErrNullDestination;
        return std::nullopt;
    }

    bool isPlanar;
    Size to, from;
    PK_PixelFormat source, destination;
    int32_t sourceField, destinationField, renderField, quality;
};

std::string WordsOf(const Request& request) {
    const auto image = [](PK_PixelFormat format, Size size, int32_t field) {
        return Words(format) + ", " + Words(size) + ", field " + std::to_string(field);
    };
    return (request.isPlanar ? "PK_ScaleConvertPlanar of " : "PK_ScaleConvertOneField of ") +
           image(request.source, request.from, request.sourceField) + " to " +
           image(request.destination, request.to, request.destinationField) + ", rendered field " +
           std::to_string(request.renderField) + ", quality " + std::to_string(request.quality);
}

/// A stream is one block, and of one that is neither DV nor planar 4:2:0 row bytes tell the length.
RowsLayout DrawImage(ByteStream& stream, PK_PixelFormat format, Size size) {
    if (!PK::IsStream(format))
        return PK::IsRasterFormat(format) ? DrawRaster(stream, format, size) : RowsLayout{};
    if (PK::StreamKind(format) > PK::kStreamLastDV && !PK::Is420Planar(format)) {
        const int32_t bytes = stream.Between(0, 300);
        return {static_cast<size_t>(bytes), 1, bytes};
    }
    const int64_t bytes = PK_PixelFormatSize(format, std::max(size.width, 0), std::max(size.height, 0));
    return {static_cast<size_t>(size.width < 0 || size.height < 0 ? 0 : bytes), 1, stream.AnyI32()};
}

constexpr int64_t kLargestBlock = int64_t{4} << 20;

/// Whether there can be memory for what a size that has no pixels is told with.
bool IsAffordable(PK_PixelFormat format, Size size) {
    return !PK::Is420Planar(format) || (std::max(size.width, 0) < 4096 && std::max(size.height, 0) < 4096) ||
           PK_PixelFormatSize(format, std::max(size.width, 0), std::max(size.height, 0)) <= kLargestBlock;
}

void CheckOutcome(const std::optional<PK_Result>& answer, PK_Result result, const Input& destination) {
    destination.memory.CheckPadding();
    CheckIsNamed(result);
    if (!answer) return;
    CheckResult(*answer, result);
    CheckSame(destination.memory.Content(), destination.memory.Rows(), "nothing is written");
}

void ScaleImages(ByteStream& stream, const Request& request, uint32_t state) {
    const Input source(stream, request.source, DrawImage(stream, request.source, request.from));
    const Input destination(stream, request.destination, DrawImage(stream, request.destination, request.to));
    const PK_Result result = CallIn(state, [&] {
        return PK_ScaleConvertOneField(source.Pixels(), source.RowBytes(), request.from.width,
                                       request.from.height, request.source, request.sourceField,
                                       destination.Pixels(), destination.RowBytes(), request.to.width,
                                       request.to.height, request.destination, request.destinationField,
                                       request.quality, request.renderField);
    });
    source.memory.CheckStays();
    CheckOutcome(request.Answer(source.isNull, destination.isNull), result, destination);
}

void ScalePlanes(ByteStream& stream, const Request& request, uint32_t state) {
    const bool hasPixels = request.from.HasPixels();
    const auto width = static_cast<size_t>(hasPixels ? request.from.width : 0);
    const auto height = static_cast<size_t>(hasPixels ? request.from.height : 0);
    const RowsLayout extents[3] = {{width, height}, {width / 2, height / 2}, {width / 2, height / 2}};
    const Planes source(extents, stream);
    const Input destination(stream, request.destination, DrawImage(stream, request.destination, request.to));
    const PK_Result result = CallIn(state, [&] {
        return PK_ScaleConvertPlanar(source.sources, source.rowBytes, request.from.width, request.from.height,
                                     request.source, request.sourceField, destination.Pixels(),
                                     destination.RowBytes(), request.to.width, request.to.height,
                                     request.destination, request.destinationField, request.quality);
    });
    source.CheckStay();
    CheckOutcome(request.AnswerOfPlanes(source.hasNull, destination.isNull), result, destination);
}

void FuzzScaleConvert(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream);
    const Request request(stream);
    if (!IsAffordable(request.source, request.from) || !IsAffordable(request.destination, request.to)) return;
    SetCall(WordsOf(request));
    if (request.isPlanar)
        ScalePlanes(stream, request, state);
    else
        ScaleImages(stream, request, state);
}

const Family sFamily('S', "scaleconvert", FuzzScaleConvert);

} // namespace
