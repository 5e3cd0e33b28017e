// Bridges to codecs from planes of ten bits in words.

#include "results/Lines.h"
#include "results/OddCalls.h"
#include "results/PlaneImages.h"

#include <PixelKiln/CodecBridges.h>

namespace {

using namespace PKResults;

struct Shape {
    int32_t width, height;
    Walk from, to;
};

constexpr Walk kLoose = {2, 6, false}, kLooseUpwards = {6, 10, true}; // steps of whole words
constexpr Shape kShapes[] = {{1, 1, kTight, kTight},         {2, 2, kLoose, kSpread},
                             {5, 4, kTight, kSpread},        {6, 3, kTight, kTight},
                             {13, 5, kLooseUpwards, kTight}, {24, 4, kLoose, kUpwards},
                             {47, 6, kTight, kUpwards},      {96, 4, kTight, kTight},
                             {101, 5, kLoose, kTight},       {386, 4, kTight, kSpread}};

PlaneImages TenBits(const Shape& shape, bool isOrdinary, Random& random) {
    const auto luma = static_cast<size_t>(2 * shape.width),
               chroma = static_cast<size_t>((shape.width + 1) / 2 * 2);
    PlaneImages planes(luma, shape.height, chroma, shape.height, shape.from, random);
    if (!isOrdinary) return planes;
    for (size_t i = 0; i < 3; ++i)
        for (int32_t row = 0; row < shape.height; ++row) {
            uint8_t* const samples = planes.Plane(i).Row(row);
            for (size_t at = 1; at < planes.Plane(i).RowLength(); at += 2) samples[at] &= 3;
        }
    return planes;
}

size_t V210Length(int32_t width) {
    return static_cast<size_t>((width + 5) / 6 * 16);
}

PK_Result ConvertReducedField1(const void* const planes[3], const int32_t rowBytes[3], int32_t width,
                               int32_t height, void* destination, int32_t destinationRowBytes) noexcept {
    return PK_ConvertW210toQuarterResVUYX_8u(planes, rowBytes, width, height, destination,
                                             destinationRowBytes, 1);
}

PK_Result ConvertReducedField2(const void* const planes[3], const int32_t rowBytes[3], int32_t width,
                               int32_t height, void* destination, int32_t destinationRowBytes) noexcept {
    return PK_ConvertW210toQuarterResVUYX_8u(planes, rowBytes, width, height, destination,
                                             destinationRowBytes, 2);
}

struct Bridge {
    const char* name;
    decltype(&PK_ConvertW210toV210) convert;
    size_t (*rowLength)(int32_t width);
    int32_t (*rows)(int32_t height);
};

constexpr Bridge kBridges[] = {
    {"w210-v210", PK_ConvertW210toV210, V210Length, [](int32_t height) { return height; }},
    {"w210-v210-double", PK_TempConvertW210toV210ToReplacePanasonicLTDebayering, V210Length,
     [](int32_t height) { return 2 * height; }},
    {"w210-v210-quarter", PK_QuarterScaleConvertW210toV210,
     [](int32_t width) { return V210Length(width / 2); }, [](int32_t height) { return height / 2; }},
    {"w210-vuyx-field-1", ConvertReducedField1,
     [](int32_t width) { return static_cast<size_t>(width / 2 * 4); },
     [](int32_t height) { return height / 2; }},
    {"w210-vuyx-field-2", ConvertReducedField2,
     [](int32_t width) { return static_cast<size_t>(width / 2 * 4); },
     [](int32_t height) { return height / 2; }},
};

void Convert(Line& line, const Bridge& bridge, const Shape& shape, bool isOrdinary) {
    PlaneImages planes = TenBits(shape, isOrdinary, line.random);
    Image destination(bridge.rowLength(shape.width), bridge.rows(shape.height), shape.to, line.random);
    line.results.Add(bridge.convert(planes.Sources().data(), planes.Steps().data(), shape.width, shape.height,
                                    destination.First(), destination.Step()));
    destination.AddTo(line.results);
}

void AddOdd(Lines& lines, const Bridge& bridge) {
    const Shape shape = {kOddWidth, kOddHeight, kTight, kTight};
    const auto odd = [&](Line& line, Nulls nulls, int32_t width, int32_t height) {
        PlaneImages planes = TenBits(shape, true, line.random);
        Image destination(bridge.rowLength(shape.width), bridge.rows(shape.height), shape.to, line.random);
        const auto sources = planes.Sources();
        const auto steps = planes.Steps();
        const void* const given[] = {nulls(3, sources[0]), nulls(4, sources[1]), nulls(5, sources[2])};
        line.results.Add(bridge.convert(nulls(0, given), nulls(1, steps.data()), width, height,
                                        nulls(2, destination.First()), destination.Step()));
        destination.AddTo(line.results);
    };
    AddOddCalls(lines, bridge.name, 6, odd);
    lines.Add(std::string(bridge.name) + "/odd/too-wide",
              [&](Line& line) { odd(line, Nulls::None(), 134217728, 1); });
}

/// Rows of less room than the last group takes.
void AddNarrow(Lines& lines, const Bridge& bridge) {
    for (const int32_t room : {0, 7, 16, 28, 31, 32, 47, 48})
        lines.Add(std::string(bridge.name) + "/narrow/" + std::to_string(room), [&](Line& line) {
            constexpr Shape shape = {17, 4, kTight, kTight};
            PlaneImages planes = TenBits(shape, true, line.random);
            Image destination(size_t{64}, 8, kTight, line.random);
            line.results.Add(bridge.convert(planes.Sources().data(), planes.Steps().data(), shape.width,
                                            shape.height, destination.First(), room));
            destination.AddTo(line.results);
        });
}

void AddBridges(Lines& lines) {
    for (const Bridge& bridge : kBridges) {
        for (const bool isOrdinary : {true, false})
            lines.Add(std::string(bridge.name) + (isOrdinary ? "/ten-bits" : "/any-bits"), [&](Line& line) {
                for (const Shape& shape : kShapes) Convert(line, bridge, shape, isOrdinary);
            });
        AddOdd(lines, bridge);
    }
    for (const Bridge* bridge : {&kBridges[0], &kBridges[1], &kBridges[2]}) AddNarrow(lines, *bridge);
    lines.Add("w210-vuyx-other-fields", [](Line& line) {
        for (const int32_t field : {0, 3, -1}) {
            PlaneImages planes = TenBits(kShapes[8], true, line.random);
            Image destination(size_t{4} * (101 / 2), 5 / 2, kTight, line.random);
            line.results.Add(PK_ConvertW210toQuarterResVUYX_8u(planes.Sources().data(), planes.Steps().data(),
                                                               101, 5, destination.First(),
                                                               destination.Step(), field));
            destination.AddTo(line.results);
        }
    });
}

const Family sPlanarBridges("planar-bridges", AddBridges);

} // namespace
