// A photograph through the colour spaces and through OpenColorIO, with the displays that both have. Built where
// OpenColorIO is installed.

#include "colour/Conversions.h"
#include "colour/WorstError.h"
#include "support/Photograph.h"

#include <OpenColorIO/OpenColorIO.h>

#include <cmath>
#include <string>
#include <vector>

namespace OCIO = OCIO_NAMESPACE;

namespace PKTest {
namespace {

using namespace PK;

ColourPixels PhotographAsFloats() {
    const Photograph photograph = ReadPhotograph("astronaut.png");
    ColourPixels pixels;
    for (size_t i = 0; i + 4 <= photograph.pixels.size(); i += 4) {
        ColourPixel pixel;
        for (size_t c = 0; c < 4; ++c) pixel[c] = static_cast<float>(photograph.pixels[i + c]) / 255;
        pixels.push_back(pixel);
    }
    return pixels;
}

OCIO::BuiltinTransformRcPtr FromXYZTo(const std::string& display, OCIO::TransformDirection direction) {
    const auto transform = OCIO::BuiltinTransform::Create();
    transform->setStyle(("DISPLAY - CIE-XYZ-D65_to_" + display).c_str());
    transform->setDirection(direction);
    return transform;
}

/// The pixels of the Rec. 709 display with its 2.4 power as those of another display; 1.0 of linear light is 100 cd/m2.
ColourPixels ByOpenColorIO(const std::string& display, ColourPixels pixels) {
    const auto group = OCIO::GroupTransform::Create();
    group->appendTransform(FromXYZTo("REC.1886-REC.709", OCIO::TRANSFORM_DIR_INVERSE));
    group->appendTransform(FromXYZTo(display, OCIO::TRANSFORM_DIR_FORWARD));
    const auto processor = OCIO::Config::CreateRaw()->getProcessor(group);
    // Without its own approximations.
    const auto cpu = processor->getOptimizedCPUProcessor(OCIO::OPTIMIZATION_NONE);
    OCIO::PackedImageDesc image(Floats(pixels), static_cast<long>(pixels.size()), 1,
                                OCIO::CHANNEL_ORDERING_BGRA, OCIO::BIT_DEPTH_F32, 4, 16,
                                static_cast<ptrdiff_t>(16 * pixels.size()));
    cpu->apply(image);
    return pixels;
}

/// Luminance of a pixel of the hub, 1 for 100 cd/m2.
double LuminanceOf(const ColourPixel& pixel) {
    const auto linear = [&](size_t i) { return std::pow(double{pixel[i]}, 2.4); };
    return 0.2126 * linear(2) + 0.7152 * linear(1) + 0.0722 * linear(0);
}

/// The photograph, brightened, to a space: largest differences in bulk and by single pixels, over all pixels that are
/// not darker than a least luminance.
void Compare(const std::string& display, const ColorSpace& space, float gain, double bulkBound,
             double singleBound, double leastLuminance = 0) {
    ColourPixels photograph = PhotographAsFloats();
    for (ColourPixel& pixel : photograph)
        for (size_t c = 0; c < 3; ++c) pixel[c] *= gain;
    const ColourPixels theirs = ByOpenColorIO(display, photograph);
    const ColourPixels ours = Convert(space, Way::kFromHub, photograph);
    ASSERT_NE(theirs, photograph);
    WorstError bulk(display + " in bulk, absolute"), single(display + " by single pixels, absolute");
    size_t compared = 0;
    for (size_t i = 0; i < photograph.size(); ++i) {
        if (LuminanceOf(photograph[i]) < leastLuminance) continue;
        ++compared;
        const ColourPixel alone = ConvertAlone(space, Way::kFromHub, photograph[i]);
        for (size_t c = 0; c < 3; ++c) {
            const double expected = double{theirs[i][c]};
            bulk.Take(std::abs(double{ours[i][c]} - expected), expected);
            single.Take(std::abs(double{alone[c]} - expected), expected);
        }
        ASSERT_EQ(ours[i][3], theirs[i][3]);
    }
    EXPECT_GT(compared, photograph.size() / 2);
    bulk.ExpectBelow(bulkBound);
    single.ExpectBelow(singleBound);
}

// Single pixels show what the two have in common but for the rounding of matrices and of curves; the bulk adds the
// approximate powers. The largest differences of single pixels lie next to black, where the curves are steep.

TEST(OpenColorIO, Rec2020) {
    Compare("REC.1886-REC.2020", Rec2020ColorSpace(), 1, 5e-4, 3e-5);
}

TEST(OpenColorIO, P3) {
    Compare("G2.6-P3-D65", DCIP3ColorSpace(kIlluminantD65), 1, 5e-4, 5e-5);
}

TEST(OpenColorIO, PQ) {
    Compare("REC.2100-PQ", PQColorSpace(false, false), 1, 2e-4, 1e-4);
    Compare("REC.2100-PQ", PQColorSpace(false, false), 6, 2e-4, 1e-4); // up to 7400 cd/m2
    Compare("ST2084-P3-D65", PQColorSpace(true, false), 1, 2e-4, 1e-4);
}

TEST(OpenColorIO, HLG) {
    // OpenColorIO holds the gain of the system gamma from below a ten-thousandth of the peak on.
    constexpr double kHeld = 1.01e-3;
    Compare("REC.2100-HLG-1000nit", HLGColorSpace(), 1, 5e-4, 3e-5, kHeld);
    Compare("REC.2100-HLG-1000nit", HLGColorSpace(), 2.6f, 5e-4, 3e-5, kHeld); // up to 1000 cd/m2
}

} // namespace
} // namespace PKTest
