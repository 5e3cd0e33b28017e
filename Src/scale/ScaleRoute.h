#pragma once

// Which way a scale-and-convert call takes: told by sizes, formats, fields and quality alone, so that whoever explains a
// call needs no image.

#include "convert/Streams.h"

namespace PK {

struct ScaleImage {
    PK_PixelFormat format;
    int32_t width;
    int32_t height;
    int32_t field; ///< 0 for the frame, 1 or 2 for the field that comes first in time
};

struct ScaleCall {
    ScaleImage source;
    ScaleImage destination;
    int32_t renderField; ///< 0 for all rows of the destination, 1 or 2 for one field
    int32_t quality;
};

/// In the order in which they are tried.
enum class ScaleRoute : uint8_t {
    Conversion,       ///< nothing to scale
    HalfSize,         ///< 4:2:2 at half its size, by dropping rows and pixels
    FieldOfPlanes,    ///< a field copied out of planar 4:2:0
    OneField,         ///< a field is the source, which goes its own way
    StraightDecoding, ///< a stream decoded to what is wanted
    Decoding,         ///< a stream decoded, which goes its own way
    Motion,           ///< everything else, by PK_Motion
};

/// The first route that takes the call. None is negative or 0 of its sizes, but for Conversion.
ScaleRoute ChooseScaleRoute(const ScaleCall& call);

/// Whether there is nothing to scale; for any sizes.
bool IsConversionAlone(const ScaleCall& call);

const char* NameOf(ScaleRoute route);

/// What the stream of a call is decoded to.
DecodeTarget DecodeTargetOf(const ScaleCall& call);

/// What is left of a call once one field of its source stands for it.
ScaleCall AfterOneField(const ScaleCall& call);

/// The same once its stream is decoded to a target. One of a lower height has lost the other field.
ScaleCall AfterDecoding(const ScaleCall& call, const DecodeTarget& target);

/// Whether the source is walked in steps of two rows from its second in memory on to have one field of it.
bool FieldBeginsAtSecondRow(PK_PixelFormat format, int32_t field);

} // namespace PK
