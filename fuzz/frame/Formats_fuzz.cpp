// Sizes, origins, names and host identifiers of any number taken for a format, at any size.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/Switches.h"

#include "convert/RasterFormats.h"
#include "frame/PixelFormat.h"

#include <PixelKiln/PixelFormat.h>

#include <cstring>

namespace {

using namespace PKFuzz;

void CheckOrdinaryRow(PK_PixelFormat format, int32_t width) {
    const int32_t rowBytes = PK_PixelFormatRowBytes(format, width);
    const int32_t packed = PK_PixelFormatPackedRowBytes(format, width);
    Check(packed > 0 && rowBytes >= packed, "a row holds its pixels");
    Check(rowBytes % 16 == 0 && rowBytes - packed < 128, "a row is padded to 128 bytes at most");
    Check(packed < 16 * (width + 6), "no pixel takes more than 16 bytes");
    Check(PK_PixelFormatPackedRowBytes(format, width + 6) > packed, "a wider row takes more bytes");
}

void CheckSizes(PK_PixelFormat format, int32_t width, int32_t height) {
    const int32_t rowBytes = PK_PixelFormatRowBytes(format, width);
    const int64_t size = PK_PixelFormatSize(format, width, height);
    Check(PK_PixelFormatRowBytes(format, width) == rowBytes, "PK_PixelFormatRowBytes repeats itself");
    Check(PK_PixelFormatSize(format, width, height) == size, "PK_PixelFormatSize repeats itself");
    Check(PK_PixelFormatPackedRowBytes(format, width) == PK_PixelFormatPackedRowBytes(format, width),
          "PK_PixelFormatPackedRowBytes repeats itself");
    if (PK::IsStream(format)) {
        Check(rowBytes == 0, "a stream has no row bytes");
        Check(width < 0 || height < 0 || size >= 0, "a stream has no negative size");
    } else {
        const int64_t product = int64_t{rowBytes} * height;
        Check(size == static_cast<int32_t>(product), "an image is its rows, in 32 bits");
    }
}

void CheckNameAndOrigin(PK_PixelFormat format, bool allTopLeft) {
    Check(PK_IsOriginTopLeft(format) != PK_IsOriginBottomLeft(format), "the origin is at one end");
    Check(!allTopLeft || PK_IsOriginTopLeft(format), "switch 10 takes all origins to the top left");
    const char* name = PK_PixelFormatName(format);
    Check(name != nullptr && std::strlen(name) > 0, "every number has a name");
    Check(PK_PixelFormatName(format) == name, "a name is constant text");
}

void CheckHostFormat(ByteStream& stream) {
    const bool isNear = stream.Bool(); // the bundled identifiers are pairs of small numbers
    const zebmediatypes::PixelFormat identifier = {
        {isNear ? stream.Below(12) : stream.U32(), isNear ? stream.Below(20) : stream.U32()}};
    const PK_PixelFormat format = PK_ZEBPixelFormatToPKPixelFormat(identifier);
    Check(PK_ZEBPixelFormatToPKPixelFormat(identifier) == format, "an identifier has one format");
    Check(format == PK_PixelFormat_Invalid || PK::IsRasterFormat(format) || PK::IsStream(format),
          "an identifier has a format of the catalogue or none");
}

void FuzzFormats(ByteStream& stream) {
    const Switches switches = DrawSwitches(stream);
    SetSwitches(switches);
    const PK_PixelFormat format = DrawFormat(stream);
    const int32_t width = stream.AnyI32();
    const int32_t height = stream.AnyI32();
    const int32_t ordinaryWidth = stream.Between(1, 100000);
    SetCall("format " + Words(format) + ", " + std::to_string(width) + " x " + std::to_string(height) +
            ", or a row of " + std::to_string(ordinaryWidth));

    CallIn(DrawFloatState(stream), [&] {
        CheckSizes(format, width, height);
        CheckNameAndOrigin(format, switches[kSwitchTopLeft]);
        if (PK::IsRasterFormat(format)) CheckOrdinaryRow(format, ordinaryWidth);
        CheckHostFormat(stream);
    });
}

const Family sFamily('f', "formats", FuzzFormats);

} // namespace
