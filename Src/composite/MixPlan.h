#pragma once

// Two images into one, row by row: the ways of both to the format in which a kernel mixes them, and that of the result
// from there. Composites, blend modes and dissolves choose kernel and formats, each by rules of its own.

#include "convert/WorkingRows.h"
#include "primitives/KernelShapes.h"

namespace PK {

/// Mixes two rows by an opacity or a weight.
using MixKernel = TwoRowKernelWith<float>;

struct MixFormats {
    PK_PixelFormat first, second, destination;
};

struct MixImages {
    SourceImage first, second;
    DestinationImage destination;

    MixFormats Formats() const { return {first.format, second.format, destination.format}; }
};

class MixPlan {
public:
    /// \param given    the formats of the images.
    /// \param working  those in which the kernel takes and gives its rows.
    /// \param amount   the opacity or weight.
    /// \return whether there are such ways.
    bool Build(const MixFormats& given, const MixFormats& working, MixKernel kernel, float amount,
               int32_t quality) {
        fKernel = kernel;
        fAmount = amount;
        return fFirst.Build(given.first, working.first, quality) &&
               fSecond.Build(given.second, working.second, quality) &&
               fDestination.Build(working.destination, given.destination, quality);
    }

    /// Rows from `firstRow` up to `endRow` of images in the formats of the plan.
    /// \param begin  is called once there is memory, before the first row.
    template <class Begin>
    PK_Result Run(const MixImages& images, int32_t firstRow, int32_t endRow, const Begin& begin) const {
        const int32_t width = images.destination.width;
        RowMemory memory(width);
        memory.AddSource(fFirst);
        memory.AddSource(fSecond);
        memory.AddSink(fDestination);
        return memory.With([&](TemporaryRows& rows) {
            const RowSource first(images.first, fFirst, rows), second(images.second, fSecond, rows);
            const RowSink sink(images.destination, fDestination, rows);
            begin();
            for (int32_t row = firstRow; row < endRow; ++row) {
                fKernel(first.Row(row), second.Row(row), sink.Row(row), width, fAmount);
                sink.Finish(row);
            }
            return PK_Success;
        });
    }

    PK_Result Run(const MixImages& images, int32_t firstRow, int32_t endRow) const {
        return Run(images, firstRow, endRow, [] {});
    }

private:
    ConversionChain fFirst, fSecond, fDestination;
    MixKernel fKernel = nullptr;
    float fAmount = 0;
};

} // namespace PK
