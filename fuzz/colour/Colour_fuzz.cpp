// Colour spaces of any kind on pixels of any bits, in memory that ends where the arguments say: nothing traps or reads
// beyond a table, in place is as out of place, and what tables give is finite.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/ImageMemory.h"

#include <PixelKiln/ColorSpace.h>

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstring>
#include <functional>
#include <limits>
#include <memory>
#include <string>
#include <type_traits>
#include <vector>

namespace {

using namespace PKFuzz;
using namespace PK;

/// Any float: one of each class of bit patterns, of either sign, or around the range of video.
float DrawFloat(ByteStream& stream) {
    using Limits = std::numeric_limits<float>;
    const uint32_t fraction = stream.U32() & 0x007fffff;
    const auto pattern = [fraction](uint32_t exponent) {
        return std::bit_cast<float>(exponent << 23 | fraction);
    };
    const float magnitude = [&] {
        switch (stream.Below(10)) {
        case 0:
            return 0.0f;
        case 1:
            return pattern(0); // denormal
        case 2:
            return pattern(1 + stream.Below(254)); // any normal one
        case 3:
            return Limits::infinity();
        case 4:
            return pattern(255); // NaN, quiet or signalling, or infinite
        case 5:
            return Limits::max();
        case 6:
            return 1.0f;
        default:
            return static_cast<float>(fraction) * 0x1p-22f;
        }
    }();
    return stream.Bool() ? -magnitude : magnitude;
}

/// A parameter of a call: an ordinary one most of the time.
float DrawParameter(ByteStream& stream, float ordinary) {
    return stream.OneIn(4) ? DrawFloat(stream) : ordinary;
}

/// A space of any class, with any of its parameters.
struct DrawnSpace {
    explicit DrawnSpace(ByteStream& stream) {
        switch (stream.Below(8)) {
        case 0:
            Set("sRGB", std::make_shared<SRGBColorSpace>());
            break;
        case 1: {
            const float gamma = DrawParameter(stream, 0.45f);
            Set("gamma " + std::to_string(gamma), std::make_shared<GammaColorSpace>(gamma));
            break;
        }
        case 2:
            Set("Rec. 709", std::make_shared<Rec709ColorSpace>());
            break;
        case 3:
            Set("Rec. 2020", std::make_shared<Rec2020ColorSpace>());
            break;
        case 4: {
            const uint32_t illuminant = stream.Below(6);
            Set("P3 of illuminant " + std::to_string(illuminant),
                std::make_shared<DCIP3ColorSpace>(static_cast<PK_Illuminant>(illuminant)));
            break;
        }
        case 5:
            Set("HLG", std::make_shared<HLGColorSpace>());
            isFiniteToHub = true;
            break;
        case 6: {
            const bool isP3 = stream.Bool(), isNormalized = stream.Bool();
            Set(std::string("PQ") + (isP3 ? " of P3" : "") + (isNormalized ? ", normalised" : ""),
                std::make_shared<PQColorSpace>(isP3, isNormalized));
            isFiniteToHub = !isNormalized;
            break;
        }
        default: {
            float primaries[6] = {0.713f, 0.293f, 0.165f, 0.83f, 0.128f, 0.044f};
            for (float& p : primaries) p = DrawParameter(stream, p);
            Set("PQ of its own primaries", std::make_shared<PQColorSpace>(primaries, stream.Bool()));
        }
        }
    }

