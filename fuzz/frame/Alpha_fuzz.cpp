// The three operations on alpha, on images laid out in any way: colour stays or is copied, and only alpha
// differs.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/ImageMemory.h"
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
    int32_t width, height;
    float alpha;
    bool isOpaque, isInPlace, isNull;
};

Request DrawRequest(ByteStream& stream) {
    Request request{};
    request.operation = static_cast<Operation>(stream.Below(3));
    request.format = DrawFormat(stream);
    request.width = stream.OneIn(16) ? -stream.Between(0, INT32_MAX - 1) : stream.Between(0, 200);
    request.height = stream.OneIn(16) ? -stream.Between(0, INT32_MAX - 1) : stream.Between(0, 6);
    stream.Fill(reinterpret_cast<uint8_t*>(&request.alpha), sizeof request.alpha);
    request.isOpaque = stream.Bool();
    request.isInPlace = stream.Bool();
    request.isNull = stream.OneIn(32);
    return request;
}

std::string WordsOfCall(const Request& request, const RowsLayout& source, const RowsLayout& destination) {
    return "alpha operation " + std::to_string(static_cast<uint32_t>(request.operation)) + " on " +
           Words(request.format) + ", " + std::to_string(request.width) + " x " +
           std::to_string(request.height) + ", row bytes " + std::to_string(source.rowBytes) + " to " +
           std::to_string(destination.rowBytes) + (request.isInPlace ? ", in place" : "") +
           (request.isNull ? ", null" : "");
}

RowsLayout DrawLayout(ByteStream& stream, const Request& request) {
    if (request.width < 1 || request.height < 1) return {0, 0, stream.AnyI32()};
    const auto rowLength = static_cast<size_t>(PK::BytesPerPixel(request.format) * request.width);
    const auto rows = static_cast<size_t>(request.height);
    return {rowLength, rows, DrawRowBytes(stream, rowLength, rows, static_cast<int32_t>(rowLength) + 64)};
}

PK_Result Call(const Request& request, const ImageMemory& source, const ImageMemory& destination) {
    void* to = request.isNull ? nullptr : destination.Pixels();
    const int32_t fromStep = source.Layout().rowBytes, toStep = destination.Layout().rowBytes;
    switch (request.operation) {
    case Operation::Set:
        return PK_SetAlphaChannel(request.width, request.height, to, toStep, request.format,
                                  request.isOpaque);
    case Operation::Invert:
        return PK_InvertAlpha(source.Pixels(), fromStep, to, toStep, request.format, request.width,
                              request.height);
    case Operation::Copy:
        break;
    }
    return PK_CopyAndSetAlpha(source.Pixels(), fromStep, to, toStep, request.format, request.width,
                              request.height, request.alpha);
}

/// The rows with zeros in the place of alpha.
std::vector<uint8_t> ColourOf(const Request& request, std::vector<uint8_t> rows) {
    const auto pixel = static_cast<size_t>(PK::BytesPerPixel(request.format));
    const size_t sample = pixel / 4;
    const size_t alpha = (request.format & PK::kOrderMask) == PK::kOrderARGB ? 0 : 3 * sample;
    for (size_t at = alpha; at < rows.size(); at += pixel) std::memset(rows.data() + at, 0, sample);
    return rows;
}

std::vector<uint8_t> FillRows(ImageMemory& image, ByteStream& stream) {
    std::vector<uint8_t> content(image.Layout().rows * image.Layout().rowLength);
    stream.Fill(content.data(), content.size());
    image.SetRows(content);
    return content;
}

void FuzzAlpha(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    const Request request = DrawRequest(stream);
    const RowsLayout sourceLayout = DrawLayout(stream, request), layout = DrawLayout(stream, request);
    SetCall(WordsOfCall(request, sourceLayout, layout));

    ImageMemory other(sourceLayout, stream), image(layout, stream);
    const std::vector<uint8_t> otherContent = FillRows(other, stream);
    const std::vector<uint8_t> before = FillRows(image, stream);
    ImageMemory& source = request.isInPlace ? image : other;
    const PK_Result result = CallIn(state, [&] { return Call(request, source, image); });
    CheckIsNamed(result);
    Check(image.IsPaddingIntact() && other.IsPaddingIntact(), "bytes outside the rows stay");
    CheckSame(otherContent, other.Rows(), "another source stays");
    if (result != PK_Success || before.empty()) {
        CheckSame(before, image.Rows(), "a refused call writes nothing");
        return;
    }
    Check(!request.isNull, "a null pointer is refused");
    const bool copies = request.operation == Operation::Copy && !request.isInPlace;
    CheckSame(ColourOf(request, copies ? otherContent : before), ColourOf(request, image.Rows()),
              "colour is copied or stays");
}

const Family sFamily('A', "alpha", FuzzAlpha);

} // namespace
