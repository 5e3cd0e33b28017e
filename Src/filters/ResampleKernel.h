#pragma once

// A table of fixed-point filter weights for one axis of an image: for each of 128 places between two pixels a row of
// weights that add up to about 1.

#include <cstdint>
#include <vector>

namespace PK {

/// Built on one thread; then any number of threads may read it.
///
/// Where a sample lies at p in pixels, whose centres are at halves: i = floor(p - 0.5), the row is the whole part of
/// (p - 0.5 - i) x 128, and its weight k is for pixel i + 1 - Width() / 2 + k.
class ResampleKernel {
public:
    static constexpr int32_t kPhases = 128;
    static constexpr int32_t kOne = 16384; ///< a weight of 1

    /// \param kind  1 linear, 2 to 5 cubic, 6 a spline of six points, 7 a windowed sinc; any other has no table.
    explicit ResampleKernel(int32_t kind) noexcept;

    /// Builds the table for a reduction, unless the one in place is for a scale within 0.01.
    /// \param decimatedScale  what the shape is stretched for, from above 0 to 1; below 0.25 counts as 0.25. More than 1
    ///                        is reported to the host as a violated contract.
    /// \param scale           what the shape's parameter is chosen for, and what is remembered of the table.
    void ScaleForDownSample(float decimatedScale, float scale);

    /// Puts the table for enlargements in place, which is one for all, unless the one in place is for a scale within 0.01
    /// of 1.
    /// \param scaleFactor  1 and up; less is reported as a violated contract.
    void ScaleForUpSample(float scaleFactor);

    /// Weights in a row; below 1 as long as there is no table, as after a build that found no memory.
    int32_t Width() const noexcept { return fWidth; }

    /// Those of row 0; the rows follow each other without a gap.
    const int16_t* Weights() const noexcept { return fKernel.data(); }

private:
    bool IsSized();
    void CalculateDefaultKernel();
    void CalculateLinearKernel();
    void ScaleCubicKernel(float scale, float a);
    void Trim(int32_t low, int32_t high);
    template <class Shape>
    void FillRows(int32_t width, Shape shape);

    int16_t fWidth = 0;
    std::vector<int16_t> fKernel; // after a trim it holds more than is in use
    int16_t fAllocatedWidth = 0;  // 0 as long as there is no memory
    int32_t fKind;
    float fCurrentScale = -10.0f; // far from all, so that the first build runs
    float fStretch;               // divides the argument of the shape
    float fCubicNear, fCubicFar;  // the parameter of the cubic at scale 1 and at scale 0.25
};

} // namespace PK
