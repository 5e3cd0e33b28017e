// The three operations on alpha, on images laid out in any way: colour stays or is copied, and only alpha
// differs.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/ImageMemory.h"
#include "support/Size.h"
#include "support/Switches.h"

#include "frame/PixelFormat.h"

#include <PixelKiln/Utilities.h>

#include <cstring>
#include <string>
#include <vector>

namespace {

using namespace PKFuzz;

enum class Operation : uint32_t { Set, Invert, Copy };

struct Request {
    Operation operation;
    PK_PixelFormat format;
    Size size;
    float alpha;
    bool isOpaque, isInPlace, isNull;
};

Request DrawRequest(ByteStream& stream) {
    Request request{};
    request.operation = static_cast<Operation>(stream.Below(3));
    request.format = DrawFormat(stream);
    request.size.width = stream.OneIn(16) ? -stream.Between(0, INT32_MAX - 1) : stream.Between(0, 200);
    request.size.height = stream.OneIn(16) ? -stream.Between(0, INT32_MAX - 1) : stream.Between(0, 6);
    stream.Fill(reinterpret_cast<uint8_t*>(&request.alpha), sizeof request.alpha);
    request.isOpaque = stream.Bool();
    request.isInPlace = stream.Bool();
    request.isNull = stream.OneIn(32);
    return request;
}

std::string WordsOfCall(const Request& request, const RowsLayout& source, const RowsLayout& destination) {
    return "alpha operation " + std::to_string(static_cast<uint32_t>(request.operation)) + " on " +
           Words(request.format) + ", " + Words(request.size) + ", row bytes " +
           std::to_string(source.rowBytes) + " to " + std::to_string(destination.rowBytes) +
           (request.isInPlace ? ", in place" : "") + (request.isNull ? ", null" : "");
}

RowsLayout DrawImage(ByteStream& stream, const Request& request) {
    const int64_t rowLength = int64_t{PK::BytesPerPixel(request.format)} * request.size.width;
    return DrawLayout(stream, rowLength, request.size);
}

PK_Result Call(const Request& request, const ImageMemory& source, const ImageMemory& destination) {
    void* to = request.isNull ? nullptr : destination.Pixels();
    const int32_t fromStep = source.RowBytes(), toStep = destination.RowBytes();
    const auto [width, height] = request.size;
    switch (request.operation) {
    case Operation::Set:
        return PK_SetAlphaChannel(width, height, to, toStep, request.format, request.isOpaque);
    case Operation::Invert:
        return PK_InvertAlpha(source.Pixels(), fromStep, to, toStep, request.format, width, height);
    case Operation::Copy:
        break;
    }
    return PK_CopyAndSetAlpha(source.Pixels(), fromStep, to, toStep, request.format, width, height,
                              request.alpha);
}

/// The rows with zeros in the place of alpha.
std::vector<uint8_t> ColourOf(const Request& request, std::vector<uint8_t> rows) {
    const auto pixel = static_cast<size_t>(PK::BytesPerPixel(request.format));
    const size_t sample = pixel / 4;
    const size_t alpha = (request.format & PK::kOrderMask) == PK::kOrderARGB ? 0 : 3 * sample;
    for (size_t at = alpha; at < rows.size(); at += pixel) std::memset(rows.data() + at, 0, sample);
    return rows;
}

void FuzzAlpha(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    const Request request = DrawRequest(stream);
    const RowsLayout sourceLayout = DrawImage(stream, request), layout = DrawImage(stream, request);
    SetCall(WordsOfCall(request, sourceLayout, layout));

    const SourceImage other(sourceLayout, stream), image(layout, stream);
    const SourceImage& source = request.isInPlace ? image : other;
    const PK_Result result = CallIn(state, [&] { return Call(request, source, image); });
    CheckIsNamed(result);
    image.CheckPadding();
    other.CheckStays();
    if (result != PK_Success || layout.Bytes() == 0) return image.CheckStays("a refused call writes nothing");
    Check(!request.isNull, "a null pointer is refused");
    const bool copies = request.operation == Operation::Copy && !request.isInPlace;
    CheckSame(ColourOf(request, (copies ? other : image).Content()), ColourOf(request, image.Rows()),
              "colour is copied or stays");
}

const Family sFamily('A', "alpha", FuzzAlpha);

} // namespace
