#pragma once

// Images whose every byte counts: rows in a block that begins at a 64-byte boundary, with gaps between them and
// margins around them, all of which belong to the hash.

#include "results/Digest.h"
#include "results/Random.h"

#include <PixelKiln/Types.h>

#include <cstdint>
#include <vector>

namespace PKResults {

/// How rows lie in their block.
struct Walk {
    size_t lead = 0;      ///< bytes from a 64-byte boundary to the lowest row
    size_t gap = 0;       ///< bytes between two rows
    bool upwards = false; ///< the first row is the highest one in memory, and the step is negative
};

/// Aligned and without gaps; at an odd place, with gaps; and from the last row in memory to the first.
inline constexpr Walk kTight = {}, kSpread = {3, 13, false}, kUpwards = {8, 24, true};
inline constexpr Walk kWalks[] = {kTight, kSpread, kUpwards};

/// What samples hold.
enum class Content {
    kOrdinary, ///< Any code; 0 to full scale in 15 bits; -0.5 to 1.5 in floats.
    kEdges, ///< One in four is a code at a border, above full scale, infinite, denormal, huge or a negative zero.
    kNaNs, ///< As kEdges, and not-a-number of both signs and kinds among them.
};

class Image {
public:
    /// Rows of random bytes.
    Image(size_t rowLength, int32_t rows, const Walk& walk, Random& random);

    /// Rows as long as the pixels of a format.
    Image(PK_PixelFormat format, int32_t width, int32_t rows, const Walk& walk, Random& random);

    uint8_t* Row(int32_t row);
    uint8_t* First() { return Row(0); }
    int32_t Step() const;
    size_t RowLength() const { return fRowLength; }

    /// Gives the rows samples of a format.
    void Fill(PK_PixelFormat format, Content content, Random& random);

    /// Makes one pattern of all not-a-numbers in rows of floats: which of two operands hands on its bits is the
    /// compiler's to choose.
    void UniteNaNs();

    void AddTo(Digest& results) const;

private:
    struct alignas(64) Unit {
        uint8_t bytes[64];
    };

    size_t fRowLength;
    int32_t fRows;
    Walk fWalk;
    std::vector<Unit> fBlock;
};

/// Gives memory samples of a format.
void FillSamples(PK_PixelFormat format, Content content, uint8_t* samples, size_t bytes, Random& random);

} // namespace PKResults
