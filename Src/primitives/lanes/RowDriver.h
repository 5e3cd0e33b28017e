#pragma once

// Runs a formula along rows of elements: pixels, pairs of them, samples, whatever the formula counts in. A formula is a
// structure with
//
//   kElements      the elements of one group: what Group works on at once
//   Destination    the operand that is written: Each<...>, or what derives from it
//   Sources        Rows<...>, an operand for each row that is read
//   Group(const uint8_t* source..., uint8_t* destination)
//
// of which Groups<...> gives the first three. A formula may have constants, and one without neighbours may carry what it
// knows of one group to the next. Kernel sources keep their formulas in an unnamed namespace, so that two sources may
// use the same name.
//
// Where a row ends within a group, or within what a group looks at beside itself, the group goes through the same Group
// on scratch copies: all elements of a row have the same arithmetic, and no byte outside the row is read or written.

#include "primitives/KernelShapes.h"
#include "primitives/simd/Target.h"

#include <cstddef>

namespace PK::PK_TARGET {

/// Where a group stands that has no room in its row.
struct RowEnd {
    bool isFirst;         ///< Nothing of the row lies before the group.
    int64_t elementsLeft; ///< From the group's first element to the end of the row.
    int32_t groupElements;
};

/// An operand: kUnitBytes for every kUnitElements elements, which cannot be parted.
template <int32_t kUnitBytes, int32_t kUnitElements = 1>
struct Each {
    static constexpr int32_t kBytes = kUnitBytes, kUnit = kUnitElements;
    static constexpr int32_t kBytesBefore = 0, kBytesAfter = 0; // that a group reads beside its own
    static constexpr uint8_t kPadding = 0;                      // stands where the row has no bytes
    static constexpr bool kIsRead = false; // for a destination: Group looks at what it holds

    static constexpr int64_t BytesOf(int64_t elements) { return (elements + kUnit - 1) / kUnit * kBytes; }

    /// Fills what a window of a source lacks at the end of a row, if zeros will not do.
    static void Complete(uint8_t*, RowEnd) {}

    /// Takes the elements of a scratch copy of the destination back into the row.
    static void CopyBack(uint8_t* row, const uint8_t* scratch, size_t bytes) {
        std::memcpy(row, scratch, bytes);
    }
};

/// A destination that Group also reads.
template <class Operand>
struct Updated : Operand {
    static constexpr bool kIsRead = true;
};

/// A source of which a group loads kBytes more than its own, without a use for them.
template <class Operand, int32_t kBytes>
struct LoadedPast : Operand {
    static constexpr int32_t kBytesAfter = kBytes;
};

/// Gives a window the neighbours that lie outside its row: the outermost of the row stand in for them. The window's
/// units of Operand::kNeighbour elements are copied by Operand::Repeat.
template <class Operand>
void RepeatEnds(uint8_t* window, RowEnd end) {
    constexpr int32_t kBefore = Operand::kUnitsBefore, kAfter = Operand::kUnitsAfter;
    const int32_t units = kBefore + end.groupElements / Operand::kNeighbour + kAfter;
    if (end.isFirst)
        for (int32_t i = kBefore; i > 0; --i) Operand::Repeat(window, i, i - 1);
    const int64_t last = kBefore + (end.elementsLeft + Operand::kNeighbour - 1) / Operand::kNeighbour;
    for (int64_t i = last; i < units && i < last + kAfter; ++i)
        Operand::Repeat(window, static_cast<int32_t>(i - 1), static_cast<int32_t>(i));
}

/// A source of which a group looks at kBefore units before it and kAfter behind it.
template <class Operand, int32_t kBefore, int32_t kAfter>
struct Neighbours : Operand {
    static constexpr int32_t kNeighbour = Operand::kUnit;
    static constexpr int32_t kUnitsBefore = kBefore, kUnitsAfter = kAfter;
    static constexpr int32_t kBytesBefore = kBefore * Operand::kBytes, kBytesAfter = kAfter * Operand::kBytes;

    static void Complete(uint8_t* window, RowEnd end) { RepeatEnds<Neighbours>(window, end); }

