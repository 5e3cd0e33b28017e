// Which way a scale-and-convert call takes and what it brings before motion: a plain restatement of the rules, for the
// tests.
#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace PKReference {

struct ScaleNumbers {
    int32_t srcWidth, srcHeight;
    uint32_t srcFormat;
    int32_t srcField;
    int32_t dstWidth, dstHeight;
    uint32_t dstFormat;
    int32_t dstField;
    int32_t quality, fieldToRender;

    bool operator==(const ScaleNumbers&) const = default;
};

// What a decoder would make of a source that is a stream.
struct DecodedPicture {
    uint32_t format;
    int32_t width, height;
};

// What one call of PK_ScaleConvertOneField does.
struct ScaleTelling {
    std::string route;

    // Half size: the row function, what it makes, and the source rows of the first and second row of the destination.
    std::string rowFunction;
    uint32_t rowFormat = 0;
    int32_t firstRow = 0, secondRow = 0;

    // One field, and motion's: how many rows further down in memory the source begins.
    int32_t rowsSkipped = 0;

    // Motion: what stands before it; 0 for no buffer.
    uint32_t sourceBuffer = 0, destinationBuffer = 0;
    bool takesField = false;
    float scaleX = 0, scaleY = 0;

    // The call that goes on with a field or with what was decoded.
    std::optional<ScaleNumbers> next;

    bool operator==(const ScaleTelling&) const = default;
    std::string Text() const;
};

ScaleTelling TellScale(const ScaleNumbers& call, const DecodedPicture& decoded, bool allOriginsTopLeft);

} // namespace PKReference
