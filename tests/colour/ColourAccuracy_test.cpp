// How far the pixel conversions are from their formulas in double precision, in bulk and by single pixels, from the
// darkest to the brightest values whose linear light is a float.
//
// Where a sum of products cancels, single precision has lost what the terms had, however it is added up. Behind a
// matrix the error is therefore taken in linear light, against the sum of the terms' magnitudes, and divided by the
// exponent that leads back to linear light: for terms of one sign that is the relative error of the encoded value.

#include "colour/Conversions.h"
#include "colour/DecodeTables.h"
#include "colour/ExactColour.h"
#include "colour/WorstError.h"

#include <algorithm>
#include <cmath>

namespace PKTest {
namespace {

using namespace PK;

constexpr double kBulkBound = 0x1p-10, kSingleBound = 2e-6;
/// Values lie between 2^-48 and 2^48: with the exponent 2.6, linear light is within the normal floats.
constexpr int kLeastBinade = -40, kMostBinade = 48;
constexpr float kLeastShare = 0x1p-8f;
/// The exponents as stored: the library's own rounding of 1 / 2.4 is not at issue.
constexpr double kDecode24 = double{2.4f}, kEncode24 = double{0.41666666f};
constexpr double kDecode26 = double{2.6f}, kEncode26 = double{0.38461539f};

double SignedPower(double v, double exponent) {
    return std::copysign(std::pow(std::abs(v), exponent), v);
}

/// The channels R, G, B of a pixel.
exact::Triple Colour(const ColourPixel& pixel) {
    return {double{pixel[2]}, double{pixel[1]}, double{pixel[0]}};
}

template <class Function>
exact::Triple ForChannels(const exact::Triple& c, Function function) {
    return {function(c[0]), function(c[1]), function(c[2])};
}

exact::Matrix Doubled(const CSMatrix& matrix) {
    exact::Matrix result;
    for (size_t i = 0; i < 9; ++i) result[i / 3][i % 3] = double{matrix.m[i]};
    return result;
}

exact::Matrix Magnitudes(exact::Matrix matrix) {
    for (auto& row : matrix)
        for (double& m : row) m = std::abs(m);
    return matrix;
}

/// Colours of every binade: three independent channels below the power of two, of which the largest is near it and the
/// others not below a 256th of it; one colour in four is a grey.
ColourPixels PixelsOfAllMagnitudes(bool withNegatives) {
    Random random(1);
    ColourPixels pixels;
    for (int binade = kLeastBinade; binade <= kMostBinade; ++binade)
        for (ColourPixel pixel : MakePixels(Content::kOrdinary, 1024, random)) {
            const size_t largest = random.Below(3), kind = random.Below(4);
            const float most = 0.5f + pixel[largest] / 2;
            for (size_t i = 0; i < 3; ++i) {
                pixel[i] = kind == 0 || i == largest ? most : std::max(pixel[i], kLeastShare);
                if (withNegatives && random.Below(3) == 0) pixel[i] = -pixel[i];
                pixel[i] = std::ldexp(pixel[i], binade);
            }
            pixels.push_back(pixel);
        }
    return pixels;
}

/// Signals from 0 to 1.
ColourPixels PixelsOfSignals() {
    Random random(2);
    ColourPixels pixels = MakePixels(Content::kOrdinary, 60000, random);
    for (int code = 0; code < 4096; ++code) pixels.push_back(Grey(static_cast<float>((code + 0.25) / 4095)));
    return pixels;
}

enum class Share { kBulk, kSingle };

/// The pixels through vector bodies, or in portions too small for them.
ColourPixels Converted(const ColorSpace& space, Way way, const ColourPixels& pixels, Share share) {
    if (share == Share::kBulk) {
        EXPECT_EQ(pixels.size() % 8, 0u);
        return Convert(space, way, pixels);
    }
    ColourPixels result(pixels.size());
    for (size_t i = 0; i < pixels.size(); i += 7) {
        const size_t count = std::min<size_t>(7, pixels.size() - i);
        Convert(space, way, pixels[i].data(), result[i].data(), static_cast<int32_t>(count));
    }
    return result;
}

std::string Title(const std::string& name, Share share) {
    return name + (share == Share::kBulk ? ", in bulk" : ", single pixels");
}

/// Measures a conversion that ends in a power: `linear` gives what a pixel is ahead of its matrix.
template <class Linear>
void MeasureEncoded(const std::string& name, const ColorSpace& space, Way way, const ColourPixels& pixels,
                    const exact::Matrix& matrix, double encode, const double (&bounds)[2], Linear linear) {
    for (const Share share : {Share::kBulk, Share::kSingle}) {
        const ColourPixels result = Converted(space, way, pixels, share);
        WorstError worst(Title(name, share));
        for (size_t i = 0; i < pixels.size(); ++i) {
            const exact::Triple given = linear(Colour(pixels[i]));
            const exact::Triple sums = exact::Apply(matrix, given);
            const exact::Triple terms =
                exact::Apply(Magnitudes(matrix), ForChannels(given, [](double v) { return std::abs(v); }));
            const exact::Triple encoded = Colour(result[i]);
            for (size_t c = 0; c < 3; ++c)
                if (terms[c] > 0)
                    worst.Take(std::abs(SignedPower(encoded[c], 1 / encode) - sums[c]) / terms[c] * encode,
                               double{pixels[i][2 - c]});
                else
                    EXPECT_EQ(encoded[c], 0) << name;
        }
        worst.ExpectBelow(bounds[share == Share::kBulk ? 0 : 1]);
    }
}

/// Measures a conversion from the hub to signals, relative to them.
template <class Signals>
void MeasureSignals(const std::string& name, const ColorSpace& space, const ColourPixels& pixels,
                    const double (&bounds)[2], Signals signals) {
    for (const Share share : {Share::kBulk, Share::kSingle}) {
        const ColourPixels result = Converted(space, Way::kFromHub, pixels, share);
        WorstError worst(Title(name, share));
        for (size_t i = 0; i < pixels.size(); ++i) {
            const exact::Triple expected = signals(Colour(pixels[i])), actual = Colour(result[i]);
            for (size_t c = 0; c < 3; ++c)
                worst.Take(std::abs(actual[c] - expected[c]) / expected[c], expected[c]);
        }
        worst.ExpectBelow(bounds[share == Share::kBulk ? 0 : 1]);
    }
}

exact::Triple HubLight(const exact::Triple& hub) {
    return ForChannels(hub, [](double v) { return SignedPower(v, kDecode24); });
}

/// 0.00024420026f and its like are not exact: an entry stands for its place in the table.
double TableSignal(double signal, int last) {
    return SignalIndex(static_cast<float>(signal), last + 1) / static_cast<double>(last);
}

/// In bulk and by single pixels.
constexpr double kUsual[2] = {kBulkBound, kSingleBound};
/// PQ's formula in single precision cannot keep the usual bound: its last power multiplies half a unit of the fraction
/// under it by 79, and on the way back numerator and denominator cancel. The table is filled in the same way.
constexpr double kPQ[2] = {kBulkBound, 2.5e-5};

TEST(ColourAccuracy, PowerLaws) {
    const ColourPixels pixels = PixelsOfAllMagnitudes(true);
    constexpr exact::Matrix kIdentity = {{{1, 0, 0}, {0, 1, 0}, {0, 0, 1}}};
    for (const float gamma : {0.45f, 1 / 2.2f, 1 / 2.6f}) {
        const GammaColorSpace space(gamma);
        const std::string name = "gamma " + std::to_string(gamma);
        MeasureEncoded("hub to " + name, space, Way::kFromHub, pixels, kIdentity, double{gamma}, kUsual,
                       HubLight);
        MeasureEncoded(name + " to hub", space, Way::kToHub, pixels, kIdentity, kEncode24, kUsual,
                       [=](const exact::Triple& c) {
                           return ForChannels(c, [=](double v) { return SignedPower(v, double{1 / gamma}); });
                       });
    }
}

TEST(ColourAccuracy, Rec2020) {
    const ColourPixels pixels = PixelsOfAllMagnitudes(true);
    const Rec2020ColorSpace space;
    constexpr exact::Matrix to = {{{0.6274020, 0.3292920, 0.0433061},
                                   {0.0690955, 0.9195440, 0.0113602},
                                   {0.0163937, 0.0880281, 0.8955780}}};
    constexpr exact::Matrix from = {{{1.6605000, -0.5876570, -0.0728399},
                                     {-0.1245470, 1.1329000, -0.0083480},
                                     {-0.0181537, -0.1005970, 1.1187500}}};
    MeasureEncoded("hub to Rec. 2020", space, Way::kFromHub, pixels, to, kEncode24, kUsual, HubLight);
    MeasureEncoded("Rec. 2020 to hub", space, Way::kToHub, pixels, from, kEncode24, kUsual, HubLight);
}

TEST(ColourAccuracy, P3) {
    const ColourPixels pixels = PixelsOfAllMagnitudes(true);
    const ColorSpace& hub = ColorSpace::WorkingSpace(kWorkingSpaceRec709);
    for (const PK_WorkingSpace which : {kWorkingSpaceDCIP3D65, kWorkingSpaceDCIP3D60}) {
        const ColorSpace& space = ColorSpace::WorkingSpace(which);
        const std::string name = which == kWorkingSpaceDCIP3D65 ? "P3 D65" : "P3 D60";
        MeasureEncoded("hub to " + name, space, Way::kFromHub, pixels,
                       Doubled(ColorSpace::CalculateConversionMatrix(hub, space)), kEncode26, kUsual,
                       HubLight);
        MeasureEncoded(name + " to hub", space, Way::kToHub, pixels,
                       Doubled(ColorSpace::CalculateConversionMatrix(space, hub)), kEncode24, kUsual,
                       [](const exact::Triple& c) {
                           return ForChannels(c, [](double v) { return SignedPower(v, kDecode26); });
                       });
    }
}

TEST(ColourAccuracy, PQ) {
    const ColorSpace& hub = ColorSpace::WorkingSpace(kWorkingSpaceRec709);
    for (const bool useP3 : {false, true}) {
        const PQColorSpace space(useP3, false), normalised(useP3, true);
        const std::string name = useP3 ? "PQ P3" : "PQ Rec. 2020";
        const exact::Matrix from = Doubled(ColorSpace::CalculateConversionMatrix(hub, space));
        const exact::Matrix to = Doubled(ColorSpace::CalculateConversionMatrix(space, hub));
        MeasureSignals("hub to " + name, space, PixelsOfAllMagnitudes(false), kPQ,
                       [&](const exact::Triple& c) {
                           return ForChannels(exact::Apply(from, HubLight(c)),
                                              [](double v) { return exact::PQSignal(v * 100); });
                       });
        MeasureEncoded(name + " to hub, against the curve at the table's steps", space, Way::kToHub,
                       PixelsOfSignals(), to, kEncode24, kPQ, [](const exact::Triple& c) {
                           return ForChannels(
                               c, [](double v) { return exact::PQLuminance(TableSignal(v, 4095)) / 100; });
                       });
        MeasureEncoded(name + " normalised to hub", normalised, Way::kToHub, PixelsOfSignals(), to, kEncode24,
                       kPQ, [](const exact::Triple& c) {
                           return ForChannels(
                               c, [](double v) { return exact::PQLuminance(v * double{0.50807786f}) / 100; });
                       });
    }
}

TEST(ColourAccuracy, HLG) {
    const HLGColorSpace space;
    constexpr exact::Matrix to2020 = {{{0.6274020, 0.3292920, 0.0433061},
                                       {0.0690955, 0.9195440, 0.0113602},
                                       {0.0163937, 0.0880281, 0.8955780}}};
    constexpr exact::Matrix from2020 = {{{1.6605000, -0.5876570, -0.0728399},
                                         {-0.1245470, 1.1329000, -0.0083480},
                                         {-0.0181537, -0.1005970, 1.1187500}}};
    MeasureSignals("hub to HLG", space, PixelsOfAllMagnitudes(false), kUsual, [&](const exact::Triple& c) {
        const exact::Triple light = exact::Apply(to2020, HubLight(c));
        // In the deepest black the gain is held.
        const double Y = exact::Luminance2020(light) / 10;
        const double gain = 1 / std::max(std::pow(Y, 1.0 / 6), 1e-4);
        return ForChannels(light, [=](double v) { return exact::HLGSignal(v / 10 * gain); });
    });
    MeasureEncoded("HLG to hub, against the curve at the table's steps", space, Way::kToHub,
                   PixelsOfSignals(), from2020, kEncode24, kUsual, [](const exact::Triple& c) {
                       const exact::Triple candelas = exact::HLGDisplayLight(ForChannels(
                           c, [](double v) { return exact::HLGSceneLight(TableSignal(v, 2047)); }));
                       return ForChannels(candelas, [](double v) { return v / 100; });
                   });
}

} // namespace
} // namespace PKTest
