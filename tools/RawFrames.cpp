#include "RawFrames.h"

#include "Failure.h"
#include "Formats.h"

#include <cerrno>
#include <sys/stat.h>

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

const char* PackingText(RowPacking packing) {
    return packing == RowPacking::Packed ? "packed rows" : "padded rows";
}

} // namespace

int64_t RawFrameBytes(const Frame& frame, RowPacking packing) {
    int64_t total = 0;
    ForEachPart(frame, packing, [&](uint8_t*, size_t bytes) { total += static_cast<int64_t>(bytes); });
    return total;
}

void RawReader::CloseFile::operator()(FILE* file) const {
    if (file != stdin) std::fclose(file);
}

RawReader::RawReader(const std::string& name, const Frame& like, RowPacking packing)
    : fName(name == "-" ? "standard input" : name), fPacking(packing),
      fFile(name == "-" ? stdin : std::fopen(name.c_str(), "rb")) {
    if (!fFile) ThrowFileFailure("cannot read '" + fName + "'", errno);
    struct stat file;
    if (fstat(fileno(fFile.get()), &file) != 0) ThrowFileFailure("cannot read '" + fName + "'", errno);
    if (S_ISDIR(file.st_mode)) ThrowFileFailure("cannot read '" + fName + "'", EISDIR);
    if (S_ISREG(file.st_mode)) {
        fFrameCount = file.st_size / RawFrameBytes(like, packing);
        if (file.st_size == 0 || file.st_size % RawFrameBytes(like, packing) != 0)
            RefuseLength(like, file.st_size);
    }
}

void RawReader::RefuseLength(const Frame& like, int64_t bytes) const {
    const bool packed = fPacking == RowPacking::Packed;
    const RowPacking other = packed ? RowPacking::Padded : RowPacking::Packed;
    std::string advice = "check --size and the format";
    if (bytes > 0 && bytes % RawFrameBytes(like, other) == 0)
        advice = packed ? "without --packed it would fit" : "with --packed it would fit";
    throw Failure(kExitFile, "'" + fName + "' has " + std::to_string(bytes) + " bytes, but a frame of " +
                                 FormatName(like.Format()) + " at " + SizeText(like) + " with " +
                                 PackingText(fPacking) + " takes " +
                                 std::to_string(RawFrameBytes(like, fPacking)) +
                                 ", and the file must hold a whole number of them; " + advice);
}

bool RawReader::Read(Frame& frame) {
    int64_t got = 0;
    int64_t wanted = 0;
    ForEachPart(frame, fPacking, [&](uint8_t* first, size_t bytes) {
        wanted += static_cast<int64_t>(bytes);
        errno = 0;
        if (!std::feof(fFile.get())) got += static_cast<int64_t>(std::fread(first, 1, bytes, fFile.get()));
        if (std::ferror(fFile.get())) ThrowFileFailure("cannot read '" + fName + "'", errno);
    });
    if (got == 0 && fFramesRead == 0) throw Failure(kExitFile, "'" + fName + "' holds no frame");
    if (got != 0 && got != wanted)
        throw Failure(kExitFile, "'" + fName + "' ends within a frame, " + std::to_string(got) +
                                     " bytes into " + std::to_string(wanted) +
                                     "; check --size, the format and --packed");
    ++fFramesRead;
    return got != 0;
}

void WriteRaw(const Frame& frame, RowPacking packing, OutputFile& file) {
    ForEachPart(frame, packing, [&](const uint8_t* first, size_t bytes) { file.Write(first, bytes); });
}

} // namespace tool
