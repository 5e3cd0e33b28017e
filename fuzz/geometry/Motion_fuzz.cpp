// Images placed in others by any numbers, from sources that end where their crops do.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/Input.h"
#include "support/Size.h"
#include "support/Switches.h"

#include "convert/RasterFormats.h"
#include "frame/PixelFormat.h"
#include "geometry/MotionFields.h"

#include <PixelKiln/Motion.h>

#include <cmath>
#include <cstring>
#include <limits>
#include <optional>
#include <string>
#include <vector>

namespace {

using namespace PKFuzz;

constexpr float kLeast = 8e-6f; // opacity and scale that draw
constexpr int32_t kBandRows = 32;

Size DrawSize(ByteStream& stream) {
    if (stream.OneIn(32)) return {stream.AnyI32(), stream.Between(-3, 0)};
    if (stream.OneIn(32)) return {stream.Between(-3, 0), stream.AnyI32()};
    if (stream.OneIn(64)) return {stream.Between(6400, 6600), 2}; // about where rows no longer fit the stack
    if (stream.OneIn(4)) return {stream.Between(1, 70), stream.Between(1, 70)};
    return {stream.Between(1, 40), stream.Between(1, kBandRows)};
}

float DrawFraction(ByteStream& stream) {
    if (stream.OneIn(32)) return stream.Bool() ? stream.AnyFloat() : static_cast<float>(stream.AnyI32());
    return static_cast<float>(stream.Between(0, 255)) / (stream.OneIn(4) ? 200.0f : 255.0f);
}

float DrawScale(ByteStream& stream) {
    switch (stream.Below(32)) {
    case 31:
        return stream.AnyFloat();
    case 30:
        return static_cast<float>(stream.Between(-1, 100)) * 1e-6f;
    case 29:
        return static_cast<float>(stream.Between(1, 255));
    default:
        return stream.OneIn(4) ? 1 : static_cast<float>(stream.Between(1, 255)) / 64;
    }
}

double DrawRotation(ByteStream& stream) {
    if (stream.Bool()) return 0;
    if (stream.OneIn(4)) return stream.Bool() ? stream.AnyDouble() : stream.AnyI32();
    return stream.OneIn(4) ? 90 * stream.Between(-5, 5) : stream.Between(-1800, 1800) / 10.0;
}

double DrawSoftness(ByteStream& stream) {
    if (stream.OneIn(32)) return stream.AnyDouble();
    return stream.Bool() ? 0 : stream.Between(stream.OneIn(16) ? -9 : 0, 100) / 100.0;
}

float DrawOpacity(ByteStream& stream) {
    if (stream.OneIn(32)) return stream.AnyFloat();
    return stream.Bool() ? 1 : static_cast<float>(stream.Below(256)) / 255;
}

PK_PixelFormat DrawSourceFormat(ByteStream& stream, int32_t quality) {
    if (quality == 5 && stream.Bool()) return PK_PixelFormat_BGRP_4444_32f_Linear;
    return stream.OneIn(8) ? DrawFormat(stream) : PK::kRasterFormats[stream.Below(24)]; // of four channels
}

std::optional<PK_Rect> DrawCrop(ByteStream& stream, Size size) {
    if (stream.Bool()) return std::nullopt;
    if (stream.OneIn(32) || !size.HasPixels())
        return PK_Rect{stream.BetweenOrAny(-1, 9, 8), stream.BetweenOrAny(-1, 9, 8),
                       stream.BetweenOrAny(0, 70, 8), stream.BetweenOrAny(0, 70, 8)};
    const int32_t left = stream.Between(0, size.width - 1), top = stream.Between(0, size.height - 1);
    return PK_Rect{left, top, stream.Between(left + 1, size.width), stream.Between(top + 1, size.height)};
}

struct Request {
    explicit Request(ByteStream& stream)
        : from(DrawSize(stream)), to(stream.OneIn(4) ? from : DrawSize(stream)),
          quality(stream.BetweenOrAny(1, 5, 16)), source(DrawSourceFormat(stream, quality)),
          destination(stream.Bool() ? DrawRasterFormat(stream) : DrawFormat(stream)),
          sourceField(stream.BetweenOrAny(0, 2, 16)), destinationField(stream.BetweenOrAny(0, 2, 16)),
          renderField(stream.BetweenOrAny(0, 2, 16)), crop(DrawCrop(stream, from)),
          aspectNum(static_cast<uint32_t>(stream.BetweenOrAny(0, 16, 8))),
          aspectDen(static_cast<uint32_t>(stream.BetweenOrAny(0, 16, 8))), anchor{DrawFraction(stream),
                                                                                  DrawFraction(stream)},
          position(stream.OneIn(4) ? anchor : PK_Point{DrawFraction(stream), DrawFraction(stream)}),
          scale{DrawScale(stream), DrawScale(stream)}, rotation(DrawRotation(stream)),
          opacity(DrawOpacity(stream)), composite(stream.Bool()), softness(DrawSoftness(stream)),
          smoothEdges(stream.Bool()), inLinear(stream.Bool()) {
        if (stream.OneIn(4)) mode = stream.BetweenOrAny(0, PK_BlendMode_Divide, 32);
    }

