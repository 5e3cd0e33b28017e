// Adds up rows of float pixels, from the first to the last, so that every body rounds alike.

#include "composite/SumKernels.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

using Pixel = Each<16>;

template <class>
using PixelOf = Pixel;

/// The sum of the pixels of all rows, stored or added to the destination.
template <class DestinationPixel, class... Pointers>
struct Sum : Groups<kLanes, DestinationPixel, PixelOf<Pointers>...> {
    static void Group(RowOf<Pointers>... rows, uint8_t* destination) {
        constexpr int kVectorBytes = 4 * kLanes;
        for (int at = 0; at < 4 * kVectorBytes; at += kVectorBytes) {
            const F32 sum = (... + LoadFloats(rows + at));
            if constexpr (DestinationPixel::kIsRead)
                Store(destination + at, LoadFloats(destination + at) + sum);
            else
                Store(destination + at, sum);
        }
    }
};

/// Takes its rows one by one out of the array.
template <int kRows, class DestinationPixel, class... Taken>
void SumRows(const uint8_t* const* rows, void* destination, int32_t width, Taken... taken) {
    if constexpr (sizeof...(Taken) == kRows)
        RunRow(Sum<DestinationPixel, Taken...>(), width, destination, taken...);
    else
        SumRows<kRows, DestinationPixel>(rows, destination, width, taken..., rows[sizeof...(Taken)]);
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
