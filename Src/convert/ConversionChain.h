#pragma once

// A conversion of rows from one raster format to another: the kernels that the router names, in order.

#include "convert/Kernel.h"
#include "frame/RowScratch.h"

#include <PixelKiln/Types.h>

namespace PK {

/// Two rows that a chain passes between its kernels.
struct ChainScratch {
    uint8_t* rows[2];
};

/// Once built it is read-only, so that any number of threads may share one and convert rows with it at the
/// same time. It owns no memory.
struct ConversionChain {
    static constexpr int32_t kMaximumSteps = 8;

    int32_t count = 0;                          ///< Steps; 0 means that there is no conversion.
    Kernel kernels[kMaximumSteps] = {};         ///< What each step does.
    RowKernel steps[kMaximumSteps] = {};        ///< The body that does it.
    PK_PixelFormat formats[kMaximumSteps] = {}; ///< The format that each step leaves the row in.

    int32_t passCount = 0;                ///< What runs: neighbouring steps with a joint body are one pass.
    RowKernel passes[kMaximumSteps] = {}; ///< The passes in order; they give the numbers of the steps.

    /// Finds the way from source to destination and takes the best bodies that the capability flags allow
    /// at this moment. `count` stays 0 where there is none: for any format that is no raster format of the
    /// catalogue, above all.
    /// \param quality  render quality, 0 to 5.
    void Build(PK_PixelFormat source, PK_PixelFormat destination, int32_t quality) noexcept;

    /// Converts one row with scratch of its own.
    /// \param source       row in the source format; neither aligned nor overlapping the destination.
    /// \param destination  row in the destination format. Only the bytes of its pixels are written.
    /// \param width        pixels, 0 to kMaximumWidth.
    /// \return PK_Success; PK_ErrFailed for an empty chain and PK_ErrOutOfMemory if a row above 16384
    ///         pixels found no scratch, both with nothing written.
    PK_Result ConvertRow(const void* source, void* destination, int32_t width) const noexcept;

    /// Converts one row through scratch that WithScratch gave for this width or a greater one. The chain is
    /// not empty.
    void ConvertRow(const void* source, void* destination, int32_t width,
                    const ChainScratch& scratch) const noexcept;

    /// Calls use(scratch) with what the chain needs for rows of this width, so that a loop over rows takes it
    /// once, and returns what it returns; PK_ErrOutOfMemory without a call if the scratch cannot be had.
    template <class Use>
    PK_Result WithScratch(int32_t width, Use&& use) const {
        const uint64_t rowBytes = kScratchPixelBytes * static_cast<uint64_t>(width);
        return WithRowScratch(passCount > 1 ? rowBytes : 0, [&](uint8_t* first) {
            return WithRowScratch(passCount > 2 ? rowBytes : 0, [&](uint8_t* second) {
                return use(ChainScratch{{first, second}});
            });
        });
    }

private:
    /// No format takes more, not even for the pair or the group of six that holds the last pixel of a row.
    static constexpr uint64_t kScratchPixelBytes = 16;

    void ChoosePasses() noexcept;
};

} // namespace PK
