// pixman, whose operators work on the back image in place: at 8 bits also where ours work on floats.

#include "operations/Composites.h"
#include "operations/Operation.h"

#include <pixman.h>

#include <memory>

namespace OperationBench {
namespace {

struct Unref {
    void operator()(pixman_image_t* image) const { pixman_image_unref(image); }
};
using Image = std::shared_ptr<pixman_image_t>;

Image Wrap(const uint8_t* bytes, pixman_format_code_t format) {
    auto* const words = reinterpret_cast<uint32_t*>(const_cast<uint8_t*>(bytes));
    return {pixman_image_create_bits(format, kWidth, kHeight, words, kBGRARowBytes), Unref()};
}

/// By a mask of one alpha.
template <pixman_op_t kOperator, pixman_format_code_t kBack>
Run Composite(const uint8_t* source, uint8_t* back) {
    const pixman_color_t opacity = {0, 0, 0, static_cast<uint16_t>(kOpacity * 65535)};
    const Image top = Wrap(source, PIXMAN_a8r8g8b8), to = Wrap(back, kBack),
                mask = {pixman_image_create_solid_fill(&opacity), Unref()};
    return [=] {
        pixman_image_composite32(kOperator, top.get(), mask.get(), to.get(), 0, 0, 0, 0, 0, 0, kWidth,
                                 kHeight);
    };
}

template <pixman_op_t kOperator>
constexpr Prepare kBlend = Composite<kOperator, PIXMAN_a8r8g8b8>;

const AddPeers add = {
    {"Premultiplied BGRA 8u over opaque", "pixman OVER", false, Composite<PIXMAN_OP_OVER, PIXMAN_x8r8g8b8>},
    {"Premultiplied BGRA 8u over premultiplied", "pixman OVER", false, kBlend<PIXMAN_OP_OVER>},
    {"Blend of BGRA 32f, ColorBurn", "pixman, 8 bits", false, kBlend<PIXMAN_OP_COLOR_BURN>},
    {"Blend of BGRA 32f, ColorDodge", "pixman, 8 bits", false, kBlend<PIXMAN_OP_COLOR_DODGE>},
    {"Blend of BGRA 32f, Darken", "pixman, 8 bits", false, kBlend<PIXMAN_OP_DARKEN>},
    {"Blend of BGRA 32f, Difference", "pixman, 8 bits", false, kBlend<PIXMAN_OP_DIFFERENCE>},
    {"Blend of BGRA 32f, Exclusion", "pixman, 8 bits", false, kBlend<PIXMAN_OP_EXCLUSION>},
    {"Blend of BGRA 32f, HardLight", "pixman, 8 bits", false, kBlend<PIXMAN_OP_HARD_LIGHT>},
    {"Blend of BGRA 32f, Lighten", "pixman, 8 bits", false, kBlend<PIXMAN_OP_LIGHTEN>},
    {"Blend of BGRA 32f, Multiply", "pixman, 8 bits", false, kBlend<PIXMAN_OP_MULTIPLY>},
    {"Blend of BGRA 32f, Overlay", "pixman, 8 bits", false, kBlend<PIXMAN_OP_OVERLAY>},
    {"Blend of BGRA 32f, Screen", "pixman, 8 bits", false, kBlend<PIXMAN_OP_SCREEN>},
    {"Blend of BGRA 32f, SoftLight", "pixman, 8 bits", false, kBlend<PIXMAN_OP_SOFT_LIGHT>},
    {"Blend of BGRA 32f, Luminosity", "pixman, 8 bits", false, kBlend<PIXMAN_OP_HSL_LUMINOSITY>},
    {"Blend of BGRA 32f, Hue", "pixman, 8 bits", false, kBlend<PIXMAN_OP_HSL_HUE>},
};

} // namespace
} // namespace OperationBench
