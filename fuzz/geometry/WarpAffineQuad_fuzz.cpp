// PK_WarpAffineQuad of any quadrilateral, sane or not, between rectangles that end where their memory does.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/ImageMemory.h"
#include "support/Switches.h"

#include <PixelKiln/QuadWarp.h>

#include <string>
#include <vector>

namespace {

using namespace PKFuzz;

/// A rectangle of an image, and memory for just this rectangle.
struct Part {
    explicit Part(ByteStream& stream)
        : rect{stream.Between(-9, 9), stream.Between(-9, 9), 0, 0},
          width(stream.Between(1, stream.OneIn(8) ? 300 : 40)), height(stream.Between(1, 24)),
          stride(width + (stream.Bool() ? stream.Between(0, 9) : 0)),
          memory({size_t{4} * static_cast<size_t>(width), static_cast<size_t>(height), 4 * stride}, stream) {
        rect.right = rect.left + width;
        rect.bottom = rect.top + height;
        // What exceeds whole pixels does not count, nor does the sign.
        rowBytes = 4 * stride + stream.Between(0, 3);
        if (stream.Bool()) rowBytes = -rowBytes;
        content = memory.DrawRows(stream);
    }

    /// Pixel (0, 0), which need not lie in the memory.
    uint8_t* Origin() const {
        const int64_t offset = 4 * (int64_t{rect.top} * stride + rect.left);
        return reinterpret_cast<uint8_t*>(reinterpret_cast<uintptr_t>(memory.Pixels()) -
                                          static_cast<uintptr_t>(offset));
    }

    PK_Rect rect;
    int32_t width, height, stride, rowBytes = 0;
    ImageMemory memory;
    std::vector<uint8_t> content;
};

double DrawCoordinate(ByteStream& stream, int32_t low, int32_t high) {
    switch (stream.Below(32)) {
    case 31:
        return stream.AnyDouble();
    case 30:
        return stream.AnyFloat();
    case 29:
        return stream.AnyI32();
    case 28:
        return stream.Between(2 * low, 2 * high) / 2.0;
    default:
        return stream.Between(1000 * (low - 10), 1000 * (high + 10)) / 1000.0;
    }
}

void DrawQuad(ByteStream& stream, const PK_Rect& rect, double quad[8]) {
    for (int32_t i = 0; i < 8; i += 2) {
        quad[i] = DrawCoordinate(stream, rect.left, rect.right);
        quad[i + 1] = DrawCoordinate(stream, rect.top, rect.bottom);
    }
}

float DrawFeather(ByteStream& stream) {
    if (stream.Bool()) return 0;
    return stream.OneIn(8) ? stream.AnyFloat() : static_cast<float>(stream.Between(-10, 300)) / 10;
}

PK_PixelFormat DrawWarpFormat(ByteStream& stream) {
    if (stream.OneIn(8)) return DrawFormat(stream);
    return stream.Bool() ? PK_PixelFormat_BGRA_4444_8u : PK_PixelFormat_VUYA_4444_8u;
}

struct Request {
    Request(ByteStream& stream, const PK_Rect& source, const PK_Rect& destination)
        : sourceRect(source), destinationRect(destination), quality(stream.BetweenOrAny(0, 5, 8)),
          opacity(stream.Bool() ? 255 : stream.BetweenOrAny(0, 255, 8)), blend(stream.Bool()),
          keepSourceAlpha(stream.Bool()), ignoreFields(stream.Bool()), featherOver(stream.OneIn(3)),
          format(DrawWarpFormat(stream)), field(stream.BetweenOrAny(0, 2, 16)), feather(DrawFeather(stream)) {
        DrawQuad(stream, source, sourceQuad);
        DrawQuad(stream, destination, destinationQuad);
        if (stream.OneIn(32)) sourceRect.right = sourceRect.left - stream.Between(0, 3);
        if (stream.OneIn(32)) destinationRect.bottom = destinationRect.top - stream.Between(0, 3);
    }

    PK_Rect sourceRect, destinationRect;
    double sourceQuad[8], destinationQuad[8];
    int32_t quality, opacity;
    bool blend, keepSourceAlpha, ignoreFields, featherOver;
    PK_PixelFormat format;
    int32_t field;
    float feather;
};

std::string WordsOfQuad(const PK_Rect& rect, const double quad[8]) {
    std::string words = "{" + std::to_string(rect.left) + ", " + std::to_string(rect.top) + ", " +
                        std::to_string(rect.right) + ", " + std::to_string(rect.bottom) + "} (";
    for (int32_t i = 0; i < 8; ++i) words += (i == 0 ? "" : ", ") + std::to_string(quad[i]);
    return words + ")";
}

std::string WordsOfCall(const Request& request) {
    return "PK_WarpAffineQuad of " + WordsOfQuad(request.sourceRect, request.sourceQuad) + " to " +
           WordsOfQuad(request.destinationRect, request.destinationQuad) + ", quality " +
           std::to_string(request.quality) + ", opacity " + std::to_string(request.opacity) + ", blend " +
           std::to_string(request.blend) + ", keepSourceAlpha " + std::to_string(request.keepSourceAlpha) +
           ", " + Words(request.format) + ", field " + std::to_string(request.field) + ", ignoreFields " +
           std::to_string(request.ignoreFields) + ", featherOver " + std::to_string(request.featherOver) +
           ", feather " + std::to_string(request.feather);
}

std::vector<uint8_t> Warp(const Request& request, uint32_t state, const Part& source, Part& destination) {
    const PK_Result result = CallIn(state, [&] {
        return PK_WarpAffineQuad(nullptr, nullptr, source.Origin(), source.rowBytes, &request.sourceRect,
                                 request.sourceQuad, destination.Origin(), destination.rowBytes,
                                 &request.destinationRect, request.destinationQuad, request.quality,
                                 request.opacity, request.blend, request.keepSourceAlpha, request.format,
                                 request.field, request.ignoreFields, request.featherOver, request.feather);
    });
    Check(result == PK_Success, "every quadrilateral is drawn or left out");
    destination.memory.CheckPadding();
    return destination.memory.Rows();
}

void FuzzWarp(ByteStream& stream) {
    const Switches switches = DrawSwitches(stream);
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    const Part source(stream);
    Part destination(stream);
    const Request request(stream, source.rect, destination.rect);
    SetCall(WordsOfCall(request));

    SetSwitches(switches);
    const std::vector<uint8_t> drawn = Warp(request, state, source, destination);
    destination.memory.SetRows(destination.content);
    SetSwitches(Switches{});
    CheckSame(Warp(request, state, source, destination), drawn, "capabilities do not change a pixel");
    CheckSame(source.content, source.memory.Rows(), "the source stays");
    if (request.field < 0 || request.field > 2)
        CheckSame(destination.content, drawn, "of a field that there is not no row is written");
}

const Family sFamily('w', "warp", FuzzWarp);

} // namespace
