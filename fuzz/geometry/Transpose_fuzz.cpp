// PK_Transpose and PK_RotateImage: whatever the sizes and steps, the rows of the destination and nothing else are
// written, and turning back gives the image again.

#include "support/Check.h"
#include "support/Family.h"
#include "support/Formats.h"
#include "support/ImageMemory.h"
#include "support/Size.h"
#include "support/Switches.h"

#include <PixelKiln/PixelFormat.h>
#include <PixelKiln/Rotate.h>

namespace {

using namespace PKFuzz;

/// Rows of whole pixels, with a step that is a whole number of them too.
RowsLayout DrawImage(ByteStream& stream, Size size, int32_t pixelBytes) {
    RowsLayout layout;
    layout.rows = static_cast<size_t>(size.height);
    layout.rowLength = static_cast<size_t>(size.width * pixelBytes);
    const int32_t padding = stream.Between(0, 3) * pixelBytes;
    layout.rowBytes = size.width * pixelBytes + padding;
    if (stream.OneIn(2)) layout.rowBytes = -layout.rowBytes;
    return layout;
}

void CheckAround(const SourceImage& image, const ImageMemory& turned, const ImageMemory& back) {
    image.CheckStays();
    turned.CheckPadding();
    back.CheckPadding();
}

void FuzzTranspose(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const int32_t pixelBytes = 1 << stream.Below(5);
    const Size size = {stream.Between(1, 70), stream.Between(1, 70)};
    const Size turnedSize = {size.height, size.width};
    const SourceImage image(DrawImage(stream, size, pixelBytes), stream);
    const ImageMemory turned(DrawImage(stream, turnedSize, pixelBytes), stream);
    const ImageMemory back(DrawImage(stream, size, pixelBytes), stream);

    const auto bytes = static_cast<uint8_t>(pixelBytes);
    Check(PK_Transpose(image.Pixels(), image.RowBytes(), turned.Pixels(), turned.RowBytes(), size.width,
                       size.height, bytes) == PK_Success,
          "any image can be transposed");
    Check(PK_Transpose(turned.Pixels(), turned.RowBytes(), back.Pixels(), back.RowBytes(), size.height,
                       size.width, bytes) == PK_Success,
          "any image can be transposed");
    CheckSame(image.Content(), back.Rows(), "transposed twice is the image");
    CheckAround(image, turned, back);
}

void FuzzRotate(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const Size size = {stream.Between(1, 70), stream.Between(1, 70)};
    const int32_t degrees = stream.OneIn(8) ? stream.AnyI32() : 90 * stream.Between(-3, 3);
    const bool isOffered = degrees % 90 == 0 && degrees != 0 && degrees >= -270 && degrees <= 270;
    const Size turnedSize = degrees % 180 == 0 ? size : Size{size.height, size.width};
    const SourceImage image(DrawImage(stream, size, 4), stream);
    const ImageMemory turned(DrawImage(stream, turnedSize, 4), stream);
    const ImageMemory back(DrawImage(stream, size, 4), stream);

    const auto turn = [&](const ImageMemory& from, const ImageMemory& to, Size fromSize, int32_t angle) {
        return PK_RotateImage(from.Pixels(), from.RowBytes(), to.Pixels(), to.RowBytes(), fromSize.width,
                              fromSize.height, PK_PixelFormat_BGRA_4444_8u, angle);
    };
    Check(turn(image, turned, size, degrees) == (isOffered ? PK_Success : PK_ErrFailed),
          "only quarter turns are offered");
    if (isOffered) {
        Check(turn(turned, back, turnedSize, -degrees) == PK_Success, "a turn can be taken back");
        CheckSame(image.Content(), back.Rows(), "turned back is the image");
    }
    CheckAround(image, turned, back);
}

const Family sTranspose('t', "transpose", FuzzTranspose);
const Family sRotate('r', "rotate", FuzzRotate);

} // namespace
