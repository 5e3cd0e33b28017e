#pragma once

// PK_Motion and PK_MotionWithBlendMode with most arguments at their defaults.

#include "support/AlignedPicture.h"

#include <PixelKiln/Motion.h>

#include <optional>

namespace PKTest {

/// What a call asks for beside its images; the defaults lay the source in the middle of the destination.
struct PlaceCall {
    int32_t sourceField = 0, destinationField = 0;
    std::optional<PK_Rect> crop;
    uint32_t aspectNum = 1, aspectDen = 1;
    PK_Point position = {0.5f, 0.5f}, anchor = {0.5f, 0.5f}, scale = {1, 1}; // y from the bottom
    double rotation = 0;
    float opacity = 1;
    bool composite = false;
    double softness = 0;
    bool smoothEdges = false;
    int32_t renderField = 0, quality = 2;

    PK_Result operator()(const AlignedPicture& source, AlignedPicture& destination) const {
        return FromMemory(source.Pixels(), source.RowBytes(), source, destination);
    }

    /// With the pixels of a source of the same size elsewhere.
    PK_Result FromMemory(const void* pixels, int32_t rowBytes, const AlignedPicture& source,
                         AlignedPicture& destination) const {
        return PK_Motion(pixels, rowBytes, source.width, source.height, source.format, sourceField,
                         crop ? &*crop : nullptr, destination.Pixels(), destination.RowBytes(),
                         destination.width, destination.height, destination.format, destinationField,
                         aspectNum, aspectDen, position, anchor, scale, rotation, opacity, composite,
                         softness, smoothEdges, renderField, quality, false);
    }

    /// Over the destination by a mode.
    PK_Result Blend(const AlignedPicture& source, AlignedPicture& destination, PK_BlendMode mode) const {
        return PK_MotionWithBlendMode(
            source.Pixels(), source.RowBytes(), source.width, source.height, source.format, sourceField,
            crop ? &*crop : nullptr, destination.Pixels(), destination.RowBytes(), destination.width,
            destination.height, destination.format, destinationField, aspectNum, aspectDen, position, anchor,
            scale, rotation, opacity, softness, smoothEdges, renderField, mode, quality, false);
    }
};

} // namespace PKTest
