// PK_BoxBlur of any size, with any radii and flags, in memory that ends where the arguments say.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/ImageMemory.h"
#include "support/Size.h"
#include "support/Switches.h"

#include <PixelKiln/BoxBlur.h>

#include <algorithm>
#include <cmath>
#include <vector>

namespace {

using namespace PKFuzz;

constexpr int32_t kSmallestSide = 4;

double DrawRadius(ByteStream& stream) {
    if (stream.OneIn(4)) return stream.AnyDouble();
    return stream.Between(-300, 30000) / 255.0;
}

struct Request {
    Size size;
    int32_t flags;
    std::vector<double> radii;
};

/// One call on these pixels.
std::vector<uint8_t> Blur(const Request& request, ImageMemory& image, const std::vector<uint8_t>& content,
                          ByteStream& stream, uint32_t state) {
    const int32_t width = request.size.width, height = request.size.height;
    const size_t room = 4 * static_cast<size_t>(width + height + std::max(width, height));
    ImageMemory scratch({room, 1, 0}, stream);
    std::vector<double> radii = request.radii;
    image.SetRows(content);
    CallIn(state, [&] {
        PK_BoxBlur(static_cast<int32_t>(radii.size()), radii.data(), request.flags, scratch.Pixels(),
                   image.Pixels(), image.RowBytes(), width, height);
    });
    image.CheckPadding();
    scratch.CheckPadding();
    const bool isTooSmall = std::min(width, height) < kSmallestSide;
    const double limit = std::min(width, height) - 3;
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
    request.size.width = stream.OneIn(16) ? stream.Between(300, 3000) : stream.Between(0, 90);
    request.size.height = stream.Between(0, 70);
    request.flags = stream.OneIn(8) ? stream.AnyI32() : static_cast<int32_t>(stream.Byte());
    request.radii.resize(stream.Below(5));
    for (double& radius : request.radii) radius = DrawRadius(stream);
    RowsLayout layout = DrawLayout(stream, static_cast<size_t>(request.size.width) * 4,
                                   static_cast<size_t>(request.size.height));
    // Columns step by whole pixels, so that other row bytes would not lead from row to row.
    layout.rowBytes = layout.rowBytes / 4 * 4;
    SetCall("PK_BoxBlur of " + Words(request.size) + ", " + std::to_string(request.radii.size()) +
            " radii, flags " + std::to_string(request.flags) + ", row bytes " +
            std::to_string(layout.rowBytes));

    ImageMemory image(layout, stream);
    const std::vector<uint8_t> content = image.DrawRows(stream);
    const std::vector<uint8_t> once = Blur(request, image, content, stream, state);
    CheckBytesKept(content, once, request.flags);
    SetSwitches(DrawSwitches(stream));
    CheckSame(once, Blur(request, image, content, stream, state), "every body gives the same bytes");
    if (request.radii.empty() || std::min(request.size.width, request.size.height) < kSmallestSide)
        CheckSame(content, once, "no passes, or no room for a window: nothing changes");
}

const Family sFamily('x', "boxblur", FuzzBoxBlur);

} // namespace
