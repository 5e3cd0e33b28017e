#pragma once

// Files of raw frames: one frame after another, with nothing between them.

#include "Frame.h"
#include "InputFile.h"
#include "OutputFile.h"
#include "VideoFormats.h"

#include <string>
#include <vector>

namespace tool {

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
    [[noreturn]] void RefuseLength(const Frame& like, int64_t bytes) const;

    size_t ReadParts(Frame& frame);

    InputFile fFile;
    RowPacking fPacking;
    std::vector<uint8_t> fDense; // a frame as it lies in the file, where it has to be taken apart
    int64_t fFrameBytes;
    int64_t fFrameCount = 0;
    int64_t fFramesRead = 0;
};

void WriteRaw(const Frame& frame, RowPacking packing, OutputFile& file);

} // namespace tool
