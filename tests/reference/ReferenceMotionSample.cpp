#include "reference/ReferenceMotionSample.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <optional>

namespace PKReference {
namespace {

// Fields of a format.
constexpr uint32_t kYUV = 1, kAlpha = 0xc, kStraight = 4, kPremultiplied = 8, kDepth = 0x1c0, k8 = 0,
                   k15 = 0x80, kAlphaFirst = 0x1000;

template <class Sample>
Sample Load(const uint8_t* from) {
    Sample sample;
    std::memcpy(&sample, from, sizeof sample);
    return sample;
}

struct Layout {
    explicit Layout(PK_PixelFormat format)
        : depth(format & kDepth), isAlphaFirst((format & kAlphaFirst) != 0), sampleBytes(depth == k8    ? 1
                                                                                         : depth == k15 ? 2
                                                                                                        : 4),
          full(depth == k8    ? 255.0f
               : depth == k15 ? 32768.0f
                              : 1.0f),
          hasVideoZero(depth == k8 && (format & kYUV) != 0) {}

    float Sample(const uint8_t* pixel, int channel) const {
        const uint8_t* at = pixel + (isAlphaFirst ? 3 - channel : channel) * sampleBytes;
        return depth == k8 ? Load<uint8_t>(at) : depth == k15 ? Load<uint16_t>(at) : Load<float>(at);
    }
    float Zero(int channel) const {
        constexpr float kZeros[] = {128, 128, 16, 0};
        return hasVideoZero ? kZeros[channel] : 0;
    }

