#pragma once

// Rows in the format that an operation works in. A RowSource delivers those of an image and a RowSink takes them
// back, each by its chain or, where image and operation agree on the format, without one. Chains belong to the plan
// of an operation; sources, sinks and temporary rows are made anew by each run over rows, on its own thread:
//
//   RowMemory memory(width);
//   memory.AddSource(fIn);
//   memory.AddSink(fOut);
//   return memory.With([&](TemporaryRows& rows) {
//       const RowSource source(image, fIn, rows);
//       const RowSink sink(destination, fOut, rows);
//       for (int32_t row = first; row < end; ++row) {
//           fKernel(source.Row(row), sink.Row(row), width);
//           sink.Finish(row);
//       }
//       return PK_Success;
//   });

#include "convert/ConversionChain.h"
#include "convert/Image.h"
#include "convert/RowsAhead.h"
#include "frame/RowScratch.h"

#include <algorithm>

namespace PK {

/// The temporary rows of one run, as RowMemory counted them. Their bytes are undefined at first.
class TemporaryRows {
public:
    TemporaryRows(uint8_t* memory, uint64_t scratchBytes, int32_t scratchRows) : fNext(memory) {
        for (int32_t i = 0; i < scratchRows; ++i) fScratch.rows[i] = Take(scratchBytes);
    }

    /// The next row; aligned to 16 bytes, since some kernels round by that.
    uint8_t* Take(uint64_t bytes) {
        uint8_t* const row = fNext;
        fNext += Rounded(bytes);
        return row;
    }

    /// What all chains of the run convert through, one after the other.
    const ChainScratch& Scratch() const { return fScratch; }

    static constexpr uint64_t Rounded(uint64_t bytes) {
        return (bytes + kRowScratchAlignment - 1) & ~(kRowScratchAlignment - 1);
    }

private:
    uint8_t* fNext;
    ChainScratch fScratch = {};
};

/// Counts what a run needs of temporary rows, then gives them.
class RowMemory {
public:
    explicit RowMemory(int32_t width) : fWidth(width) {}

    /// Scratch for a chain that converts from and to memory which the operation has.
    void AddChain(const ConversionChain& chain) {
        fScratchRows = std::max(fScratchRows, chain.ScratchRows());
        fScratchBytes = std::max(fScratchBytes, chain.ScratchBytes(fWidth));
    }

    /// A source that takes this chain to the working format.
    void AddSource(const ConversionChain& chain) {
        if (chain.IsCopy()) return;
        AddChain(chain);
        AddRow(chain.destination);
    }

    /// A sink that takes this chain from the working format.
    void AddSink(const ConversionChain& chain) {
        if (chain.IsCopy()) return;
        AddChain(chain);
        AddRow(chain.source);
    }

    /// A further row, for TemporaryRows::Take of BytesOfRow.
    void AddRow(PK_PixelFormat format) { AddBytes(BytesOfRow(format, fWidth)); }

    /// Whatever else is to be had from TemporaryRows::Take.
    void AddBytes(uint64_t bytes) { fRowBytes += TemporaryRows::Rounded(bytes); }

    /// Bytes of all that was counted.
    uint64_t Bytes() const {
        return fRowBytes + static_cast<uint64_t>(fScratchRows) * TemporaryRows::Rounded(fScratchBytes);
    }

    /// The rows in so much memory.
    TemporaryRows In(uint8_t* memory) const { return {memory, fScratchBytes, fScratchRows}; }

    /// Calls use(rows) with a TemporaryRows and returns what it returns; PK_ErrOutOfMemory without a call if more
    /// than the stack is given for, 256 KiB in all, could not be had.
    template <class Use>
    PK_Result With(Use&& use) const {
        return WithRowScratch(Bytes(), [&](uint8_t* memory) {
            TemporaryRows rows = In(memory);
            return use(rows);
        });
    }

private:
    int32_t fWidth;
    uint64_t fRowBytes = 0;
    uint64_t fScratchBytes = 0;
    int32_t fScratchRows = 0;
};

/// The rows of an image in the format that a chain leads to. Lives as long as image, chain and temporary rows do.
class RowSource {
public:
    /// Through a temporary row, which RowMemory::AddSource counted.
    RowSource(const SourceImage& image, const ConversionChain& chain, TemporaryRows& rows)
        : RowSource(image, chain, rows.Scratch()) {
        if (!chain.IsCopy()) fTemporary = rows.Take(BytesOfRow(chain.destination, image.width));
    }

    /// For ConvertRow alone.
    RowSource(const SourceImage& image, const ConversionChain& chain, const ChainScratch& scratch)
        : fImage(image), fChain(chain), fScratch(scratch), fAhead(image) {}

    /// A row in the working format, where it lies or converted: then it stays until the next is asked for.
    const uint8_t* Row(int32_t row) const {
        if (fTemporary == nullptr) {
            fAhead.Fetch(row + 1);
            return fImage.Row(row);
        }
        ConvertRow(row, fTemporary);
        return fTemporary;
    }

    /// Writes a row in the working format to memory of the operation's own, as far as pixels go.
    void ConvertRow(int32_t row, void* destination) const {
        fAhead.Fetch(row + 1);
        fChain.ConvertRow(fImage.Row(row), destination, fImage.width, fScratch);
    }

private:
    const SourceImage& fImage;
    const ConversionChain& fChain;
    ChainScratch fScratch;
    RowsAhead fAhead;
    uint8_t* fTemporary = nullptr;
};

/// Takes rows in the format that a chain begins with to an image. Lives as long as image, chain and temporary rows
/// do.
class RowSink {
public:
    /// Through a temporary row, which RowMemory::AddSink counted.
    RowSink(const DestinationImage& image, const ConversionChain& chain, TemporaryRows& rows)
        : fImage(image), fChain(chain), fScratch(rows.Scratch()) {
        if (!chain.IsCopy()) fTemporary = rows.Take(BytesOfRow(chain.source, image.width));
    }

    /// Where the operation writes a row in the working format.
    uint8_t* Row(int32_t row) const { return fTemporary != nullptr ? fTemporary : fImage.Row(row); }

    /// Brings a row in the working format that stands elsewhere to its place.
    void Take(int32_t row, const uint8_t* working) const {
        fChain.ConvertRow(working, fImage.Row(row), fImage.width, fScratch);
    }

    /// Brings the row that was written to its place.
    void Finish(int32_t row) const {
        if (fTemporary != nullptr) fChain.ConvertRow(fTemporary, fImage.Row(row), fImage.width, fScratch);
    }

private:
    const DestinationImage& fImage;
    const ConversionChain& fChain;
    ChainScratch fScratch;
    uint8_t* fTemporary = nullptr;
};

} // namespace PK
