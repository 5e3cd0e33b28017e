// PK_BoxBlur of any size, with any radii and flags, in memory that ends where the arguments say.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/ImageMemory.h"
#include "support/Switches.h"

#include <PixelKiln/BoxBlur.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <vector>

namespace {

using namespace PKFuzz;

constexpr int32_t kSmallestSide = 4;

double DrawRadius(ByteStream& stream) {
    if (stream.OneIn(4)) { // any bits: NaN, infinite, huge, denormal
        const uint64_t bits = stream.U64();
        double radius;
        std::memcpy(&radius, &bits, sizeof radius);
        return radius;
    }
    return stream.Between(-300, 30000) / 255.0;
}

struct Request {
    int32_t width, height, flags;
    std::vector<double> radii;
};

/// One call on these pixels.
std::vector<uint8_t> Blur(const Request& request, ImageMemory& image, const std::vector<uint8_t>& content,
                          ByteStream& stream, uint32_t state) {
    const auto sides = static_cast<size_t>(request.width) + static_cast<size_t>(request.height);
    const size_t room = 4 * (sides + static_cast<size_t>(std::max(request.width, request.height)));
    ImageMemory scratch({room, 1, 0}, stream);
    std::vector<double> radii = request.radii;
    image.SetRows(content);
    CallIn(state, [&] {
        PK_BoxBlur(static_cast<int32_t>(radii.size()), radii.data(), request.flags, scratch.Pixels(),
                   image.Pixels(), image.Layout().rowBytes, request.width, request.height);
    });
    Check(image.IsPaddingIntact(), "bytes outside the rows stay");
    Check(scratch.IsPaddingIntact(), "bytes around the scratch stay");
    const bool isTooSmall = std::min(request.width, request.height) < kSmallestSide;
    const double limit = std::min(request.width, request.height) - 3;
    for (size_t i = 0; i < radii.size(); ++i) {
        const double given = request.radii[i];
        const double expected = !isTooSmall && given > limit ? limit : given;
        Check(radii[i] == expected || (std::isnan(radii[i]) && std::isnan(given)),
              "radii are limited in place");
    }
    return image.Rows();
}

void CheckBytesKept(const std::vector<uint8_t>& before, const std::vector<uint8_t>& after, int32_t flags) {
    for (size_t i = 0; i < before.size(); ++i)
        Check((flags >> (i % 4) & 1) != 0 || before[i] == after[i], "bytes without a flag stay");
}

void FuzzBoxBlur(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    Request request;
    request.width = stream.OneIn(16) ? stream.Between(300, 3000) : stream.Between(0, 90);
    request.height = stream.Between(0, 70);
    request.flags = stream.OneIn(8) ? stream.AnyI32() : static_cast<int32_t>(stream.Byte());
    request.radii.resize(stream.Below(5));
    for (double& radius : request.radii) radius = DrawRadius(stream);
    const auto rowLength = static_cast<size_t>(request.width) * 4;
    const auto rows = static_cast<size_t>(request.height);
    // Columns step by whole pixels, so that other row bytes would not lead from row to row.
    const int32_t rowBytes = DrawRowBytes(stream, rowLength, rows, request.width * 4 + 12) / 4 * 4;
    SetCall("PK_BoxBlur of " + std::to_string(request.width) + " x " + std::to_string(request.height) + ", " +
            std::to_string(request.radii.size()) + " radii, flags " + std::to_string(request.flags) +
            ", row bytes " + std::to_string(rowBytes));

    ImageMemory image({rowLength, rows, rowBytes}, stream);
    std::vector<uint8_t> content(rowLength * rows);
    stream.Fill(content.data(), content.size());
    const std::vector<uint8_t> once = Blur(request, image, content, stream, state);
    CheckBytesKept(content, once, request.flags);
    SetSwitches(DrawSwitches(stream));
    CheckSame(once, Blur(request, image, content, stream, state), "every body gives the same bytes");
    if (request.radii.empty() || std::min(request.width, request.height) < kSmallestSide)
        CheckSame(content, once, "no passes, or no room for a window: nothing changes");
}

const Family sFamily('x', "boxblur", FuzzBoxBlur);

} // namespace
