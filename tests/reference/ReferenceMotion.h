#pragma once

// PK_Motion restated: row by row, without bands, every row's pixels found one by one in double precision. What is done with
// a row then, and to a source beforehand, is asked of the exported calls, which are held to restatements of their own.

#include <PixelKiln/BlendMode.h>
#include <PixelKiln/Types.h>

#include <cstdint>

namespace PKReference {

/// A call's arguments.
struct MotionArguments {
    const uint8_t* source;
    int32_t sourceRowBytes, sourceWidth, sourceHeight;
    PK_PixelFormat sourceFormat;
    int32_t sourceField;
    PK_Rect crop; ///< where none is given, the source
    uint8_t* destination;
    int32_t destinationRowBytes, destinationWidth, destinationHeight;
    PK_PixelFormat destinationFormat;
    int32_t destinationField;
    uint32_t aspectNum, aspectDen;
    PK_Point position, anchor, scale; ///< y of places from the bottom
    double rotation;
    float opacity;
    bool composites;
    double softness;
    bool smoothEdges;
    int32_t renderField;
    PK_BlendMode mode;
    int32_t quality;
    bool inLinear;
    bool blursInLinear; ///< a switch of the library's, and none of the call
};

/// Expects arguments that are good and an opacity that shows. Of destinations whose pixels share samples, a row's pixels
/// have to be whole groups, or to go to its end.
/// \return the first result that is none of success.
PK_Result DrawMotion(const MotionArguments& arguments);

} // namespace PKReference
