#include "support/KernelTrial.h"

#include "colour/ColourKernels.h"
#include "colour/DecodeTables.h"
#include "composite/BlackKernels.h"
#include "composite/MaskKernels.h"
#include "composite/MatteKernels.h"
#include "composite/SumKernels.h"
#include "convert/BridgeKernels.h"
#include "convert/ConvertNV12toYV12Kernels.h"
#include "convert/PlanarKernels.h"
#include "dv/DVBlockKernels.h"
#include "dv/DVSampleKernels.h"
#include "filters/BoxBlurKernels.h"
#include "filters/GaussianCoefficients.h"
#include "filters/ResampleKernel.h"
#include "geometry/MotionSampleKernels.h"
#include "geometry/WarpSpan.h"
#include "primitives/BlockTransforms.h"
#include "primitives/Channels.h"
#include "primitives/Coefficients.h"
#include "primitives/ConvertFloat.h"
#include "primitives/DVMacroblocks.h"
#include "primitives/DVTransforms.h"
#include "primitives/FillPixels.h"
#include "primitives/MultiplyConstant.h"
#include "primitives/TransposeKernels.h"
#include "scale/QuarterScaleKernels.h"
#include "support/ColumnsOfBand.h"
#include "support/Random.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <memory>
#include <stdexcept>
#include <string>

