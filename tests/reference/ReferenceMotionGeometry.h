#pragma once

// Where PK_Motion puts a source, how much it blurs it and which of its rows a pass reads, restated. Places keep the mix of
// float and double in which they are told: their last bit decides which pixel is sampled.

#include "reference/ReferenceMotion.h"

namespace PKReference {

constexpr bool IsField(int32_t field) {
    return field == 1 || field == 2;
}

/// The source under the first column and row that are drawn, and how far it is to the next ones.
struct MotionWay {
    PK_Point start, column, row;
    bool isExact; ///< columns lie on columns
};

class MotionGeometry {
public:
    explicit MotionGeometry(const MotionArguments& arguments);

    bool IsRotated() const { return fIsRotated; }
    /// All of the source lies where it would without any geometry.
    bool IsIdentity() const;

    /// In pixels of the source, 0 for none.
    double BlurX() const { return Blur(fArguments.scale.x, fCosine - fSine * Across()); }
    double BlurY() const { return Blur(fArguments.scale.y, fSine + fCosine * Across()); }

    /// Pixels of the destination within which a rectangle of the source comes to lie.
    PK_Rect BoxOf(const PK_Rect& source) const;

    MotionWay WayFrom(int32_t column, int32_t row) const;

private:
    PK_Point ToDestination(float x, float y) const;
    PK_Point ToSource(int32_t column, int32_t row) const;
    double Across() const { return fArguments.softness + 1; }
    double Blur(float scale, double acrossFields) const;

    const MotionArguments& fArguments;
    PK_Point fPosition, fAnchor; // y from the top
    double fCosine, fSine;
    bool fIsRotated;
};

/// The rows of a source that a pass reads: from one of them on, each or every other one.
struct MotionField {
    int32_t firstRow;
    bool isSameLine; ///< else they count from half a row higher
};

/// \param row  of the source, from its top.
MotionField MotionFieldAt(int32_t row, int32_t sourceField, int32_t destinationField, int32_t pass);

} // namespace PKReference
