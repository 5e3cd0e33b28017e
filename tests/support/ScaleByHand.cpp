#include "support/ScaleByHand.h"

#include "convert/Planar420.h"
#include "frame/DebugSwitches.h"

#include <PixelKiln/Buffers.h>
#include <PixelKiln/Convert.h>
#include <PixelKiln/Fills.h>
#include <PixelKiln/Motion.h>
#include <PixelKiln/ScaleConvert.h>

#include <cstring>
#include <vector>

namespace PKTest {
namespace {

using PKReference::ScaleNumbers;
using PKReference::ScaleTelling;

/// A buffer with the row bytes of its format.
struct Buffer {
    Buffer(PK_PixelFormat format, int32_t width, int32_t height)
        : rowBytes(PK_PixelFormatRowBytes(format, width)),
          bytes(static_cast<size_t>(rowBytes) * static_cast<size_t>(height)) {}

    int32_t rowBytes;
    std::vector<uint8_t> bytes;
};

std::vector<uint8_t> HalvedRow(const ScaleTelling& told, const uint8_t* source, int32_t width) {
    std::vector<uint8_t> row;
    if (told.rowFunction == "HalveRowUYVY32f") {
        for (int32_t k = 0; k < width; ++k) {
            float uyvy[4];
            std::memcpy(uyvy, source + 16 * k, sizeof uyvy);
            const float pixel[4] = {uyvy[2], uyvy[0], uyvy[1], 1};
            const auto* bytes = reinterpret_cast<const uint8_t*>(pixel);
            row.insert(row.end(), bytes, bytes + sizeof pixel);
        }
        return row;
    }
    for (int32_t k = 0; k < width; ++k) {
        uint8_t u, y, v;
        if (told.rowFunction == "HalveRowV210") {
            const auto sample = [&](int32_t which) {
                uint32_t word;
                std::memcpy(&word, source + 16 * (k / 3) + which / 3 * 4, sizeof word);
                return static_cast<uint8_t>((word >> (10 * (which % 3)) & 0x3ff) >> 2);
            };
            const int32_t first = 4 * (k % 3);
            u = sample(first), y = sample(first + 1), v = sample(first + 2);
        } else if (told.rowFunction == "HalveRowUYVY8u") {
            u = source[4 * k], y = source[4 * k + 1], v = source[4 * k + 2];
        } else {
            y = source[4 * k], u = source[4 * k + 1], v = source[4 * k + 3];
        }
        for (const uint8_t sample : {v, u, y, uint8_t{255}}) row.push_back(sample);
    }
    return row;
}

PK_Result Halve(const ScaleNumbers& call, const ScaleTelling& told, const ScaleMemory& memory) {
    for (int32_t row = 0; row < call.dstHeight; ++row) {
        const int32_t from = told.firstRow + row * (told.secondRow - told.firstRow);
        const auto halved =
            HalvedRow(told, memory.source + int64_t{from} * memory.sourceRowBytes, call.dstWidth);
        const PK_Result result = PK_Convert(halved.data(), 0, told.rowFormat,
                                            memory.destination + int64_t{row} * memory.destinationRowBytes, 0,
                                            call.dstFormat, call.dstWidth, 1, call.quality);
        if (result != PK_Success) return result;
    }
    return PK_Success;
}

PK_Result Move(const ScaleNumbers& call, const ScaleTelling& told, const ScaleMemory& memory) {
    const uint8_t* source = memory.source;
    int32_t rowBytes = memory.sourceRowBytes, height = call.srcHeight, field = call.srcField;
    uint32_t format = call.srcFormat;
    Buffer converted(told.sourceBuffer == 0 ? format : told.sourceBuffer, call.srcWidth, height);
    if (told.sourceBuffer != 0) {
        if (const PK_Result result =
                PK_Convert(source, rowBytes, format, converted.bytes.data(), converted.rowBytes,
                           told.sourceBuffer, call.srcWidth, height, call.quality))
            return result;
        source = converted.bytes.data();
        rowBytes = converted.rowBytes;
        format = told.sourceBuffer;
    }
    if (told.takesField) {
        source += int64_t{told.rowsSkipped} * rowBytes;
        rowBytes *= 2;
        height /= 2;
        field = 0;
    }
    const auto motion = [&](void* destination, int32_t step, uint32_t to) {
        return PK_Motion(source, rowBytes, call.srcWidth, height, format, field, nullptr, destination, step,
                         call.dstWidth, call.dstHeight, to, call.dstField, 1, 1, {0.5f, 0.5f}, {0.5f, 0.5f},
                         {told.scaleX, told.scaleY}, 0.0, 1.0f, false, 0.0, false, call.fieldToRender,
                         call.quality, true);
    };
    if (told.destinationBuffer == 0)
        return motion(memory.destination, memory.destinationRowBytes, call.dstFormat);
    Buffer rendered(told.destinationBuffer, call.dstWidth, call.dstHeight);
    PK_FillWithOpaqueBlack(rendered.bytes.data(), rendered.rowBytes, call.dstWidth, call.dstHeight,
                           told.destinationBuffer);
    motion(rendered.bytes.data(), rendered.rowBytes, told.destinationBuffer);
    return PK_Convert(rendered.bytes.data(), rendered.rowBytes, told.destinationBuffer, memory.destination,
                      memory.destinationRowBytes, call.dstFormat, call.dstWidth, call.dstHeight,
                      call.quality);
}

/// What the library decodes to is held to rules of its own elsewhere.
PKReference::DecodedPicture DecodedOf(const ScaleNumbers& call) {
    const PK::DecodeTarget wanted = {call.dstFormat, call.dstWidth, call.dstHeight};
    PK::DecodeTarget target = wanted;
    PK::ChooseDecodeTarget({call.srcFormat, call.srcWidth, call.srcHeight}, wanted, call.quality, target);
    return {target.format, target.width, target.height};
}

/// Rows from the top of the picture, wherever the format has it.
PK_Result Decode(const ScaleNumbers& call, const uint8_t* block, const PK::DestinationImage& picture) {
    return PK::DecodePlanar420(PK::PlanesInBlock(block, call.srcFormat, call.srcWidth, call.srcHeight),
                               call.srcFormat, PK::FromTop(picture), call.srcField, call.quality);
}

PK_Result DecodeAndGoOn(const ScaleNumbers& call, const ScaleTelling& told, const ScaleMemory& memory) {
    const ScaleNumbers& next = *told.next;
    Buffer buffer(next.srcFormat, next.srcWidth, next.srcHeight);
    if (const PK_Result result =
            Decode(call, memory.source,
                   {buffer.bytes.data(), buffer.rowBytes, next.srcFormat, next.srcWidth, next.srcHeight}))
        return result;
    return ScaleByHand(
        next, {buffer.bytes.data(), buffer.rowBytes, memory.destination, memory.destinationRowBytes});
}

PK_Result CopyField(const ScaleNumbers& call, const ScaleMemory& memory) {
    const auto from = PK::PlanesInBlock(memory.source, call.srcFormat, call.srcWidth, call.srcHeight);
    const auto to = PK::PlanesInBlock(memory.destination, call.dstFormat, call.dstWidth, call.dstHeight);
    for (size_t plane = 0; plane < 3; ++plane)
        for (int32_t line = 0; line < to[plane].height; ++line)
            std::memcpy(to[plane].Row(line),
                        from[plane].Row(2 * line + (plane == 0 && call.srcField == 2 ? 1 : 0)),
                        static_cast<size_t>(to[plane].width));
    return PK_Success;
}

} // namespace

PK_Result CallScale(const ScaleNumbers& call, const ScaleMemory& memory) {
    return PK_ScaleConvertOneField(memory.source, memory.sourceRowBytes, call.srcWidth, call.srcHeight,
                                   call.srcFormat, call.srcField, memory.destination,
                                   memory.destinationRowBytes, call.dstWidth, call.dstHeight, call.dstFormat,
                                   call.dstField, call.quality, call.fieldToRender);
}

PK_Result ScaleByHand(const ScaleNumbers& call, const ScaleMemory& memory) {
    const ScaleTelling told = PKReference::TellScale(call, DecodedOf(call), PK::sAllOriginsTopLeft != 0);
    if (told.route == "conversion")
        return PK_Convert(memory.source, memory.sourceRowBytes, call.srcFormat, memory.destination,
                          memory.destinationRowBytes, call.dstFormat, call.dstWidth, call.dstHeight,
                          call.quality);
    if (told.route == "half size") return Halve(call, told, memory);
    if (told.route == "one field")
        return ScaleByHand(*told.next,
                           {memory.source + int64_t{told.rowsSkipped} * memory.sourceRowBytes,
                            2 * memory.sourceRowBytes, memory.destination, memory.destinationRowBytes});
    if (told.route == "field of planes") return CopyField(call, memory);
    if (told.route == "straight decoding")
        return Decode(
            call, memory.source,
            {memory.destination, memory.destinationRowBytes, call.dstFormat, call.dstWidth, call.dstHeight});
    if (told.route == "decoding") return DecodeAndGoOn(call, told, memory);
    return Move(call, told, memory);
}

} // namespace PKTest