namespace PKTest {
namespace {

using namespace PK;

using Sources = std::vector<const uint8_t*>;
using MakeKernelTrial = KernelTrial (*)(const KernelRow& kernel, int32_t size, Random& random);

TrialRow RowOf(const Operand& operand, int64_t elements) {
    return {operand.samples, operand.RowBytes(elements)};
}

size_t Count(int32_t size) {
    return static_cast<size_t>(size);
}

/// A typed call behind a body of the register.
template <class Function, class Call>
auto Typed(Call call) {
    return [call](AnyKernel body, const Sources& sources, uint8_t* destination) {
        call(reinterpret_cast<Function>(body), sources, destination);
    };
}

KernelTrial RowTrial(const KernelRow& kernel, int32_t size, Random&) {
    return {{RowOf(kernel.operands.source, size)},
            RowOf(kernel.operands.destination, size),
            Typed<RowKernel>([=](RowKernel run, const Sources& sources, uint8_t* destination) {
                run(sources[0], destination, size);
            })};
}

KernelTrial TwoRowTrial(const KernelRow& kernel, int32_t size, Random&) {
    return {{RowOf(kernel.operands.source, size), RowOf(kernel.operands.second, size)},
            RowOf(kernel.operands.destination, size),
            Typed<TwoRowKernel>([=](TwoRowKernel run, const Sources& sources, uint8_t* destination) {
                run(sources[0], sources[1], destination, size);
            })};
}

/// One row in and one out by constants that are drawn.
template <class Constants, Constants (*kDraw)(Random&)>
KernelTrial TrialWith(const KernelRow& kernel, int32_t size, Random& random) {
    const Constants constants = kDraw(random);
    return {{RowOf(kernel.operands.source, size)},
            RowOf(kernel.operands.destination, size),
            Typed<RowKernelWith<Constants>>(
                [=](RowKernelWith<Constants> run, const Sources& sources, uint8_t* destination) {
                    run(sources[0], destination, size, constants);
                })};
}

/// Two rows in and one out by constants that are drawn.
template <class Constants, Constants (*kDraw)(Random&)>
KernelTrial TwoRowTrialWith(const KernelRow& kernel, int32_t size, Random& random) {
    const Constants constants = kDraw(random);
    return {{RowOf(kernel.operands.source, size), RowOf(kernel.operands.second, size)},
            RowOf(kernel.operands.destination, size),
            Typed<TwoRowKernelWith<Constants>>(
                [=](TwoRowKernelWith<Constants> run, const Sources& sources, uint8_t* destination) {
                    run(sources[0], sources[1], destination, size, constants);
                })};
}

/// An opacity or weight, one in four at an end.
float DrawAmount(Random& random) {
    constexpr float kEnds[] = {0, 1, 8e-6f, 0.99999f};
    return random.Below(4) == 0 ? kEnds[random.Below(4)] : static_cast<float>(random.Next()) * 0x1p-32f;
}

ChannelPattern DrawInteger(Random& random) {
    const auto channel = static_cast<int32_t>(random.Below(4));
    return random.Below(2) ? PatternOfChannel(channel, static_cast<uint8_t>(random.Next()))
                           : PatternOfChannel(channel, static_cast<uint16_t>(random.Next()));
}
ChannelPattern DrawFloat(Random& random) {
    return PatternOfChannel(static_cast<int32_t>(random.Below(4)),
                            static_cast<float>(random.Below(7)) * 0.3f);
}
int32_t DrawScale(Random& random) {
    return static_cast<int32_t>(random.Below(40)) - 8;
}
PowerOfTwo DrawPower(Random& random) {
    return {std::ldexp(1.0f, static_cast<int32_t>(random.Below(12))),
            std::ldexp(1.0f, static_cast<int32_t>(random.Below(12)))};
}
uint32_t DrawFactors(Random& random, uint32_t limit) {
    return random.Below(limit) | random.Below(limit) << 16;
}
ChannelFactors DrawUnscaled(Random& random) {
    return {DrawFactors(random, 257), DrawFactors(random, 257), 0};
}
ChannelFactors DrawScaled(Random& random) {
    const uint32_t unit = 1u << random.Below(16);
    return {DrawFactors(random, 256), DrawFactors(random, 256), unit | unit << 16};
}

constexpr float kMatrix[9] = {0.61f, 0.32f, 0.07f, 0.12f, 0.83f, 0.11f, -0.13f, 0.21f, 0.92f};

GammaConversion DrawGamma(Random& random) {
    return {kMatrix, 2.4f, 0.45f, {0.2126f, 0.7152f, 0.0722f}, random.Below(2) != 0, random.Below(2) != 0};
}
SignalDecoding DrawPQDecoding(Random&) {
    return {kMatrix, PQDecodeTable()};
}
SignalDecoding DrawHLGDecoding(Random&) {
    return {kMatrix, HLGDecodeTable()};
}
PQEncoding DrawPQEncoding(Random& random) {
    return {kMatrix, random.Below(2) ? 1.0f : 1.7f};
}
HLGEncoding DrawHLGEncoding(Random&) {
    return {kMatrix};
}
FloatRange DrawRange(Random&) {
    return {0.1f, 0.9f};
}

/// Luma, and behind it the sums of whole pairs.
KernelTrial EncodeTrial(const KernelRow& kernel, int32_t size, Random&) {
    const size_t luma = Count(size), sums = luma / 2 * 4;
    return {{RowOf(kernel.operands.source, size)},
            {Samples::Bytes, luma + sums},
            Typed<PlanarEncodeKernels::EncodeRow>(
                [=](PlanarEncodeKernels::EncodeRow run, const Sources& sources, uint8_t* destination) {
                    std::vector<uint8_t> room(4 * luma + 2 * PlanarEncodeKernels::kGroup);
                    run(sources[0], destination, room.data(), size);
                    std::copy_n(room.data(), sums, destination + luma);
                })};
}

ChromaWeights DrawWeights(Random& random) {
    const auto first = static_cast<int32_t>(random.Below(9));
    return {first, 8 - first};
}

KernelTrial MaskTrial(const KernelRow& kernel, int32_t size, Random& random) {
    const auto bit = static_cast<int32_t>(random.Below(8));
    const size_t maskBytes = size == 0 ? 0 : Count(size + bit + 7) / 8;
    return {{RowOf(kernel.operands.source, size),
             RowOf(kernel.operands.second, size),
             {Samples::Bytes, maskBytes}},
            RowOf(kernel.operands.destination, size),
            Typed<MaskKernels::Select>(
                [=](MaskKernels::Select run, const Sources& sources, uint8_t* destination) {
                    run(sources[0], sources[1], destination, size, {sources[2], bit});
                })};
}

/// A test that tells a number.
KernelTrial AlphaTestTrial(const KernelRow& kernel, int32_t size, Random&) {
    return {{RowOf(kernel.operands.source, size)},
            RowOf(kernel.operands.destination, 1),
            Typed<AlphaTestKernels::Test>(
                [=](AlphaTestKernels::Test run, const Sources& sources, uint8_t* destination) {
                    const AlphaTest told = run(sources[0], size);
                    std::memcpy(destination, &told, sizeof told);
                })};
}

MattePixel DrawMatte(Random& random) {
    MattePixel pixel;
    random.Fill(pixel.bytes, sizeof pixel.bytes);
    return pixel;
}

/// Y, U and V, and for an average the same of the row below.
template <int kRows>
KernelTrial PlanesTrial(const KernelRow& kernel, int32_t size, Random&) {
    const TrialRow luma = RowOf(kernel.operands.source, size), chroma = RowOf(kernel.operands.second, size);
    std::vector<TrialRow> planes;
    for (int row = 0; row < kRows; ++row) planes.insert(planes.end(), {luma, chroma, chroma});
    return {planes, RowOf(kernel.operands.destination, size),
            Typed<PlanesRow>([=](PlanesRow run, const Sources& sources, uint8_t* destination) {
                run(sources.data(), destination, size);
            })};
}

KernelTrial InterleaveTrial(const KernelRow& kernel, int32_t size, Random&) {
    const TrialRow chroma = RowOf(kernel.operands.second, size);
    using Interleave = QuarterScaleKernels::Interleave;
    return {{RowOf(kernel.operands.source, size), chroma, chroma},
            RowOf(kernel.operands.destination, size),
            Typed<Interleave>([=](Interleave run, const Sources& sources, uint8_t* destination) {
                run(sources[0], sources[1], sources[2], destination, size);
            })};
}

/// Both planes are written one after the other.
KernelTrial PartPairsTrial(const KernelRow& kernel, int32_t size, Random&) {
    using PartPairs = NV12Kernels::PartPairs;
    return {{RowOf(kernel.operands.source, size)},
            RowOf(kernel.operands.destination, size),
            Typed<PartPairs>([=](PartPairs run, const Sources& sources, uint8_t* destination) {
                run(sources[0], destination, destination + size, size);
            })};
}

/// A gain, one in four at an end or beyond what bytes can show.
float DrawGain(Random& random) {
    constexpr float kEnds[] = {8e-6f, 1, 0.5f, 1e30f};
    return random.Below(4) == 0 ? kEnds[random.Below(4)] : static_cast<float>(random.Next()) * 0x1p-31f;
}

/// As many rows as the name ends in.
KernelTrial SumTrial(const KernelRow& kernel, int32_t size, Random& random) {
    std::vector<float> weights(std::stoul(std::strrchr(kernel.name, '_') + 1));
    for (float& weight : weights) weight = DrawGain(random);
    return {std::vector<TrialRow>(weights.size(), RowOf(kernel.operands.source, size)),
            RowOf(kernel.operands.destination, size),
            Typed<SumKernels::Sum>([=](SumKernels::Sum run, const Sources& sources, uint8_t* destination) {
                std::vector<WeightedRow> rows;
                for (size_t i = 0; i < weights.size(); ++i) rows.push_back({sources[i], weights[i]});
                run(rows.data(), destination, size);
            })};
}

KernelTrial FillTrial(const KernelRow& kernel, int32_t size, Random& random) {
    FillPattern pattern;
    random.Fill(pattern.bytes, FillPattern::kPeriod);
    for (size_t at = FillPattern::kPeriod; at < sizeof pattern.bytes; ++at)
        pattern.bytes[at] = pattern.bytes[at - FillPattern::kPeriod];
    using Run = decltype(FillKernels::run);
    return {{},
            RowOf(kernel.operands.destination, size),
            Typed<Run>([=](Run run, const Sources&, uint8_t* destination) {
                run(destination, Count(size), pattern);
            })};
}

/// An area of nearly `size` pixels in all.
KernelTrial TransposeTrial(const KernelRow& kernel, int32_t size, Random& random) {
    const int32_t rows = static_cast<int32_t>(random.Below(static_cast<uint32_t>(std::min(size, 79)) + 1));
    const int32_t columns = rows == 0 ? 0 : size / rows;
    const int64_t pixel = kernel.operands.source.bytes;
    using Run = decltype(TransposeKernels::pixels4);
    const TrialRow area = RowOf(kernel.operands.source, int64_t{rows} * columns);
    return {{area}, area, Typed<Run>([=](Run run, const Sources& sources, uint8_t* destination) {
                run({sources[0], columns * pixel, destination, rows * pixel, rows, columns});
            })};
}

KernelTrial TransformTrial(const KernelRow& kernel, int32_t, Random&) {
    using Transform = BlockTransformKernels::Transform;
    return {{RowOf(kernel.operands.source, 1)},
            RowOf(kernel.operands.destination, 1),
            Typed<Transform>([](Transform run, const Sources& sources, uint8_t* destination) {
                int16_t block[64];
                std::memcpy(block, sources[0], sizeof block);
                run(block, block);
                std::memcpy(destination, block, sizeof block);
            })};
}

/// A step and factors.
struct DrawnSteps {
    explicit DrawnSteps(Random& random) {
        for (float& factor : factors.raster) factor = static_cast<float>(random.Below(32768)) / 256;
        for (int i = 0; i < 64; ++i) factors.parted[i - i % 8 + i % 8 / 2 + i % 2 * 4] = factors.raster[i];
        step = static_cast<float>(1 + random.Below(416));
    }
    PK::DVFactorTable factors;
    float step;
};

KernelTrial LevelsTrial(const KernelRow& kernel, int32_t, Random& random) {
    const auto drawn = std::make_shared<DrawnSteps>(random);
    using Transform = DVTransformKernels::Transform;
    const TrialRow samples = RowOf(kernel.operands.destination, 1);
    return {{RowOf(kernel.operands.source, 1)},
            samples,
            Typed<Transform>([=](Transform run, const Sources& sources, uint8_t* destination) {
                int16_t block[64];
                std::memcpy(block, sources[0], sizeof block);
                run(block, {&drawn->factors, drawn->step}, block);
                std::memcpy(destination, block, samples.bytes);
            })};
}

KernelTrial LevelsOfFourTrial(const KernelRow& kernel, int32_t, Random& random) {
    const auto drawn = std::make_shared<std::vector<DrawnSteps>>();
    for (int i = 0; i < kDVBlocksAtOnce; ++i) drawn->emplace_back(random);
    using Transform = DVFourBlocksKernels::Transform;
    const TrialRow blocks = RowOf(kernel.operands.source, kDVBlocksAtOnce);
    return {
        {blocks}, blocks, Typed<Transform>([=](Transform run, const Sources& sources, uint8_t* destination) {
            int16_t levels[kDVBlocksAtOnce * 64], samples[kDVBlocksAtOnce * 64];
            std::memcpy(levels, sources[0], sizeof levels);
            DVSteps steps[kDVBlocksAtOnce];
            for (size_t i = 0; i < kDVBlocksAtOnce; ++i) steps[i] = {&(*drawn)[i].factors, (*drawn)[i].step};
            run(levels, steps, samples);
            std::memcpy(destination, samples, sizeof samples);
        })};
}

KernelTrial SamplesToBytesTrial(const KernelRow& kernel, int32_t, Random&) {
    using ToBytes = decltype(DVMacroblockKernels::toBytes);
    return {{RowOf(kernel.operands.source, 1)},
            RowOf(kernel.operands.destination, 1),
            Typed<ToBytes>([](ToBytes run, const Sources& sources, uint8_t* destination) {
                int16_t block[64];
                std::memcpy(block, sources[0], sizeof block);
                run(block, destination);
            })};
}

/// Four blocks to all lines, or to every second one.
KernelTrial SamplesToYUYVTrial(const KernelRow& kernel, int32_t, Random& random) {
    const auto lineStep = 1 + static_cast<int32_t>(random.Below(2));
    using ToYUYV = decltype(DVMacroblockKernels::toYUYV);
    return {{RowOf(kernel.operands.source, 4)},
            RowOf(kernel.operands.destination, 8 / lineStep),
            Typed<ToYUYV>([=](ToYUYV run, const Sources& sources, uint8_t* destination) {
                int16_t blocks[4][64];
                std::memcpy(blocks, sources[0], sizeof blocks);
                run({blocks[0], blocks[1], blocks[2], blocks[3], lineStep}, destination, 32);
            })};
}

/// Sixteen pixels of eight rows to four blocks.
KernelTrial LoadBlocksTrial(const KernelRow& kernel, int32_t, Random& random) {
    const auto bits = static_cast<int32_t>(random.Below(4));
    using Load = DVSampleKernels::Load;
    return {{RowOf(kernel.operands.source, 1)},
            RowOf(kernel.operands.destination, 1),
            Typed<Load>([=](Load run, const Sources& sources, uint8_t* destination) {
                int16_t blocks[4][64];
                run(sources[0], 32, {blocks[0], blocks[1], blocks[2], 3 * 64, bits});
                std::memcpy(destination, blocks, sizeof blocks);
            })};
}

/// Factors as those of weights or steps.
std::shared_ptr<std::vector<float>> DrawBlockFactors(Random& random, float most) {
    const auto factors = std::make_shared<std::vector<float>>(64);
    for (float& factor : *factors) factor = most * static_cast<float>(random.Below(1000)) / 1000;
    return factors;
}

const DVBlockFactors& AsBlockFactors(const std::vector<float>& factors) {
    return *reinterpret_cast<const DVBlockFactors*>(factors.data());
}

KernelTrial ScaleBlockTrial(const KernelRow& kernel, int32_t, Random& random) {
    const auto factors = DrawBlockFactors(random, 4);
    const float roundUp = DrawAmount(random);
    using Scale = decltype(DVBlockKernels::scale);
    return {{RowOf(kernel.operands.source, 1)},
            RowOf(kernel.operands.destination, 1),
            Typed<Scale>([=](Scale run, const Sources& sources, uint8_t* destination) {
                int16_t block[64];
                std::memcpy(block, sources[0], sizeof block);
                run(AsBlockFactors(*factors), roundUp, block);
                std::memcpy(destination, block, sizeof block);
            })};
}

/// A function of a block that tells a number or two.
template <class Told>
KernelTrial BlockTrial(const KernelRow& kernel, int32_t, Random&) {
    using Tell = Told (*)(const int16_t* block);
    return {{RowOf(kernel.operands.source, 1)},
            RowOf(kernel.operands.destination, 1),
            Typed<Tell>([](Tell run, const Sources& sources, uint8_t* destination) {
                int16_t block[64];
                std::memcpy(block, sources[0], sizeof block);
                const Told told = run(block);
                std::memcpy(destination, &told, sizeof told);
            })};
}

KernelTrial SumOfLogarithmsTrial(const KernelRow& kernel, int32_t, Random& random) {
    const float factor = DrawAmount(random);
    using Sum = decltype(DVBlockKernels::sumOfLogarithms);
    return {{RowOf(kernel.operands.source, 1)},
            RowOf(kernel.operands.destination, 1),
            Typed<Sum>([=](Sum run, const Sources& sources, uint8_t* destination) {
                int16_t block[64];
                std::memcpy(block, sources[0], sizeof block);
                const uint32_t sum = run(block, factor);
                std::memcpy(destination, &sum, sizeof sum);
            })};
}

/// The levels, which of them are not 0, and whether one is too large.
KernelTrial QuantiseBlockTrial(const KernelRow& kernel, int32_t, Random& random) {
    const auto factors = DrawBlockFactors(random, random.Below(2) ? 0.02f : 0.005f);
    const float roundUp = DrawAmount(random), least = static_cast<float>(1 + random.Below(3));
    using Quantise = decltype(DVBlockKernels::quantise);
    return {{RowOf(kernel.operands.source, 1)},
            RowOf(kernel.operands.destination, 1),
            Typed<Quantise>([=](Quantise run, const Sources& sources, uint8_t* destination) {
                int16_t block[64];
                std::memcpy(block, sources[0], sizeof block);
                DVLevels levels;
                run(block, {AsBlockFactors(*factors), roundUp, least}, levels);
                std::memcpy(destination, levels.level, sizeof levels.level);
                std::memcpy(destination + 64, &levels.nonZero, sizeof levels.nonZero);
                destination[72] = levels.areTooLarge ? 1 : 0;
            })};
}

KernelTrial BoxTrial(const KernelRow& kernel, int32_t size, Random& random) {
    const int32_t radius = 1 + static_cast<int32_t>(random.Below(40));
    const int32_t length = size + radius + 2;
    const BoxPass pass = {length, radius, static_cast<int32_t>(random.Below(3) * random.Below(128)),
                          random.Below(2) != 0, random.Below(2) ? ~0u : 0x00ff00ffu};
    using Run = BoxBlurKernels::Run;
    const TrialRow line = RowOf(kernel.operands.source, length);
    return {{line}, line, Typed<Run>([=](Run run, const Sources& sources, uint8_t* destination) {
                run(pass, sources[0], destination);
            })};
}

/// Nearly `size` pixels in lines of one length: a full bundle if they are many, as the operation does it.
KernelTrial GaussianTrial(const KernelRow& kernel, int32_t size, Random& random) {
    constexpr int32_t kMany = 1024;
    const int32_t lines =
        size < kMany ? 1 + static_cast<int32_t>(random.Below(kGaussianLines)) : kGaussianLines;
    const int32_t length = size / lines, count = length == 0 ? 0 : lines;
    const int32_t more = static_cast<int32_t>(random.Below(2) * random.Below(20));
    const GaussianCoefficients c =
        GaussianCoefficientsOf(0.3 + 40 * static_cast<double>(random.Next()) * 0x1p-32);
    const auto scratch =
        std::make_shared<std::vector<uint8_t>>(kGaussianLines * kGaussianPixelBytes * Count(length + more));
    const bool repeatEdge = random.Below(2) != 0;
    using Filter = GaussianBlurKernels::Filter;
    return {{RowOf(kernel.operands.source, int64_t{count} * length)},
            RowOf(kernel.operands.destination, int64_t{count} * (length + more)),
            Typed<Filter>([=](Filter run, const Sources& sources, uint8_t* destination) {
                run({sources[0], int64_t{length} * kGaussianPixelBytes, destination,
                     int64_t{length + more} * kGaussianPixelBytes, scratch->data(), count, length,
                     length + more, repeatEdge},
                    c);
            })};
}

/// A span across a small picture, whose places leave it on both sides.
KernelTrial WarpTrial(const KernelRow& kernel, int32_t size, Random& random) {
    constexpr int32_t kSide = 24;
    const auto draw = [&random](float least, float most) {
        return least + (most - least) * static_cast<float>(random.Next()) * 0x1p-32f;
    };
    WarpSource source{};
    source.stride = kSide;
    source.right = source.bottom = kSide - 1;
    source.rowScale = 1;
    source.rowStep = 1;
    source.lastRow = kSide - 1;
    source.offsetsFit = true;
    const WarpPaint paint = {static_cast<int32_t>(random.Below(256)), random.Below(2) != 0};
    const WarpSpan span = {nullptr,      size,        draw(-3, 20), draw(-3, 20),
                           draw(0, 255), draw(-2, 2), draw(-1, 1),  draw(-2, 2)};
    return {{RowOf(kernel.operands.source, kSide * kSide)},
            RowOf(kernel.operands.destination, size),
            Typed<FillWarpSpan>([=](FillWarpSpan run, const Sources& sources, uint8_t* destination) {
                WarpSource picture = source;
                picture.pixels = sources[0];
                WarpSpan here = span;
                here.pixels = destination;
                run(picture, paint, here);
            })};
}

float DrawBetween(Random& random, float least, float most) {
    return least + (most - least) * static_cast<float>(random.Next()) * 0x1p-32f;
}

/// A row across a picture of half its length, mostly inside; now and then across anything.
MotionRow DrawMotionRow(Random& random, int32_t columns, int32_t pixelBytes) {
    constexpr int32_t kRows = 16;
    constexpr float kWild[] = {NAN, INFINITY, -INFINITY, 3e38f, -1e9f, 0};
    MotionRow row{};
    row.columns = columns;
    row.left = static_cast<int32_t>(random.Below(3));
    row.top = static_cast<int32_t>(random.Below(3));
    row.right = columns / 2 + 8;
    row.bottom = kRows;
    row.rowBytes = int64_t{row.right} * pixelBytes;
    row.rotated = random.Below(2) != 0;
    row.smoothEdges = random.Below(2) != 0;
    row.isOpaque = random.Below(3) == 0;
    row.x = DrawBetween(random, -3, 3);
    row.y = DrawBetween(random, 4, 13);
    row.stepX = DrawBetween(random, 0.45f, 0.55f);
    if (row.rotated) row.stepY = DrawBetween(random, -6, 6) / static_cast<float>(columns + 1);
    float* const places[] = {&row.x, &row.y, &row.stepX, &row.stepY};
    const uint32_t kind = random.Below(8);
    if (kind == 1) *places[random.Below(4)] = DrawBetween(random, -30, 30);
    if (kind == 2) *places[random.Below(4)] = kWild[random.Below(6)];
    return row;
}

KernelTrial MotionTrial(const KernelRow& kernel, int32_t size, Random& random) {
    const MotionRow row = DrawMotionRow(random, size, kernel.operands.source.bytes);
    const auto table = std::make_shared<ResampleKernel>(2); // lives as long as the call
    const float scale = DrawBetween(random, 0.2f, 1.3f);
    if (scale > 1)
        table->ScaleForUpSample(scale);
    else
        table->ScaleForDownSample(scale, scale);
    // The columns that the kernel tells stand behind the line.
    return {{RowOf(kernel.operands.source, int64_t{row.right} * row.bottom)},
            RowOf(kernel.operands.destination, size + 1),
            Typed<SampleMotionRow>([=](SampleMotionRow run, const Sources& sources, uint8_t* destination) {
                MotionRow here = row;
                here.pixels = sources[0];
                here.kernelX = here.kernelY = {table->Weights(), table->Width()};
                ColumnsOfBand band(size);
                here.shared = band.Shared();
                const MotionSpan span = run(here, reinterpret_cast<float*>(destination));
                const float told[] = {static_cast<float>(span.first), static_cast<float>(span.count)};
                std::memcpy(destination + 16 * Count(size), told, sizeof told);
            })};
}

LineScale DrawLineScale(Random& random) {
    LineScale scale;
    for (int i = 0; i < 4; ++i) {
        scale.zero[i] = static_cast<float>(random.Below(129));
        scale.scale[i] = DrawAmount(random);
    }
    return scale;
}

struct SpecialTrial {
    const char* family;
    MakeKernelTrial make;
    const char* name = ""; ///< The beginning of the kernel's name, where the family has several kinds.
};

constexpr SpecialTrial kSpecial[] = {
    {"Channel", TrialWith<ChannelPattern, DrawFloat>, "InvertChannelRow_Float"},
    {"Channel", TrialWith<ChannelPattern, DrawInteger>},
    {"Coefficient", BlockTrial<uint32_t>, "CountZeros"},
    {"Coefficient", TrialWith<int32_t, DrawScale>},
    {"ConvertFloat", TrialWith<PowerOfTwo, DrawPower>},
    {"MultiplyConstant", TrialWith<ChannelFactors, DrawUnscaled>, "MultiplyConstantRow_Unscaled"},
    {"MultiplyConstant", TrialWith<ChannelFactors, DrawScaled>},
    {"Fill", FillTrial},
    {"Transpose", TransposeTrial, "TransposeArea"},
    {"BlockTransform", TransformTrial},
    {"DVTransform", LevelsTrial},
    {"DVFourBlocks", LevelsOfFourTrial},
    {"DVMacroblock", SamplesToBytesTrial, "SamplesToBytes"},
    {"DVMacroblock", SamplesToYUYVTrial},
    {"DVRow", PlanesTrial<1>, "FullPlanes"},
    {"DVSample", LoadBlocksTrial},
    {"DVBlock", ScaleBlockTrial, "Scale"},
    {"DVBlock", BlockTrial<DVLineDifferences>, "DVLineDifferences"},
    {"DVBlock", BlockTrial<uint32_t>, "Greatest"},
    {"DVBlock", SumOfLogarithmsTrial, "Sum"},
    {"DVBlock", QuantiseBlockTrial, "Quantise"},
    {"W210", PlanesTrial<2>, "Average"},
    {"W210", PlanesTrial<1>},
    {"PlanarDecode", TwoRowTrialWith<ChromaWeights, DrawWeights>, "Blend"},
    {"PlanarDecode", PlanesTrial<1>},
    {"PlanarWiden", PlanesTrial<1>, "FloatPlanes"},
    {"PlanarEncode", EncodeTrial, "PixelsToPlanes"},
    {"NV12", PartPairsTrial, "PartPairs"},
    {"QuarterScale", InterleaveTrial, "Interleave"},
    {"Mask", MaskTrial},
    {"Black", TrialWith<float, DrawAmount>},
    {"AlphaTest", AlphaTestTrial},
    {"Matte", TrialWith<MattePixel, DrawMatte>, "MatteComplement"},
    {"Matte", TwoRowTrial},
    {"Over", TwoRowTrialWith<float, DrawAmount>},
    {"Blend", TwoRowTrialWith<float, DrawAmount>},
    {"AlphaGain", TrialWith<float, DrawGain>},
    {"Sum", SumTrial},
    {"Dissolve", TwoRowTrialWith<float, DrawAmount>},
    {"BoxBlur", BoxTrial},
    {"MotionSample", TrialWith<LineScale, DrawLineScale>, "ScaleMotionLine"},
    {"MotionSample", MotionTrial},
    {"MotionResample", MotionTrial},
    {"GaussianBlur", GaussianTrial},
    {"WarpNearest", WarpTrial},
    {"WarpBilinear", WarpTrial},
    {"Gamma", TrialWith<GammaConversion, DrawGamma>},
    {"PQ", TrialWith<SignalDecoding, DrawPQDecoding>, "PQTo"},
    {"PQ", TrialWith<PQEncoding, DrawPQEncoding>},
    {"HLG", TrialWith<SignalDecoding, DrawHLGDecoding>, "HLGTo"},
    {"HLG", TrialWith<HLGEncoding, DrawHLGEncoding>},
    {"Clamp", TrialWith<FloatRange, DrawRange>},
};

MakeKernelTrial TrialOf(const KernelRow& kernel) {
    const std::string family = kernel.family, name = kernel.name;
    for (const SpecialTrial& special : kSpecial)
        if (family == special.family && name.starts_with(special.name)) return special.make;
    if (kernel.shape == Shape::Row) return RowTrial;
    if (kernel.shape == Shape::TwoRows) return TwoRowTrial;
    throw std::logic_error("nobody knows how to call " + family + " " + name);
}

} // namespace

KernelTrial MakeTrial(const KernelRow& kernel, int32_t size, uint64_t seed) {
    Random random(seed);
    return TrialOf(kernel)(kernel, size - size % kernel.place.group, random);
}

} // namespace PKTest