    std::string name;
    std::shared_ptr<const ColorSpace> space;
    bool isFiniteToHub = false;  ///< Decodes by a table and a sane matrix, unless the gamut is clipped.
    bool codesAnyNumber = false; ///< Its curves are defined for all numbers.

private:
    template <class Space>
    void Set(const std::string& words, std::shared_ptr<Space> made) {
        name = words;
        space = made;
        codesAnyNumber = !std::is_same_v<Space, PQColorSpace> && !std::is_same_v<Space, GammaColorSpace>;
    }
};

struct Conversion {
    std::string name;
    std::function<void(const float*, float*, int32_t)> run;
    bool keepsAlpha = true;
    bool isFinite = false;
};

Conversion DrawConversion(ByteStream& stream, const DrawnSpace& drawn) {
    const std::shared_ptr<const ColorSpace> space = drawn.space;
    const bool clip = stream.Bool();
    const std::string words = drawn.name + (clip ? ", clipped" : "");
    const auto yuv = std::dynamic_pointer_cast<const Rec2020ColorSpace>(space);
    switch (stream.Below(yuv != nullptr ? 5 : 3)) {
    case 0:
        return {"from the hub to " + words,
                [=](const float* s, float* d, int32_t n) { space->ConvertPixelsFromRec709(s, d, n, clip); }};
    case 1:
        return {"to the hub from " + words,
                [=](const float* s, float* d, int32_t n) { space->ConvertPixelsToRec709(s, d, n, clip); },
                true, drawn.isFiniteToHub && !clip};
    case 2: {
        const float exposure = DrawParameter(stream, 1), slope = DrawParameter(stream, 1.2f),
                    knee = DrawParameter(stream, 0.7f);
        return {"compression in " + drawn.name + " with exposure " + std::to_string(exposure) + ", slope " +
                    std::to_string(slope) + ", knee " + std::to_string(knee),
                [=](const float* s, float* d, int32_t n) {
                    space->CompressPixelsToSDR(s, d, n, exposure, slope, knee);
                },
                true};
    }
    case 3:
        return {"YCbCr to RGB of " + drawn.name,
                [=](const float* s, float* d, int32_t n) { yuv->ConvertPixelsFromYUVtoRGB(s, d, n); }, false};
    default:
        return {"RGB to YCbCr of " + drawn.name,
                [=](const float* s, float* d, int32_t n) { yuv->ConvertPixelsFromRGBtoYUV(s, d, n); }, false};
    }
}

std::vector<uint8_t> DrawFloats(ByteStream& stream, size_t count) {
    std::vector<uint8_t> bytes(4 * count);
    for (size_t i = 0; i < count; ++i) {
        const float x = DrawFloat(stream);
        std::memcpy(&bytes[4 * i], &x, sizeof x);
    }
    return bytes;
}

/// Pixels of a few drawn floats, mixed so that they meet one another.
std::vector<uint8_t> DrawPixels(ByteStream& stream, size_t count) {
    constexpr size_t kDrawn = 24;
    const std::vector<uint8_t> drawn = DrawFloats(stream, kDrawn);
    std::vector<uint8_t> pixels(16 * count);
    const size_t step = 2 * stream.Below(12) + 1;
    for (size_t i = 0; i < 4 * count; ++i)
        std::copy_n(&drawn[(i * step + i / kDrawn) % kDrawn * 4], 4, &pixels[4 * i]);
    return pixels;
}

/// Pixels or samples in memory of their own.
struct FloatMemory : ImageMemory {
    FloatMemory(const std::vector<uint8_t>& content, ByteStream& stream)
        : ImageMemory({content.size(), 1, 0, alignof(float)}, stream) {
        SetRows(content);
    }

