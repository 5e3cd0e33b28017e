// The primitives on arrays of samples, as a host calls them.

#include "frame/Arguments.h"
#include "primitives/ALaw.h"
#include "primitives/ConvertFloat.h"
#include "primitives/MultiplyConstant.h"

#include <PixelKiln/Utilities.h>

namespace PK {
namespace {

PK_Result ResultOf(int32_t status) {
    return status == 0 ? PK_Success : PK_ErrFailed;
}

} // namespace
} // namespace PK

using namespace PK;

PK_Result PK_MultiplyByConstant(int32_t width, int32_t height, const void* source, int32_t sourceRowBytes,
                                void* destination, int32_t destinationRowBytes, const uint8_t constants[4],
                                int32_t scaleFactor) noexcept {
    if (const auto result =
            ResultWithoutWork(width, height, {source, destination, constants}, BelowZero::Refused))
        return *result;
    return ResultOf(MultiplyConstant(static_cast<const uint8_t*>(source), sourceRowBytes, constants,
                                     static_cast<uint8_t*>(destination), destinationRowBytes, width, height,
                                     scaleFactor));
}

PK_Result PK_Convert_32f32sSfs(const float* source, int32_t* destination, int32_t length, int32_t rounding,
                               int32_t scaleFactor) noexcept {
    if (length == 0) return PK_Success;
    return ResultOf(ConvertFloatToInt32(source, destination, length, rounding, scaleFactor));
}

PK_Result PK_Convert_32f16sSfs(const float* source, int16_t* destination, int32_t length, int32_t rounding,
                               int32_t scaleFactor) noexcept {
    if (length == 0) return PK_Success;
    return ResultOf(ConvertFloatToInt16(source, destination, length, rounding, scaleFactor));
}

PK_Result PK_DecodeALawTo16Bit(const uint8_t* source, int32_t length, int16_t* destination) noexcept {
    if (length == 0) return PK_Success;
    return ResultOf(ALawToLinear16(source, destination, length));
}