    static void Repeat(uint8_t* window, int32_t from, int32_t to) {
        constexpr int32_t kBytes = Operand::kBytes;
        std::memcpy(window + to * kBytes, window + from * kBytes, kBytes);
    }
};

template <class... Operands>
struct Rows {};

/// The part of a formula that tells its operands.
template <int32_t kCount, class DestinationOperand, class... SourceOperands>
struct Groups {
    static constexpr int32_t kElements = kCount;
    using Destination = DestinationOperand;
    using Sources = Rows<SourceOperands...>;
};

/// kLanes pixels, one vector a channel or one lane a pixel.
template <int32_t kSourcePixel, int32_t kDestinationPixel>
using PixelGroup = Groups<kLanes, Each<kDestinationPixel>, Each<kSourcePixel>>;

/// Interleaved samples, four a unit: a pixel, or a pair of pixels for 4:2:2. The group is kVectors times kLanes samples.
template <int kSourceSample, int kDestinationSample, int kUnitPixels = 1, int kVectors = 1>
using SampleGroup = Groups<kVectors * kLanes / 4 * kUnitPixels, Each<4 * kDestinationSample, kUnitPixels>,
                           Each<4 * kSourceSample, kUnitPixels>>;

template <class Operand, class Formula>
inline constexpr int32_t kGroupBytes = Formula::kElements / Operand::kUnit* Operand::kBytes;

/// The elements that must be left so that a group finds in the row all bytes that it loads.
template <class Operand, class Formula>
inline constexpr int64_t kElementsOfWholeGroup =
    (int64_t{kGroupBytes<Operand, Formula> + Operand::kBytesAfter - 1} / Operand::kBytes) * Operand::kUnit +
    1;

/// What a group looks at of one source, complete.
template <class Operand, class Formula>
class Window {
public:
    Window(const uint8_t* group, RowEnd end) {
        constexpr int64_t kWanted = kGroupBytes<Operand, Formula> + Operand::kBytesAfter;
        std::memset(fBytes, Operand::kPadding, sizeof fBytes);
        const int64_t before = end.isFirst ? 0 : Operand::kBytesBefore;
        const int64_t left = Operand::BytesOf(end.elementsLeft);
        std::memcpy(fBytes + Operand::kBytesBefore - before, group - before,
                    static_cast<size_t>(before + (left < kWanted ? left : kWanted)));
        Operand::Complete(fBytes, end);
    }

