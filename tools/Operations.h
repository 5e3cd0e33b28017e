#pragma once

// The operations of the library on whole frames, as the commands and the demonstration use them. What has a
// place or a direction goes by the picture as one sees it, from its top left corner and clockwise, however the
// format stores its rows. All throw a Failure if the library refuses.

#include "ColourSpaces.h"
#include "Frame.h"

#include <array>
#include <string>
#include <vector>

namespace tool {

/// \param colour  black, white, clear-black, clear-white, or R,G,B,A from 0 to 255.
void Fill(Frame& frame, const std::string& colour);

/// \param degrees  clockwise; a multiple of 90 from -270 to 270, but not 0.
Frame Rotated(const Frame& frame, int32_t degrees);

struct Scaling {
    PK_PixelFormat format = PK_PixelFormat_Invalid;
    int32_t width = 0;
    int32_t height = 0;
    int32_t sourceField = 0; ///< the earlier one, 0 for none
    int32_t destinationField = 0;
    int32_t renderField = 0; ///< 0 for all rows
    int32_t quality = kDefaultQuality;
};
/// The frame at another size, format and field order. Rows of the field that is not rendered are 0.
Frame Scaled(const Frame& frame, const Scaling& scaling);

struct BoxBlur {
    double radius = 0;
    int32_t passes = 1;
    bool rows = true;
    bool columns = true;
    bool renormalise = false;
};
void Blur(Frame& frame, const BoxBlur& blur);

struct GaussianBlur {
    double sigmaX = 0;
    double sigmaY = 0;
    bool repeatEdge = false;
    bool linear = false;
    int32_t grow = 0; ///< pixels more on each side, in the directions that are blurred
    int32_t quality = kDefaultQuality;
};
Frame Blurred(const Frame& frame, const GaussianBlur& blur);

struct Warp {
    std::array<double, 8> quad = {}; ///< where the corners of the picture go, clockwise from the top left one
    float feather = 0;
    int32_t opacity = 255;
    int32_t quality = kDefaultQuality;
};
/// Composites the whole picture into a quadrilateral of the background, which has its format.
void DrawWarped(const Frame& picture, const Warp& warp, Frame& background);

/// The sum of pictures of one size, each times its weight.
/// \param quality  5 sums light, less the codes of the samples.
void AddUp(const std::vector<Frame>& pictures, const std::vector<double>& weights, int32_t quality,
           Frame& sum);

/// A mix of two pictures of one size in the format of the first.
/// \param ratio  0 is the first alone, 1 the second.
Frame Dissolved(const Frame& first, const Frame& second, float ratio, int32_t quality);

/// Rebuilds one field from the other; field and quality as PK_Deinterlace has them.
void Deinterlace(Frame& frame, int32_t field, int32_t quality);

struct Stamp {
    int32_t number = 0;
    PK_Point at = {};    ///< as fractions of width and height
    float digit = 0.05F; ///< width of a digit, as a fraction of the width
    bool hex = false;
};
void Burn(Frame& frame, const Stamp& stamp);

/// Takes BGRA_4444_32f pixels from one colour space to another, by way of the hub.
/// \param gamutClip  pull colours that the destination cannot show towards their luminance.
void ConvertSpace(Frame& frame, const Space& from, const Space& to, bool gamutClip);

struct ToneRange {
    float exposure = 1;
    float slope = 1;
    float knee = 0.5F;
};
/// Bends the luminance of encoded BGRA_4444_32f pixels into the range of standard video; they stay encoded.
void CompressToneRange(Frame& frame, const Space& space, const ToneRange& range);
/// Throws a Failure for a space that has no tone-range compression.
void RequireToneRange(const Space& space);

} // namespace tool
