// PK_Transpose and PK_RotateImage: whatever the sizes and steps, the rows of the destination and nothing else are
// written, and turning back gives the image again.

#include "support/Check.h"
#include "support/Family.h"
#include "support/Formats.h"
#include "support/ImageMemory.h"
#include "support/Switches.h"

#include <PixelKiln/PixelFormat.h>
#include <PixelKiln/Rotate.h>

namespace {

using namespace PKFuzz;

struct Size {
    int32_t width, height;
};

/// Rows of whole pixels, with a step that is a whole number of them too.
RowsLayout DrawLayout(ByteStream& stream, Size size, int32_t pixelBytes) {
    RowsLayout layout;
    layout.rows = static_cast<size_t>(size.height);
    layout.rowLength = static_cast<size_t>(size.width * pixelBytes);
    const int32_t padding = stream.Between(0, 3) * pixelBytes;
    layout.rowBytes = size.width * pixelBytes + padding;
    if (stream.OneIn(2)) layout.rowBytes = -layout.rowBytes;
    return layout;
}

void FillRows(ByteStream& stream, ImageMemory& image) {
    std::vector<uint8_t> rows = image.Rows();
    for (uint8_t& byte : rows) byte = static_cast<uint8_t>(stream.Below(256));
    image.SetRows(rows);
}

void FuzzTranspose(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const int32_t pixelBytes = 1 << stream.Below(5);
    const Size size = {stream.Between(1, 70), stream.Between(1, 70)};
    const Size turnedSize = {size.height, size.width};
    ImageMemory image(DrawLayout(stream, size, pixelBytes), stream);
    ImageMemory turned(DrawLayout(stream, turnedSize, pixelBytes), stream);
    ImageMemory back(DrawLayout(stream, size, pixelBytes), stream);
    FillRows(stream, image);

    const auto bytes = static_cast<uint8_t>(pixelBytes);
    Check(PK_Transpose(image.Pixels(), image.Layout().rowBytes, turned.Pixels(), turned.Layout().rowBytes,
                       size.width, size.height, bytes) == PK_Success,
          "any image can be transposed");
    Check(PK_Transpose(turned.Pixels(), turned.Layout().rowBytes, back.Pixels(), back.Layout().rowBytes,
                       size.height, size.width, bytes) == PK_Success,
          "any image can be transposed");
    Check(back.Rows() == image.Rows(), "transposed twice is the image");
    Check(turned.IsPaddingIntact() && back.IsPaddingIntact(), "only rows are written");
}

void FuzzRotate(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const Size size = {stream.Between(1, 70), stream.Between(1, 70)};
    const int32_t degrees = stream.OneIn(8) ? stream.AnyI32() : 90 * stream.Between(-3, 3);
    const bool isOffered = degrees % 90 == 0 && degrees != 0 && degrees >= -270 && degrees <= 270;
    const Size turnedSize = degrees % 180 == 0 ? size : Size{size.height, size.width};
    ImageMemory image(DrawLayout(stream, size, 4), stream);
    ImageMemory turned(DrawLayout(stream, turnedSize, 4), stream);
    ImageMemory back(DrawLayout(stream, size, 4), stream);
    FillRows(stream, image);

    const auto turn = [&](ImageMemory& from, ImageMemory& to, Size fromSize, int32_t angle) {
        return PK_RotateImage(from.Pixels(), from.Layout().rowBytes, to.Pixels(), to.Layout().rowBytes,
                              fromSize.width, fromSize.height, PK_PixelFormat_BGRA_4444_8u, angle);
    };
    Check(turn(image, turned, size, degrees) == (isOffered ? PK_Success : PK_ErrFailed),
          "only quarter turns are offered");
    if (isOffered) {
        Check(turn(turned, back, turnedSize, -degrees) == PK_Success, "a turn can be taken back");
        Check(back.Rows() == image.Rows(), "turned back is the image");
    }
    Check(turned.IsPaddingIntact() && back.IsPaddingIntact(), "only rows are written");
}

const Family sTranspose('t', "transpose", FuzzTranspose);
const Family sRotate('r', "rotate", FuzzRotate);

} // namespace