    bool HasMode() const { return !mode || (*mode >= 0 && *mode <= PK_BlendMode_Divide); }

    bool IsSourceTaken() const {
        if (quality == 5 && (scale.x != 1 || scale.y != 1))
            return source == PK_PixelFormat_BGRP_4444_32f_Linear;
        return PK::IsRasterFormat(source) && PK::IsPacked4444(source);
    }

    bool IsCropInside() const {
        return crop->left >= 0 && crop->left < crop->right && crop->right <= from.width && crop->top >= 0 &&
               crop->top < crop->bottom && crop->bottom <= from.height;
    }

    /// The result where arguments alone decide, and nothing is written.
    std::optional<PK_Result> Answer(bool hasNullSource, bool hasNullDestination) const {
        if (crop && !IsCropInside()) return PK_ErrBadRect;
        if (!IsSourceTaken()) return PK_ErrBadSrcFormat;
        if (!PK::IsRasterFormat(destination)) return PK_ErrBadDstFormat;
        if (softness < 0 || softness > 1) return PK_ErrBadMotionParameter;
        if (opacity < kLeast || scale.x < kLeast || scale.y < kLeast) return PK_Success;
        const PK_Result ofSource = ResultOfPixels(from, hasNullSource);
        if (ofSource != PK_Success || !from.HasPixels()) return ofSource;
        const PK_Result ofDestination = ResultOfPixels(to, hasNullDestination);
        if (ofDestination != PK_Success || !to.HasPixels()) return ofDestination;
        return std::nullopt;
    }

    /// A source that may be copied as it is, or is made progressive, is read outside its crop too.
    bool ReadsCropAlone() const {
        const bool mayBeCopied =
            from.width == to.width && from.height == to.height && sourceField == destinationField;
        return crop && from.HasPixels() && IsCropInside() && IsSourceTaken() && !mayBeCopied &&
               !(quality == 5 && PK::IsInterlaced(sourceField));
    }

    /// A field without rows is blurred into an image without memory.
    bool MayLackMemory() const {
        const int32_t top = crop ? crop->top : 0, bottom = crop ? crop->bottom : from.height;
        return quality > 2 && PK::IsInterlaced(sourceField) && top / 2 == bottom / 2;
    }

    Size from, to;
    int32_t quality;
    PK_PixelFormat source, destination;
    int32_t sourceField, destinationField, renderField;
    std::optional<PK_Rect> crop;
    uint32_t aspectNum, aspectDen;
    PK_Point anchor, position, scale;
    double rotation;
    float opacity;
    bool composite;
    double softness;
    bool smoothEdges, inLinear;
    std::optional<PK_BlendMode> mode;
};

/// The source, of which there may be no more memory than for its crop.
struct Source {
    Source(ByteStream& stream, const Request& request)
        : image(stream, request.source, LayoutOf(stream, request)), first(image.Pixels()) {
        if (image.isNull || !request.ReadsCropAlone()) return;
        const PK_Rect& crop = *request.crop; // its last row is the first in memory
        const int64_t before = int64_t{request.from.height - crop.bottom} * image.RowBytes() +
                               int64_t{crop.left} * PK_PixelFormatPackedRowBytes(request.source, 1);
        first =
            reinterpret_cast<uint8_t*>(reinterpret_cast<uintptr_t>(first) - static_cast<uintptr_t>(before));
    }

    static RowsLayout LayoutOf(ByteStream& stream, const Request& request) {
        RowsLayout layout = DrawRaster(stream, request.source, request.from);
        if (!request.ReadsCropAlone()) return layout;
        const PK_Rect& crop = *request.crop;
        // Of fields half the crop is drawn, from half its top.
        const int32_t top = PK::IsInterlaced(request.sourceField) ? crop.top / 2 * 2 : crop.top;
        layout.rowLength =
            static_cast<size_t>(PK_PixelFormatPackedRowBytes(request.source, crop.right - crop.left));
        layout.rows = static_cast<size_t>(crop.bottom - top);
        return layout;
    }