    const uint8_t* Group() const { return fBytes + Operand::kBytesBefore; }

private:
    alignas(64) uint8_t fBytes[Operand::kBytesBefore + kGroupBytes<Operand, Formula> + Operand::kBytesAfter];
};

template <class Operand>
using RowOf = const uint8_t*;

constexpr int64_t Greater(int64_t a, int64_t b) {
    return a > b ? a : b;
}

/// A group at an end of its rows. Apart from the loop, and the formula by value, so that its constants stay in registers
/// there.
template <class Formula, class... Operands>
[[gnu::noinline]] void EndGroup(Formula formula, RowEnd end, Rows<Operands...>, uint8_t* destination,
                                RowOf<Operands>... sources) {
    using Destination = typename Formula::Destination;
    const int64_t elements =
        end.elementsLeft < Formula::kElements ? end.elementsLeft : int64_t{Formula::kElements};
    const auto bytes = static_cast<size_t>(Destination::BytesOf(elements));
    alignas(64) uint8_t scratch[kGroupBytes<Destination, Formula>] = {};
    if constexpr (Destination::kIsRead) std::memcpy(scratch, destination, bytes);
    formula.Group(Window<Operands, Formula>(sources, end).Group()..., scratch);
    Destination::CopyBack(destination, scratch, bytes);
}

template <class Formula, class... Operands>
PK_FLATTEN void RunGroups(Formula formula, int64_t elements, Rows<Operands...> operands, uint8_t* destination,
                          RowOf<Operands>... sources) {
    constexpr int32_t kElements = Formula::kElements;
    constexpr bool kLooksBack = ((Operands::kBytesBefore > 0) || ...);
    static_assert(((kElements % Operands::kUnit == 0) && ...));
    static_assert(kElements % Formula::Destination::kUnit == 0);
    static_assert(((kGroupBytes<Operands, Formula> >= Operands::kBytesBefore) && ...),
                  "only the first group lacks what is before");
    int64_t whole = kElements; // what must be left for a group that has room
    ((whole = Greater(whole, kElementsOfWholeGroup<Operands, Formula>)), ...);
    const auto advance = [&] {
        destination += kGroupBytes<typename Formula::Destination, Formula>;
        ((sources += kGroupBytes<Operands, Formula>), ...);
    };
    if (kLooksBack && elements > 0) {
        EndGroup(formula, {true, elements, kElements}, operands, destination, sources...);
        elements -= kElements;
        advance();
    }
    // The end is known beforehand, so that the compiler needs one counter for the loop and all its pointers.
    const int64_t groups = elements < whole ? 0 : (elements - whole) / kElements + 1;
    elements -= groups * kElements;
    const uint8_t* const end = destination + groups * kGroupBytes<typename Formula::Destination, Formula>;
    while (destination != end) {
        formula.Group(sources..., destination);
        advance();
    }
    for (; elements > 0; elements -= kElements, advance())
        EndGroup(formula, {false, elements, kElements}, operands, destination, sources...);
}

/// The formula comes by value: behind a reference its constants would be loaded anew after every store.
/// \param elements     below 1 does nothing.
/// \param destination  may be a source where their elements have one size and no neighbour is looked at.
template <class Formula, class... Pointers>
inline void RunRow(const Formula& formula, int64_t elements, void* destination, Pointers... sources) {
    RunGroups(formula, elements, typename Formula::Sources(), static_cast<uint8_t*>(destination),
              reinterpret_cast<const uint8_t*>(sources)...);
}

/// A formula without constants as a kernel of one row in and one out, and of two in.
template <class Formula>
void Row(const void* source, void* destination, int32_t width) {
    RunRow(Formula(), width, destination, source);
}
template <class Formula>
void TwoRows(const void* first, const void* second, void* destination, int32_t width) {
    RunRow(Formula(), width, destination, first, second);
}

/// A formula of three planes as a kernel.
template <class Formula>
void ThreePlanes(PlaneRows planes, uint8_t* destination, int32_t width) {
    RunRow(Formula(), width, destination, planes[0], planes[1], planes[2]);
}

/// A formula that is made of constants, as a kernel of one row in and one out.
template <class Formula, class Constants>
void RowWith(const void* source, void* destination, ptrdiff_t count, const Constants& constants) {
    RunRow(Formula(constants), count, destination, source);
}

/// The elements of kBytes each that begin before the next boundary of kAlignment bytes.
template <int32_t kAlignment, int32_t kBytes>
inline int64_t ElementsBeforeBoundary(const void* destination, int64_t elements) {
    const auto bytes = static_cast<int64_t>(-reinterpret_cast<uintptr_t>(destination) & (kAlignment - 1));
    const int64_t head = (bytes + kBytes - 1) / kBytes;
    return head < elements ? head : elements;
}

template <class HeadFormula, class Formula, class... Operands>
void RunHeadAndRest(const HeadFormula& headFormula, const Formula& formula, int64_t head, int64_t rest,
                    Rows<Operands...>, uint8_t* destination, RowOf<Operands>... sources) {
    RunRow(headFormula, head, destination, sources...);
    RunRow(formula, rest, destination + Formula::Destination::BytesOf(head),
           (sources + Operands::BytesOf(head))...);
}

/// A row whose elements before a boundary of the destination follow another formula on the same operands.
template <int32_t kAlignment, class HeadFormula, class Formula, class... Pointers>
void RunRowWithHead(const HeadFormula& headFormula, const Formula& formula, int64_t elements,
                    void* destination, Pointers... sources) {
    const int64_t head =
        ElementsBeforeBoundary<kAlignment, Formula::Destination::kBytes>(destination, elements);
    RunHeadAndRest(headFormula, formula, head, elements - head, typename Formula::Sources(),
                   static_cast<uint8_t*>(destination), static_cast<const uint8_t*>(sources)...);
}

template <class EndFormula, class Formula, class... Operands>
void RunMiddleAndEnds(const EndFormula& endFormula, const Formula& formula, int64_t head, int64_t middle,
                      int64_t tail, Rows<Operands...> operands, uint8_t* destination,
                      RowOf<Operands>... sources) {
    RunHeadAndRest(endFormula, formula, head, middle, operands, destination, sources...);
    RunRow(endFormula, tail, destination + Formula::Destination::BytesOf(head + middle),
           (sources + Operands::BytesOf(head + middle))...);
}

/// A row of which only whole runs of kRun elements from a boundary of the destination on follow one formula, and the
/// elements before and behind them another on the same operands; all of them where none begins at the boundary.
template <int32_t kAlignment, int32_t kRun, class EndFormula, class Formula, class... Pointers>
void RunRowWithEnds(const EndFormula& endFormula, const Formula& formula, int64_t elements, void* destination,
                    Pointers... sources) {
    constexpr int32_t kBytes = Formula::Destination::kBytes;
    const bool meetsBoundary = reinterpret_cast<uintptr_t>(destination) % kBytes == 0;
    const int64_t head =
        meetsBoundary ? ElementsBeforeBoundary<kAlignment, kBytes>(destination, elements) : elements;
    const int64_t middle = (elements - head) / kRun * kRun;
    RunMiddleAndEnds(endFormula, formula, head, middle, elements - head - middle, typename Formula::Sources(),
                     static_cast<uint8_t*>(destination), static_cast<const uint8_t*>(sources)...);
}

/// A formula that is made of constants, as a kernel of two rows in and one out.
template <class Formula, class Constants>
void TwoRowsWith(const void* first, const void* second, void* destination, int32_t width,
                 const Constants& constants) {
    RunRow(Formula(constants), width, destination, first, second);
}

} // namespace PK::PK_TARGET
