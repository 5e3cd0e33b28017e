#pragma once

// A conversion of rows from one raster format to another: the kernels that the router names, in order.

#include "convert/Kernel.h"

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

    /// One kernel over the row, and the format that it leaves the row in.
    struct Pass {
        RowKernel run;
        PK_PixelFormat next;
    };

    PK_PixelFormat source = 0;
    PK_PixelFormat destination = 0;

    int32_t count = 0;                          ///< Steps; 0 means that there is no conversion.
    Kernel kernels[kMaximumSteps] = {};         ///< What each step does.
    RowKernel steps[kMaximumSteps] = {};        ///< The body that does it.
    PK_PixelFormat formats[kMaximumSteps] = {}; ///< The format that each step leaves the row in.

    int32_t passCount = 0;           ///< What runs: neighbouring steps with a joint body are one pass.
    Pass passes[kMaximumSteps] = {}; ///< The passes in order; they give the numbers of the steps.

    /// Finds the way from one format to another and takes the best bodies that the capability flags allow at
    /// this moment. From a format to itself that is a copy.
    /// \param quality  render quality, 0 to 5.
    /// \return whether there is a way. Without one `count` is 0: for any format that is no raster format of
    ///         the catalogue, above all.
    bool Build(PK_PixelFormat from, PK_PixelFormat to, int32_t quality) noexcept;

    /// Whether rows stay as they are.
    bool IsCopy() const { return source == destination; }

    /// The scratch rows that ConvertRow writes, 0 to 2.
    int32_t ScratchRows() const { return passCount < 2 ? 0 : passCount == 2 ? 1 : 2; }

    /// Bytes of each of them for rows of this width: the widest that a pass hands to the next.
    uint64_t ScratchBytes(int32_t width) const noexcept;

    /// Converts one row. The chain is not empty.
    /// \param from     row in the source format; neither aligned nor overlapping the destination.
    /// \param to       row in the destination format. Only the bytes of its pixels are written.
    /// \param width    pixels, 0 to kMaximumWidth.
    /// \param scratch  ScratchRows() rows of ScratchBytes(width).
    void ConvertRow(const void* from, void* to, int32_t width, const ChainScratch& scratch) const noexcept;

private:
    void ChoosePasses() noexcept;
};

} // namespace PK
