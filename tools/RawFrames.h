#pragma once

// Files of raw frames: one frame after another, with nothing between them.

#include "Frame.h"
#include "OutputFile.h"

#include <cstdio>
#include <memory>
#include <string>

namespace tool {

/// How the rows of a frame lie in a file.
enum class RowPacking {
    Padded, ///< as in memory: each row takes PK_PixelFormatRowBytes
    Packed, ///< the bytes of the pixels alone
};

/// The bytes of one frame in a file.
int64_t RawFrameBytes(const Frame& frame, RowPacking packing);

class RawReader {
public:
    /// \param like  a frame of the format and size that the file holds. A regular file of any other length
    ///              than a whole number of such frames is refused here.
    RawReader(const std::string& name, const Frame& like, RowPacking packing);

    /// Frames in the file; 0 if that shows only at its end, as with a pipe.
    int64_t FrameCount() const { return fFrameCount; }

    /// False at the end of the file. A file without any frame is a failure.
    bool Read(Frame& frame);

private:
    struct CloseFile {
        void operator()(FILE* file) const;
    };

    [[noreturn]] void RefuseLength(const Frame& like, int64_t bytes) const;

    std::string fName;
    RowPacking fPacking;
    std::unique_ptr<FILE, CloseFile> fFile;
    int64_t fFrameCount = 0;
    int64_t fFramesRead = 0;
};

void WriteRaw(const Frame& frame, RowPacking packing, OutputFile& file);

} // namespace tool