    Input image;
    uint8_t* first; ///< row of the source, which need not lie in the memory
};

std::string WordsOf(PK_Point point) {
    return "{" + std::to_string(point.x) + ", " + std::to_string(point.y) + "}";
}

std::string WordsOf(const Request& request) {
    const auto number = [](const char* name, auto value) {
        return std::string(", ") + name + " " + std::to_string(value);
    };
    std::string words = (request.mode ? "PK_MotionWithBlendMode of " : "PK_Motion of ") +
                        Words(request.source) + ", " + Words(request.from) +
                        number("field", request.sourceField);
    if (const auto& crop = request.crop)
        words += ", crop {" + std::to_string(crop->left) + ", " + std::to_string(crop->top) + ", " +
                 std::to_string(crop->right) + ", " + std::to_string(crop->bottom) + "}";
    words += ", to " + Words(request.destination) + ", " + Words(request.to) +
             number("field", request.destinationField) + number("aspect", request.aspectNum) + "/" +
             std::to_string(request.aspectDen) + ", position " + WordsOf(request.position) + ", anchor " +
             WordsOf(request.anchor) + ", scale " + WordsOf(request.scale) +
             number("rotation", request.rotation) + number("opacity", request.opacity) +
             number("composite", request.composite) + number("softness", request.softness) +
             number("smoothEdges", request.smoothEdges) + number("renderField", request.renderField) +
             number("quality", request.quality) + number("inLinear", request.inLinear);
    return request.mode ? words + number("mode", *request.mode) : words;
}

PK_Result Place(const Request& request, uint32_t state, const Source& source, const Input& image) {
    const PK_Rect* const crop = request.crop ? &*request.crop : nullptr;
    return CallIn(state, [&] {
        if (request.mode)
            return PK_MotionWithBlendMode(
                source.first, source.image.RowBytes(), request.from.width, request.from.height,
                request.source, request.sourceField, crop, image.Pixels(), image.RowBytes(), request.to.width,
                request.to.height, request.destination, request.destinationField, request.aspectNum,
                request.aspectDen, request.position, request.anchor, request.scale, request.rotation,
                request.opacity, request.softness, request.smoothEdges, request.renderField, *request.mode,
                request.quality, request.inLinear);
        return PK_Motion(source.first, source.image.RowBytes(), request.from.width, request.from.height,
                         request.source, request.sourceField, crop, image.Pixels(), image.RowBytes(),
                         request.to.width, request.to.height, request.destination, request.destinationField,
                         request.aspectNum, request.aspectDen, request.position, request.anchor,
                         request.scale, request.rotation, request.opacity, request.composite,
                         request.softness, request.smoothEdges, request.renderField, request.quality,
                         request.inLinear);
    });
}

/// With one pattern for all that is not a number: which of two operands hands on its bits is the compiler's to choose.
std::vector<uint8_t> RowsOf(const Input& image) {
    std::vector<uint8_t> rows = image.memory.Rows();
    if (PK::DepthOf(image.format) != PK::kDepth32f) return rows;
    constexpr float kNaN = std::numeric_limits<float>::quiet_NaN();
    for (size_t i = 0; i + sizeof(float) <= rows.size(); i += sizeof(float)) {
        float sample;
        std::memcpy(&sample, rows.data() + i, sizeof sample);
        if (std::isnan(sample)) std::memcpy(rows.data() + i, &kNaN, sizeof kNaN);
    }
    return rows;
}

/// Without the instruction sets between which no rule differs: compositing, words and shared chroma have rules that go by
/// those up to SSSE3.
Switches WithoutCapabilities(Switches switches, const Request& request) {
    const bool hasRules = request.mode || request.composite ||
                          PK::DepthOf(request.destination) == PK::kDepth15u || PK::Is422(request.destination);
    for (uint32_t which = hasRules ? kSwitchSSE4 : 2; which <= kSwitchAVX2; ++which) switches[which] = false;
    return switches;
}

void FuzzMotion(ByteStream& stream) {
    const Switches switches = DrawSwitches(stream);
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    const Request request(stream);
    const Source source(stream, request);
    Input image(stream, request.destination, request.to);
    SetCall(WordsOf(request));

    SetSwitches(switches);
    const PK_Result result = Place(request, state, source, image);
    image.memory.CheckPadding();
    source.image.memory.CheckStays();
    if (const auto answer = request.Answer(source.image.isNull, image.isNull)) {
        CheckResult(*answer, result);
        image.memory.CheckStays("a call that is answered by its arguments writes nothing");
        return;
    }
    if (result == PK_ErrNotSupported)
        Check(!request.HasMode(), "every mode is drawn");
    else
        Check(result == PK_Success || (result == PK_ErrOutOfMemory && request.MayLackMemory()),
              "every source is drawn or left out");
    if (request.mode == PK_BlendMode_Dissolve && request.to.height > kBandRows)
        return; // draws from the C runtime on several threads

    const std::vector<uint8_t> drawn = RowsOf(image);
    image.memory.SetRows(image.memory.Content());
    SetSwitches(WithoutCapabilities(switches, request));
    CheckResult(result, Place(request, state, source, image));
    CheckSame(RowsOf(image), drawn, "capabilities do not change a pixel");
}

const Family sFamily('p', "motion", FuzzMotion);

} // namespace
