#pragma once

/// \file
/// The types that every exported function speaks in: result codes, pixel formats, points and rectangles.

#include <cstdint>

/// Marks a name that leaves the shared library; everything else is hidden.
#define PK_API __attribute__((visibility("default")))

/// Outcome of an operation: 0 is success, every failure is negative.
using PK_Result = int32_t;

enum : PK_Result {
    PK_Success = 0,                 ///< Success.
    PK_ErrBadRect = -2,             ///< Crop rectangle not inside the image.
    PK_ErrBadSrcFormat = -3,        ///< Source pixel format unknown, or not accepted by the operation.
    PK_ErrBadDstFormat = -4,        ///< Destination pixel format unknown, or not accepted by the operation.
    PK_ErrBadPosX = -5,             ///< Negative horizontal position.
    PK_ErrBadPosY = -6,             ///< Negative vertical position.
    PK_ErrBadWidth = -7,            ///< Width that the operation cannot serve.
    PK_ErrBadHeight = -8,           ///< Height that the operation cannot serve.
    PK_ErrBadDVSourceSize = -9,     ///< Source of DV compression not of the frame size of its format.
    PK_ErrNullSource = -11,         ///< Null source buffer.
    PK_ErrNullDestination = -12,    ///< Null destination buffer.
    PK_ErrSizeMismatch = -13,       ///< The sizes cannot be served as given.
    PK_ErrBadDVFormat = -14,        ///< DV format that this decoder does not cover.
    PK_ErrBadDVDestination = -15,   ///< DV compression destination refused.
    PK_ErrOutOfMemory = -16,        ///< A pixel buffer or a transient block could not be had.
    PK_ErrBadMotionParameter = -17, ///< A blur-related parameter of motion outside 0 to 1.
    PK_ErrBadFieldType = -18,       ///< Field selector other than 1 or 2.
    PK_ErrFailed = -999,            ///< No conversion chain, a failed primitive, or an impossible argument.
    PK_ErrNotSupported = -1000,     ///< The combination is recognised but not offered.
};

/// A pixel format: a bit-field, see PixelFormat.h.
using PK_PixelFormat = uint32_t;

/// A point in pixels.
struct PK_Point {
    float x, y;
};

/// A rectangle in pixels; right and bottom are exclusive.
struct PK_Rect {
    int32_t left, top, right, bottom;
};
