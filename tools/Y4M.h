#pragma once

// Streams of uncompressed video that players and encoders read and write.

#include "Frame.h"
#include "InputFile.h"
#include "OutputFile.h"

#include <string>
#include <vector>

namespace tool {

/// By its name: whether a file is to be read or written as a stream.
bool IsY4MName(const std::string& name);

/// What a stream says of itself before its first frame. It has no word for the matrix.
struct Y4MHead {
    int32_t width = 0, height = 0;
    std::string rate = "25:1"; ///< frames a second
    std::string aspect = "1:1";
    int32_t field = 0; ///< the earlier one, 1 for that of the top row, 2 for the other; 0: progressive

    /// A format of planar 4:2:0, or UYVY_422_8u or VUYX_4444_8u, of any matrix; Invalid: planes of 4:4:4 in limited range.
    PK_PixelFormat format = PK_PixelFormat_Invalid;
};

class Y4MReader {
public:
    /// Throws for what is no stream of 4:2:0, 4:2:2 or 4:4:4 with 8 bits. Interlaced pictures of 4:2:0 are field pictures.
    /// \param matrix  as Is709 takes it.
    Y4MReader(const std::string& name, const std::string& matrix);

    const Y4MHead& Head() const { return fHead; }

    /// False at the end of the stream. One without any frame is a failure.
    /// \param frame  of the format and size of the head.
    bool Read(Frame& frame);

private:
    InputFile fFile;
    Y4MHead fHead;
    std::vector<uint8_t> fBytes;
    bool fHasFrames = false;
};

/// Planes of 4:4:4 are of the matrix that players take for the size.
class Y4MWriter {
public:
    Y4MWriter(const std::string& name, const Y4MHead& head);

    /// Of the size of the stream. For planes of 4:4:4 any raster format, and what is transparent is seen over black; for
    /// 4:2:0 and 4:2:2 that of the head.
    void Write(const Frame& frame);
    void Commit() { fFile.Commit(); }

private:
    OutputFile fFile;
    PK_PixelFormat fFormat;
};

} // namespace tool
