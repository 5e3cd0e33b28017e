// Products, conversions to integers and A-law on arrays that end where the arguments say.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/ImageMemory.h"
#include "support/Size.h"
#include "support/Switches.h"

#include <PixelKiln/Utilities.h>

#include <cmath>
#include <cstring>
#include <string>
#include <vector>

namespace {

using namespace PKFuzz;

constexpr int32_t kLongest = 700;

int32_t DrawCount(ByteStream& stream) {
    return stream.OneIn(16) ? -stream.Between(1, INT32_MAX) : stream.Between(0, kLongest);
}

size_t Bytes(int32_t count, size_t elementBytes) {
    return count < 0 ? 0 : static_cast<size_t>(count) * elementBytes;
}

/// Two arrays of their own, the source filled.
struct Arrays {
    Arrays(ByteStream& stream, size_t sourceBytes, size_t resultBytes)
        : source({sourceBytes, 1, 0}, stream), result({resultBytes, 1, 0}, stream) {}

    void CheckAround(PK_Result outcome, PK_Result expected) const {
        CheckResult(expected, outcome);
        source.CheckStays();
        result.CheckPadding();
    }

    SourceImage source;
    ImageMemory result;
};

template <class Integer, class Function>
void ConvertFloats(ByteStream& stream, uint32_t state, Function convert, const char* name) {
    const int32_t count = DrawCount(stream), rounding = stream.BetweenOrAny(0, 1, 4);
    const int32_t scale = stream.BetweenOrAny(-40, 40, 4);
    SetCall(std::string(name) + " of " + std::to_string(count) + ", rounding " + std::to_string(rounding) +
            ", scale " + std::to_string(scale));
    const Arrays arrays(stream, Bytes(count, sizeof(float)), Bytes(count, sizeof(Integer)));
    const PK_Result result = CallIn(state, [&] {
        return convert(reinterpret_cast<const float*>(arrays.source.Pixels()),
                       reinterpret_cast<Integer*>(arrays.result.Pixels()), count, rounding, scale);
    });
    arrays.CheckAround(result, count < 0 ? PK_ErrFailed : PK_Success);
    for (int32_t i = 0; i < count; ++i) {
        float x;
        Integer integer;
        std::memcpy(&x, arrays.source.Content().data() + Bytes(i, sizeof x), sizeof x);
        std::memcpy(&integer, arrays.result.Pixels() + Bytes(i, sizeof integer), sizeof integer);
        const bool isPositive = !std::isnan(x) && x > 0, isNegative = !std::isnan(x) && x < 0;
        Check((integer <= 0 || isPositive) && (integer >= 0 || isNegative), "the sign stays");
    }
}

void DecodeALaw(ByteStream& stream, uint32_t state) {
    const int32_t count = DrawCount(stream);
    SetCall("PK_DecodeALawTo16Bit of " + std::to_string(count));
    const Arrays arrays(stream, Bytes(count, 1), Bytes(count, 2));
    const PK_Result result = CallIn(state, [&] {
        return PK_DecodeALawTo16Bit(arrays.source.Pixels(), count,
                                    reinterpret_cast<int16_t*>(arrays.result.Pixels()));
    });
    arrays.CheckAround(result, count < 0 ? PK_ErrFailed : PK_Success);
    for (int32_t i = 0; i < count; ++i) {
        int16_t sample;
        std::memcpy(&sample, arrays.result.Pixels() + Bytes(i, 2), sizeof sample);
        const uint8_t code = arrays.source.Content()[static_cast<size_t>(i)];
        Check((sample > 0) == ((code & 0x80) != 0) && sample % 8 == 0 && sample != 0, "samples of the law");
    }
}

void Multiply(ByteStream& stream, uint32_t state) {
    const Size size = {DrawCount(stream), stream.Between(-1, 4)};
    const int32_t scale = stream.BetweenOrAny(-9, 18, 4);
    uint8_t constants[4];
    stream.Fill(constants, sizeof constants);
    SetCall("PK_MultiplyByConstant of " + Words(size) + ", scale " + std::to_string(scale));
    const auto layout = [&] { return DrawLayout(stream, int64_t{4} * size.width, size); };
    const SourceImage source(layout(), stream);
    ImageMemory result(layout(), stream);
    const PK_Result outcome = CallIn(state, [&] {
        return PK_MultiplyByConstant(size.width, size.height, source.Pixels(), source.RowBytes(),
                                     result.Pixels(), result.RowBytes(), constants, scale);
    });
    CheckResult(size.IsPossible() ? PK_Success : PK_ErrFailed, outcome);
    source.CheckStays();
    result.CheckPadding();
    const std::vector<uint8_t> products = result.Rows();
    for (size_t i = 0; i < products.size(); ++i)
        Check(source.Content()[i] * constants[i % 4] != 0 || products[i] == 0, "a product with 0 is 0");
}

void FuzzArrayUtilities(ByteStream& stream) {
    SetSwitches(DrawSwitches(stream));
    const uint32_t state = DrawFloatState(stream);
    switch (stream.Below(4)) {
    case 0:
        return ConvertFloats<int32_t>(stream, state, PK_Convert_32f32sSfs, "PK_Convert_32f32sSfs");
    case 1:
        return ConvertFloats<int16_t>(stream, state, PK_Convert_32f16sSfs, "PK_Convert_32f16sSfs");
    case 2:
        return DecodeALaw(stream, state);
    default:
        return Multiply(stream, state);
    }
}

const Family sFamily('U', "utilities", FuzzArrayUtilities);

} // namespace
