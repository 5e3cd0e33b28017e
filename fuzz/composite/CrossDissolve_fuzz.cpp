// Mixes of two images, of any format and size and by any ratio.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/Input.h"
#include "support/Size.h"
#include "support/Switches.h"

#include "convert/RasterFormats.h"

#include <PixelKiln/CrossDissolve.h>

#include <algorithm>
#include <string>

namespace {

using namespace PKFuzz;

Size DrawSize(ByteStream& stream) {
    if (stream.OneIn(16)) return {stream.AnyI32(), stream.Between(-3, 0)};
    if (stream.OneIn(64)) return {stream.Between(5450, 5470), 1}; // about where rows no longer fit the stack
    return {stream.Between(-1, 100), stream.Between(-1, 20)};
}

/// Between the ends, where the call is not one of PK_Convert.
float DrawRatio(ByteStream& stream) {
    return static_cast<float>(1 + stream.Below(99)) / 100;
}

/// Opaque pixels or clear ones, each channel is a mean; roundings may be off by one.
void CheckMeans(const Input& first, const Input& second, const Input& destination) {
    const PK_PixelFormat format = destination.format;
    if (format != PK_PixelFormat_BGRA_4444_8u && format != PK_PixelFormat_BGRP_4444_8u) return;
    if (first.format != format || second.format != format) return;
    const std::vector<uint8_t>&a = first.memory.Content(), &b = second.memory.Content();
    const std::vector<uint8_t> mixed = destination.memory.Rows();
    for (size_t i = 0; i < mixed.size(); ++i)
        Check(mixed[i] + 1 >= std::min(a[i], b[i]) && mixed[i] <= std::max(a[i], b[i]) + 1,
              "a sample of a mix lies between the two");
}

void FuzzCrossDissolve(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    const Size size = DrawSize(stream);
    const PK_PixelFormat format = DrawFormat(stream);
    const auto drawOther = [&] { return stream.Bool() ? format : DrawFormat(stream); };
    const Input first(stream, drawOther(), size), second(stream, drawOther(), size);
    const Input destination(stream, format, size);
    const float ratio = DrawRatio(stream);
    const int32_t quality = stream.BetweenOrAny(0, 5, 8);
    SetCall("PK_CrossDissolve of " + Words(first.format) + " and " + Words(second.format) + " to " +
            Words(format) + ", " + Words(size) + ", ratio " + std::to_string(ratio) + ", quality " +
            std::to_string(quality));

    const PK_Result result = CallIn(state, [&] {
        return PK_CrossDissolve(first.Pixels(), first.RowBytes(), first.format, second.Pixels(),
                                second.RowBytes(), second.format, destination.Pixels(),
                                destination.RowBytes(), format, size.width, size.height, ratio, quality);
    });
    PK_Result expected = ResultOfPixels(size, first.isNull || second.isNull || destination.isNull);
    if (!PK::IsRasterFormat(format)) expected = PK_ErrBadDstFormat;
    if (!PK::IsRasterFormat(first.format) || !PK::IsRasterFormat(second.format))
        expected = PK_ErrBadSrcFormat;
    CheckResult(expected, result);
    destination.memory.CheckPadding();
    first.memory.CheckStays();
    second.memory.CheckStays();
    if (result != PK_Success || !size.HasPixels())
        destination.memory.CheckStays("a refused call writes nothing");
    if (result == PK_Success && size.HasPixels()) CheckMeans(first, second, destination);
}

const Family sFamily('d', "dissolve", FuzzCrossDissolve);

} // namespace
