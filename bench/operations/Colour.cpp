// Colour spaces on float pixels.

#include "operations/Operation.h"

#include <PixelKiln/ColorSpace.h>

#include <memory>

namespace OperationBench {
namespace {

constexpr size_t kBytes = 16 * static_cast<size_t>(kPixels);

const float* Floats(const uint8_t* pixels) {
    return reinterpret_cast<const float*>(pixels);
}
float* Floats(uint8_t* pixels) {
    return reinterpret_cast<float*>(pixels);
}

template <class Space, auto... kArguments>
Run FromHub(const uint8_t* source, uint8_t* destination) {
    const auto space = std::make_shared<Space>(kArguments...);
    return [=] { space->ConvertPixelsFromRec709(Floats(source), Floats(destination), kPixels, false); };
}

template <class Space, auto... kArguments>
Run ToHub(const uint8_t* source, uint8_t* destination) {
    const auto space = std::make_shared<Space>(kArguments...);
    return [=] { space->ConvertPixelsToRec709(Floats(source), Floats(destination), kPixels, false); };
}

Run ToHubClipped(const uint8_t* source, uint8_t* destination) {
    const auto space = std::make_shared<PK::Rec2020ColorSpace>();
    return [=] { space->ConvertPixelsToRec709(Floats(source), Floats(destination), kPixels, true); };
}

Run YUVToRGB(const uint8_t* source, uint8_t* destination) {
    const auto space = std::make_shared<PK::Rec2020ColorSpace>();
    return [=] { space->ConvertPixelsFromYUVtoRGB(Floats(source), Floats(destination), kPixels); };
}

Run RGBToYUV(const uint8_t* source, uint8_t* destination) {
    const auto space = std::make_shared<PK::Rec2020ColorSpace>();
    return [=] { space->ConvertPixelsFromRGBtoYUV(Floats(source), Floats(destination), kPixels); };
}

Run Clamp(const uint8_t* source, uint8_t* destination) {
    constexpr int32_t kRowBytes = 16 * kWidth;
    return [=] { PK::ClampFloatPixels(Floats(source), Floats(destination), kHeight, kRowBytes, 0.1F, 0.9F); };
}

Run Compress(const uint8_t* source, uint8_t* destination) {
    const auto space = std::make_shared<PK::Rec709ColorSpace>();
    return
        [=] { space->CompressPixelsToSDR(Floats(source), Floats(destination), kPixels, 0.1F, 1.2F, 0.7F); };
}

using PK::DCIP3ColorSpace, PK::HLGColorSpace, PK::PQColorSpace, PK::Rec2020ColorSpace, PK::SRGBColorSpace;

// clang-format off: one row an operation
const AddOperations add = {
    {"Rec. 709 to Rec. 2020", kBytes, kBytes, Samples::Floats, Against::Peer, 1, FromHub<Rec2020ColorSpace>},
    {"Rec. 2020 to Rec. 709", kBytes, kBytes, Samples::Floats, Against::Peer, 1, ToHub<Rec2020ColorSpace>},
    {"Rec. 2020 to Rec. 709, clipped", kBytes, kBytes, Samples::Floats, Against::Nothing, 0, ToHubClipped},
    {"Rec. 709 to P3", kBytes, kBytes, Samples::Floats, Against::Peer, 1, FromHub<DCIP3ColorSpace>},
    {"P3 to Rec. 709", kBytes, kBytes, Samples::Floats, Against::Peer, 1, ToHub<DCIP3ColorSpace>},
    {"Rec. 709 to PQ", kBytes, kBytes, Samples::Floats, Against::Peer, 1,
     FromHub<PQColorSpace, false, false>},
    {"PQ to Rec. 709", kBytes, kBytes, Samples::Floats, Against::Peer, 1, ToHub<PQColorSpace, false, false>},
    {"Normalised PQ to Rec. 709", kBytes, kBytes, Samples::Floats, Against::Nothing, 0,
     ToHub<PQColorSpace, false, true>},
    {"Rec. 709 to HLG", kBytes, kBytes, Samples::Floats, Against::Peer, 1, FromHub<HLGColorSpace>},
    {"HLG to Rec. 709", kBytes, kBytes, Samples::Floats, Against::Peer, 1, ToHub<HLGColorSpace>},
    {"Rec. 709 to sRGB", kBytes, kBytes, Samples::Floats, Against::Nothing, 0, FromHub<SRGBColorSpace>},
    {"YCbCr of Rec. 2020 to RGB", kBytes, kBytes, Samples::Floats, Against::Memcpy, 0.5, YUVToRGB},
    {"RGB to YCbCr of Rec. 2020", kBytes, kBytes, Samples::Floats, Against::Memcpy, 0.5, RGBToYUV},
    {"Clamp of float pixels", kBytes, kBytes, Samples::Floats, Against::Memcpy, 0.5, Clamp},
    {"Tone-range compression of Rec. 709", kBytes, kBytes, Samples::Floats, Against::Nothing, 0, Compress},
};
// clang-format on

} // namespace
} // namespace OperationBench
