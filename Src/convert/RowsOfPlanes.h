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
};

class RowsOfPlanes {
public:
    /// Adds what Fetch writes to.
    static void AddTo(RowMemory& memory, const UseOfPlanes& use, const SourcePlanes& planes, int32_t width) {
        memory.AddBytes(SamplesOfChroma(planes));
        memory.AddBytes(SamplesOfChroma(planes));
        if (use.widening == Widening::None) return;
        memory.AddBytes(BytesOfFloats(width));
        memory.AddBytes(BytesOfFloats(width / 2));
        memory.AddBytes(BytesOfFloats(width / 2));
    }

    RowsOfPlanes(const UseOfPlanes& use, const SourcePlanes& planes, int32_t width, TemporaryRows& rows)
        : fUse(use), fPlanes(planes), fWidth(width) {
        for (uint8_t*& chroma : fChroma) {
            chroma = rows.Take(SamplesOfChroma(planes));
            constexpr int kNeutral = 128; // for a picture too small to have chroma
            std::memset(chroma, kNeutral, SamplesOfChroma(planes));
        }
        if (use.widening == Widening::None) return;
        const auto& kernels = Best<PlanarWidenKernels>();
        fWiden = use.widening == Widening::By3To2 ? kernels.by3To2 : kernels.by4To3;
        fFloats[0] = rows.Take(BytesOfFloats(width));
        fFloats[1] = rows.Take(BytesOfFloats(width / 2));
        fFloats[2] = rows.Take(BytesOfFloats(width / 2));
    }

    /// They stay until the next are fetched.
    PlaneRows Fetch(int32_t lumaRow) {
        fRows[0] = fPlanes[0].Row(lumaRow);
        fRows[1] = fChroma[0];
        fRows[2] = fChroma[1];
        if (!fPlanes[1].IsEmpty()) {
            const ChromaOfRow chroma(fUse.isFieldPicture, lumaRow, fPlanes[1].height);
            const ChromaRows rows = fUse.interpolates ? chroma.Interpolated() : chroma.Shared();
            fRows[1] = Chroma(fPlanes[1], rows, fChroma[0]);
            fRows[2] = Chroma(fPlanes[2], rows, fChroma[1]);
        }
        if (fWiden != nullptr) Widen();
        return fRows;
    }

private:
    /// A sample for each pair of columns, of which a last lone one counts as a pair.
    static size_t SamplesOfChroma(const SourcePlanes& planes) {
        return (static_cast<size_t>(planes[0].width) + 1) / 2;
    }
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
        for (int plane = 0; plane < 3; ++plane) {
            fWiden(fRows[plane], fFloats[plane], plane == 0 ? fWidth : fWidth / 2);
            fRows[plane] = fFloats[plane];
        }
    }

    const UseOfPlanes& fUse;
    const SourcePlanes& fPlanes;
    int32_t fWidth;
    const PlanarDecodeKernels& fKernels = Best<PlanarDecodeKernels>();
    RowKernel fWiden = nullptr;
    uint8_t* fChroma[2];
    uint8_t* fFloats[3] = {};
    const uint8_t* fRows[3] = {};
};

} // namespace PK
