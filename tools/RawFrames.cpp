#include "RawFrames.h"

#include "DensePlanes.h"
#include "Failure.h"
#include "Formats.h"

namespace tool {
namespace {

// Calls take(first byte, bytes) for the parts of a frame in the order of the file.
template <typename Take>
void ForEachPart(const Frame& frame, RowPacking packing, Take take) {
    if (packing == RowPacking::Padded) {
        take(const_cast<uint8_t*>(frame.Pixels()), static_cast<size_t>(frame.Bytes()));
        return;
    }
    for (const Plane& plane : frame.Planes())
        for (int32_t y = 0; y < plane.rows; ++y)
            take(plane.first + int64_t{y} * plane.rowBytes, static_cast<size_t>(plane.packedRowBytes));
}

bool IsDense(RowPacking packing) {
    return packing == RowPacking::Planes || packing == RowPacking::Pairs;
}

const char* PackingText(RowPacking packing) {
    switch (packing) {
    case RowPacking::Padded:
        return "padded rows";
    case RowPacking::Packed:
        return "packed rows";
    case RowPacking::Planes:
        return "planes without padding";
    case RowPacking::Pairs:
        return "interleaved chroma";
    }
    return "";
}

} // namespace

int64_t RawFrameBytes(const Frame& frame, RowPacking packing) {
    if (IsDense(packing)) return static_cast<int64_t>(DenseBytes(frame.Width(), frame.Height()));
    int64_t total = 0;
    ForEachPart(frame, packing, [&](uint8_t*, size_t bytes) { total += static_cast<int64_t>(bytes); });
    return total;
}

RawReader::RawReader(const std::string& name, const Frame& like, RowPacking packing)
    : fFile(name), fPacking(packing), fFrameBytes(RawFrameBytes(like, packing)) {
    if (IsDense(packing)) fDense.resize(static_cast<size_t>(fFrameBytes));
    if (!fFile.Size()) return;
    fFrameCount = *fFile.Size() / fFrameBytes;
    if (*fFile.Size() == 0 || *fFile.Size() % fFrameBytes != 0) RefuseLength(like, *fFile.Size());
}

void RawReader::RefuseLength(const Frame& like, int64_t bytes) const {
    const bool packed = fPacking == RowPacking::Packed;
    const RowPacking other = packed ? RowPacking::Padded : RowPacking::Packed;
    std::string advice = "check --size and the format";
    if (!IsDense(fPacking) && bytes > 0 && bytes % RawFrameBytes(like, other) == 0)
        advice = packed ? "without --packed it would fit" : "with --packed it would fit";
    throw Failure(kExitFile, "'" + fFile.Name() + "' has " + std::to_string(bytes) +
                                 " bytes, but a frame of " + FormatName(like.Format()) + " at " +
                                 SizeText(like) + " with " + PackingText(fPacking) + " takes " +
                                 std::to_string(fFrameBytes) +
                                 ", and the file must hold a whole number of them; " + advice);
}

size_t RawReader::ReadParts(Frame& frame) {
    if (IsDense(fPacking)) return fFile.Read(fDense.data(), fDense.size());
    size_t got = 0;
    ForEachPart(frame, fPacking, [&](uint8_t* first, size_t bytes) { got += fFile.Read(first, bytes); });
    return got;
}

bool RawReader::Read(Frame& frame) {
    const auto got = static_cast<int64_t>(ReadParts(frame));
    if (got == 0 && fFramesRead == 0) throw Failure(kExitFile, "'" + fFile.Name() + "' holds no frame");
    if (got != 0 && got != fFrameBytes)
        throw Failure(kExitFile, "'" + fFile.Name() + "' ends within a frame, " + std::to_string(got) +
                                     " bytes into " + std::to_string(fFrameBytes) +
                                     "; check --size, the format and --packed");
    if (got != 0 && IsDense(fPacking)) FromDense(fDense, fPacking, frame);
    ++fFramesRead;
    return got != 0;
}

void WriteRaw(const Frame& frame, RowPacking packing, OutputFile& file) {
    if (!IsDense(packing))
        return ForEachPart(frame, packing,
                           [&](const uint8_t* first, size_t bytes) { file.Write(first, bytes); });
    const std::vector<uint8_t> bytes = ToDense(frame, packing);
    file.Write(bytes.data(), bytes.size());
}

} // namespace tool
