#pragma once

// Transfer functions of two pieces: a power above a threshold, a straight line up to it.

#include <cmath>

namespace PK {

/// One direction: a space has one for decoding and one for encoding.
struct TransferSegments {
    float threshold, scale, offset, exponent, slope;

    /// \param a  a magnitude.
    float Decode(float a) const {
        return a > threshold ? std::pow((a + offset) * scale, exponent) : a * slope;
    }
    float Encode(float a) const { return a > threshold ? std::pow(a, exponent) * scale + offset : a * slope; }
};

} // namespace PK
