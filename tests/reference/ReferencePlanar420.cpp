#include "reference/ReferencePlanar420.h"

#include "reference/ReferenceBridges.h"

#include <algorithm>
#include <cmath>
#include <string>

namespace PKTest {
namespace {

bool Names(PK_PixelFormat format, const char* part) {
    return std::string(PK_PixelFormatName(format)).find(part) != std::string::npos;
}
bool IsField(PK_PixelFormat format) {
    return Names(format, "FIELD");
}
bool Is709(PK_PixelFormat format) {
    return Names(format, "_709");
}
PK_PixelFormat Pick(PK_PixelFormat source, PK_PixelFormat of601, PK_PixelFormat of709) {
    return Is709(source) ? of709 : of601;
}

using Row = std::vector<uint8_t>;

Row Weigh(const Row& a, const Row& b, int wa, int wb, int rounding, int shift) {
    Row out(a.size());
    for (size_t i = 0; i < a.size(); ++i)
        out[i] = static_cast<uint8_t>((wa * a[i] + wb * b[i] + rounding) >> shift);
    return out;
}

/// Every second row.
Samples OneField(const Samples& rows, size_t first) {
    Samples out;
    for (size_t i = first; i < rows.size(); i += 2) out.push_back(rows[i]);
    return out;
}

enum class Between { Frame, EvenField, OddField };

/// Twice as many rows, or one more.
Samples DoubleRows(const Samples& chroma, size_t height, Between kind) {
    Samples out = {chroma.front()};
    for (size_t i = 0; i + 1 < chroma.size(); ++i) {
        const Row &a = chroma[i], &b = chroma[i + 1];
        if (kind == Between::Frame) {
            out.push_back(Weigh(a, b, 3, 1, 2, 2));
            out.push_back(Weigh(a, b, 1, 3, 2, 2));
        } else if (kind == Between::EvenField) {
            out.push_back(Weigh(a, b, 5, 3, 4, 3));
            out.push_back(Weigh(a, b, 1, 7, 4, 3));
        } else {
            out.push_back(Weigh(a, b, 7, 1, 4, 3));
            out.push_back(Weigh(a, b, 3, 5, 4, 3));
        }
    }
    while (out.size() < height) out.push_back(chroma.back());
    out.resize(height);
    out.back() = chroma[std::min(height / 2, chroma.size() - 1)]; // as it stands
    return out;
}

Samples DoubleRowsOfField(const Samples& chroma, size_t rowsOfField, bool isOdd) {
    const Samples own = OneField(chroma, isOdd && chroma.size() > 1 ? 1 : 0);
    return DoubleRows(own, rowsOfField, isOdd ? Between::OddField : Between::EvenField);
}

/// Chroma for so many rows of the picture or of a field; grey where it has none.
Samples FullHeight(const PlanarPicture& picture, int plane, size_t height, int32_t field) {
    const Samples& chroma = picture.planes[plane];
    if (chroma.empty() || chroma[0].empty())
        return Samples(height, Row(static_cast<size_t>(picture.width + 1) / 2, 128));
    Samples complete = chroma;
    if (picture.width % 2 == 1)
        for (Row& row : complete) row.push_back(row.back());
    if (!IsField(picture.format)) return DoubleRows(complete, height, Between::Frame);
    if (field != 0) return DoubleRowsOfField(complete, height, field == 2);
    const Samples even = DoubleRowsOfField(complete, (height + 1) / 2, false);
    const Samples odd = DoubleRowsOfField(complete, height / 2, true);
    Samples out;
    for (size_t row = 0; row < height; ++row) out.push_back(row % 2 ? odd[row / 2] : even[row / 2]);
    return out;
}

/// The row of chroma that luma takes where none is made between two.
Row SharedChroma(const PlanarPicture& picture, int plane, int32_t luma) {
    const Samples& chroma = picture.planes[plane];
    if (chroma.empty() || chroma[0].empty()) return Row(static_cast<size_t>(picture.width + 1) / 2, 128);
    const auto count = static_cast<int32_t>(chroma.size());
    int32_t row = luma / 2;
    if (IsField(picture.format)) {
        row = ((luma / 2) & ~1) + (luma & 1);
        while (row >= count) row -= 2;
    }
    Row out = chroma[static_cast<size_t>(std::clamp(row, 0, count - 1))];
    if (picture.width % 2 == 1) out.push_back(out.back());
    return out;
}

Row ToUYVY(const Row& y, const Row& u, const Row& v) {
    Row out;
    for (size_t i = 0; i < y.size(); i += 2) {
        const uint8_t second = i + 1 < y.size() ? y[i + 1] : y[i];
        out.insert(out.end(), {u[i / 2], y[i], v[i / 2], second});
    }
    return out;
}

Row DoubleColumns(const Row& c, size_t width, bool isBetween) {
    Row out;
    for (size_t x = 0; x < width; ++x) {
        const size_t k = x / 2;
        const int here = c[k], left = k > 0 ? c[k - 1] : here, right = k + 1 < c.size() ? c[k + 1] : here;
        int value = 0;
        if (isBetween)
            value = x % 2 ? (3 * here + right + 2) >> 2 : (left + 3 * here + 2) >> 2;
        else
            value = x % 2 ? (here + right + 1) >> 1 : here;
        out.push_back(static_cast<uint8_t>(value));
    }
    return out;
}

Row ToVUYX(const Row& y, const Row& u, const Row& v) {
    Row out;
    for (size_t i = 0; i < y.size(); ++i) out.insert(out.end(), {v[i], u[i], y[i], 255});
    return out;
}

std::vector<float> Widen(const Row& row, bool byThirds) {
    std::vector<float> out;
    if (!byThirds)
        for (size_t i = 0; i < row.size(); i += 2) {
            const int a = row[i], b = row[i + 1];
            for (const int value : {a, (a + b) >> 1, b}) out.push_back(static_cast<float>(value));
        }
    else
        for (size_t i = 0; i < row.size(); i += 3) {
            const int a = row[i], b = row[i + 1], c = row[i + 2];
            out.push_back(static_cast<float>(a));
            out.push_back(static_cast<float>(a + 2 * b) * 0.33333334f);
            out.push_back(static_cast<float>(2 * b + c) * 0.33333334f);
            out.push_back(static_cast<float>(c));
        }
    return out;
}

uint8_t Code(float value) {
    return static_cast<uint8_t>(std::clamp(std::nearbyint(value), 0.0f, 255.0f));
}

using Floats = std::vector<float>;

void To709(Floats& y, Floats& u, Floats& v) {
    for (size_t i = 0; i < y.size(); ++i) {
        const float du = u[i / 2] - 128, dv = v[i / 2] - 128;
        y[i] = y[i] - 16 - 0.11554975f * du - 0.20793764f * dv + 16;
    }
    for (size_t k = 0; k < u.size(); ++k) {
        const float du = u[k] - 128, dv = v[k] - 128;
        u[k] = 1.01863968f * du + 0.11461795f * dv + 128;
        v[k] = 0.07504945f * du + 1.02532709f * dv + 128;
    }
}

Row WidenedUYVY(const Floats& y, const Floats& u, const Floats& v) {
    Row out;
    for (size_t i = 0; i < y.size(); i += 2)
        out.insert(out.end(), {Code(u[i / 2]), Code(y[i]), Code(v[i / 2]), Code(y[i + 1])});
    return out;
}

Row WidenedV210(const Floats& y, const Floats& u, const Floats& v) {
    const auto codes = [](const Floats& samples) {
        std::vector<uint32_t> out;
        for (const float sample : samples)
            out.push_back(static_cast<uint32_t>(std::clamp(std::nearbyint(4 * sample), 0.0f, 1023.0f)));
        return out;
    };
    return ReferencePlanarToV210({codes(y), codes(u), codes(v)}, static_cast<int>(y.size()));
}

Row WidenedVUYX(const Floats& y, const Floats& u, const Floats& v) {
    Row out;
    for (size_t i = 0; i < y.size(); ++i)
        out.insert(out.end(), {Code(v[i / 2]), Code(u[i / 2]), Code(y[i]), 255});
    return out;
}

Row WidenedBGRX(const Floats& y, const Floats& u, const Floats& v, bool is709) {
    Row out;
    for (size_t i = 0; i < y.size(); ++i) {
        const float du = u[i / 2] - 128, dv = v[i / 2] - 128, luma = 1.16438f * (y[i] - 16);
        const float blue = luma + (is709 ? 2.1124f : 2.01723f) * du;
        const float green =
            luma - (is709 ? 0.213249f : 0.391762f) * du - (is709 ? 0.532909f : 0.812969f) * dv;
        const float red = luma + (is709 ? 1.79274f : 1.59603f) * dv;
        out.insert(out.end(), {Code(blue), Code(green), Code(red), 255});
    }
    return out;
}

int32_t FirstRowOf(int32_t field) {
    return field == 2 ? 1 : 0;
}

} // namespace

DecodedPicture ReferenceFullWidth(const PlanarPicture& picture, int32_t height, PK_PixelFormat destination,
                                  int32_t field) {
    const PK_PixelFormat vuyx =
        Pick(picture.format, PK_PixelFormat_VUYX_4444_8u, PK_PixelFormat_VUYX_4444_8u_709);
    const bool is444 = destination == vuyx;
    DecodedPicture out = {
        is444 ? vuyx : Pick(picture.format, PK_PixelFormat_UYVY_422_8u, PK_PixelFormat_UYVY_422_8u_709), {}};
    const bool isFull = height == picture.height;
    const auto doubled = [&](int plane) {
        return FullHeight(picture, plane, static_cast<size_t>(height), isFull ? 0 : std::max(field, 1));
    };
    const Samples full[2] = {doubled(1), doubled(2)};
    for (int32_t row = 0; row < height; ++row) {
        const int32_t luma = isFull ? row : 2 * row + FirstRowOf(field);
        const bool asItStands = !isFull && !IsField(picture.format);
        const auto chroma = [&](int plane) {
            return asItStands ? SharedChroma(picture, plane, luma)
                              : full[plane - 1][static_cast<size_t>(row)];
        };
        const Row& y = picture.planes[0][static_cast<size_t>(luma)];
        const bool isBetween = Names(picture.format, "MPEG4");
        out.rows.push_back(is444 ? ToVUYX(y, DoubleColumns(chroma(1), y.size(), isBetween),
                                          DoubleColumns(chroma(2), y.size(), isBetween))
                                 : ToUYVY(y, chroma(1), chroma(2)));
    }
    return out;
}

DecodedPicture ReferenceDecimated(const PlanarPicture& picture, int32_t columns, int32_t rows) {
    DecodedPicture out = {Pick(picture.format, PK_PixelFormat_VUYA_4444_8u, PK_PixelFormat_VUYA_4444_8u_709),
                          {}};
    const auto count = static_cast<size_t>(picture.width / columns), step = static_cast<size_t>(columns);
    for (int32_t luma = 0; luma / rows < picture.height / rows; luma += rows) {
        const Row &y = picture.planes[0][static_cast<size_t>(luma)], u = SharedChroma(picture, 1, luma),
                  v = SharedChroma(picture, 2, luma);
        Row pixels;
        for (size_t k = 0; k < count; ++k)
            pixels.insert(pixels.end(), {v[step * k / 2], u[step * k / 2], y[step * k], 255});
        out.rows.push_back(pixels);
    }
    return out;
}

DecodedPicture ReferenceWidened(const PlanarPicture& picture, int32_t width, int32_t height,
                                PK_PixelFormat destination, int32_t field) {
    const bool byThirds = 3 * width == 4 * picture.width;
    const bool toRGB = (destination & 1) == 0,
               to4444 = (destination & 0x3c) != 0 && (destination & 0x30) == 0;
    const bool to709 = (destination & 0x600) != 0, from709 = Is709(picture.format);
    DecodedPicture out = {};
    const bool toV210 = !from709 && (destination == PK_PixelFormat_V210_422_10u ||
                                     destination == PK_PixelFormat_V210_422_10u_709);
    if (toRGB)
        out.format = PK_PixelFormat_BGRX_4444_8u;
    else if (to4444)
        out.format = Pick(picture.format, PK_PixelFormat_VUYX_4444_8u, PK_PixelFormat_VUYX_4444_8u_709);
    else if (toV210)
        out.format = destination;
    else
        out.format = from709 || to709 ? PK_PixelFormat_UYVY_422_8u_709 : PK_PixelFormat_UYVY_422_8u;
    for (int32_t row = 0; row < height; ++row) {
        const int32_t luma = height == picture.height ? row : 2 * row + FirstRowOf(field);
        Floats y = Widen(picture.planes[0][static_cast<size_t>(luma)], byThirds);
        Floats u = Widen(SharedChroma(picture, 1, luma), byThirds);
        Floats v = Widen(SharedChroma(picture, 2, luma), byThirds);
        if (!toRGB && !to4444 && !from709 && to709) To709(y, u, v);
        out.rows.push_back(toRGB    ? WidenedBGRX(y, u, v, from709)
                           : to4444 ? WidenedVUYX(y, u, v)
                           : toV210 ? WidenedV210(y, u, v)
                                    : WidenedUYVY(y, u, v));
    }
    return out;
}

PlanarPicture ReferenceEncoded(const Samples& pixels, PK_PixelFormat format, int32_t width) {
    const auto height = static_cast<int32_t>(pixels.size());
    PlanarPicture out = {format, width, height, {Samples(pixels.size()), {}, {}}};
    const int32_t lumaRows = IsField(format) ? height : height & ~1;
    for (int32_t row = 0; row < lumaRows; ++row)
        for (int32_t x = 0; x < width; ++x)
            out.planes[0][static_cast<size_t>(row)].push_back(
                pixels[static_cast<size_t>(row)][static_cast<size_t>(4 * x + 2)]);
    const auto add = [&](int32_t first, int32_t second) {
        for (const int channel : {1, 0}) { // U lies behind V
            const auto at = [&](int32_t row, int32_t x) {
                return int{
                    pixels[static_cast<size_t>(row)][static_cast<size_t>(4 * std::max(x, 0) + channel)]};
            };
            Row chroma;
            for (int32_t k = 0; k < width / 2; ++k) {
                int sum = 0;
                for (const int32_t row : {first, second})
                    sum += at(row, 2 * k - 1) + 2 * at(row, 2 * k) + at(row, 2 * k + 1);
                chroma.push_back(static_cast<uint8_t>(sum >> 3));
            }
            out.planes[channel == 1 ? 1 : 2].push_back(chroma);
        }
    };
    if (!IsField(format))
        for (int32_t row = 0; row + 2 <= height; row += 2) add(row, row + 1);
    else
        for (int32_t row = 0; row < height; row += 4) {
            if (row + 4 <= height) {
                add(row, row + 2);
                add(row + 1, row + 3);
            } else {
                add(row, row);
            }
        }
    return out;
}

} // namespace PKTest
