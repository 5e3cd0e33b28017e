// PK_ScaleConvert, to half of each side.

#include "Reducer.h"

#include "Failure.h"

#include <algorithm>

namespace Scaling {
namespace {

void Halve(const tool::Frame& source, tool::Frame& result, int32_t quality) {
    tool::Require(PK_ScaleConvert(source.Pixels(), source.RowBytes(), source.Width(), source.Height(),
                                  source.Format(), 0, result.Pixels(), result.RowBytes(), result.Width(),
                                  result.Height(), result.Format(), 0, quality),
                  "scale", source);
}

template <int32_t kQuality>
Reduction Reduce(const tool::Frame& source) {
    return ReductionTo([&source](tool::Frame& result) { Halve(source, result, kQuality); });
}

/// One row of the table stands for three qualities, so they had better be one.
Reduction ReduceByAnyLow(const tool::Frame& source) {
    Reduction reduction = Reduce<2>(source);
    reduction.finish = [&source, result = reduction.result] {
        for (const int32_t quality : {0, 1}) {
            tool::Frame other(kPixels, kHalfWidth, kHalfHeight);
            Halve(source, other, quality);
            if (!std::equal(other.Pixels(), other.Pixels() + other.Bytes(), result->Pixels()))
                throw tool::Failure(tool::kExitFailed, "quality 2 differs from a lower one");
        }
    };
    return reduction;
}

const AddReducers add = {
    {kPixels, "PixelKiln, quality 0 to 2", ReduceByAnyLow},
    {kPixels, "PixelKiln, quality 3", Reduce<3>, false}, // draws what 4 draws
    {kPixels, "PixelKiln, quality 4", Reduce<4>},
    {kPixels, "PixelKiln, quality 5", Reduce<5>},
    {kPairs, "PixelKiln, quality 0 to 2", ReduceByAnyLow},
    {kPairs, "PixelKiln, quality 3", Reduce<3>},
    {kPairs, "PixelKiln, quality 5", Reduce<5>, false},
    {kPlanes, "PixelKiln, quality 0 to 2", ReduceByAnyLow},
    {kPlanes, "PixelKiln, quality 3", Reduce<3>},
    {kPlanes, "PixelKiln, quality 5", Reduce<5>, false},
};

} // namespace
} // namespace Scaling