    float* Data() const { return reinterpret_cast<float*>(Pixels()); }
};

float FloatAt(const std::vector<uint8_t>& bytes, size_t i) {
    float x;
    std::memcpy(&x, &bytes[4 * i], sizeof x);
    return x;
}

uint32_t WordAt(const std::vector<uint8_t>& bytes, size_t i) {
    return std::bit_cast<uint32_t>(FloatAt(bytes, i));
}

void FuzzColour(ByteStream& stream) {
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    const DrawnSpace drawn(stream);
    const Conversion conversion = DrawConversion(stream, drawn);
    const int32_t count = stream.OneIn(8) ? std::min(0, stream.AnyI32()) : stream.Between(0, 41);
    const auto pixels = static_cast<size_t>(count < 0 ? 0 : count);
    SetCall(conversion.name + ", " + std::to_string(count) + " pixels");

    const std::vector<uint8_t> content = DrawPixels(stream, pixels);
    FloatMemory source(content, stream),
        destination(content, stream); // some classes leave the destination as it is
    float *from = source.Data(), *to = destination.Data();
    CallIn(state, [&] { conversion.run(from, to, count); });
    const std::vector<uint8_t> result = destination.Rows();
    CheckSame(content, source.Rows(), "the source stays");
    CallIn(state, [&] { conversion.run(from, from, count); });
    CheckSame(result, source.Rows(), "in place is as out of place");
    source.CheckPadding();
    destination.CheckPadding();
    for (size_t i = 0; i < pixels; ++i) {
        if (conversion.keepsAlpha)
            Check(WordAt(result, 4 * i + 3) == WordAt(content, 4 * i + 3), "alpha is copied");
        if (conversion.isFinite)
            for (size_t k = 0; k < 3; ++k)
                Check(std::isfinite(FloatAt(result, 4 * i + k)),
                      "signals are limited, and so is what tables give");
    }
}

void FuzzCurvesAndMatrices(ByteStream& stream) {
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    const DrawnSpace from(stream), to(stream);
    const float value = DrawFloat(stream);
    SetCall("single values and matrices of " + from.name + " and " + to.name);
    CallIn(state, [&] {
        const float encoded = from.space->LinearToEOTF(value), linear = from.space->EOTFToLinear(value);
        if (from.codesAnyNumber && !std::isnan(value))
            Check(!std::isnan(encoded) && !std::isnan(linear), "numbers are coded as numbers");
        const CSMatrix matrix = ColorSpace::CalculateConversionMatrix(*from.space, *to.space);
        const CSMatrix again = ColorSpace::CalculateConversionMatrix(*from.space, *to.space);
        Check(std::memcmp(&matrix, &again, sizeof matrix) == 0, "the matrix is the same every time");
    });
    const std::vector<uint8_t> whites = DrawFloats(stream, 6);
    float triples[6];
    std::memcpy(triples, whites.data(), sizeof triples);
    if (stream.Bool()) std::copy_n(triples, 3, triples + 3);
    CallIn(state, [&] {
        const CSMatrix adaptation = ColorSpace::CalculateAdaptationMatrix(triples, triples + 3);
        bool ok = false;
        const CSMatrix inverse = adaptation.Inverted(&ok);
        Check(ok || std::ranges::equal(inverse.m, CSMatrix().m), "what has no inverse gives the identity");
    });
}

void FuzzClamp(ByteStream& stream) {
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    const int32_t rows = stream.OneIn(8) ? std::min(0, stream.AnyI32()) : stream.Between(0, 5);
    const int32_t rowBytes =
        stream.OneIn(8) ? std::min(3, stream.AnyI32()) : stream.Between(0, stream.OneIn(4) ? 1200 : 70);
    const float least = DrawParameter(stream, 0), most = DrawParameter(stream, 1);
    SetCall("ClampFloatPixels of " + std::to_string(rows) + " rows of " + std::to_string(rowBytes) +
            " bytes, from " + std::to_string(least) + " to " + std::to_string(most));
    // The last of two rows and more is not touched.
    const size_t passes = rows < 1 || rowBytes < 4 ? 0 : static_cast<size_t>(std::max(1, rows - 1));
    const size_t step = static_cast<size_t>(std::max(0, rowBytes));
    const size_t bytes = passes == 0 ? 0 : ((passes - 1) * step & ~size_t{3}) + (step & ~size_t{3});
    std::vector<uint8_t> content = DrawPixels(stream, bytes / 16 + 1);
    content.resize(bytes);
    FloatMemory source(content, stream), destination(content, stream);
    float *from = source.Data(), *to = destination.Data();
    CallIn(state, [&] { ClampFloatPixels(from, to, rows, rowBytes, least, most); });
    source.CheckPadding();
    destination.CheckPadding();
    // The first row is treated twice, which shows in place between limits that are crossed, be it only where denormals
    // count as zero.
    constexpr float kSmallestNormal = std::numeric_limits<float>::min();
    if (!(most - least > 4 * kSmallestNormal)) return;
    CallIn(state, [&] { ClampFloatPixels(from, from, rows, rowBytes, least, most); });
    CheckSame(destination.Rows(), source.Rows(), "in place is as out of place");
    const std::vector<uint8_t> result = destination.Rows();
    for (size_t row = 0; row < passes; ++row)
        for (size_t i = 0; i < step / 4; ++i) {
            const float x = FloatAt(result, row * step / 4 + i);
            Check(x >= least - kSmallestNormal && x <= most + kSmallestNormal,
                  "samples are between the limits");
        }
}

const Family sColour('C', "colour", FuzzColour);
const Family sCurvesAndMatrices('M', "colour-matrices", FuzzCurvesAndMatrices);
const Family sClamp('L', "clamp", FuzzClamp);

} // namespace
