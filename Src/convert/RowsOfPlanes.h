#pragma once

// Rows of 4:2:0 planes as the kernels take them: each row of luma with its chroma, in bytes or, widened, in floats.

#include "convert/ChromaRows.h"
#include "convert/PlanarSizes.h"
#include "convert/WorkingRows.h"
#include "frame/Planes.h"

#include <cstring>

namespace PK {

struct UseOfPlanes {
    bool isFieldPicture;
    bool interpolates; ///< chroma between its rows
    Widening widening;
    bool changesMatrix; ///< of what is widened, from BT.601 to BT.709
    bool packsWords;    ///< gives words of 10 bits
};

class RowsOfPlanes {
public:
    /// Adds what Fetch writes to.
    static void AddTo(RowMemory& memory, const UseOfPlanes& use, const SourcePlanes& planes, int32_t width) {
        memory.AddBytes(SamplesOfChroma(planes));
        memory.AddBytes(SamplesOfChroma(planes));
        if (use.widening == Widening::None) return;
        memory.AddBytes(BytesOfFloats(width));
        for (int row = 0; row < kFloatChromas; ++row) memory.AddBytes(BytesOfFloats(width / 2));
        if (!use.packsWords) return;
        for (int plane = 0; plane < kPlanes; ++plane) memory.AddBytes(BytesOfWords(width));
    }

    RowsOfPlanes(const UseOfPlanes& use, const SourcePlanes& planes, int32_t width, TemporaryRows& rows)
        : fUse(use), fPlanes(planes), fWidth(width) {
        for (uint8_t*& chroma : fChroma) {
            chroma = rows.Take(SamplesOfChroma(planes));
            constexpr int kNeutral = 128; // for a picture too small to have chroma
            std::memset(chroma, kNeutral, SamplesOfChroma(planes));
        }
        if (use.widening == Widening::None) return;
        fFloatLuma = rows.Take(BytesOfFloats(width));
        for (uint8_t*& chroma : fFloatChroma) chroma = rows.Take(BytesOfFloats(width / 2));
        if (!use.packsWords) return;
        for (uint8_t*& words : fWords) words = rows.Take(BytesOfWords(width));
    }

    /// They stay until the next are fetched.
    /// \param isLast  of its field or frame: it takes the nearest row of chroma as it stands.
    PlaneRows Fetch(int32_t lumaRow, bool isLast) {
        fRows[0] = fPlanes[0].Row(lumaRow);
        fRows[1] = fChroma[0];
        fRows[2] = fChroma[1];
        if (!fPlanes[1].IsEmpty()) {
            const ChromaOfRow chroma(fUse.isFieldPicture, lumaRow, fPlanes[1].height);
            const ChromaRows between = chroma.Interpolated();
            const ChromaRows rows = !fUse.interpolates ? chroma.Shared()
                                    : isLast           ? between.Nearest()
                                                       : between;
            fRows[1] = Chroma(fPlanes[1], rows, fChroma[0]);
            fRows[2] = Chroma(fPlanes[2], rows, fChroma[1]);
        }
        if (fUse.widening != Widening::None) Widen();
        return fRows;
    }

private:
    static constexpr int kPlanes = 3, kFloatChromas = 3;

    /// A sample for each pair of columns, of which a last lone one counts as a pair.
    static size_t SamplesOfChroma(const SourcePlanes& planes) {
        return (static_cast<size_t>(planes[0].width) + 1) / 2;
    }
    static size_t BytesOfWords(int32_t count) { return sizeof(uint16_t) * static_cast<size_t>(count); }
    static size_t BytesOfFloats(int32_t count) { return sizeof(float) * static_cast<size_t>(count); }

    const uint8_t* Chroma(const Plane<const uint8_t>& plane, const ChromaRows& rows, uint8_t* scratch) const {
        const bool isComplete = fPlanes[0].width % 2 == 0;
        if (rows.first == rows.second && isComplete) return plane.Row(rows.first);
        fKernels.blendChroma(plane.Row(rows.first), plane.Row(rows.second), scratch, plane.width,
                             rows.weights);
        if (!isComplete) scratch[plane.width] = scratch[plane.width - 1];
        return scratch;
    }

    void Widen() {
        const auto& kernels = Best<PlanarWidenKernels>();
        const RowKernel widen = fUse.widening == Widening::By3To2 ? kernels.by3To2 : kernels.by4To3;
        auto& [u, v, otherU] = fFloatChroma;
        const int32_t pairs = fWidth / 2;
        widen(fRows[0], fFloatLuma, fWidth);
        widen(fRows[1], u, pairs);
        widen(fRows[2], v, pairs);
        fRows[0] = fFloatLuma;
        fRows[1] = u;
        fRows[2] = v;
        if (fUse.changesMatrix) {
            kernels.lumaTo709(fRows, fFloatLuma, fWidth);
            kernels.uTo709(u, v, otherU, pairs);
            kernels.vTo709(u, v, v, pairs);
            fRows[1] = otherU;
        }
        if (!fUse.packsWords) return;
        for (int plane = 0; plane < kPlanes; ++plane) {
            kernels.toWords(fRows[plane], fWords[plane], plane == 0 ? fWidth : pairs);
            fRows[plane] = fWords[plane];
        }
    }

    const UseOfPlanes& fUse;
    const SourcePlanes& fPlanes;
    int32_t fWidth;
    const PlanarDecodeKernels& fKernels = Best<PlanarDecodeKernels>();
    uint8_t* fChroma[2];
    uint8_t* fFloatLuma = nullptr;
    uint8_t* fFloatChroma[kFloatChromas] = {}; // U, V, and U of the other matrix
    uint8_t* fWords[kPlanes] = {};
    const uint8_t* fRows[kPlanes] = {};
};

} // namespace PK
