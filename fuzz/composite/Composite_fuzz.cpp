// One image over another, plainly and by every blend mode, of any format and size.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/Input.h"
#include "support/Size.h"
#include "support/Switches.h"

#include "convert/RasterFormats.h"
#include "frame/PixelFormat.h"

#include <PixelKiln/Composite.h>

#include <cmath>
#include <string>

namespace {

using namespace PKFuzz;

Size DrawSize(ByteStream& stream) {
    if (stream.OneIn(16)) return {stream.AnyI32(), stream.Between(-3, 0)};
    if (stream.OneIn(64)) return {stream.Between(5400, 5500), 1}; // about where rows no longer fit the stack
    if (stream.OneIn(16)) return {stream.Between(1, 20), stream.Between(60, 70)}; // and where there are bands
    return {stream.Between(-1, 120), stream.Between(0, 20)};
}

float DrawOpacity(ByteStream& stream) {
    if (stream.OneIn(16)) {
        const float any = stream.AnyFloat();
        return std::fpclassify(any) == FP_SUBNORMAL ? 0 : any;
    }
    return static_cast<float>(stream.Below(257)) / 256;
}

struct Layers {
    const Input &top, &back, &destination;
    Size size;
};

/// Where no shortcut hands the call to a conversion.
PK_Result ExpectedResult(const Layers& layers, bool isMode) {
    const PK_PixelFormat top = layers.top.format, back = layers.back.format, to = layers.destination.format;
    if (PK::IsStream(top) || PK::IsStream(back)) return PK_ErrBadSrcFormat;
    if (PK::IsStream(to)) return PK_ErrBadDstFormat;
    if (!isMode) return PK_ErrNotSupported;
    if (!PK::IsRasterFormat(top) || !PK::IsRasterFormat(back)) return PK_ErrBadSrcFormat;
    if (!PK::IsRasterFormat(to)) return PK_ErrBadDstFormat;
    const Size size = layers.size;
    if (size.height < 1 || size.width == 0) return PK_Success;
    const bool hasNull = layers.top.isNull || layers.back.isNull || layers.destination.isNull;
    return size.width < 0 || hasNull ? PK_ErrFailed : PK_Success;
}

/// Whether the call is one of PK_Convert.
bool IsConversion(const Layers& layers, float opacity) {
    return opacity < 8e-6f || (opacity + 8e-6f > 1 && PK::HasNoAlphaMeaning(layers.top.format));
}

void FuzzComposite(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    const Size size = DrawSize(stream);
    const PK_PixelFormat format = DrawFormat(stream);
    const auto drawOther = [&] { return stream.Bool() ? format : DrawFormat(stream); };
    const Input top(stream, drawOther(), size), back(stream, drawOther(), size),
        destination(stream, format, size);
    const Layers layers = {top, back, destination, size};
    const PK_BlendMode mode = stream.BetweenOrAny(0, PK_BlendMode_Divide, 32);
    const bool isPlain = stream.Bool(), inLinear = stream.Bool();
    const float opacity = DrawOpacity(stream);
    const int32_t quality = stream.BetweenOrAny(0, 5, 8);
    SetCall(std::string(isPlain ? "PK_Composite" : "PK_CompositeWithBlendMode") + " of " + Words(top.format) +
            " over " + Words(back.format) + " to " + Words(format) + ", " + Words(size) + ", mode " +
            std::to_string(mode) + ", opacity " + std::to_string(opacity));

    const PK_Result result = CallIn(state, [&] {
        if (isPlain)
            return PK_Composite(top.Pixels(), top.RowBytes(), top.format, back.Pixels(), back.RowBytes(),
                                back.format, destination.Pixels(), destination.RowBytes(), format, size.width,
                                size.height, opacity, quality, inLinear);
        return PK_CompositeWithBlendMode(top.Pixels(), top.RowBytes(), top.format, back.Pixels(),
                                         back.RowBytes(), back.format, destination.Pixels(),
                                         destination.RowBytes(), format, size.width, size.height, opacity,
                                         mode, quality, inLinear);
    });
    const bool goesByOpacity = isPlain || mode == PK_BlendMode_Normal;
    if (!goesByOpacity || !IsConversion(layers, opacity))
        CheckResult(ExpectedResult(layers, goesByOpacity || (mode >= 0 && mode <= PK_BlendMode_Divide)),
                    result);
    destination.memory.CheckPadding();
    top.memory.CheckStays();
    back.memory.CheckStays();
    if (result != PK_Success) destination.memory.CheckStays("a refused call writes nothing");
}

const Family sFamily('O', "composite", FuzzComposite);

} // namespace
