// Adds up rows of float pixels, each times its weight, from the first to the last, so that every body rounds alike.

#include "composite/SumKernels.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

using Pixel = Each<16>;

template <class>
using PixelOf = Pixel;

/// The sum of the pixels of all rows, each times the weight of its row, stored or added to the destination.
template <class DestinationPixel, class... Pointers>
struct Sum : Groups<kLanes, DestinationPixel, PixelOf<Pointers>...> {
    static constexpr int kRows = sizeof...(Pointers);

    explicit Sum(const WeightedRow* rows) {
        for (int i = 0; i < kRows; ++i) fWeights[i] = Floats(rows[i].weight);
    }

    void Group(RowOf<Pointers>... rows, uint8_t* destination) const {
        constexpr int kVectorBytes = 4 * kLanes;
        for (int at = 0; at < 4 * kVectorBytes; at += kVectorBytes) {
            const F32 samples[] = {LoadFloats(rows + at)...};
            F32 sum = samples[0] * fWeights[0];
            for (int i = 1; i < kRows; ++i) sum = sum + samples[i] * fWeights[i];
            if constexpr (DestinationPixel::kIsRead) sum = LoadFloats(destination + at) + sum;
            Store(destination + at, sum);
        }
    }

    F32 fWeights[kRows];
};

/// Takes its rows one by one out of the array.
template <int kRows, class DestinationPixel, class... Taken>
void SumRows(const WeightedRow* rows, void* destination, int32_t width, Taken... taken) {
    if constexpr (sizeof...(Taken) == kRows)
        RunRow(Sum<DestinationPixel, Taken...>(rows), width, destination, taken...);
    else
        SumRows<kRows, DestinationPixel>(rows, destination, width, taken..., rows[sizeof...(Taken)].pixels);
}

template <int kRows>
constexpr SumKernels::Sum kStore = SumRows<kRows, Pixel>;
template <int kRows>
constexpr SumKernels::Sum kAdd = SumRows<kRows, Updated<Pixel>>;

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::SumKernels& PK::SumKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr SumKernels kernels = {
        .store = {kStore<1>, kStore<2>, kStore<3>, kStore<4>, kStore<5>, kStore<6>, kStore<7>, kStore<8>,
                  kStore<9>, kStore<10>},
        .add = {kAdd<1>, kAdd<2>, kAdd<3>, kAdd<4>, kAdd<5>, kAdd<6>, kAdd<7>, kAdd<8>, kAdd<9>, kAdd<10>},
    };
    return kernels;
}
