#include "reference/ReferenceDissolve.h"

#include <cmath>
#include <cstring>

namespace PKTest {
namespace {

class ReferenceDissolve {
public:
    ReferenceDissolve(DissolveRule rule, SampleDepth depth, float weight)
        : fRule(rule), fDepth(depth), fWeight(weight), fOther(1 - weight) {}

    /// Alpha is the last of four.
    void Mix(const float (&a)[4], const float (&b)[4], float (&out)[4]) const {
        if (fRule == DissolveRule::kOpaque) {
            for (int i = 0; i < 3; ++i)
                out[i] = 8e-6f > fWeight ? b[i] : 8e-6f + fWeight > 1.0f ? a[i] : Mean(a[i], b[i]);
            out[3] = Full();
        } else if (IsZero(a[3])) {
            CopyColour(b, out);
            out[3] = Stored(b[3] * fOther);
        } else if (IsZero(b[3])) {
            CopyColour(a, out);
            out[3] = Stored(a[3] * fWeight);
        } else if (AreEqual(a[3], b[3])) {
            for (int i = 0; i < 3; ++i) out[i] = Mean(a[i], b[i]);
            out[3] = a[3];
        } else if (fRule == DissolveRule::kPremultiplied) {
            for (int i = 0; i < 4; ++i) out[i] = Mean(a[i], b[i]);
        } else {
            const float first = a[3] * fWeight, second = b[3] * fOther, sum = first + second;
            for (int i = 0; i < 3; ++i) out[i] = Stored((a[i] * first + b[i] * second) * (1 / sum));
            out[3] = Stored(sum);
        }
    }

private:
    bool IsFloat() const { return fDepth == SampleDepth::k32f; }
    uint32_t Limit() const { return fDepth == SampleDepth::k8u ? 255 : 32768; }
    float Full() const { return IsFloat() ? 1.0f : static_cast<float>(Limit()); }
    float Stored(float value) const {
        return IsFloat() ? value : static_cast<float>(reference::NearestClamped(value, Limit()));
    }
    float Mean(float a, float b) const { return Stored(a * fWeight + b * fOther); }
    bool IsZero(float alpha) const { return IsFloat() ? 8e-6f > alpha : alpha == 0; }
    bool AreEqual(float a, float b) const { return IsFloat() ? 8e-6f > std::abs(a - b) : a == b; }
    static void CopyColour(const float (&from)[4], float (&to)[4]) {
        std::memcpy(to, from, 3 * sizeof(float));
    }

    DissolveRule fRule;
    SampleDepth fDepth;
    float fWeight, fOther;
};

} // namespace

void ReferenceDissolveRow(DissolveRule rule, SampleDepth depth, bool alphaFirst, const uint8_t* first,
                          const uint8_t* second, uint8_t* destination, size_t pixels, float weight) {
    const ReferenceDissolve dissolve(rule, depth, weight);
    for (int64_t pixel = 0; pixel < static_cast<int64_t>(pixels); ++pixel) {
        const auto place = [&](int64_t channel) { return 4 * pixel + (alphaFirst ? 3 - channel : channel); };
        float a[4], b[4], mixed[4];
        for (int64_t i = 0; i < 4; ++i) {
            a[i] = LoadSample(depth, first, place(i));
            b[i] = LoadSample(depth, second, place(i));
        }
        dissolve.Mix(a, b, mixed);
        for (int64_t i = 0; i < 4; ++i) StoreSample(depth, destination, place(i), mixed[i]);
    }
}

uint32_t ReferenceDissolveV210(uint32_t first, uint32_t second, float weight) {
    uint32_t word = 0;
    for (int bit = 0; bit < 30; bit += 10) {
        const auto a = static_cast<float>(first >> bit & 1023), b = static_cast<float>(second >> bit & 1023);
        word |= reference::NearestClamped(a * weight + b * (1 - weight), 1023) << bit;
    }
    return word;
}

} // namespace PKTest
