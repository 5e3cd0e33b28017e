// The matrices between BT.601 and BT.709, against their formulas restated for one pixel.

#include "convert/MatrixKernels.h"

namespace PKTest {
namespace {

using enum PK::Kernel;
using Bytes = Quad<uint8_t>;
using Floats = Quad<float>;

Floats To709(Floats vuya) {
    const float v = vuya[0], u = vuya[1], y = vuya[2];
    return {0.07504945f * u + 1.02532709f * v, 1.01863968f * u + 0.11461795f * v,
            y - 0.11554975f * u - 0.20793764f * v, vuya[3]};
}

Floats To601(Floats vuya) {
    const float v = vuya[0], u = vuya[1], y = vuya[2];
    return {-0.07245296f * u + 0.98339784f * v, 0.98985380f * u - 0.11065251f * v,
            y + 0.09931166f * u + 0.19169955f * v, vuya[3]};
}

template <Floats (*kConvert)(Floats)>
Bytes Codes(Bytes vuya) {
    const Floats result = kConvert({vuya[0] - 128.0f, vuya[1] - 128.0f, vuya[2] - 16.0f, 0});
    return {NearestCode(result[0] + 128), NearestCode(result[1] + 128), NearestCode(result[2] + 16), vuya[3]};
}

/// Both pixels of a pair have the pair's chroma.
template <Floats (*kConvert)(Floats)>
Bytes UYVY(Bytes uyvy) {
    const Bytes first = Codes<kConvert>({uyvy[2], uyvy[0], uyvy[1], 0});
    const Bytes second = Codes<kConvert>({uyvy[2], uyvy[0], uyvy[3], 0});
    return {first[1], first[2], first[0], second[2]};
}

template <Floats (*kConvert)(Floats)>
Bytes YUYV(Bytes yuyv) {
    const Bytes uyvy = UYVY<kConvert>({yuyv[1], yuyv[0], yuyv[3], yuyv[2]});
    return {uyvy[1], uyvy[0], uyvy[3], uyvy[2]};
}

constexpr MatrixRule<uint8_t, uint8_t> kCodeRules[] = {
    {YUV601To709Row, Codes<To709>},    {YUV709To601Row, Codes<To601>},    {UYVY601To709Row, UYVY<To709>, 2},
    {UYVY709To601Row, UYVY<To601>, 2}, {YUYV601To709Row, YUYV<To709>, 2}, {YUYV709To601Row, YUYV<To601>, 2},
};
constexpr MatrixRule<float, float> kFloatRules[] = {{YUV601To709Float32Row, To709},
                                                    {YUV709To601Float32Row, To601}};

TEST(YUVToYUV, GreysStay) {
    for (const PK::Kernel kernel : {YUV601To709Row, YUV709To601Row})
        for (const uint8_t luma : std::initializer_list<uint8_t>{0, 1, 16, 127, 235, 254, 255})
            ExpectValue(kernel, Bytes{128, 128, luma, 200}, Bytes{128, 128, luma, 200});
    for (const PK::Kernel kernel : {UYVY601To709Row, UYVY709To601Row})
        ExpectValue(kernel, Bytes{128, 1, 128, 254}, Bytes{128, 1, 128, 254});
    for (const PK::Kernel kernel : {YUYV601To709Row, YUYV709To601Row})
        ExpectValue(kernel, Bytes{1, 128, 254, 128}, Bytes{1, 128, 254, 128});
}

TEST(YUVToYUV, RedGoesToRed) {
    ExpectValue(YUV601To709Row, Bytes{240, 90, 81, 5}, Bytes{240, 102, 62, 5}); // 239.98 102.13 62.10
    ExpectValue(YUV709To601Row, Bytes{240, 102, 63, 5}, Bytes{240, 90, 82, 5}); // 240.02 89.87 81.89
}

TEST(YUVToYUV, PairSharesItsChroma) {
    ExpectValue(UYVY601To709Row, Bytes{90, 81, 240, 100}, Bytes{102, 62, 240, 81}); // Y1 81.10
    ExpectValue(YUYV601To709Row, Bytes{81, 90, 100, 240}, Bytes{62, 102, 81, 240});
    ExpectValue(UYVY709To601Row, Bytes{102, 63, 240, 100}, Bytes{90, 82, 240, 119}); // Y1 118.89
    ExpectValue(YUYV709To601Row, Bytes{63, 102, 100, 240}, Bytes{82, 90, 119, 240});
}

TEST(YUVToYUV, CodesAreLimited) {
    ExpectValue(YUV601To709Row, Bytes{0, 0, 255, 5}, Bytes{0, 0, 255, 5});
    ExpectValue(YUV601To709Row, Bytes{255, 255, 0, 5}, Bytes{255, 255, 0, 5});
    ExpectValue(UYVY709To601Row, Bytes{255, 255, 255, 0}, Bytes{240, 255, 244, 37}); // 239.66 243.69 36.96
}

TEST(YUVToYUV, FloatsHaveNoOffsets) {
    ExpectValue(YUV601To709Float32Row, Floats{0, 0, 0.5f, 2}, Floats{0, 0, 0.5f, 2});
    ExpectValue(YUV601To709Float32Row, Floats{0, 1, 0, 2}, Floats{0.07504945f, 1.01863968f, -0.11554975f, 2});
    ExpectValue(YUV601To709Float32Row, Floats{1, 0, 0, 2}, Floats{1.02532709f, 0.11461795f, -0.20793764f, 2});
    ExpectValue(YUV709To601Float32Row, Floats{0, 1, 0, 2}, Floats{-0.07245296f, 0.98985380f, 0.09931166f, 2});
    ExpectValue(YUV709To601Float32Row, Floats{1, 0, 0, 2}, Floats{0.98339784f, -0.11065251f, 0.19169955f, 2});
}

TEST(YUVToYUV, OddWidthConvertsTheWholeLastPair) {
    for (const auto& rule : kCodeRules) {
        if (rule.pixelsInUnit == 1) continue;
        for (int32_t pairs = 1; pairs <= 20; ++pairs) {
            const auto source = RandomUnits<uint8_t>(static_cast<size_t>(pairs), 3);
            ForEachBody(rule.kernel, [&](PK::Target, PK::RowKernel body) {
                std::vector<Bytes> odd(source.size()), even(source.size());
                body(source.data(), odd.data(), 2 * pairs - 1);
                body(source.data(), even.data(), 2 * pairs);
                EXPECT_EQ(odd, even) << "pairs " << pairs;
            });
        }
    }
}

TEST(YUVToYUV, AllCodes) {
    for (const auto& rule : kCodeRules) ASSERT_NO_FATAL_FAILURE(ExpectAllCodes(rule));
}

TEST(YUVToYUV, AllLengths) {
    for (const auto& rule : kCodeRules) ExpectAllLengths(rule);
    for (const auto& rule : kFloatRules) ExpectAllLengths(rule);
}

TEST(YUVToYUV, AllRoundingModes) {
    for (const auto& rule : kCodeRules) ExpectAllRoundingModes(rule);
    for (const auto& rule : kFloatRules) ExpectAllRoundingModes(rule);
}

TEST(YUVToYUV, InPlace) {
    for (const auto& rule : kCodeRules) ExpectInPlace(rule);
    for (const auto& rule : kFloatRules) ExpectInPlace(rule);
}

} // namespace
} // namespace PKTest
