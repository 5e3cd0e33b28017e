// The pixel conversions of the colour spaces in slow, plain scalar code, one pixel at a time, to hold the fast ones
// against: those of the vector bodies with their approximate powers, and those of single pixels behind the last whole
// group of eight. It includes nothing of Src/.
#pragma once

#include <array>
#include <cstdint>

namespace reference {

// Of a product that feeds a sum: rounded by itself, or with the sum. The latter is what the bodies with fused
// arithmetic do, wherever it happens.
enum class Rounding { kEach, kFused };

// x^exponent and ln x for x >= 0, with the processor's own reciprocal estimate. The power is 0 for all x that are
// not above 0, and for NaN.
float ApproxPow(float x, float exponent, Rounding rounding);
float ApproxLn(float x, Rounding rounding);

// Between linear RGB of Rec. 709 and Rec. 2020, row by row, and the weights of R, G, B in luminance.
inline constexpr float kTo2020[9] = {0.6274020f, 0.3292920f, 0.0433061f, 0.0690955f, 0.9195440f,
                                     0.0113602f, 0.0163937f, 0.0880281f, 0.8955780f};
inline constexpr float kFrom2020[9] = {1.6605000f,  -0.5876570f, -0.0728399f, -0.1245470f, 1.1329000f,
                                       -0.0083480f, -0.0181537f, -0.1005970f, 1.1187500f};
inline constexpr float kLuma709[3] = {0.2126f, 0.7152f, 0.0722f}, kLuma2020[3] = {0.2627f, 0.678f, 0.0593f};

// B, G, R, alpha.
using ColourPixel = std::array<float, 4>;

// Decode with a power, matrix, clip, encode with a power.
struct PowerLaws {
    float inExponent, outExponent;
    const float* matrix = nullptr; // nine floats, row by row for R, G, B; null is the identity
    bool gamutClip = false;        // counts only with a matrix
    const float* luma = nullptr;   // for the clip: of R, G, B
};

// As the vector bodies do it.
ColourPixel BulkPowerLaws(const ColourPixel& pixel, const PowerLaws& laws, Rounding rounding);
ColourPixel BulkPQToHub(const ColourPixel& pixel, const float* matrix, const float* table, Rounding rounding);
// The last power is that of double precision, rounded once; the library's may differ from it in the last place.
ColourPixel BulkHubToPQ(const ColourPixel& pixel, const float* matrix, float outScale, Rounding rounding);
ColourPixel BulkHLGToHub(const ColourPixel& pixel, const float* matrix, const float* table,
                         Rounding rounding);
ColourPixel BulkHubToHLG(const ColourPixel& pixel, const float* matrix, Rounding rounding);

// As single pixels are converted, with powers of single precision.
ColourPixel SingleClip(ColourPixel pixel, const float* luma);
ColourPixel SinglePowerLaws(const ColourPixel& pixel, const PowerLaws& laws);
ColourPixel SinglePQToHubByTable(const ColourPixel& pixel, const float* matrix, const float* table);
// By the formula. The clip works on encoded values here.
ColourPixel SinglePQToHub(const ColourPixel& pixel, const float* matrix, float inScale, bool gamutClip,
                          const float* luma);
ColourPixel SingleHubToPQ(const ColourPixel& pixel, const float* matrix, float outScale);
ColourPixel SingleHLGToHub(const ColourPixel& pixel, const float* matrix, const float* table);
ColourPixel SingleHubToHLG(const ColourPixel& pixel, const float* matrix);
// The clip works on encoded values here too.
ColourPixel SingleHubToSRGB(const ColourPixel& pixel, bool gamutClip);
ColourPixel SingleSRGBToHub(const ColourPixel& pixel, bool gamutClip);

} // namespace reference
