#pragma once

// Width and height of an image in pixels.

#include <PixelKiln/Types.h>

#include <cstdint>
#include <string>

namespace PKFuzz {

inline constexpr int32_t kWidestRow = INT32_MAX / 16; // as documented

struct Size {
    int32_t width, height;

    bool IsPossible() const { return width >= 0 && width <= kWidestRow && height >= 0; }
    bool HasPixels() const { return IsPossible() && width > 0 && height > 0; }
};

inline std::string Words(Size size) {
    return std::to_string(size.width) + " x " + std::to_string(size.height);
}

/// What operations say that walk rows: nothing to do comes before what is wrong.
inline PK_Result ResultOfRows(Size size, bool hasNull) {
    if (size.height < 1 || size.width == 0) return PK_Success;
    return size.HasPixels() && !hasNull ? PK_Success : PK_ErrFailed;
}

/// What operations say that refuse every negative size.
inline PK_Result ResultOfPixels(Size size, bool hasNull) {
    if (size.width < 0 || size.height < 0) return PK_ErrFailed;
    return ResultOfRows(size, hasNull);
}

} // namespace PKFuzz
