// Products, conversions to integers and A-law on arrays that end where the arguments say.

#include "support/Check.h"
#include "support/Family.h"
#include "support/FloatState.h"
#include "support/ImageMemory.h"
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
        : source({sourceBytes, 1, 0}, stream), result({resultBytes, 1, 0}, stream), content(sourceBytes) {
        stream.Fill(content.data(), content.size());
        source.SetRows(content);
    }

    void CheckAround(PK_Result outcome, PK_Result expected) const {
        Check(outcome == expected, "the arguments decide the result");
        CheckSame(content, source.Rows(), "the source stays");
        Check(source.IsPaddingIntact() && result.IsPaddingIntact(), "nothing in front is written");
    }

    ImageMemory source, result;
    std::vector<uint8_t> content;
};

template <class Integer, class Function>
void ConvertFloats(ByteStream& stream, uint32_t state, Function convert, const char* name) {
    const int32_t count = DrawCount(stream),
                  rounding = stream.OneIn(4) ? stream.AnyI32() : stream.Between(0, 1);
    const int32_t scale = stream.OneIn(4) ? stream.AnyI32() : stream.Between(-40, 40);
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
        std::memcpy(&x, arrays.content.data() + Bytes(i, sizeof x), sizeof x);
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
        const uint8_t code = arrays.content[static_cast<size_t>(i)];
        Check((sample > 0) == ((code & 0x80) != 0) && sample % 8 == 0 && sample != 0, "samples of the law");
    }
}

void Multiply(ByteStream& stream, uint32_t state) {
    const int32_t width = DrawCount(stream), height = stream.Between(-1, 4);
    const int32_t scale = stream.OneIn(4) ? stream.AnyI32() : stream.Between(-9, 18);
    uint8_t constants[4];
    stream.Fill(constants, sizeof constants);
    SetCall("PK_MultiplyByConstant of " + std::to_string(width) + " x " + std::to_string(height) +
            ", scale " + std::to_string(scale));
    const bool isPossible = width >= 0 && height >= 0, isEmpty = width == 0 || height == 0;
    const size_t rows = isPossible && !isEmpty ? static_cast<size_t>(height) : 0;
    const auto layout = [&] {
        const size_t length = rows == 0 ? 0 : Bytes(width, 4);
        return RowsLayout{length, rows,
                          DrawRowBytes(stream, length, rows, static_cast<int32_t>(length) + 60)};
    };
    ImageMemory source(layout(), stream), result(layout(), stream);
    std::vector<uint8_t> content(rows * source.Layout().rowLength);
    stream.Fill(content.data(), content.size());
    source.SetRows(content);
    const PK_Result outcome = CallIn(state, [&] {
        return PK_MultiplyByConstant(width, height, source.Pixels(), source.Layout().rowBytes,
                                     result.Pixels(), result.Layout().rowBytes, constants, scale);
    });
    Check(outcome == (isPossible ? PK_Success : PK_ErrFailed), "the arguments decide the result");
    CheckSame(content, source.Rows(), "the source stays");
    Check(source.IsPaddingIntact() && result.IsPaddingIntact(), "bytes outside the rows stay");
    const std::vector<uint8_t> products = result.Rows();
    for (size_t i = 0; i < products.size(); ++i)
        Check(content[i] * constants[i % 4] != 0 || products[i] == 0, "a product with 0 is 0");
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