    uint32_t depth;
    bool isAlphaFirst;
    int sampleBytes;
    float full;
    bool hasVideoZero;
};

/// Colours as differences from their zeros, and alpha.
template <class Real>
struct Neighbour {
    bool isInside = false;
    std::array<Real, 4> channels{};
};

template <class Real>
Neighbour<Real> Fetch(const MotionSource& source, int64_t column, int64_t row) {
    Neighbour<Real> result;
    const PK_Rect& rect = source.rect;
    result.isInside = column >= rect.left && column < rect.right && row >= rect.top && row < rect.bottom;
    if (!result.isInside) return result;
    const Layout layout(source.format);
    const uint8_t* pixel = source.pixels + row * source.rowBytes + column * 4 * layout.sampleBytes;
    for (int c = 0; c < 4; ++c)
        result.channels[static_cast<size_t>(c)] = Real(layout.Sample(pixel, c)) - Real(layout.Zero(c));
    const uint32_t alpha = source.format & kAlpha;
    if (alpha != kStraight && alpha != kPremultiplied) result.channels[3] = layout.full;
    return result;
}

/// A row of two: one inside stands for both; without any, those of the other row do, or what is inside of them.
template <class Real>
void Replace(Neighbour<Real>& left, Neighbour<Real>& right, const Neighbour<Real>& otherLeft,
             const Neighbour<Real>& otherRight) {
    if (left.isInside && right.isInside) return;
    if (left.isInside) {
        right = left;
    } else if (right.isInside) {
        left = right;
    } else {
        left = otherLeft.isInside ? otherLeft : otherRight;
        right = otherRight.isInside ? otherRight : otherLeft;
    }
}

std::optional<std::array<double, 2>> Clip(const PK_Rect& r, const MotionLine& line) {
    if (r.right < r.left || r.bottom < r.top) return std::nullopt;
    const auto [x, y] = line.at;
    const auto [dx, dy] = line.step;
    const auto time = [](int32_t side, float at, float step) {
        return (double(side) - double(at)) / double(step);
    };
    const auto isOutside = [](float at, int32_t low, int32_t high) {
        return at - float(low) < 8e-6f || at - float(high) >= -8e-6f;
    };
    std::array<double, 4> t = {time(r.left, x, dx), time(r.right, x, dx), time(r.top, y, dy),
                               time(r.bottom, y, dy)};
    if (std::abs(dx) < 8e-6f) {
        if (isOutside(x, r.left, r.right)) return std::nullopt;
        return std::array{std::min(t[2], t[3]), std::max(t[2], t[3])};
    }
    if (std::abs(dy) < 8e-6f) {
        if (isOutside(y, r.top, r.bottom)) return std::nullopt;
        return std::array{std::min(t[0], t[1]), std::max(t[0], t[1])};
    }
    std::sort(t.begin(), t.end());
    const double middle = (t[1] + t[2]) * 0.5;
    const double px = x + middle * dx, py = y + middle * dy;
    if (px < r.left || px > r.right || py < r.top || py > r.bottom) return std::nullopt;
    return std::array{t[1], t[2]};
}

int32_t Limit(double column, int32_t columns) {
    return static_cast<int32_t>(std::clamp<double>(column, 0, columns));
}

PK_Rect Grown(const PK_Rect& r, int32_t by) {
    return {r.left - by, r.top - by, r.right + by, r.bottom + by};
}

template <class Real>
std::array<Real, 4> WithZeros(std::array<Real, 4> pixel, const Layout& layout) {
    if (layout.hasVideoZero)
        for (int c = 0; c < 3; ++c) pixel[static_cast<size_t>(c)] += Real(layout.Zero(c));
    return pixel;
}

/// By blocks of 128 columns that go over no more than 256 of the source.
void MarkMixed(std::vector<MotionPlace>& places, int32_t begin, int32_t end) {
    const auto pixel = [](const MotionPlace& place) { return std::floor(place.at.x - 0.5f); };
    for (int32_t block = begin; block < end; block += 128) {
        const auto first = places.begin() + block, last = places.begin() + std::min(block + 128, end);
        const auto [least, most] = std::minmax_element(
            first, last, [&](const MotionPlace& a, const MotionPlace& b) { return pixel(a) < pixel(b); });
        const bool isMixed = pixel(*most) - pixel(*least) <= 256;
        std::for_each(first, last, [isMixed](MotionPlace& place) { place.isMixed = isMixed; });
    }
}

/// Pixels of two rows as they are weighed, premultiplied where alpha is.
template <class Real>
std::array<Real, 4> Mix(const std::array<Neighbour<Real>, 4>& n, const MotionSource& source, Real fx,
                        Real fy) {
    const Layout layout(source.format);
    const Real scale = Real(1.0f / layout.full);
    const auto weighed = [&](size_t k, size_t c) {
        const Real alpha = n[k].channels[3];
        if (c == 3 || (source.format & kAlpha) != kStraight) return n[k].channels[c];
        return n[k].channels[c] * (alpha * scale);
    };
    const auto between = [](Real a, Real b, Real way) { return a + (b - a) * way; };
    std::array<Real, 4> sum;
    for (size_t c = 0; c < 4; ++c)
        sum[c] =
            between(between(weighed(0, c), weighed(2, c), fy), between(weighed(1, c), weighed(3, c), fy), fx);
    const auto share = [&](size_t upper, size_t lower, Real way) {
        return std::max(n[upper].channels[3] * (1 - fy), n[lower].channels[3] * fy) * way;
    };
    if (std::max(share(0, 2, 1 - fx), share(1, 3, fx)) <= Real(0x1p-17)) sum = {};
    return sum;
}

} // namespace

MotionPlaces WalkMotionLine(const PK_Rect& rect, const MotionLine& line, int32_t margin) {
    const int32_t columns = line.columns;
    const auto outer = Clip(Grown(rect, margin), line);
    if (!outer) return {columns, {}};
    const int32_t start = Limit(std::floor((*outer)[0]), columns),
                  end = Limit(std::ceil((*outer)[1]), columns);
    int32_t inner = end, right = end;
    if (const auto inside = Clip(Grown(rect, -margin), line)) {
        right = Limit(std::floor((*inside)[1]), columns);
        inner = std::min(Limit(std::ceil((*inside)[0]), columns), right);
    }
    MotionPlaces walk{start, {}};
    const PK_Point step = {line.step.x, line.rotated ? line.step.y : 0};
    PK_Point at = {line.at.x + step.x * static_cast<float>(start),
                   line.at.y + step.y * static_cast<float>(start)};
    for (int32_t i = start; i < inner; ++i, at = {at.x + step.x, at.y + step.y})
        walk.places.push_back({at, false});
    for (int32_t i = 0; i < right - inner; ++i) {
        if (i < 4) {
            const auto k = static_cast<float>(i);
            walk.places.push_back({{at.x + step.x * k, at.y + step.y * k}, true});
        } else {
            const PK_Point before = walk.places[walk.places.size() - 4].at;
            walk.places.push_back({{before.x + step.x * 4, before.y + step.y * 4}, true});
        }
    }
    if (!line.rotated) MarkMixed(walk.places, inner - start, right - start);
    const auto passed = static_cast<float>(right - inner);
    at = {at.x + step.x * passed, at.y + step.y * passed};
    for (int32_t i = right; i < end; ++i, at = {at.x + step.x, at.y + step.y})
        walk.places.push_back({at, false});
    return walk;
}

template <class Real>
std::array<Real, 4> SampleBilinear(const MotionSource& source, const MotionPlace& place) {
    const Real x = Real(place.at.x) - Real(0.5), y = Real(place.at.y) - Real(0.5);
    const Real i = std::floor(x), j = std::floor(y), fx = x - i, fy = y - j;
    const auto column = static_cast<int64_t>(i), row = static_cast<int64_t>(j);
    std::array<Neighbour<Real>, 4> n = {
        Fetch<Real>(source, column, row), Fetch<Real>(source, column + 1, row),
        Fetch<Real>(source, column, row + 1), Fetch<Real>(source, column + 1, row + 1)};
    if (!source.smoothEdges) {
        const auto before = n;
        Replace(n[0], n[1], before[2], before[3]);
        Replace(n[2], n[3], before[0], before[1]);
    }
    if (place.isMixed) return WithZeros(Mix(n, source, fx, fy), Layout(source.format));
    const std::array<Real, 4> weights = {(1 - fx) * (1 - fy), fx * (1 - fy), (1 - fx) * fy, fx * fy};
    const Layout layout(source.format);
    const Real scale = Real(1.0f / layout.full);
    std::array<Real, 4> sum{};
    bool anyShows = false;
    for (size_t k = 0; k < 4; ++k) {
        const Real share = weights[k] * n[k].channels[3];
        anyShows = anyShows || share > Real(0x1p-17);
        const Real factor = (source.format & kAlpha) == kStraight ? share * scale : weights[k];
        for (size_t c = 0; c < 3; ++c) {
            const Real part = n[k].channels[c] * factor;
            sum[c] = k == 0 ? part : sum[c] + part;
        }
        sum[3] = k == 0 ? share : sum[3] + share;
    }
    const bool isVisible = place.isInside ? anyShows : sum[3] - Real(8e-6f) > 0;
    if (!isVisible) sum = {};
    return WithZeros(sum, layout);
}

template std::array<float, 4> SampleBilinear(const MotionSource&, const MotionPlace&);
template std::array<double, 4> SampleBilinear(const MotionSource&, const MotionPlace&);

MotionSum SampleByWeights(const MotionSource& source, PK_Point at, MotionWeights x, MotionWeights y) {
    const float px = at.x - 0.5f, py = at.y - 0.5f;
    const float i = std::floor(px), j = std::floor(py);
    // Just below a whole pixel the difference rounds to one.
    const int32_t phaseX = std::min(static_cast<int32_t>((px - i) * 128), 127);
    const int32_t phaseY = std::min(static_cast<int32_t>((py - j) * 128), 127);
    MotionSum sum{};
    for (int32_t v = 0; v < y.width; ++v)
        for (int32_t h = 0; h < x.width; ++h) {
            const auto pixel = Fetch<double>(source, static_cast<int64_t>(i) + 1 - x.width / 2 + h,
                                             static_cast<int64_t>(j) + 1 - y.width / 2 + v);
            if (!pixel.isInside) continue;
            const double weight =
                double(x.weights[phaseX * x.width + h]) * y.weights[phaseY * y.width + v] * 0x1p-28;
            for (size_t c = 0; c < 4; ++c) {
                sum.pixel[c] += weight * pixel.channels[c];
                sum.magnitude += std::abs(weight * pixel.channels[c]);
            }
        }
    sum.pixel[3] = std::clamp(sum.pixel[3], 0.0, 1.0);
    return sum;
}

} // namespace PKReference
