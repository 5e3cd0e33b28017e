// Bridges to codecs, by how they are called: from image to image, in place, from planes.

#include "stress/Calls.h"
#include "stress/Operation.h"

#include <PixelKiln/CodecBridges.h>

#include <array>

namespace {

using namespace PKStress;

constexpr int32_t kWidth = 97, kHeight = 22; // odd: ends of rows take part
constexpr int32_t kV210Bytes = (kWidth + 5) / 6 * 16;

std::vector<uint8_t> RandomRows(int32_t rowBytes, int32_t rows, PKTest::Random& random) {
    return random.Bytes(static_cast<size_t>(rowBytes) * static_cast<size_t>(rows));
}

struct RowBridge {
    decltype(&PK_ConvertRGB_444_8uToBGRA_4444_8u) convert;
    int32_t sourceRowBytes, destinationRowBytes;
};

constexpr RowBridge kRowBridges[] = {
    {PK_ConvertRGB_444_8uToBGRA_4444_8u, 3 * kWidth, 4 * kWidth},
    {PK_ConvertUYVY_422_10uToV210_422_10u, 4 * kWidth, kV210Bytes},
    {PK_Convert_j2k_V210_To_10_Bits_Within_UYVY16u, kV210Bytes, 4 * kWidth},
    {PK_Convert_j2k_BGR16u_To_RGB_444_10u, 6 * kWidth, 4 * kWidth},
    {PK_Convert_j2k_RGB_444_10u_To_10_Bits_Within_BGR16u, 4 * kWidth, 6 * kWidth},
};

PK_Result ConvertRGB16ToXRGB15(const void* source, void* destination, int32_t width,
                               int32_t height) noexcept {
    PK_ConvertRGB_444_16u_To_XRGB_4444_15u(source, destination, width, height);
    return PK_Success;
}

struct TightBridge {
    decltype(&PK_Convert_DNxHD16u_To_RGB_444_10u) convert;
    int32_t sourceRowBytes, destinationRowBytes; // what the bridge takes them to be
};

constexpr TightBridge kTightBridges[] = {
    {PK_Convert_DNxHD16u_To_RGB_444_10u, 8 * kWidth, 4 * kWidth},
    {PK_Convert_RGB_444_10u_To_DNxHD16u, 4 * kWidth, 8 * kWidth},
    {ConvertRGB16ToXRGB15, 6 * kWidth, 8 * kWidth},
};

std::function<bool()> PrepareRowBridges() {
    PKTest::Random random(31);
    std::vector<Call> calls;
    for (const RowBridge& bridge : kRowBridges)
        calls.push_back(
            {RandomRows(bridge.destinationRowBytes, kHeight, random),
             [bridge, source = RandomRows(bridge.sourceRowBytes, kHeight, random)](uint8_t* image) {
                 return bridge.convert(source.data(), bridge.sourceRowBytes, image,
                                       bridge.destinationRowBytes, kWidth, kHeight);
             }});
    for (const TightBridge& bridge : kTightBridges)
        calls.push_back(
            {RandomRows(bridge.destinationRowBytes, kHeight, random),
             [bridge, source = RandomRows(bridge.sourceRowBytes, kHeight, random)](uint8_t* image) {
                 return bridge.convert(source.data(), image, kWidth, kHeight);
             }});
    return Repeat(calls);
}

std::function<bool()> PrepareInPlaceBridges() {
    PKTest::Random random(32);
    constexpr int32_t kPairBytes = 8 * kWidth, kPixelBytes = 16 * kWidth;
    std::vector<Call> calls = {
        {RandomRows(kPairBytes, kHeight, random),
         [](uint8_t* image) {
             return PK_Convert_j2k_UYVY_422_32f_Offset_In_Place(image, kPairBytes, kWidth, kHeight);
         }},
        {RandomRows(kPixelBytes, kHeight, random), [](uint8_t* image) {
             return PK_Convert_j2k_ZYXx_32f_To_BGRX_32f_In_Place(image, kPixelBytes, kWidth, kHeight);
         }}};
    for (const bool byteSwap : {false, true})
        calls.push_back({RandomRows(8 * kWidth, kHeight, random), [byteSwap](uint8_t* image) {
                             return PK_Scale16uBufferTo15uSIMD(image, 8 * kWidth, kWidth, kHeight, byteSwap);
                         }});
    return Repeat(calls);
}

/// Y, U and V of ten bits in 16.
struct Planes {
    static constexpr int32_t kRowBytes[3] = {2 * kWidth, kWidth + 1, kWidth + 1};

    explicit Planes(PKTest::Random& random) {
        for (size_t i = 0; i < 3; ++i)
            for (int32_t sample = 0; sample < kRowBytes[i] / 2 * kHeight; ++sample)
                samples[i].push_back(static_cast<uint16_t>(random.Below(1024)));
    }
    std::array<const void*, 3> Pointers() const {
        return {samples[0].data(), samples[1].data(), samples[2].data()};
    }

    std::vector<uint16_t> samples[3];
};

struct PlanarBridge {
    decltype(&PK_ConvertW210toV210) convert;
    int32_t rowBytes, rows; // of the destination
};

constexpr PlanarBridge kPlanarBridges[] = {
    {PK_ConvertW210toV210, kV210Bytes, kHeight},
    {PK_TempConvertW210toV210ToReplacePanasonicLTDebayering, kV210Bytes, 2 * kHeight},
    {PK_QuarterScaleConvertW210toV210, (kWidth / 2 + 5) / 6 * 16, kHeight / 2},
};

std::function<bool()> PreparePlanarBridges() {
    PKTest::Random random(33);
    const Planes planes(random);
    std::vector<Call> calls;
    for (const PlanarBridge& bridge : kPlanarBridges)
        calls.push_back({RandomRows(bridge.rowBytes, bridge.rows, random), [bridge, planes](uint8_t* image) {
                             return bridge.convert(planes.Pointers().data(), Planes::kRowBytes, kWidth,
                                                   kHeight, image, bridge.rowBytes);
                         }});
    constexpr int32_t kHalfBytes = kWidth / 2 * 4;
    for (const int32_t field : {1, 2})
        calls.push_back({RandomRows(kHalfBytes, kHeight / 2, random), [field, planes](uint8_t* image) {
                             return PK_ConvertW210toQuarterResVUYX_8u(planes.Pointers().data(),
                                                                      Planes::kRowBytes, kWidth, kHeight,
                                                                      image, kHalfBytes, field);
                         }});
    return Repeat(calls);
}

const Operation sRowBridges("row-bridges", PrepareRowBridges);
const Operation sInPlaceBridges("in-place-bridges", PrepareInPlaceBridges);
const Operation sPlanarBridges("planar-bridges", PreparePlanarBridges);

} // namespace
