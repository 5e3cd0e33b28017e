// One channel among others. The others are written back as they are.

#include "primitives/Channels.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

inline I32 Repeated(const uint32_t (&lanes)[4]) {
    return PixelInts(static_cast<int32_t>(lanes[0]), static_cast<int32_t>(lanes[1]),
                     static_cast<int32_t>(lanes[2]), static_cast<int32_t>(lanes[3]));
}

template <class Destination>
struct Channel : Groups<4 * kLanes, Destination, Each<1>> {

    explicit Channel(const ChannelPattern& pattern)
        : fMask(Repeated(pattern.mask)), fBits(Repeated(pattern.bits)) {}

    I32 fMask, fBits;
};

struct Replace : Channel<Each<1>> {
    using Channel::Channel;

    void Group(const uint8_t* source, uint8_t* destination) const {
        Store(destination, Select(fMask, fBits, LoadInts(source)));
    }
};

/// A channel is the highest or the lowest part of its lane, so that no borrow reaches it from below.
struct InvertInteger : Channel<Updated<Each<1>>> {
    using Channel::Channel;

    void Group(const uint8_t* source, uint8_t* destination) const {
        const I32 inverse = fBits - (LoadInts(source) & fMask);
        Store(destination, Select(fMask, inverse, LoadInts(destination)));
    }
};

struct InvertFloat : Channel<Updated<Each<1>>> {
    using Channel::Channel;

    void Group(const uint8_t* source, uint8_t* destination) const {
        const F32 inverse = FromBits(fBits) - FromBits(LoadInts(source) & fMask);
        Store(destination, Select(fMask, Bits(inverse), LoadInts(destination)));
    }
};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PK::ChannelKernels& PK::ChannelKernels::For<PK::Target::PK_TARGET>() {
    using namespace PK_TARGET;
    static constexpr ChannelKernels kernels = {RowWith<Replace>, RowWith<InvertInteger>,
                                               RowWith<InvertFloat>};
    return kernels;
}
