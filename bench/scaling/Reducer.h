#pragma once

// A way to halve each side of a frame of 3840 x 2160, ours or another library's, entered in a list before main begins, as
// scalers are.

#include "Frame.h"

#include <functional>
#include <initializer_list>
#include <memory>
#include <vector>

namespace Scaling {

inline constexpr int32_t kLargeWidth = 3840, kLargeHeight = 2160;
inline constexpr int32_t kHalfWidth = kLargeWidth / 2, kHalfHeight = kLargeHeight / 2;

/// What all results are; the rows of a frame begin at the bottom.
inline constexpr PK_PixelFormat kPixels = PK_PixelFormat_BGRA_4444_8u;
inline constexpr PK_PixelFormat kPairs = PK_PixelFormat_UYVY_422_8u;
inline constexpr PK_PixelFormat kPlanes = PK_PixelFormat_YUV_420_MPEG2_FRAME;

/// A reduction that can be run as often as one likes.
struct Reduction {
    std::shared_ptr<tool::Frame> result;
    std::function<void()> run;
    std::function<void()> finish =
        {}; ///< brings what was run into the result, where that takes more; is not measured
};

/// \param write  given the result.
template <typename Write>
Reduction ReductionTo(Write write) {
    const auto result = std::make_shared<tool::Frame>(kPixels, kHalfWidth, kHalfHeight);
    return {result, [=] { write(*result); }};
}

struct Reducer {
    PK_PixelFormat from;
    const char* name;
    Reduction (*prepare)(const tool::Frame& source); ///< which lasts longer
    bool isShown = true;                             ///< in the picture, too
};

inline std::vector<Reducer>& AllReducers() {
    static std::vector<Reducer> reducers;
    return reducers;
}

struct AddReducers {
    AddReducers(std::initializer_list<Reducer> reducers) {
        AllReducers().insert(AllReducers().end(), reducers.begin(), reducers.end());
    }
};

} // namespace Scaling
