// Copies and reductions of planar images.

#include "results/Formats.h"
#include "results/Lines.h"
#include "results/OddCalls.h"
#include "results/PlaneImages.h"

#include <PixelKiln/Planar.h>
#include <PixelKiln/QuarterScale.h>

namespace {

using namespace PKResults;

struct Shape {
    int32_t width, height;
    Walk from, to;
};

constexpr Shape kShapes[] = {
    {1, 1, kTight, kTight},       {2, 2, kTight, kTight},   {3, 5, kSpread, kTight},
    {30, 8, kTight, kUpwards},    {32, 7, kTight, kTight},  {63, 9, kSpread, kSpread},
    {64, 4, kUpwards, kSpread},   {65, 6, kTight, kTight},  {131, 22, kUpwards, kTight},
    {258, 11, kSpread, kUpwards}, {640, 12, kTight, kTight}};

/// Planes of 4:2:0 with rows so many times as long.
PlaneImages Planes(int32_t width, int32_t height, const Walk& walk, Random& random, int32_t times = 1) {
    return {static_cast<size_t>(times * width),
            height,
            static_cast<size_t>(times * (width / 2)),
            height / 2,
            walk,
            random};
}

std::string NameOf(const Shape& shape) {
    return std::to_string(shape.width) + "x" + std::to_string(shape.height);
}

void Copy(Line& line, const Shape& shape) {
    PlaneImages source = Planes(shape.width, shape.height, shape.from, line.random);
    PlaneImages destination = Planes(shape.width, shape.height, shape.to, line.random);
    line.results.Add(PK_CopyPlanar_8u(source.Sources().data(), source.Steps().data(),
                                      destination.Destinations().data(), destination.Steps().data(),
                                      shape.width, shape.height));
    destination.AddTo(line.results);
}

void Reduce(Line& line, const Shape& shape, int32_t field) {
    PlaneImages source = Planes(shape.width, shape.height, shape.from, line.random, 2);
    PlaneImages destination = Planes(shape.width, shape.height, shape.to, line.random);
    line.results.Add(PK_QuarterScalePlanar420_8u(
        source.Sources().data(), source.Steps().data(), destination.Destinations().data(),
        destination.Steps().data(), static_cast<uint32_t>(shape.width), static_cast<uint32_t>(shape.height),
        field));
    destination.AddTo(line.results);
}

void Pack(Line& line, const Shape& shape, bool yuyvOrder, int32_t field) {
    const size_t pairs = static_cast<size_t>(shape.width + 1) / 2;
    PlaneImages source(static_cast<size_t>(shape.width), shape.height, pairs, shape.height / 2, shape.from,
                       line.random);
    Image destination(4 * pairs, shape.height / 2, shape.to, line.random);
    line.results.Add(PK_QuarterScalePlanar_8uAndConvertTo422_8u(
        source.Sources().data(), source.Steps().data(), destination.First(), destination.Step(),
        static_cast<uint32_t>(shape.width), static_cast<uint32_t>(shape.height), yuyvOrder, field));
    destination.AddTo(line.results);
}

/// A surface, and the planes of all of it or of a field.
template <int kMember>
void Part(Line& line, const Shape& shape) {
    constexpr int32_t kTimes = 1 + kMember;
    Image luma(static_cast<size_t>(shape.width), kTimes * shape.height, shape.from, line.random);
    Image chroma(static_cast<size_t>(shape.width / 2 * 2), kTimes * (shape.height / 2), shape.from,
                 line.random);
    PlaneImages destination = Planes(shape.width, shape.height, shape.to, line.random);
    PK_ConvertNV12toYV12_SSE4<kMember>(luma.First(), luma.Step(), chroma.First(), chroma.Step(),
                                       destination.Destinations().data(), destination.Steps().data(),
                                       shape.width, shape.height);
    destination.AddTo(line.results);
}

struct Decoding {
    int32_t width, height, toWidth, toHeight;
};

/// The whole, a field, a quarter, ratios, wider rows, and what is refused.
constexpr Decoding kDecodings[] = {
    {1, 1, 1, 1},    {2, 2, 2, 2},    {3, 5, 3, 5},     {33, 7, 33, 7},  {130, 9, 130, 9},
    {31, 8, 31, 4},  {64, 6, 64, 3},  {41, 9, 20, 4},   {66, 8, 33, 4},  {24, 12, 6, 3},
    {64, 16, 8, 2},  {40, 24, 40, 4}, {16, 5, 24, 5},   {96, 6, 128, 3}, {192, 5, 256, 5},
    {48, 12, 16, 2}, {48, 12, 24, 4}, {48, 12, 48, 13}, {0, 4, 0, 4},    {8, 4, 0, 2},
};

constexpr PK_PixelFormat kDecodedTo[] = {
    PK_PixelFormat_VUYX_4444_8u, PK_PixelFormat_VUYX_4444_8u_709, PK_PixelFormat_VUYA_4444_32f,
    PK_PixelFormat_UYVY_422_8u,  PK_PixelFormat_YUYV_422_8u_709,  PK_PixelFormat_V210_422_10u,
    PK_PixelFormat_BGRA_4444_8u, PK_PixelFormat_ARGB_4444_32f,    PK_PixelFormat_RGB_444_10u,
};

void Decode(Line& line, const Decoding& job, PK_PixelFormat from, PK_PixelFormat to) {
    for (const int32_t field : {0, 1, 2})
        for (const int32_t quality : {1, 4}) {
            PlaneImages source = Planes(job.width, job.height, field == 1 ? kUpwards : kSpread, line.random);
            Image destination(static_cast<size_t>(PK_PixelFormatPackedRowBytes(to, job.toWidth)),
                              job.toHeight, field == 2 ? kUpwards : kSpread, line.random);
            line.results.Add(PK::DecompressYUV_420_8u(
                source.Sources().data(), source.Steps().data(), job.width, job.height, from,
                destination.First(), destination.Step(), job.toWidth, job.toHeight, to, field, quality));
            destination.AddTo(line.results);
        }
}

void AddDecodings(Lines& lines) {
    for (const PK_PixelFormat from : kStreams) {
        if (from >> 24 < 9) continue;
        for (const PK_PixelFormat to : kDecodedTo)
            lines.Add("decode/" + PKResults::NameOf(from) + "/" + PKResults::NameOf(to), [=](Line& line) {
                for (const Decoding& job : kDecodings) Decode(line, job, from, to);
            });
    }
}

void AddShapes(Lines& lines) {
    for (const Shape& shape : kShapes) {
        lines.Add("part/" + NameOf(shape), [&](Line& line) { Part<0>(line, shape); });
        lines.Add("part-field/" + NameOf(shape), [&](Line& line) { Part<1>(line, shape); });
        lines.Add("copy/" + NameOf(shape), [&](Line& line) { Copy(line, shape); });
        for (const int32_t field : {-1, 0, 1, 2, 3}) {
            const std::string name = NameOf(shape) + "/" + std::to_string(field);
            lines.Add("reduce/" + name, [&](Line& line) { Reduce(line, shape, field); });
            lines.Add("pack-uyvy/" + name, [&](Line& line) { Pack(line, shape, false, field); });
            lines.Add("pack-yuyv/" + name, [&](Line& line) { Pack(line, shape, true, field); });
        }
    }
    static constexpr Shape kBands = {210, 97, kSpread, kUpwards};
    lines.Add("part/" + NameOf(kBands), [](Line& line) { Part<0>(line, kBands); });
    lines.Add("part-field/" + NameOf(kBands), [](Line& line) { Part<1>(line, kBands); });
    lines.Add("copy/1024x512", [](Line& line) { Copy(line, {1024, 512, kTight, kTight}); }); // past the cache
}

/// The calls that have nulls among their pointers: the arrays first, then what is in them.
struct Given {
    Given(PlaneImages& source, PlaneImages& destination, Nulls nulls)
        : from(source.Sources()), to(destination.Destinations()) {
        for (size_t i = 0; i < 3; ++i) {
            from[i] = nulls(static_cast<int>(4 + i), from[i]);
            to[i] = nulls(static_cast<int>(7 + i), to[i]);
        }
    }

