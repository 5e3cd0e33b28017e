#pragma once

// Which rows of 4:2:0 chroma a row of luma takes.

#include "convert/PlanarKernels.h"
#include "frame/PixelFormat.h"

#include <algorithm>

namespace PK {

/// Chroma rows alternate between the fields as luma rows do.
constexpr bool HasFieldPictures(PK_PixelFormat format) {
    return StreamKind(format) % 2 == 1;
}

/// Chroma samples stand between the columns of luma, and not on the even ones (MPEG4 siting).
constexpr bool HasChromaBetween(PK_PixelFormat format) {
    return StreamKind(format) >= kStreamFirst420 + 2;
}

struct ChromaRows {
    int32_t first, second;
    ChromaWeights weights;

    /// The nearer of both alone.
    ChromaRows Nearest() const {
        const int32_t row = weights.first < weights.second ? second : first;
        return {row, row, weights};
    }
};

/// The chroma of a frame, or of the field that a luma row belongs to. Beyond either end its outermost row is repeated. A
/// field without a row has those of the other one.
class ChromaOfRow {
public:
    /// \param chromaRows  those of both fields, at least 1.
    ChromaOfRow(bool isFieldPicture, int32_t lumaRow, int32_t chromaRows) {
        const bool isSecond = isFieldPicture && lumaRow % 2 == 1;
        fKind = !isFieldPicture ? Kind::Frame : isSecond ? Kind::SecondField : Kind::FirstField;
        fLumaRow = isFieldPicture ? lumaRow / 2 : lumaRow;
        fStep = isFieldPicture ? 2 : 1;
        fFirst = isSecond && chromaRows > 1 ? 1 : 0;
        fCount = (chromaRows - fFirst + fStep - 1) / fStep;
    }

    /// Between the two rows about the luma row, by where they stand in the picture: those of a frame half-way between two
    /// of its luma rows, those of a first field a quarter of the way, those of a second three quarters.
    ChromaRows Interpolated() const {
        constexpr ChromaWeights kWeights[][2] = {{{6, 2}, {2, 6}}, {{5, 3}, {1, 7}}, {{7, 1}, {3, 5}}};
        const int32_t first = (fLumaRow + 1) / 2 - 1;
        return {Row(first), Row(first + 1), kWeights[static_cast<int32_t>(fKind)][fLumaRow % 2 == 1 ? 0 : 1]};
    }

    /// The row that two luma rows share.
    ChromaRows Shared() const {
        const int32_t row = Row(fLumaRow / 2);
        return {row, row, {8, 0}};
    }

private:
    enum class Kind : uint8_t { Frame, FirstField, SecondField };

    int32_t Row(int32_t row) const { return fFirst + fStep * std::clamp(row, 0, fCount - 1); }

    Kind fKind;
    int32_t fLumaRow; // within its field
    int32_t fFirst, fStep, fCount;
};

} // namespace PK
