// Images over black, and without the share of a matte, of any format and size.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/Input.h"
#include "support/Size.h"
#include "support/Switches.h"

#include "convert/RasterFormats.h"
#include "frame/PixelFormat.h"

#include <PixelKiln/Matte.h>

#include <cmath>
#include <string>

namespace {

using namespace PKFuzz;

Size DrawSize(ByteStream& stream) {
    if (stream.OneIn(16)) return {stream.AnyI32(), stream.Between(-3, 0)};
    if (stream.OneIn(64)) return {stream.Between(8180, 8200), 1}; // about where rows no longer fit the stack
    return {stream.Between(-1, 100), stream.Between(0, 20)};
}

float DrawOpacity(ByteStream& stream) {
    const float any = stream.OneIn(16) ? stream.AnyFloat() : static_cast<float>(1 + stream.Below(257)) / 256;
    return std::fpclassify(any) == FP_SUBNORMAL ? 0 : any;
}

PK_Result ExpectedToBlack(const Input& source, const Input& destination, Size size) {
    for (const auto isRefused : {+[](PK_PixelFormat format) { return PK::IsStream(format); },
                                 +[](PK_PixelFormat format) { return !PK::IsRasterFormat(format); }}) {
        if (isRefused(source.format)) return PK_ErrBadSrcFormat;
        if (isRefused(destination.format)) return PK_ErrBadDstFormat;
    }
    return ResultOfPixels(size, source.isNull || destination.isNull);
}

void FuzzToBlack(ByteStream& stream, uint32_t state) {
    const Size size = DrawSize(stream);
    const PK_PixelFormat format = DrawFormat(stream);
    const Input source(stream, stream.Bool() ? format : DrawFormat(stream), size),
        destination(stream, format, size);
    const float opacity = DrawOpacity(stream);
    const bool tests = stream.Bool();
    const int32_t quality = stream.BetweenOrAny(0, 5, 8);
    SetCall(std::string(tests ? "PK_CompositeToBlackAndTestSourceAlpha" : "PK_CompositeToBlack") + " of " +
            Words(source.format) + " to " + Words(format) + ", " + Words(size) + ", opacity " +
            std::to_string(opacity));
    uint32_t told = 9;
    const PK_Result result = CallIn(state, [&] {
        return tests
                   ? PK_CompositeToBlackAndTestSourceAlpha(source.Pixels(), source.RowBytes(), source.format,
                                                           destination.Pixels(), destination.RowBytes(),
                                                           format, size.width, size.height, &told, quality)
                   : PK_CompositeToBlack(source.Pixels(), source.RowBytes(), source.format,
                                         destination.Pixels(), destination.RowBytes(), format, size.width,
                                         size.height, opacity, quality);
    });
    if (tests || !(opacity < 8e-6f)) CheckResult(ExpectedToBlack(source, destination, size), result);
    if (tests) Check((told <= 2) == (result == PK_Success), "the test result is written on success only");
    source.memory.CheckStays();
    destination.memory.CheckPadding();
    if (result != PK_Success) destination.memory.CheckStays("a refused call writes nothing");
}

void FuzzMatte(ByteStream& stream, uint32_t state) {
    const Size size = DrawSize(stream);
    const PK_PixelFormat format = DrawFormat(stream);
    const Input source(stream, format, size), destination(stream, format, size);
    const Input matte(stream, DrawRasterFormat(stream), Size{1, 1});
    const int32_t quality = stream.BetweenOrAny(0, 5, 8);
    SetCall("PK_UnPremultiplyAgainstMatteColor of " + Words(format) + ", " + Words(size) + ", matte " +
            Words(matte.format));
    const PK_Result result = CallIn(state, [&] {
        return PK_UnPremultiplyAgainstMatteColor(source.Pixels(), source.RowBytes(), destination.Pixels(),
                                                 destination.RowBytes(), format, size.width, size.height,
                                                 matte.Pixels(), matte.format, quality);
    });
    const bool isServed = PK::IsRasterFormat(format) && !PK::IsYUV(format) && !PK::HasNoAlphaMeaning(format);
    const bool hasMatte = !matte.isNull;
    CheckResult(!isServed   ? PK_ErrBadSrcFormat
                : !hasMatte ? PK_ErrFailed
                            : ResultOfPixels(size, source.isNull || destination.isNull),
                result);
    source.memory.CheckStays();
    matte.memory.CheckStays();
    destination.memory.CheckPadding();
    if (result != PK_Success) destination.memory.CheckStays("a refused call writes nothing");
}

void FuzzMattes(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    stream.Bool() ? FuzzToBlack(stream, state) : FuzzMatte(stream, state);
}

const Family sFamily('K', "matte", FuzzMattes);

} // namespace
