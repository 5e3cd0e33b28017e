#include "SamplePlanes.h"

namespace tool {
namespace {

/// Where the samples of a plane stand in a row of pixels.
struct Samples {
    int32_t first, step;
};
struct Layout {
    Samples planes[3]; // Y, U and V
    int32_t chromaShift;
};
constexpr Layout kVUYX = {{{2, 4}, {1, 4}, {0, 4}}, 0}, kUYVY = {{{1, 2}, {0, 4}, {2, 4}}, 1};

const Layout& LayoutOf(PK_PixelFormat format) {
    return Is422(format) ? kUYVY : kVUYX;
}

int32_t SamplesOfRow(const Layout& layout, int plane, int32_t width) {
    return plane == 0 ? width : (width + layout.chromaShift) >> layout.chromaShift;
}

/// Calls use(first sample, samples, step) for each row of each plane.
template <typename Image, typename Use>
void ForEachRow(Image& frame, const Use& use) {
    const Layout& layout = LayoutOf(frame.Format());
    for (int plane = 0; plane < 3; ++plane)
        for (int32_t y = 0; y < frame.Height(); ++y)
            use(frame.Row(y) + layout.planes[plane].first, SamplesOfRow(layout, plane, frame.Width()),
                layout.planes[plane].step);
}

} // namespace

bool Is422(PK_PixelFormat format) {
    return format == PK_PixelFormat_UYVY_422_8u || format == PK_PixelFormat_UYVY_422_8u_709;
}

PK_PixelFormat UYVYOf(bool is709) {
    return is709 ? PK_PixelFormat_UYVY_422_8u_709 : PK_PixelFormat_UYVY_422_8u;
}

bool HasSamplePlanes(PK_PixelFormat format) {
    return Is422(format) || format == PK_PixelFormat_VUYX_4444_8u ||
           format == PK_PixelFormat_VUYX_4444_8u_709;
}

size_t SamplePlanesBytes(PK_PixelFormat format, int32_t width, int32_t height) {
    size_t samples = 0;
    for (int plane = 0; plane < 3; ++plane)
        samples += static_cast<size_t>(SamplesOfRow(LayoutOf(format), plane, width));
    return samples * static_cast<size_t>(height);
}

void AppendSamplePlanes(const Frame& frame, std::string& bytes) {
    const size_t before = bytes.size();
    bytes.resize(before + SamplePlanesBytes(frame.Format(), frame.Width(), frame.Height()));
    char* to = bytes.data() + before;
    ForEachRow(frame, [&](const uint8_t* from, int32_t samples, int32_t step) {
        for (int32_t i = 0; i < samples; ++i) *to++ = static_cast<char>(from[ptrdiff_t{i} * step]);
    });
}

void FromSamplePlanes(const std::vector<uint8_t>& bytes, Frame& frame) {
    const uint8_t* from = bytes.data();
    ForEachRow(frame, [&](uint8_t* to, int32_t samples, int32_t step) {
        for (int32_t i = 0; i < samples; ++i) to[ptrdiff_t{i} * step] = *from++;
    });
}

} // namespace tool
