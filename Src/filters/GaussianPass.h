#pragma once

// One direction of the Gaussian blur: lines are taken to floats, filtered and taken to their destination, in bands that
// share nothing but the plan.

#include "convert/WorkingRows.h"
#include "filters/GaussianBlurKernels.h"
#include "frame/BandMemory.h"

namespace PK {

class GaussianPass {
public:
    /// \param source, destination  formats of four channels.
    /// \param working     a premultiplied float format.
    /// \param sigma       above 0.
    /// \param repeatEdge  whether the ends of a line go on for ever.
    /// \param quality     of the conversions.
    /// \return whether there are ways between the formats.
    bool Build(PK_PixelFormat source, PK_PixelFormat working, PK_PixelFormat destination, double sigma,
               bool repeatEdge, int32_t quality) noexcept;

    /// What a band takes: of rows, or of columns.
    uint64_t BytesOfRows(const DestinationImage& destination) const noexcept;
    uint64_t BytesOfColumns(const DestinationImage& destination) const noexcept;

    /// Filters each row of the source into that of the same number, which is as wide or wider. Both images may be one.
    /// \param memory  of BytesOfRows or more.
    /// \param isTask  whether bands run on all processors.
    PK_Result AlongRows(const SourceImage& source, const DestinationImage& destination, BandMemory& memory,
                        bool isTask) const;

    /// The same with the columns of the source, which may be fewer than those of the destination.
    /// \param memory  of BytesOfColumns or more.
    PK_Result AlongColumns(const SourceImage& source, const DestinationImage& destination, BandMemory& memory,
                           bool isTask) const;

private:
    RowMemory MemoryOfLines(int32_t length) const;
    RowMemory MemoryOfStrip(int32_t length) const;
    int32_t ColumnsOfStrip() const;
    uint64_t StripStep(int32_t length) const;

    void FilterRows(const SourceImage& source, const DestinationImage& destination, int32_t firstRow,
                    int32_t endRow, TemporaryRows& rows) const;
    void FilterStrip(const SourceImage& source, const DestinationImage& destination, int32_t firstColumn,
                     int32_t endColumn, TemporaryRows& rows) const;

    ConversionChain fIn, fOut;
    GaussianCoefficients fCoefficients = {};
    GaussianBlurKernels::Filter fFilter = nullptr;
    bool fRepeatEdge = false;
};

} // namespace PK
