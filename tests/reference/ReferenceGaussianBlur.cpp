#include "reference/ReferenceGaussianBlur.h"

#include <cmath>

namespace PKTest {
namespace {

/// One channel of a line, from two samples before its beginning.
class Samples {
public:
    explicit Samples(int count) : fSamples(static_cast<size_t>(count) + 2) {}
    float& operator[](int i) { return fSamples[static_cast<size_t>(i + 2)]; }

private:
    std::vector<float> fSamples;
};

std::vector<float> FilterChannel(const std::vector<float>& source, int n, const ReferenceGaussian& g,
                                 bool repeatEdge) {
    const int s = static_cast<int>(source.size()), m = (n - s + 1) / 2;
    Samples x(n + 4), y(n + 4), z(n + 4);
    for (int i = 0; i < s; ++i) x[m + i] = source[static_cast<size_t>(i)];
    if (repeatEdge) {
        const float first = source.front(), last = source.back();
        for (int i = -2; i <= m - 1; ++i) {
            x[i] = first;
            y[i] = first * 0.5f;
        }
        for (int i = m + s; i <= m + s + m + 1; ++i) {
            x[i] = last;
            z[i] = last * 0.5f;
        }
    }
    for (int i = m; i <= n - 1; ++i) y[i] = g.c0 * x[i] + g.c1 * x[i - 1] - g.d1 * y[i - 1] - g.d2 * y[i - 2];
    for (int i = n - m - 1; i >= 0; --i)
        z[i] = g.c2 * x[i + 1] + g.c3 * x[i + 2] - g.d1 * z[i + 1] - g.d2 * z[i + 2];
    std::vector<float> out;
    for (int i = 0; i < n; ++i) out.push_back(y[i] + z[i]);
    return out;
}

} // namespace

ReferenceGaussian ReferenceGaussianOf(double sigma) {
    const float a0 = 0.9629f, a1 = 1.942f, w = 0.8448f, b = 1.26f;
    const double e1 = std::exp(-double{b} / sigma), e2 = std::exp(-2.52 / sigma);
    const double c = std::cos(double{w} / sigma), s = std::sin(double{w} / sigma);
    const float den = static_cast<float>(1.0 - 2.0 * c * e1 + e2);
    const float norm = static_cast<float>(
        2.0 * (double{a0} * (1.0 - e1 * c) / double{den} + double{a1} * (e1 * s) / double{den}) - double{a0});
    const float k = 1.0f / norm, p = a1 * k;
    ReferenceGaussian g{};
    g.c0 = a0 * k;
    g.c1 = static_cast<float>(e1 * (s * double{p} - c * double{g.c0}));
    g.d1 = static_cast<float>(-2.0 * e1 * c);
    g.d2 = static_cast<float>(e2);
    g.c2 = g.c1 - g.c0 * g.d1;
    g.c3 = -(g.c0 * g.d2);
    return g;
}

std::vector<FloatPixel> ReferenceGaussianLine(const std::vector<FloatPixel>& source, int length,
                                              const ReferenceGaussian& gaussian, bool repeatEdge) {
    std::vector<FloatPixel> result(static_cast<size_t>(length));
    for (size_t channel = 0; channel < 4; ++channel) {
        std::vector<float> samples;
        for (const FloatPixel& pixel : source) samples.push_back(pixel[channel]);
        const std::vector<float> filtered = FilterChannel(samples, length, gaussian, repeatEdge);
        for (size_t i = 0; i < filtered.size(); ++i) result[i][channel] = filtered[i];
    }
    return result;
}

} // namespace PKTest
