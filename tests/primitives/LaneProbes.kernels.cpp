// The bodies of the probes of pixel lanes.

#include "primitives/LaneProbes.h"

#include "primitives/lanes/ByteScale.h"
#include "primitives/lanes/PixelLanes.h"
#include "primitives/lanes/RowDriver.h"

namespace PK::PK_TARGET {
namespace {

template <class Layout>
struct LoadLayout : PixelGroup<Layout::kPixelBytes, 16> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        StoreFloatChannels(destination, Layout::Load(source));
    }
};

template <class Layout>
struct StoreLayout : PixelGroup<16, Layout::kPixelBytes> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Layout::Store(destination, LoadFloatChannels(source));
    }
};

struct Vote : PixelGroup<4, 4> {
    static void Group(const uint8_t* source, uint8_t* destination) {
        Store(destination, WhereGroupAgrees(LoadInts(source)));
    }
};

struct Products : Groups<kLanes, Each<4>, Each<4>, Each<4>> {
    static void Group(const uint8_t* a, const uint8_t* b, uint8_t* destination) {
        Store(destination, MultiplyBytes(LoadInts(a), LoadInts(b)));
    }
};

template <I32 (*kOperation)(I32, I32)>
struct OfBytes : Groups<kLanes, Each<4>, Each<4>, Each<4>> {
    static void Group(const uint8_t* a, const uint8_t* b, uint8_t* destination) {
        Store(destination, kOperation(LoadInts(a), LoadInts(b)));
    }
};

template <class Layout>
constexpr PKTest::LayoutProbe kProbe = {Row<LoadLayout<Layout>>, Row<StoreLayout<Layout>>};

} // namespace
} // namespace PK::PK_TARGET

template <>
const PKTest::LaneProbes& PKTest::LaneProbes::For<PK::Target::PK_TARGET>() {
    using namespace PK::PK_TARGET;
    using enum AlphaPlace;
    static constexpr LaneProbes probes = {
        .bytesAlphaLast = kProbe<Pixels8<last>>,
        .bytesAlphaFirst = kProbe<Pixels8<first>>,
        .wordsAlphaLast = kProbe<Pixels15<last>>,
        .wordsAlphaFirst = kProbe<Pixels15<first>>,
        .floatsAlphaLast = kProbe<Pixels32f<last>>,
        .floatsAlphaFirst = kProbe<Pixels32f<first>>,
        .vote = Row<Vote>,
        .products = TwoRows<Products>,
        .lesserBytes = TwoRows<OfBytes<MinBytes>>,
        .greaterBytes = TwoRows<OfBytes<MaxBytes>>,
    };
    return probes;
}
