// Gains and weighted sums of images of any format and size.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/Formats.h"
#include "support/Input.h"
#include "support/Size.h"
#include "support/Switches.h"

#include "convert/RasterFormats.h"
#include "frame/PixelFormat.h"

#include <PixelKiln/Accumulate.h>

#include <algorithm>
#include <cmath>
#include <deque>
#include <string>

namespace {

using namespace PKFuzz;

Size DrawSize(ByteStream& stream) {
    if (stream.OneIn(16)) return {stream.AnyI32(), stream.Between(-3, 0)};
    if (stream.OneIn(64)) return {stream.Between(16380, 16390), 1}; // rows that do not fit the stack
    return {stream.Between(-1, 90), stream.Between(0, 20)};
}

/// Expansion to 15 bits goes by where a pixel lies.
bool IsPlaceFree(PK_PixelFormat destination) {
    return PK::DepthOf(destination) != PK::kDepth15u;
}

/// Two calls, each into memory of its own: every byte of the rows is written, and none beside them.
template <class Make>
void CheckTwice(ByteStream& stream, uint32_t state, PK_PixelFormat format, Size size, PK_Result expected,
                const Make& make) {
    const Input first(stream, format, size), second(stream, format, size);
    for (const Input* to : {&first, &second}) {
        const PK_Result wanted =
            to->isNull && size.HasPixels() && expected == PK_Success ? PK_ErrFailed : expected;
        CheckResult(wanted, CallIn(state, [&] { return make(to->Pixels(), to->RowBytes()); }));
        to->memory.CheckPadding();
        if (wanted != PK_Success) to->memory.CheckStays("a refused call writes nothing");
    }
    if (expected == PK_Success && !first.isNull && !second.isNull && IsPlaceFree(format))
        CheckSame(first.memory.Rows(), second.memory.Rows(), "the same, whatever was there");
}

/// Border values and any bits, those of denormal numbers left out: MXCSR may say them to be 0.
template <class Number>
Number DrawNumber(ByteStream& stream, Number any) {
    constexpr Number kBorders[] = {0, 1, 7e-6f, 8e-6f, 0.5, 2, -1};
    if (stream.OneIn(8)) return std::fpclassify(any) == FP_SUBNORMAL ? Number{0} : any;
    if (stream.Bool()) return kBorders[stream.Below(std::size(kBorders))];
    return static_cast<Number>(stream.Below(257)) / 200;
}

void FuzzGain(ByteStream& stream, uint32_t state) {
    const Size size = DrawSize(stream);
    const PK_PixelFormat to = DrawFormat(stream);
    const Input source(stream, stream.Bool() ? to : DrawFormat(stream), size);
    const float gain = DrawNumber(stream, stream.AnyFloat());
    const int32_t quality = stream.BetweenOrAny(0, 5, 8);
    SetCall("PK_AlphaGain of " + Words(source.format) + " to " + Words(to) + ", " + Words(size) + ", gain " +
            std::to_string(gain) + ", quality " + std::to_string(quality));

    const bool isFill = 8e-6f > gain;
    PK_Result expected = PK_Success;
    if (!PK::IsRasterFormat(source.format))
        expected = PK_ErrBadSrcFormat;
    else if (!PK::IsRasterFormat(to) || (isFill && PK::HasNoAlphaMeaning(to)))
        expected = PK_ErrBadDstFormat;
    else
        expected = ResultOfPixels(size, source.isNull && !isFill);
    CheckTwice(stream, state, to, size, expected, [&](uint8_t* pixels, int32_t rowBytes) {
        return PK_AlphaGain(source.Pixels(), source.RowBytes(), source.format, pixels, rowBytes, to,
                            size.width, size.height, gain, quality);
    });
    source.memory.CheckStays();
}

struct Arrays {
    std::vector<const void*> pixels;
    std::vector<int32_t> rowBytes;
    std::vector<PK_PixelFormat> formats;
    std::vector<double> weights;
};

void FuzzSum(ByteStream& stream, uint32_t state) {
    const Size size = DrawSize(stream);
    const PK_PixelFormat to = DrawFormat(stream);
    const int32_t images = stream.Below(4) == 0 ? stream.Between(0, 24) : stream.Between(1, 5);
    const int32_t count = stream.OneIn(64) ? stream.Between(-2, -1) : images;
    std::deque<Input> inputs;
    Arrays arrays;
    bool hasNull = false, isKnown = true;
    std::string words;
    for (int32_t i = 0; i < images; ++i) {
        const PK_PixelFormat format = stream.Bool() ? to : DrawRasterFormat(stream);
        const Input& input =
            inputs.emplace_back(stream, stream.OneIn(32) ? DrawFormat(stream) : format, size);
        arrays.pixels.push_back(input.Pixels());
        arrays.rowBytes.push_back(input.RowBytes());
        arrays.formats.push_back(input.format);
        arrays.weights.push_back(DrawNumber(stream, stream.AnyDouble()));
        hasNull = hasNull || input.isNull;
        isKnown = isKnown && PK::IsRasterFormat(input.format);
        words += " " + std::to_string(arrays.weights.back()) + " of " + Words(input.format);
    }
    const int32_t quality = stream.BetweenOrAny(0, 5, 8);
    SetCall("PK_Accumulate of " + std::to_string(count) + words + " to " + Words(to) + ", " + Words(size) +
            ", quality " + std::to_string(quality));

    PK_Result expected = PK_Success;
    if (!PK::IsRasterFormat(to))
        expected = PK_ErrBadDstFormat;
    else if (count > 0 && !isKnown)
        expected = PK_ErrBadSrcFormat;
    else
        expected = count < 0 ? PK_ErrFailed : ResultOfPixels(size, hasNull);
    CheckTwice(stream, state, to, size, expected, [&](uint8_t* pixels, int32_t rowBytes) {
        return PK_Accumulate(arrays.pixels.data(), arrays.rowBytes.data(), arrays.formats.data(),
                             arrays.weights.data(), count, pixels, rowBytes, to, size.width, size.height,
                             quality);
    });
    for (const Input& input : inputs) input.memory.CheckStays();
}

void FuzzSums(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream) | kExceptionFlags;
    stream.Bool() ? FuzzGain(stream, state) : FuzzSum(stream, state);
}

const Family sFamily('s', "sums", FuzzSums);

} // namespace
