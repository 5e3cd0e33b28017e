#include "filters/GaussianPass.h"

#include "filters/GaussianCoefficients.h"
#include "frame/Bands.h"
#include "primitives/Dispatch.h"
#include "primitives/TransposeKernels.h"

#include <algorithm>

namespace PK {
namespace {

constexpr int32_t kBandRows = 32;
constexpr int32_t kStripBytes = 128; // two cache lines of each row

/// Bytes from line to line: a cache line more than they need, so that not all begin in the same set of a cache.
constexpr uint64_t Apart(uint64_t bytes) {
    return TemporaryRows::Rounded(bytes) + kRowScratchAlignment;
}

/// The float lines of a bundle. They come in at the beginning of their memory and leave one pixel behind it, as the filter
/// wants it.
class FloatLines {
public:
    FloatLines(int32_t length, TemporaryRows& rows)
        : fStep(static_cast<int64_t>(StepOf(length))), fFirst(rows.Take(kGaussianLines * StepOf(length))),
          fScratch(rows.Take(ScratchOf(length))) {}

    static uint64_t BytesOf(int32_t length) {
        return TemporaryRows::Rounded(kGaussianLines * StepOf(length)) + ScratchOf(length);
    }

    uint8_t* In(int32_t line) const { return fFirst + line * fStep; }
    uint8_t* Out(int32_t line) const { return In(line) + kGaussianPixelBytes; }
    int64_t Step() const { return fStep; }
    uint8_t* Scratch() const { return fScratch; }

private:
    static uint64_t StepOf(int32_t length) { return Apart(kGaussianPixelBytes * (uint64_t(length) + 1)); }
    static uint64_t ScratchOf(int32_t length) {
        return uint64_t{kGaussianLines * kGaussianPixelBytes} * uint64_t(length);
    }

    int64_t fStep;
    uint8_t *fFirst, *fScratch;
};

} // namespace

bool GaussianPass::Build(PK_PixelFormat source, PK_PixelFormat working, PK_PixelFormat destination,
                         double sigma, bool repeatEdge, int32_t quality) noexcept {
    fCoefficients = GaussianCoefficientsOf(sigma);
    fFilter = Best<GaussianBlurKernels>().filterLines;
    fRepeatEdge = repeatEdge;
    return fIn.Build(source, working, quality) && fOut.Build(working, destination, quality);
}

RowMemory GaussianPass::MemoryOfLines(int32_t length) const {
    RowMemory memory(length);
    memory.AddChain(fIn);
    memory.AddChain(fOut);
    memory.AddBytes(FloatLines::BytesOf(length));
    return memory;
}

RowMemory GaussianPass::MemoryOfStrip(int32_t length) const {
    RowMemory memory = MemoryOfLines(length);
    memory.AddBytes(static_cast<uint64_t>(ColumnsOfStrip()) * StripStep(length));
    return memory;
}

int32_t GaussianPass::ColumnsOfStrip() const {
    return kStripBytes / std::max(BytesPerPixel(fIn.source), 1); // four channels are never less
}

uint64_t GaussianPass::StripStep(int32_t length) const {
    return Apart(std::max(BytesOfRow(fIn.source, length), BytesOfRow(fOut.destination, length)));
}

uint64_t GaussianPass::BytesOfRows(const DestinationImage& destination) const noexcept {
    return MemoryOfLines(destination.width).Bytes();
}

uint64_t GaussianPass::BytesOfColumns(const DestinationImage& destination) const noexcept {
    return MemoryOfStrip(destination.height).Bytes();
}

PK_Result GaussianPass::AlongRows(const SourceImage& source, const DestinationImage& destination,
                                  BandMemory& memory, bool isTask) const {
    return RunInBands(source.height, Bands::OfRows(kBandRows).AsTaskIf(isTask),
                      [&](int32_t firstRow, int32_t endRow) {
                          return memory.With([&](uint8_t* bytes) {
                              TemporaryRows rows = MemoryOfLines(destination.width).In(bytes);
                              FilterRows(source, destination, firstRow, endRow, rows);
                              return PK_Success;
                          });
                      });
}

PK_Result GaussianPass::AlongColumns(const SourceImage& source, const DestinationImage& destination,
                                     BandMemory& memory, bool isTask) const {
    return RunInBands(source.width, Bands::OfRows(ColumnsOfStrip()).AsTaskIf(isTask),
                      [&](int32_t firstColumn, int32_t endColumn) {
                          return memory.With([&](uint8_t* bytes) {
                              TemporaryRows rows = MemoryOfStrip(destination.height).In(bytes);
                              FilterStrip(source, destination, firstColumn, endColumn, rows);
                              return PK_Success;
                          });
                      });
}

void GaussianPass::FilterRows(const SourceImage& source, const DestinationImage& destination,
                              int32_t firstRow, int32_t endRow, TemporaryRows& rows) const {
    const int32_t length = destination.width;
    const FloatLines lines(length, rows);
    const RowSource in(source, fIn, rows.Scratch());
    for (int32_t row = firstRow; row < endRow; row += kGaussianLines) {
        const int32_t count = std::min(kGaussianLines, endRow - row);
        for (int32_t i = 0; i < count; ++i) in.ConvertRow(row + i, lines.In(i));
        const bool isDirect = fOut.IsCopy();
        fFilter({lines.In(0), lines.Step(), isDirect ? destination.Row(row) : lines.Out(0),
                 isDirect ? destination.rowBytes : lines.Step(), lines.Scratch(), count, source.width, length,
                 fRepeatEdge},
                fCoefficients);
        if (isDirect) continue;
        for (int32_t i = 0; i < count; ++i)
            fOut.ConvertRow(lines.Out(i), destination.Row(row + i), length, rows.Scratch());
    }
}

void GaussianPass::FilterStrip(const SourceImage& source, const DestinationImage& destination,
                               int32_t firstColumn, int32_t endColumn, TemporaryRows& rows) const {
    const int32_t columns = endColumn - firstColumn, length = destination.height;
    const int32_t sourcePixel = BytesPerPixel(source.format), pixel = BytesPerPixel(destination.format);
    const TransposeKernels& transpose = Best<TransposeKernels>();
    const auto step = static_cast<int64_t>(StripStep(length));
    uint8_t* const strip = rows.Take(static_cast<uint64_t>(ColumnsOfStrip()) * StripStep(length));

    transpose.OfPixels(sourcePixel)({source.pixels + int64_t{firstColumn} * sourcePixel, source.rowBytes,
                                     strip, step, source.height, columns});
    FilterRows({strip, step, source.format, source.height, columns},
               {strip, step, destination.format, length, columns}, 0, columns, rows);
    transpose.OfPixels(pixel)({strip, step, destination.pixels + int64_t{firstColumn} * pixel,
                               destination.rowBytes, columns, length});
}

} // namespace PK
