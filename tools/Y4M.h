#pragma once

// A stream of uncompressed video that players and encoders read.

#include "Frame.h"
#include "OutputFile.h"

namespace tool {

struct Y4MShape {
    int32_t width, height;
    int32_t framesASecond;
    int32_t field; ///< the earlier one, 1 for that of the top row, 2 for the other; 0: progressive
};

/// Planes of 4:4:4 in limited range. The stream has no word for the matrix, so that it is the one that players take
/// for the size: Rec. 709 from 1280 columns or 577 rows on, below that Rec. 601.
class Y4MWriter {
public:
    Y4MWriter(const std::string& name, const Y4MShape& shape);

    /// Of the size of the stream, any raster format; what is transparent is seen over black.
    void Write(const Frame& frame);
    void Commit() { fFile.Commit(); }

private:
    OutputFile fFile;
};

} // namespace tool
