#include "reference/ReferenceBridges.h"

#include <algorithm>
#include <cmath>
#include <cstring>

namespace PKTest {

namespace {

uint32_t Word16(const Bytes& bytes, int index) {
    const size_t at = 2 * static_cast<size_t>(index);
    return bytes[at] | static_cast<uint32_t>(bytes[at + 1]) << 8;
}

uint32_t Word32(const Bytes& bytes, int index) {
    return Word16(bytes, 2 * index) | Word16(bytes, 2 * index + 1) << 16;
}

void Append16(Bytes& bytes, uint32_t word) {
    bytes.push_back(static_cast<uint8_t>(word));
    bytes.push_back(static_cast<uint8_t>(word >> 8));
}

void Append32(Bytes& bytes, uint32_t word) {
    Append16(bytes, word & 0xffff);
    Append16(bytes, word >> 16);
}

/// Words of 10 bits at the top, as bits 2-11, 12-21 and 22-31 of a pixel.
uint32_t TopBitsToRGB10(const Bytes& source, int firstWord) {
    return Word16(source, firstWord) >> 6 << 2 | Word16(source, firstWord + 1) >> 6 << 12 |
           Word16(source, firstWord + 2) >> 6 << 22;
}

void AppendV210Group(Bytes& bytes, const std::vector<uint32_t>& samples) {
    for (size_t i = 0; i < 12; i += 3)
        Append32(bytes, samples[i] | samples[i + 1] << 10 | samples[i + 2] << 20);
}

uint32_t SampleOrLast(const std::vector<uint32_t>& samples, int index) {
    return samples[std::min(static_cast<size_t>(index), samples.size() - 1)];
}

long double SignedPower(long double c, long double exponent) {
    return std::copysign(std::pow(std::abs(c), exponent), c);
}

} // namespace

Bytes ReferenceRGB8ToBGRA(const Bytes& source, int width) {
    Bytes result;
    for (size_t i = 0; i < static_cast<size_t>(width); ++i)
        for (const uint8_t sample : {source[3 * i + 2], source[3 * i + 1], source[3 * i], uint8_t{255}})
            result.push_back(sample);
    return result;
}

Bytes ReferenceDNxHDToRGB10(const Bytes& source, int width) {
    Bytes result;
    for (int i = 0; i < width; ++i) Append32(result, TopBitsToRGB10(source, 4 * i));
    return result;
}

Bytes ReferenceRGB10ToDNxHD(const Bytes& source, int width, const Bytes& before) {
    Bytes result;
    for (int i = 0; i < width; ++i) {
        const uint32_t p = Word32(source, i);
        Append16(result, ((p >> 2) & 0x3ff) << 6);
        Append16(result, ((p >> 12) & 0x3ff) << 6);
        Append16(result, (p >> 22) << 6);
        Append16(result, Word16(before, 4 * i + 3));
    }
    return result;
}

Bytes ReferenceUYVY10ToV210(const Bytes& source, int width, bool withPartialGroup) {
    Bytes result;
    for (int first = 0; first < width; first += 6) {
        if (first + 6 > width && !withPartialGroup) break;
        std::vector<uint32_t> samples;
        for (int i = 2 * first; i < 2 * first + 12; ++i)
            samples.push_back(i < 2 * width ? Word16(source, i) : i % 2 == 0 ? 512 : 64);
        AppendV210Group(result, samples);
    }
    return result;
}

Bytes ReferenceV210ToUYVY10(const Bytes& source, int width) {
    Bytes result;
    for (int i = 0; i < 2 * width; ++i) Append16(result, Word32(source, i / 3) >> (10 * (i % 3)) & 0x3ff);
    return result;
}

Bytes ReferenceBGR16ToRGB10(const Bytes& source, int width) {
    Bytes result;
    for (int i = 0; i < width; ++i) Append32(result, TopBitsToRGB10(source, 3 * i));
    return result;
}

Bytes ReferenceRGB10ToBGR16(const Bytes& source, int width) {
    Bytes result;
    for (int i = 0; i < width; ++i)
        for (const int position : {2, 12, 22}) Append16(result, Word32(source, i) >> position & 0x3ff);
    return result;
}

Bytes ReferenceOffsetUYVY32f(const Bytes& source, int width) {
    Bytes result = source;
    for (size_t i = 0; i < 2 * static_cast<size_t>(width); i += 2) {
        float chroma;
        std::memcpy(&chroma, &source[4 * i], sizeof chroma);
        chroma = chroma - 0.5f;
        std::memcpy(&result[4 * i], &chroma, sizeof chroma);
    }
    return result;
}

Bytes ReferenceXRGB15(const Bytes& source, int width, bool rounded) {
    Bytes result;
    for (int i = 0; i < 3 * width; ++i) {
        if (i % 3 == 0) Append16(result, rounded ? 0 : 65535);
        const uint32_t c = Word16(source, i);
        const float scaled = static_cast<float>(c) * 32.03128f;
        Append16(result, rounded ? static_cast<uint32_t>(std::min(std::lrint(scaled), 65535L))
                                 : c * 32768 / 1023 & 0xffff);
    }
    return result;
}

Bytes ReferenceHalve16(const Bytes& source, int width, bool swap) {
    Bytes result;
    for (int i = 0; i < 4 * width; ++i) {
        const uint32_t word = Word16(source, i);
        const uint32_t c = swap ? word >> 8 | (word & 0xff) << 8 : word;
        Append16(result, ((c << 15) | 0x7fff) / 65535);
    }
    return result;
}

LinearBGR ReferenceLinearBGR(const float* zyx) {
    constexpr long double weights[3][3] = {{1.0572252L, -0.2040259L, 0.0556434L},
                                           {0.041556L, 1.8760108L, -0.969266L},
                                           {-0.4985314L, -1.5371385L, 3.2404542L}};
    LinearBGR result{};
    for (size_t i = 0; i < 3; ++i)
        for (size_t j = 0; j < 3; ++j) {
            const long double term = weights[i][j] * SignedPower(zyx[j], 2.6L);
            result.values[i] += term;
            result.terms[i] += std::abs(term);
        }
    return result;
}

PlanarRow ReferenceAverage(const PlanarRow& a, const PlanarRow& b) {
    PlanarRow result;
    for (auto plane : {&PlanarRow::y, &PlanarRow::u, &PlanarRow::v})
        for (size_t i = 0; i < (a.*plane).size(); ++i)
            (result.*plane).push_back(((a.*plane)[i] + (b.*plane)[i]) >> 1);
    return result;
}

PlanarRow ReferenceEverySecond(const PlanarRow& row, int width) {
    PlanarRow result;
    for (size_t i = 0; i < static_cast<size_t>(width / 2); ++i) {
        result.y.push_back(row.y[2 * i]);
        if (i % 2 != 0) continue;
        result.u.push_back(row.u[i]);
        result.v.push_back(row.v[i]);
    }
    return result;
}

Bytes ReferencePlanarToV210(const PlanarRow& row, int width) {
    Bytes result;
    for (int first = 0; first < width; first += 6) {
        std::vector<uint32_t> samples;
        for (int pair = first / 2; pair < first / 2 + 3; ++pair)
            for (const uint32_t sample : {SampleOrLast(row.u, pair), SampleOrLast(row.y, 2 * pair),
                                          SampleOrLast(row.v, pair), SampleOrLast(row.y, 2 * pair + 1)})
                samples.push_back(sample);
        AppendV210Group(result, samples);
    }
    return result;
}

Bytes ReferencePlanarToVUYX(const PlanarRow& row, int width) {
    Bytes result;
    for (size_t k = 0; k < static_cast<size_t>(width / 2); ++k)
        for (const uint32_t sample :
             {row.v[k] >> 2, row.u[k] >> 2, (row.y[2 * k] + row.y[2 * k + 1]) >> 3, 255u})
            result.push_back(static_cast<uint8_t>(sample));
    return result;
}

} // namespace PKTest
