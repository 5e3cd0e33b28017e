#pragma once

// Two opaque BGRA images of 8 bits for those that mix images.

#include "operations/Operation.h"

#include <memory>
#include <vector>

namespace OperationBench {

struct OpaqueImages {
    std::vector<uint8_t> bytes;

    const uint8_t* First() const { return bytes.data(); }
    const uint8_t* Second() const { return bytes.data() + 4 * size_t{kPixels}; }
};

/// Of the pixels of a source of as many bytes.
inline std::shared_ptr<const OpaqueImages> MakeOpaqueImages(const uint8_t* source) {
    auto images = std::make_shared<OpaqueImages>();
    images->bytes.assign(source, source + 8 * size_t{kPixels});
    for (size_t alpha = 3; alpha < images->bytes.size(); alpha += 4) images->bytes[alpha] = 255;
    return images;
}

/// A quarter of the way from the first to the second: exact in 8 bits too, which some peers have.
inline constexpr float kDissolveRatio = 0.25f;

} // namespace OperationBench
