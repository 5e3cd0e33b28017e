#pragma once

// A stream of uncompressed video that players and encoders read.

#include "Frame.h"
#include "OutputFile.h"

namespace tool {

/// Planes of 4:4:4, limited range, Rec. 709.
class Y4MWriter {
public:
    Y4MWriter(const std::string& name, int32_t width, int32_t height, int32_t framesASecond);

    /// Of the size of the stream, any raster format.
    void Write(const Frame& frame);
    void Commit() { fFile.Commit(); }

private:
    OutputFile fFile;
};

} // namespace tool
