#pragma once

// One object of every kind of colour space.

#include <PixelKiln/ColorSpace.h>

#include <string>
#include <vector>

namespace PKResults {

/// As a host derives a space: the numbers are its own, pixels stay.
class OwnSpace : public PK::ColorSpace {
public:
    explicit OwnSpace(const float* primariesAndWhite) : fNumbers(primariesAndWhite) {
        CalculateLumaCoeffs(fLuma);
    }

    const float* Primaries() const override { return fNumbers; }
    const float* WhitePoint() const override { return fNumbers + 6; }
    const float* LuminanceCoeffs() const override { return fLuma; }
    float LinearToEOTF(float linear) const override { return linear; }
    float EOTFToLinear(float encoded) const override { return encoded; }
    void ConvertPixelsFromRec709(const float*, float*, int32_t, bool) const override {}
    void ConvertPixelsToRec709(const float*, float*, int32_t, bool) const override {}
    void CompressPixelsToSDR(const float*, float*, int32_t, float, float, float) const override {}

private:
    const float* fNumbers; ///< x and y of red, green, blue and white, and a third number of white
    float fLuma[3] = {};
};

struct NamedSpace {
    std::string name;
    const PK::ColorSpace* space;
};

/// They live as long as the program. Their names are unique.
const std::vector<NamedSpace>& AllSpaces();

} // namespace PKResults
