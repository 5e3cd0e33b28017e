// One channel among others. The others are written back as they are.

#include "primitives/Channels.h"
#include "primitives/simd/RunGroups.h"

namespace PK::PK_TARGET {
namespace {

inline I32 Repeated(const uint32_t (&lanes)[4]) {
    return PixelInts(static_cast<int32_t>(lanes[0]), static_cast<int32_t>(lanes[1]),
                     static_cast<int32_t>(lanes[2]), static_cast<int32_t>(lanes[3]));
}

struct Channel {
    static constexpr size_t kElements = 4 * kLanes;
    static constexpr size_t kSourceElement = 1, kDestinationElement = 1;

    explicit Channel(const ChannelPattern& pattern)
        : fMask(Repeated(pattern.mask)), fBits(Repeated(pattern.bits)) {}

    I32 fMask, fBits;
};

struct Replace : Channel {
    using Channel::Channel;

    void Group(const uint8_t* source, uint8_t* destination) const {
        Store(destination, Select(fMask, fBits, LoadInts(source)));
    }
};

/// A channel is the highest or the lowest part of its lane, so that no borrow reaches it from below.
struct InvertInteger : Channel {
    using Channel::Channel;

    void Group(const uint8_t* source, uint8_t* destination) const {
        const I32 inverse = fBits - (LoadInts(source) & fMask);
        Store(destination, Select(fMask, inverse, LoadInts(destination)));
    }
};

struct InvertFloat : Channel {
    using Channel::Channel;

    void Group(const uint8_t* source, uint8_t* destination) const {
        const F32 inverse = FromBits(fBits) - FromBits(LoadInts(source) & fMask);
        Store(destination, Select(fMask, Bits(inverse), LoadInts(destination)));
    }
};

template <class Formula>
void ChannelRow(const uint8_t* source, uint8_t* destination, size_t bytes, const ChannelPattern& pattern) {
    RunGroups(Formula(pattern), static_cast<ptrdiff_t>(bytes), destination, source);
}

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::ChannelKernels& PK::ChannelKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr ChannelKernels kernels = {ChannelRow<Replace>, ChannelRow<InvertInteger>,
                                               ChannelRow<InvertFloat>};
    return kernels;
}
