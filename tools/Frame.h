#pragma once

// One image in the library's memory.

#include <PixelKiln/PixelKiln.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace tool {

/// The quality that is taken when nothing else is asked for: the best.
inline constexpr int32_t kDefaultQuality = 5;

struct Size {
    int32_t width = 0;
    int32_t height = 0;
};

/// Rows of one size that follow each other in memory.
struct Plane {
    uint8_t* first;
    int32_t rowBytes;       ///< from one row to the next
    int32_t packedRowBytes; ///< without padding
    int32_t rows;
};

class Frame {
public:
    /// All bytes are 0, padding included, so that a frame written out tells nothing of the memory before it.
    Frame(PK_PixelFormat format, int32_t width, int32_t height);

    PK_PixelFormat Format() const { return fFormat; }
    int32_t Width() const { return fWidth; }
    int32_t Height() const { return fHeight; }
    Size PixelSize() const { return {fWidth, fHeight}; }

    /// Of a DV frame all bytes of it.
    int32_t RowBytes() const { return fRowBytes; }
    uint64_t Bytes() const { return fBytes; }
    uint8_t* Pixels() { return fPixels; }
    const uint8_t* Pixels() const { return fPixels; }

    /// A row of a raster format, counted from the top of the picture.
    uint8_t* Row(int32_t fromTop) { return fPixels + RowOffset(fromTop); }
    const uint8_t* Row(int32_t fromTop) const { return fPixels + RowOffset(fromTop); }

    /// One plane of a raster format in memory order, Y, U and V of a 4:2:0 format, the whole of a DV frame.
    std::vector<Plane> Planes() const;

private:
    struct FreePixels {
        PK_PixelFormat format;
        uint64_t size;
        void operator()(void* base) const { PK_FreePixelBuffer(format, base, size); }
    };

    int64_t RowOffset(int32_t fromTop) const;

    PK_PixelFormat fFormat;
    int32_t fWidth;
    int32_t fHeight;
    int32_t fRowBytes = 0;
    uint64_t fBytes = 0;
    uint8_t* fPixels = nullptr;
    std::unique_ptr<void, FreePixels> fBlock;
};

/// Such as 1920x1080.
std::string SizeText(int32_t width, int32_t height);
inline std::string SizeText(const Frame& frame) {
    return SizeText(frame.Width(), frame.Height());
}

/// Throws a Failure that names both formats if the library refuses.
void Convert(const Frame& source, Frame& destination, int32_t quality);
Frame Converted(const Frame& source, PK_PixelFormat format, int32_t quality);

Frame Copied(const Frame& source);

/// Throws a Failure for any result but success.
/// \param what  what was asked for, such as "rotate".
void Require(PK_Result result, const std::string& what, const Frame& frame);

/// What a result code says, as a clause.
const char* ResultText(PK_Result result);

} // namespace tool
