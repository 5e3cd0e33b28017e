// CImg's recursive filters, on one thread, in place on planes of floats.

#include "operations/Operation.h"

#define cimg_display 0
#define cimg_use_openmp 0
#include <CImg.h>

#include <memory>

namespace OperationBench {
namespace {

using Planes = cimg_library::CImg<float>;

std::shared_ptr<Planes> MakePlanes(const uint8_t* source) {
    const auto* const samples = reinterpret_cast<const float*>(source);
    const auto planes = std::make_shared<Planes>(kWidth, kHeight, 1, 4);
    for (int32_t channel = 0; channel < 4; ++channel)
        for (int32_t i = 0; i < kPixels; ++i)
            planes->data(0, 0, 0, static_cast<unsigned>(channel))[i] = samples[4 * ptrdiff_t{i} + channel];
    return planes;
}

template <int32_t kSigma>
Run Deriche(const uint8_t* source, uint8_t*) {
    return [planes = MakePlanes(source)] {
        for (const char axis : {'x', 'y'}) planes->deriche(kSigma, 0, axis);
    };
}

template <int32_t kSigma>
Run VanVliet(const uint8_t* source, uint8_t*) {
    return [planes = MakePlanes(source)] {
        for (const char axis : {'x', 'y'}) planes->vanvliet(kSigma, 0, axis);
    };
}

// On large frames they take as long for each pixel.
const bool areAdded = [] {
    if (kHeight > 1080) return false;
    AddPeers{
        {"Gaussian blur of BGRP 32f, sigma 10", "CImg deriche (planes)", false, Deriche<10>},
        {"Gaussian blur of BGRP 32f, sigma 40", "CImg deriche (planes)", false, Deriche<40>},
        {"Gaussian blur of BGRP 32f, sigma 10", "CImg vanvliet (planes)", false, VanVliet<10>},
        {"Gaussian blur of BGRP 32f, sigma 40", "CImg vanvliet (planes)", false, VanVliet<40>},
    };
    return true;
}();

} // namespace
} // namespace OperationBench
