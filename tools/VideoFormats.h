#pragma once

// The planar formats by what streams of video tell of them, and the names that FFmpeg has for them.

#include "Frame.h"

#include <optional>
#include <string>

namespace tool {

/// What tells the formats of planar 4:2:0 apart.
struct Video420 {
    bool isCentred =
        false; ///< Chroma lies between two columns, as in MPEG-1 and JPEG; else on every second one.
    bool areFields = false; ///< Interlaced pictures.
    bool isFullRange = false;
    bool is709 = false;

    PK_PixelFormat Format() const;
};

/// None for any other format.
std::optional<Video420> Video420Of(PK_PixelFormat format);

/// The matrix of video that does not tell its own: 601 or 709 where it is asked for by these names, else the one that
/// players take for the size, which is Rec. 709 from 1280 columns or 577 rows on. Throws a usage Failure for others.
bool Is709(const std::string& matrix, Size size);

/// How the rows of a frame lie in a file.
enum class RowPacking {
    Padded, ///< as in memory: each row takes PK_PixelFormatRowBytes
    Packed, ///< the bytes of the pixels alone
    Planes, ///< Y, U and V of 4:2:0 without padding, chroma of odd sizes rounded up
    Pairs,  ///< the same with U and V interleaved
};

/// A format as an option names it.
class FileFormat {
public:
    /// None: what is read or written keeps its own.
    FileFormat() = default;
    FileFormat(PK_PixelFormat format, RowPacking packing) : fFormat(format), fPacking(packing) {}

    /// A name or number of the catalogue, in rows of \p packing. Or planes of 4:2:0 as FFmpeg names them: yuv420p,
    /// yuvj420p or nv12, behind which ":left" or ":center" may tell where chroma lies, and ":frames" or ":fields" the kind
    /// of picture. Throws a usage Failure.
    static FileFormat Parse(const std::string& text, RowPacking packing);

    /// For frames of a size. What the name leaves open is that of \p like, where that is a format of 4:2:0; else left
    /// chroma and frames, and the matrix of the size.
    PK_PixelFormat At(Size size, const std::string& matrix,
                      PK_PixelFormat like = PK_PixelFormat_Invalid) const;

    RowPacking Packing() const { return fPacking; }

private:
    /// What a name of FFmpeg tells.
    struct Told {
        bool isFullRange;
        std::optional<bool> isCentred, areFields;
    };
    static Told ParseWords(const std::string& text, bool isFullRange);

    PK_PixelFormat fFormat = PK_PixelFormat_Invalid;
    RowPacking fPacking = RowPacking::Padded;
    std::optional<Told> fTold; ///< instead of a format
};

} // namespace tool
