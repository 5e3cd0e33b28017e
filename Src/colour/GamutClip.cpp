#include "colour/GamutClip.h"

namespace PK {

namespace {

// As the vector instructions choose: the second operand unless the comparison holds.
float Least(float a, float b) {
    return a < b ? a : b;
}
float Greatest(float a, float b) {
    return a > b ? a : b;
}

RGB RaiseToZero(RGB c, const float* luma) {
    const float Y = luma[2] * c.b + luma[1] * c.g + luma[0] * c.r;
    const RGB scales = ForChannels(c, [Y](float v) { return v < 0 ? Y / (Y - v) : 1.0f; });
    const float scale = Least(Least(scales.r, scales.g), scales.b);
    return ForChannels(c, [Y, scale](float v) { return (v - Y) * scale + Y; });
}

RGB LowerToOne(RGB c, const float* luma) {
    if (c.r == c.g && c.g == c.b) return {1, 1, 1}; // a grey has no hue to keep
    const float least = Least(Least(c.r, c.g), c.b);
    const float most = Greatest(Greatest(c.r, c.g), c.b);
    const RGB above = ForChannels(c, [least](float v) { return v - least; });
    const float mostAbove = Greatest(Greatest(above.r, above.g), above.b);
    const float weighted = (luma[0] * above.r + luma[1] * above.g + luma[2] * above.b) / mostAbove;
    const float grey = Least(Greatest(weighted, 0.15f), 0.9f);
    const float scale = (1 - grey) / (most - grey);
    return ForChannels(c, [grey, scale](float v) { return (v - grey) * scale + grey; });
}

} // namespace

RGB GamutClipPixel(RGB c, const float* luma) {
    if (c.r < 0 || c.g < 0 || c.b < 0) c = RaiseToZero(c, luma);
    if (c.r > 1 || c.g > 1 || c.b > 1) c = LowerToOne(c, luma);
    return c;
}

} // namespace PK
