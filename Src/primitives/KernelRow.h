#pragma once

// One row of the register of kernels. Each room lists the kernels of its families in such rows; Src/register joins them
// for whoever walks them all: the sweep over all bodies, the micro-benchmark and the listing of the program.

#include "primitives/Dispatch.h"
#include "primitives/KernelShapes.h"

#include <PixelKiln/PixelFormat.h>

#include <type_traits>

namespace PK {

/// What a kernel takes. The rows that it takes tell its operands; what is none of rows has none.
enum class Shape : uint8_t {
    Row,
    RowWithConstants,
    TwoRows,
    TwoRowsWithConstants,
    SeveralRows, ///< Rows of planes, or rows that are summed.
    Area,        ///< Blocks, lines or spans of an image.
};

/// How the bodies of a kernel agree with each other.
struct Agreement {
    enum Kind : uint8_t {
        Exact,    ///< Every body gives the bytes of the plain one.
        Declared, ///< The bodies from a target on follow another stated rule, and agree among themselves.
    };
    Kind kind = Exact;
    Target from = Target::plain; ///< The lowest body of the other rule.
};

constexpr Agreement DeclaredFrom(Target target) {
    return {Agreement::Declared, target};
}

/// Where the place of an element in its row is part of the arithmetic.
struct PlaceRule {
    int32_t headAlignment =
        0;             ///< Elements that begin before this boundary of the destination follow the plain rule.
    int32_t group = 1; ///< Rows are whole groups of so many elements.
};

/// What the samples of an operand are, for whoever makes rows up or compares them.
enum class Samples : uint8_t { Bits, Bytes, Words, SignedWords, Integers, Floats };

/// The elements of an operand: `unit` elements that cannot be parted take `bytes`.
struct Operand {
    Samples samples = Samples::Bytes;
    int32_t bytes = 0;
    int32_t unit = 1;
    PK_PixelFormat format = PK_PixelFormat_Invalid; ///< Where the elements are pixels of the catalogue.

    constexpr size_t RowBytes(int64_t elements) const {
        return static_cast<size_t>((elements + unit - 1) / unit * bytes);
    }
};

/// Those of a kernel, as far as it has them.
struct Operands {
    Operand source{}, second{}, destination{};

    constexpr Operands() = default;
    constexpr Operands(Operand from, Operand to) : source(from), destination(to) {}
    constexpr Operands(Operand first, Operand other, Operand to)
        : source(first), second(other), destination(to) {}
};

/// A kernel of any shape, to be cast back to its own type before a call.
using AnyKernel = void (*)();

struct KernelRow {
    const char* family; ///< As the source of its bodies is named.
    const char* name;
    Shape shape;
    Offer offer;
    AnyKernel (*body)(Target target); ///< For a target of the offer; null where the kernel has none.
    Operands operands;
    Agreement agreement;
    PlaceRule place;
};

template <class Function>
inline constexpr Shape kShapeOf = Shape::Area;
template <>
inline constexpr Shape kShapeOf<RowKernel> = Shape::Row;
template <class Constants>
inline constexpr Shape kShapeOf<RowKernelWith<Constants>> = Shape::RowWithConstants;
template <>
inline constexpr Shape kShapeOf<TwoRowKernel> = Shape::TwoRows;
template <class Constants>
inline constexpr Shape kShapeOf<TwoRowKernelWith<Constants>> = Shape::TwoRowsWithConstants;

/// What a pointer to the member of a family tells of the kernel; of an array of kernels, with the place of one.
template <auto kMember, size_t... kPlace>
struct KernelOf;
template <class Family, class Function, Function Family::*kMember>
struct KernelOf<kMember> {
    static constexpr Shape kShape = kShapeOf<Function>;
    static constexpr Offer kOffer = Family::kOffer;
    static constexpr const char* kFamily = Family::kFamily;

    static AnyKernel Body(Target target) {
        return reinterpret_cast<AnyKernel>(KernelsFor<Family>(target).*kMember);
    }
};

template <class Family, class Function, size_t kCount, Function (Family::*kMember)[kCount], size_t kPlace>
struct KernelOf<kMember, kPlace> {
    static constexpr Shape kShape = kShapeOf<Function>;
    static constexpr Offer kOffer = Family::kOffer;
    static constexpr const char* kFamily = Family::kFamily;

    static AnyKernel Body(Target target) {
        return reinterpret_cast<AnyKernel>((KernelsFor<Family>(target).*kMember)[kPlace]);
    }
};

/// The row of a kernel, given as the member of its family: Entry<&ALawKernels::toLinear16>("ALawToLinear16", ...); and
/// with a place for a member that is an array.
template <auto kMember, size_t... kPlace>
constexpr KernelRow Entry(const char* name, Operands operands = {}, Agreement agreement = {},
                          PlaceRule place = {}) {
    using Member = KernelOf<kMember, kPlace...>;
    return {Member::kFamily, name, Member::kShape, Member::kOffer, Member::Body, operands, agreement, place};
}

} // namespace PK
