#pragma once

// One image row in guarded memory, with a margin of known bytes on each side that does not end at a guard
// page.

#include "support/GuardedRows.h"

#include <algorithm>
#include <cstring>
#include <ostream>

namespace PKTest {

/// Where a row lies: against a guard page on one side, or at an offset from a 64-byte boundary.
struct Placement {
    enum Kind { kBeforeGuard, kAfterGuard, kAtOffset } kind;
    int offset = 0;
};

inline std::ostream& operator<<(std::ostream& stream, const Placement& place) {
    switch (place.kind) {
    case Placement::kBeforeGuard:
        return stream << "before a guard page";
    case Placement::kAfterGuard:
        return stream << "after a guard page";
    default:
        return stream << "at offset " << place.offset;
    }
}

class RowBuffer {
public:
    RowBuffer(size_t bytes, Placement place)
        : fBytes(bytes), fBefore(place.kind == Placement::kAfterGuard ? 0 : kMargin + size_t(place.offset)),
          fAfter(place.kind == Placement::kBeforeGuard ? 0 : kMargin),
          fRows(fBefore + bytes + fAfter,
                place.kind == Placement::kBeforeGuard ? Guard::kAfter : Guard::kBefore) {
        std::fill_n(fRows.Bytes(), fRows.Size(), kFill);
    }

    uint8_t* Data() const { return fRows.Bytes() + fBefore; }
    size_t Size() const { return fBytes; }

    bool MarginsIntact() const {
        const auto isFill = [](uint8_t byte) { return byte == kFill; };
        return std::all_of(fRows.Bytes(), Data(), isFill) &&
               std::all_of(Data() + fBytes, Data() + fBytes + fAfter, isFill);
    }

private:
    static constexpr size_t kMargin = 64;
    static constexpr uint8_t kFill = 0xa5;

    size_t fBytes, fBefore, fAfter;
    GuardedRows fRows;
};

} // namespace PKTest
