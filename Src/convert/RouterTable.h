#pragma once

// The router's table: for one exact source format, which kernel comes next on the way to a destination.

#include "convert/Kernel.h"
#include "frame/PixelFormat.h"

#include <span>

namespace PK {

/// A condition on a format: its bits under the mask have this value.
struct FormatTest {
    uint32_t mask;
    uint32_t bits;

    constexpr FormatTest(PK_PixelFormat exactly) : mask(~0u), bits(exactly) {}
    constexpr FormatTest(uint32_t maskBits, uint32_t wantedBits) : mask(maskBits), bits(wantedBits) {}

    constexpr bool operator()(PK_PixelFormat format) const { return (format & mask) == bits; }
};

/// The alpha kind of a destination. One without a fourth channel counts as having one that tells nothing,
/// since the formats on the way there have four.
constexpr uint32_t FourChannelAlpha(PK_PixelFormat destination) {
    const uint32_t alpha = AlphaOf(destination);
    return alpha != kAlphaNone ? alpha : kAlphaMeaningless;
}

/// The format that a kernel of the table leaves the row in.
class NextFormat {
public:
    /// The destination itself.
    constexpr NextFormat() = default;

    /// Always this format.
    constexpr NextFormat(PK_PixelFormat fixed) : fRule(Rule::fixed), fFormat(fixed) {}

    /// This format, given without alpha kind, with FourChannelAlpha of the destination.
    static constexpr NextFormat WithAlpha(PK_PixelFormat base) {
        NextFormat next(base);
        next.fRule = Rule::alphaOfDestination;
        return next;
    }

    constexpr PK_PixelFormat For(PK_PixelFormat destination) const {
        switch (fRule) {
        case Rule::fixed:
            return fFormat;
        case Rule::alphaOfDestination:
            return fFormat | FourChannelAlpha(destination);
        case Rule::destination:
            break;
        }
        return destination;
    }

private:
    enum class Rule : uint8_t { destination, fixed, alphaOfDestination };

    Rule fRule = Rule::destination;
    PK_PixelFormat fFormat = 0;
};

/// One row: for destinations of this kind, this kernel, which leaves the row in `next`.
struct RouterRow {
    FormatTest destination;
    Kernel kernel;
    NextFormat next = {};
};

/// The rows of one source format; the first that fits the destination decides.
struct RouterSource {
    PK_PixelFormat source;
    std::span<const RouterRow> rows;
};

/// The whole table.
std::span<const RouterSource> RouterTable();

/// The row that decides between these formats; null when the table has none.
const RouterRow* FindRouterRow(PK_PixelFormat source, PK_PixelFormat destination);

} // namespace PK
