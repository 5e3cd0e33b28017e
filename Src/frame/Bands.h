#pragma once

// Rows, or columns, cut into bands that run as the parts of a task and may fail.

#include "frame/Task.h"

#include <PixelKiln/Types.h>

#include <atomic>
#include <cstdint>

namespace PK {

/// How rows are cut into bands, and where these run.
class Bands {
public:
    /// \p count bands of height / count rows, rounded down; the last one takes the remainder too. Fewer rows than
    /// bands are one band.
    static constexpr Bands Count(int32_t count) { return {count, 0, true}; }

    /// Bands of \p rows rows; the last one takes what is left.
    static constexpr Bands OfRows(int32_t rows) { return {0, rows, true}; }

    /// Unless \p isLarge, nothing is handed over: the same bands run in order on the calling thread.
    constexpr Bands AsTaskIf(bool isLarge) const { return {fCount, fRows, isLarge}; }

    constexpr bool IsTask() const { return fIsTask; }

    /// Band i begins at row i * rows, and the last one ends with the image.
    struct Cut {
        int32_t bands, rows;
    };
    constexpr Cut CutOf(int32_t height) const {
        if (height <= 0) return {0, 0};
        if (fRows != 0) return {(height - 1) / fRows + 1, fRows};
        const int32_t bands = height < fCount ? 1 : fCount;
        return {bands, height / bands};
    }

private:
    constexpr Bands(int32_t count, int32_t rows, bool isTask) : fCount(count), fRows(rows), fIsTask(isTask) {}

    int32_t fCount, fRows; // one of the two is 0
    bool fIsTask;
};

/// What RunInBands runs.
template <class Use>
class BandTask final : public Threading::Task {
public:
    BandTask(int32_t height, Bands::Cut cut, const Use& use) : fHeight(height), fCut(cut), fUse(use) {}

    int32_t GetPartCount() const override { return fCut.bands; }

    void RunPart(int32_t band) const override {
        uint64_t failure = fFirstFailure.load(std::memory_order_relaxed);
        if (BandOf(failure) < static_cast<uint32_t>(band)) return;
        const int32_t firstRow = band * fCut.rows;
        const PK_Result result = fUse(firstRow, band + 1 == fCut.bands ? fHeight : firstRow + fCut.rows);
        if (result == PK_Success) return;
        const uint64_t own = Failure(static_cast<uint32_t>(band), result);
        while (own < failure &&
               !fFirstFailure.compare_exchange_weak(failure, own, std::memory_order_relaxed)) {
        }
    }

    PK_Result Result() const { return static_cast<PK_Result>(fFirstFailure.load(std::memory_order_relaxed)); }

private:
    // In the order of bands, the result below.
    static constexpr uint64_t Failure(uint32_t band, PK_Result result) {
        return uint64_t{band} << 32 | static_cast<uint32_t>(result);
    }
    static constexpr uint32_t BandOf(uint64_t failure) { return static_cast<uint32_t>(failure >> 32); }

    int32_t fHeight;
    Bands::Cut fCut;
    const Use& fUse;
    mutable std::atomic<uint64_t> fFirstFailure{Failure(UINT32_MAX, PK_Success)}; // behind all bands
};

/// Calls use(firstRow, endRow) for bands that together are the rows from 0 to \p height - 1: as a task, or on the
/// calling thread where there is one band only. Each call takes its own scratch. A height of 0 or less makes none.
///
/// \p use returns a PK_Result. After a failure no band behind the one that failed is begun any more; those before
/// it are run.
/// \return the first failure in the order of bands. Throws what \p use throws. Allocates nothing.
template <class Use>
PK_Result RunInBands(int32_t height, Bands bands, const Use& use) {
    const BandTask<Use> task(height, bands.CutOf(height), use);
    if (bands.IsTask() && task.GetPartCount() > 1)
        Threading::RunTaskOnAllProcessors(task);
    else
        for (int32_t band = 0; band < task.GetPartCount(); ++band) task.RunPart(band);
    return task.Result();
}

} // namespace PK