    std::array<const void*, 3> from;
    std::array<void*, 3> to;
};

template <class Call>
void AddOdd(Lines& lines, const std::string& name, Call call) {
    AddOddCalls(lines, name, 10, [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
        PlaneImages source = Planes(kOddWidth, kOddHeight, kTight, line.random, 2);
        PlaneImages destination = Planes(kOddWidth, kOddHeight, kTight, line.random);
        Given given(source, destination, nulls);
        const auto sourceSteps = source.Steps(), destinationSteps = destination.Steps();
        line.results.Add(call(nulls(0, given.from.data()), nulls(1, sourceSteps.data()),
                              nulls(2, given.to.data()), nulls(3, destinationSteps.data()), width, height));
        destination.AddTo(line.results);
    });
}

using Sources = const void* const*;
using Destinations = void* const*;
using Steps = const int32_t*;

void AddAllOdd(Lines& lines) {
    AddOdd(lines, "copy",
           [](Sources from, Steps fromSteps, Destinations to, Steps toSteps, int32_t width, int32_t height) {
               return PK_CopyPlanar_8u(from, fromSteps, to, toSteps, width, height);
           });
    AddOdd(lines, "reduce",
           [](Sources from, Steps fromSteps, Destinations to, Steps toSteps, int32_t width, int32_t height) {
               return PK_QuarterScalePlanar420_8u(from, fromSteps, to, toSteps, static_cast<uint32_t>(width),
                                                  static_cast<uint32_t>(height), 1);
           });
    // Packed rows go to the first plane, which has room for them.
    AddOdd(lines, "pack",
           [](Sources from, Steps fromSteps, Destinations to, Steps, int32_t width, int32_t height) {
               return PK_QuarterScalePlanar_8uAndConvertTo422_8u(
                   from, fromSteps, to == nullptr ? nullptr : to[0], 12, static_cast<uint32_t>(width),
                   static_cast<uint32_t>(height), false, 1);
           });
}

/// The two planes of the surface are the first two of the source.
template <int kMember>
void AddOddParts(Lines& lines, const std::string& name) {
    AddOddCalls(lines, name, 7, [](Line& line, Nulls nulls, int32_t width, int32_t height) {
        PlaneImages source = Planes(kOddWidth, kOddHeight, kTight, line.random, 2);
        PlaneImages destination = Planes(kOddWidth, kOddHeight, kTight, line.random);
        auto planes = destination.Destinations();
        for (size_t i = 0; i < 3; ++i) planes[i] = nulls(static_cast<int>(4 + i), planes[i]);
        const auto steps = destination.Steps();
        PK_ConvertNV12toYV12_SSE4<kMember>(nulls(0, source.Plane(0).First()), source.Plane(0).Step() / 2,
                                           nulls(1, source.Plane(1).First()), source.Plane(1).Step() / 2,
                                           nulls(2, planes.data()), nulls(3, steps.data()), width, height);
        destination.AddTo(line.results);
    });
}

void AddPlanar(Lines& lines) {
    AddOddParts<0>(lines, "part");
    AddOddParts<1>(lines, "part-field");
    AddShapes(lines);
    AddDecodings(lines);
    AddAllOdd(lines);
}

const Family sPlanar("planar", AddPlanar);

} // namespace
