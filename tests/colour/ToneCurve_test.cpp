// Tone-range compression: the curve, and what the spaces do with it.

#include "colour/ToneCurve.h"

#include "colour/ReferenceColorimetry.h"
#include "support/ColourPixels.h"

#include <algorithm>
#include <cmath>

namespace {

using namespace PKTest;
using namespace PK;

struct Settings {
    float exposure, slope, knee;
};

constexpr Settings kSettings[] = {
    {1, 1, 0.5f}, {1, 1.2f, 0.7f}, {2, 1.5f, 0.6f}, {0.5f, 1.1f, 0.9f}, {10, 2, 0.2f}, {1, 1.2f, 0.0f},
};

auto Compress(const ColorSpace& space, Settings s) {
    return [&space, s](const float* source, float* destination, int32_t count) {
        space.CompressPixelsToSDR(source, destination, count, s.exposure, s.slope, s.knee);
    };
}

/// The curve in double precision, from its definition.
double SlowCurve(double Y, Settings settings) {
    const auto slope = static_cast<double>(settings.slope), knee = static_cast<double>(settings.knee);
    const double k = knee / slope;
    const double p = (1 - k) / (1 - knee) * slope;
    const double t =
        std::log10(std::max(Y, 0.0) * 99.99 * static_cast<double>(settings.exposure) + 1) / 2 - 1;
    const double u = std::min(1.0, std::abs(t));
    const double w = u > k ? (1 - std::pow(1 - (u - k) / (1 - k), p)) * (1 - knee) + knee : u * slope;
    return (std::pow(10.0, (t < 0 ? -w : w) + 1) - 1) / 99;
}

TEST(ToneCurve, ByHand) {
    // With the slope 1 the logarithm comes back as it was, whatever the knee: the square root of 1 + 99.99 Y, less 1, over
    // 99.
    for (const float knee : {0.0f, 0.25f, 0.5f, 0.9f, 1.0f}) {
        const ToneCurve curve(1, 1, knee);
        EXPECT_NEAR(curve(0), 0.0f, 1e-9f);
        EXPECT_NEAR(curve(0.01f), (std::sqrt(1.9999) - 1) / 99, 1e-7);
        EXPECT_NEAR(curve(1), 0.0914078, 1e-6);
        EXPECT_NEAR(curve(100), 1.0f, 1e-5f);
        EXPECT_NEAR(ToneCurve(4, 1, knee)(25), 1.0f, 1e-5f) << "the exposure is a factor on luminance";
    }
    // The centre, Y = 0.99 / exposure, stays where it is for every slope: t = 0 gives (10 - 1) / 99.
    for (const Settings& s : kSettings)
        EXPECT_NEAR(ToneCurve(s.exposure, s.slope, s.knee)(0.99f / s.exposure), 1.0f / 11, 1e-4f);
}

TEST(ToneCurve, AboveItsRangeIsOne) {
    for (const Settings& s : kSettings)
        for (const float Y : {100.0f, 1000.0f, 1e30f, kInfinity})
            EXPECT_NEAR(ToneCurve(s.exposure, s.slope, s.knee)(Y * 1.01f / s.exposure), 1.0f, 1e-6f) << Y;
}

TEST(ToneCurve, BlackAndBelowIsBlack) {
    // v may miss -1 by half a unit in the last place, and 10^(v + 1) then misses 1 by one.
    for (const float knee : {0.0f, 0.1f, 0.3f, 0.5f, 0.7f, 0.9f, 0.99f})
        for (const float slope : {1.0f, 1.1f, 1.5f, 2.0f, 7.0f})
            for (const float Y : {0.0f, -0.0f, -1e-9f, -1.0f, -kInfinity})
                EXPECT_NEAR(ToneCurve(1, slope, knee)(Y), 0.0f, 1.3e-9f) << slope << " " << knee;
}

TEST(ToneCurve, MeetsAtTheKnee) {
    for (const Settings& s : kSettings) {
        if (s.knee == 0) continue;
        const ToneCurve curve(s.exposure, s.slope, s.knee);
        const double k = static_cast<double>(s.knee) / static_cast<double>(s.slope);
        const auto luminanceAt = [&](double t) {
            return static_cast<float>((std::pow(100, t + 1) - 1) / (99.99 * static_cast<double>(s.exposure)));
        };
        const double below = static_cast<double>(curve(luminanceAt(k - 1e-3)));
        const double at = static_cast<double>(curve(luminanceAt(k)));
        const double above = static_cast<double>(curve(luminanceAt(k + 1e-3)));
        EXPECT_NEAR(at, (std::pow(10, static_cast<double>(s.knee) + 1) - 1) / 99, 2e-5)
            << "the level is the knee";
        EXPECT_NEAR((above - at) / (at - below), 1, 0.03) << "the gradient is the same on both sides";
    }
}

TEST(ToneCurve, Rises) {
    for (const Settings& s : kSettings) {
        const ToneCurve curve(s.exposure, s.slope, s.knee);
        float last = -1;
        for (float Y = 1e-4f; Y < 200; Y *= 1.05f) {
            EXPECT_GE(curve(Y), last);
            last = curve(Y);
        }
    }
}

TEST(ToneCurve, AgreesWithDoublePrecision) {
    for (const Settings& s : kSettings) {
        const ToneCurve curve(s.exposure, s.slope, s.knee);
        for (double Y = 1e-7; Y < 1e5; Y *= 1.01) {
            const double exact = SlowCurve(Y, s);
            ASSERT_NEAR(static_cast<double>(curve(static_cast<float>(Y))), exact, 4e-6 * exact + 6e-9) << Y;
        }
    }
}

TEST(ToneCurve, BadParametersGoByIEEE) {
    // No slope: the line is flat at the centre, and is never left, since the knee is infinitely far, or no number.
    for (const float knee : {0.0f, 0.5f})
        for (const float Y : {0.0f, 1.0f, 1000.0f}) EXPECT_NEAR(ToneCurve(1, 0, knee)(Y), 1.0f / 11, 1e-6f);
    // The knee at 1: from there on the bend is infinitely sharp.
    EXPECT_NEAR(ToneCurve(1, 2, 1)(100), 1.0f, 1e-6f);
    EXPECT_NEAR(ToneCurve(1, 2, 1)(0.99f), 1.0f / 11, 1e-4f);
    // The knee and the slope at 1 with u at 1: not above the knee, and so on the line.
    EXPECT_NEAR(ToneCurve(1, 1, 1)(1000), 1.0f, 1e-6f);
    // A slope below the knee begins to bend beyond 1, and so never does.
    EXPECT_NEAR(ToneCurve(1, 0.5f, 0.8f)(1000), (std::pow(10.0f, 1.5f) - 1) / 99, 1e-6f);
    EXPECT_TRUE(std::isnan(ToneCurve(1, kNaN, 0.5f)(1)));
    EXPECT_TRUE(std::isnan(ToneCurve(1, 2, kNaN)(1000)) || ToneCurve(1, 2, kNaN)(1000) > 1);
}

const SRGBColorSpace sSRGB;
const Rec709ColorSpace sRec709;
const Rec2020ColorSpace sRec2020;
const DCIP3ColorSpace sP3, sP3D60(kIlluminantD60);

/// A space that compresses: how it decodes and encodes, in double precision.
struct Compressing {
    const char* name;
    const ColorSpace& space;
    double (*decode)(double);
    double (*encode)(double);
};

const Compressing kCompressing[] = {
    {"sRGB", sSRGB, [](double a) { return a > 0.04045 ? std::pow((a + 0.055) / 1.055, 2.4) : a / 12.92; },
     [](double a) { return a > 0.0031308 ? 1.055 * std::pow(a, 1 / 2.4) - 0.055 : 12.92 * a; }},
    {"Rec. 709", sRec709, [](double a) { return std::pow(a, 2.4); },
     [](double a) { return std::pow(a, 1 / 2.4); }},
    {"Rec. 2020", sRec2020, [](double a) { return std::pow(a, 2.4); }, [](double a) { return a; }},
    {"P3", sP3, [](double a) { return std::pow(a, 2.6); }, [](double a) { return a; }},
    {"P3 D60", sP3D60, [](double a) { return std::pow(a, 2.6); }, [](double a) { return a; }},
};

double WithSignOf(double (*function)(double), double v) {
    return std::copysign(function(std::abs(v)), v);
}

TEST(CompressPixelsToSDR, GreysFollowTheCurve) {
    for (const Compressing& c : kCompressing)
        for (const Settings& s : kSettings)
            for (const float grey : {0.05f, 0.5f, 1.0f, 2.0f, 5.0f, 20.0f}) {
                const ColourPixel pixel = Converted({{grey, grey, grey, 0.5f}}, Compress(c.space, s))[0];
                const double exact = c.encode(SlowCurve(c.decode(static_cast<double>(grey)), s));
                for (size_t k = 0; k < 3; ++k)
                    EXPECT_NEAR(static_cast<double>(pixel[k]), exact, 2e-5 * exact + 1e-7)
                        << c.name << " " << grey;
                EXPECT_EQ(pixel[3], 0.5f);
            }
}

TEST(CompressPixelsToSDR, Rec2020AndP3LeaveLinearPixels) {
    // 0.5 is 0.18946 in linear light of Rec. 2020; the slope 1 makes (sqrt(1 + 99.99 Y) - 1) / 99 of it, 0.035009,
    // which is not encoded again.
    const ColourPixel rec2020 = Converted({{0.5f, 0.5f, 0.5f, 1}}, Compress(sRec2020, {1, 1, 0.5f}))[0];
    for (size_t k = 0; k < 3; ++k) EXPECT_NEAR(rec2020[k], 0.0350094, 1e-6);
    const ColourPixel p3 = Converted({{0.5f, 0.5f, 0.5f, 1}}, Compress(sP3, {1, 1, 0.5f}))[0];
    for (size_t k = 0; k < 3; ++k)
        EXPECT_NEAR(p3[k], (std::sqrt(1 + 99.99 * std::pow(0.5, 2.6)) - 1) / 99, 1e-6);
    const ColourPixel rec709 = Converted({{0.5f, 0.5f, 0.5f, 1}}, Compress(sRec709, {1, 1, 0.5f}))[0];
    for (size_t k = 0; k < 3; ++k)
        EXPECT_NEAR(rec709[k], std::pow(0.0350094, 1 / 2.4), 1e-5) << "this one encodes";
}

TEST(CompressPixelsToSDR, BlackStaysBlack) {
    for (const Compressing& c : kCompressing)
        for (const Settings& s : kSettings)
            for (const float black : {0.0f, -0.0f}) {
                const ColourPixel pixel = Converted({{black, black, black, 1}}, Compress(c.space, s))[0];
                // What the curve may leave, and the matrices multiply, is encoded by some.
                for (size_t k = 0; k < 3; ++k)
                    EXPECT_LE(static_cast<double>(std::abs(pixel[k])), c.encode(1.5e-9)) << c.name;
            }
    EXPECT_EQ(Converted({{0, 0, 0, 1}}, Compress(sRec709, {1, 1, 0.5f}))[0], (ColourPixel{0, 0, 0, 1}));
    EXPECT_EQ(Converted({{0, 0, 0, 1}}, Compress(sSRGB, {1, 1, 0.5f}))[0], (ColourPixel{0, 0, 0, 1}));
}

TEST(CompressPixelsToSDR, NegativePixelsTakeTheChromaticityOfWhite) {
    for (const Compressing& c : kCompressing) {
        const ColourPixel pixel =
            Converted({{-0.5f, -0.5f, -0.5f, 1}}, Compress(c.space, {1, 1.2f, 0.7f}))[0];
        for (size_t k = 0; k < 3; ++k)
            EXPECT_LE(static_cast<double>(std::abs(pixel[k])), c.encode(1.5e-9)) << c.name;
    }
    // Without a slope every luminance becomes 1 / 11, in the white of the space: its three channels are the same.
    for (const Compressing& c : kCompressing) {
        const ColourPixel pixel = Converted({{-0.9f, -0.1f, -0.3f, 1}}, Compress(c.space, {1, 0, 0.5f}))[0];
        for (size_t k = 0; k < 3; ++k)
            EXPECT_NEAR(static_cast<double>(pixel[k]), c.encode(1.0 / 11), 1e-5) << c.name;
    }
}

TEST(CompressPixelsToSDR, ColoursBelowAMillionthCountAsBlack) {
    // X + Y + Z of blue is 1.289 times its linear value. Without a slope all luminances become 1 / 11.
    const auto compressed = [](float linear) {
        return Converted({{std::pow(linear, 1 / 2.4f), 0, 0, 1}}, Compress(sRec2020, {1, 0, 0.5f}))[0];
    };
    const ColourPixel below = compressed(7.4e-7f), above = compressed(8e-7f);
    for (size_t k = 0; k < 3; ++k) EXPECT_NEAR(below[k], 1.0f / 11, 1e-5f) << "white";
    EXPECT_NEAR(above[0], 1 / (11 * 0.0593), 0.001) << "blue of that luminance";
    EXPECT_NEAR(above[1], 0.0f, 1e-4f);
    EXPECT_NEAR(above[2], 0.0f, 1e-4f);
}

TEST(CompressPixelsToSDR, NothingGuardsAColourWithoutLuminance) {
    class Host : public Rec2020ColorSpace {
    public:
        Host() {
            std::fill_n(rgbToXYZ.m + 3, 3, 0.0f); // Y is always 0
            matricesValid = true;
        }
    };
    const Host host;
    const ColourPixel pixel = Converted({{0.5f, 0.5f, 0.5f, 0.25f}}, Compress(host, {1, 1, 0.5f}))[0];
    EXPECT_TRUE(std::isnan(pixel[0]) || std::isnan(pixel[2])) << "0 / 0";
    EXPECT_EQ(pixel[3], 0.25f);
}

TEST(CompressPixelsToSDR, ColoursAgreeWithDoublePrecision) {
    Random random(34);
    for (const Compressing& c : kCompressing) {
        const Matrix3<double> toXYZ = RGBToXYZOf<double>(c.space.Primaries(), c.space.WhitePoint());
        const Matrix3<double> toRGB = Inverse(toXYZ);
        for (const Settings& s : kSettings) {
            const ColourPixels pixels = UniformPixels(random, 1000, 0.01f, 6);
            const ColourPixels compressed = Converted(pixels, Compress(c.space, s));
            for (size_t i = 0; i < pixels.size(); ++i) {
                Vector3<double> linear;
                for (size_t k = 0; k < 3; ++k)
                    linear[k] = WithSignOf(c.decode, static_cast<double>(pixels[i][2 - k]));
                const auto [X, Y, Z] = Times(toXYZ, linear);
                const double bent = SlowCurve(Y, s);
                const Vector3<double> bentXYZ = {X * bent / Y, bent, Z * bent / Y};
                const Vector3<double> exact = Times(toRGB, bentXYZ);
                for (size_t k = 0; k < 3; ++k) {
                    double magnitude = 0;
                    for (size_t j = 0; j < 3; ++j) magnitude += std::abs(toRGB[k][j] * bentXYZ[j]);
                    const double tolerance = 1e-5 * magnitude + 2e-8;
                    const double least = WithSignOf(c.encode, exact[k] - tolerance),
                                 most = WithSignOf(c.encode, exact[k] + tolerance);
                    const double value = static_cast<double>(compressed[i][2 - k]);
                    ASSERT_GE(value, least - 1e-6 * std::abs(least) - 1e-7)
                        << c.name << ", seed " << random.Seed();
                    ASSERT_LE(value, most + 1e-6 * std::abs(most) + 1e-7)
                        << c.name << ", seed " << random.Seed();
                }
            }
        }
    }
}

TEST(CompressPixelsToSDR, ChromaticityIsKept) {
    Random random(35);
    const auto chromaticity = [](const ColorSpace& space, const ColourPixel& linear) {
        const CSMatrix& m = space.RGBtoXYZ();
        double XYZ[3];
        for (size_t i = 0; i < 3; ++i)
            XYZ[i] = static_cast<double>(m.m[3 * i] * linear[2] + m.m[3 * i + 1] * linear[1] +
                                         m.m[3 * i + 2] * linear[0]);
        const double sum = XYZ[0] + XYZ[1] + XYZ[2];
        return std::pair(XYZ[0] / sum, XYZ[1] / sum);
    };
    for (const ColourPixel& pixel : UniformPixels(random, 300, 0.3f, 4)) {
        const ColourPixel bent = Converted({pixel}, Compress(sRec2020, {2, 1.5f, 0.6f}))[0];
        ColourPixel linear = pixel;
        for (size_t k = 0; k < 3; ++k) linear[k] = std::pow(pixel[k], 2.4f);
        const auto [x, y] = chromaticity(sRec2020, linear);
        const auto [bentX, bentY] = chromaticity(sRec2020, bent);
        EXPECT_NEAR(bentX, x, 1e-5);
        EXPECT_NEAR(bentY, y, 1e-5);
    }
}

TEST(CompressPixelsToSDR,
     APixelDoesNotDependOnItsPlace) { // nor does any value harm in place or at a guard page
    Random random(36);
    const ColourPixels pixels = MakePixels(Content::kMixed, 200, random);
    for (const Compressing& c : kCompressing)
        for (const Settings& s :
             {kSettings[1], Settings{kNaN, 1, 0.5f}, Settings{1, 0, 0}, Settings{1, 2, 1}}) {
            const ColourPixels all = Converted(pixels, Compress(c.space, s));
            for (size_t i = 0; i < pixels.size(); ++i) {
                EXPECT_TRUE(AreSameBits(Converted({pixels[i]}, Compress(c.space, s)), {all[i]})) << c.name;
                EXPECT_EQ(Pattern(all[i][3]), Pattern(pixels[i][3])) << "alpha";
            }
        }
}

TEST(CompressPixelsToSDR, ThreeClassesDoNothing) {
    const GammaColorSpace gamma;
    const PQColorSpace pq(false, true), ownPQ(sP3.Primaries(), false);
    const HLGColorSpace hlg;
    const ColourPixels source(9, {0.5f, 0.25f, 2, 1}), untouched(9, {7, 8, 9, 10});
    for (const ColorSpace* space :
         {static_cast<const ColorSpace*>(&gamma), static_cast<const ColorSpace*>(&pq),
          static_cast<const ColorSpace*>(&ownPQ), static_cast<const ColorSpace*>(&hlg)}) {
        ColourPixels destination = untouched;
        space->CompressPixelsToSDR(source.data()->data(), destination.data()->data(), 9, 1, 1.2f, 0.5f);
        EXPECT_TRUE(AreSameBits(destination, untouched));
        space->CompressPixelsToSDR(nullptr, nullptr, 9, 1, 1.2f, 0.5f);
    }
}

TEST(CompressPixelsToSDR, NoPixelsAreNoWork) {
    for (const Compressing& c : kCompressing)
        for (const int32_t count : kNoCounts) Compress(c.space, kSettings[0])(nullptr, nullptr, count);
}

} // namespace
