// Colour spaces as objects: their virtual functions and fields as other binaries know them, copies and moves with what
// an object has calculated so far, and the shared instances.

#include <PixelKiln/ColorSpace.h>

#include "support/ColourPixels.h"

#include <algorithm>
#include <barrier>
#include <cstddef>
#include <cstdlib>
#include <thread>
#include <typeinfo>
#include <utility>

namespace {

using namespace PKTest;
using namespace PK;

/// The slot of a virtual function as a compiled caller has it: the Itanium ABI stores 1 + its offset in the table.
template <class Function>
size_t SlotOf(Function function) {
    static_assert(sizeof function == 2 * sizeof(size_t));
    const auto words = std::bit_cast<std::array<size_t, 2>>(function);
    EXPECT_EQ(words[0] & 1, 1u) << "not virtual";
    EXPECT_EQ(words[1], 0u) << "the table is that of the object's first base";
    return words[0] / sizeof(void*) + 1;
}

template <class Field>
Field FieldAt(const void* object, size_t offset) {
    Field field;
    std::memcpy(&field, static_cast<const char*>(object) + offset, sizeof field);
    return field;
}

size_t OffsetIn(const void* object, const void* field) {
    return static_cast<size_t>(static_cast<const char*>(field) - static_cast<const char*>(object));
}

ColourPixels ThroughSpace(const ColorSpace& space, bool fromHub, bool gamutClip = true) {
    Random random(3);
    ColourPixels pixels = UniformPixels(random, 11, -0.2f, 1.2f);
    auto* floats = pixels.data()->data();
    const auto count = static_cast<int32_t>(pixels.size());
    if (fromHub)
        space.ConvertPixelsFromRec709(floats, floats, count, gamutClip);
    else
        space.ConvertPixelsToRec709(floats, floats, count, gamutClip);
    return pixels;
}

bool ConvertAlike(const ColorSpace& a, const ColorSpace& b) {
    return AreSameBits(ThroughSpace(a, true), ThroughSpace(b, true)) &&
           AreSameBits(ThroughSpace(a, false), ThroughSpace(b, false)) &&
           AreSameBits(ThroughSpace(a, false, false), ThroughSpace(b, false, false));
}

/// Has the object calculate all that it keeps.
void FillCaches(const ColorSpace& space) {
    space.RGBtoXYZ();
    space.LuminanceCoeffs();
    ThroughSpace(space, true);
    ThroughSpace(space, false);
    ThroughSpace(space, false, false);
}

constexpr float kPrimaries[6] = {0.713f, 0.293f, 0.165f, 0.83f, 0.128f, 0.044f};

TEST(ColorSpaceObjects, VirtualFunctionsAreInOrder) {
    EXPECT_EQ(SlotOf(&ColorSpace::Primaries), 1u);
    EXPECT_EQ(SlotOf(&ColorSpace::WhitePoint), 2u);
    EXPECT_EQ(SlotOf(&ColorSpace::LuminanceCoeffs), 3u);
    EXPECT_EQ(SlotOf(&ColorSpace::LinearToEOTF), 4u);
    EXPECT_EQ(SlotOf(&ColorSpace::EOTFToLinear), 5u);
    EXPECT_EQ(SlotOf(&ColorSpace::ConvertPixelsFromRec709), 6u);
    EXPECT_EQ(SlotOf(&ColorSpace::ConvertPixelsToRec709), 7u);
    EXPECT_EQ(SlotOf(&ColorSpace::CompressPixelsToSDR), 8u);
    EXPECT_EQ(SlotOf(&Rec2020ColorSpace::ConvertPixelsFromYUVtoRGB), 9u);
    EXPECT_EQ(SlotOf(&Rec2020ColorSpace::ConvertPixelsFromRGBtoYUV), 10u);
}

TEST(ColorSpaceObjects, DerivedClassesKeepTheSlotsOfTheirBase) {
    EXPECT_EQ(SlotOf(&HLGColorSpace::LinearToEOTF), 4u);
    EXPECT_EQ(SlotOf(&PQColorSpace::ConvertPixelsToRec709), 7u);
    EXPECT_EQ(SlotOf(&DCIP3ColorSpace::CompressPixelsToSDR), 8u);
    EXPECT_EQ(SlotOf(&GammaColorSpace::ConvertPixelsFromRec709), 6u);
    EXPECT_EQ(SlotOf(&SRGBColorSpace::Primaries), 1u);
}

TEST(ColorSpaceObjects, ACallerWithNothingButTheTableReachesTheFunctions) {
    // What a binary compiled against these classes does: it takes the table from the front of the object and calls
    // through a slot, with the object as the first argument.
    using Transfer = float (*)(const ColorSpace*, float);
    const GammaColorSpace root(0.5f);
    const auto* table = FieldAt<void* const*>(static_cast<const ColorSpace*>(&root), 0);
    EXPECT_EQ(std::bit_cast<Transfer>(table[3])(&root, 0.25f), 0.5f);
    EXPECT_EQ(std::bit_cast<Transfer>(table[4])(&root, 0.5f), 0.25f);
    using Pointer = const float* (*)(const ColorSpace*);
    EXPECT_EQ(std::bit_cast<Pointer>(table[0])(&root), root.Primaries());
    EXPECT_EQ(std::bit_cast<Pointer>(table[1])(&root), root.WhitePoint());
    EXPECT_EQ(std::bit_cast<Pointer>(table[2])(&root), root.LuminanceCoeffs());
}

TEST(ColorSpaceObjects, TheMatricesAndTheirFlagStandFirst) {
    const SRGBColorSpace space;
    EXPECT_EQ(OffsetIn(&space, &space.RGBtoXYZ()), sizeof(void*));
    EXPECT_EQ(OffsetIn(&space, &space.XYZtoRGB()), sizeof(void*) + sizeof(CSMatrix));
    EXPECT_EQ(FieldAt<uint8_t>(&space, sizeof(void*) + 2 * sizeof(CSMatrix)), 0);
}

constexpr size_t kGammaOffset = 84, kIlluminantOffset = 88, kP3LumaOffset = 92, kFromOffset = 104,
                 kToOffset = 140, kFromValidOffset = 176, kToValidOffset = 177;

TEST(ColorSpaceObjects, GammaIsBehindThem) {
    const GammaColorSpace space(0.3f);
    EXPECT_EQ(FieldAt<float>(&space, kGammaOffset), 0.3f);
    const GammaColorSpace camera;
    EXPECT_EQ(FieldAt<float>(&camera, kGammaOffset), 0.45f);
    const Rec709ColorSpace hub;
    EXPECT_EQ(FieldAt<float>(&hub, kGammaOffset), 0.41666666f);
    const Rec2020ColorSpace rec2020;
    EXPECT_EQ(FieldAt<float>(&rec2020, kGammaOffset), 0.41666666f);
    const HLGColorSpace hlg;
    EXPECT_EQ(FieldAt<float>(&hlg, kGammaOffset), 0.41666666f);
}

TEST(ColorSpaceObjects, FieldsOfP3) {
    const DCIP3ColorSpace space(kIlluminantDCI);
    EXPECT_EQ(FieldAt<float>(&space, kGammaOffset), 0.38461539f);
    EXPECT_EQ(FieldAt<uint32_t>(&space, kIlluminantOffset), 3u);
    for (size_t i = 0; i < 3; ++i) EXPECT_EQ(FieldAt<float>(&space, kP3LumaOffset + 4 * i), 0.0f);
    EXPECT_EQ(FieldAt<float>(&space, kFromOffset), 1.0f) << "the identity";
    EXPECT_EQ(FieldAt<float>(&space, kToOffset), 1.0f);
    EXPECT_EQ(FieldAt<uint16_t>(&space, kFromValidOffset), 0);

    EXPECT_EQ(OffsetIn(&space, space.LuminanceCoeffs()), kP3LumaOffset);
    const Rec709ColorSpace hub;
    ThroughSpace(space, true);
    EXPECT_EQ(FieldAt<uint8_t>(&space, kFromValidOffset), 1);
    EXPECT_EQ(FieldAt<uint8_t>(&space, kToValidOffset), 0) << "each direction for itself";
    const CSMatrix from = ColorSpace::CalculateConversionMatrix(hub, space);
    EXPECT_EQ(std::memcmp(reinterpret_cast<const char*>(&space) + kFromOffset, from.m, sizeof from.m), 0);
    ThroughSpace(space, false);
    EXPECT_EQ(FieldAt<uint8_t>(&space, kToValidOffset), 1);
    const CSMatrix to = ColorSpace::CalculateConversionMatrix(space, hub);
    EXPECT_EQ(std::memcmp(reinterpret_cast<const char*>(&space) + kToOffset, to.m, sizeof to.m), 0);
}

TEST(ColorSpaceObjects, PrimariesOfPQAreItsOwnCopy) {
    float chromaticities[6];
    std::copy_n(kPrimaries, 6, chromaticities);
    const PQColorSpace space(chromaticities, false);
    chromaticities[0] = 0;
    EXPECT_TRUE(std::equal(kPrimaries, kPrimaries + 6, space.Primaries()));
    EXPECT_EQ(OffsetIn(&space, space.Primaries()), kGammaOffset);
    EXPECT_EQ(OffsetIn(&space, space.LuminanceCoeffs()), kGammaOffset + sizeof chromaticities);
}

TEST(ColorSpaceObjects, WeightsAreCalculatedWhileTheFirstIsZero) {
    DCIP3ColorSpace space;
    auto* luma = const_cast<float*>(space.LuminanceCoeffs());
    const float first = luma[0], second = luma[1];
    luma[1] = 7;
    EXPECT_EQ(space.LuminanceCoeffs()[1], 7.0f) << "only the first is looked at";
    luma[0] = 0;
    EXPECT_EQ(space.LuminanceCoeffs()[0], first);
    EXPECT_EQ(space.LuminanceCoeffs()[1], second);
}

/// Copies and moves of an object are like it, whatever it had calculated by then, and what they are assigned to forgets
/// what it was.
template <class Space>
void ExpectCopiesAlike(const Space& space, const Space& other) {
    for (const bool isFilled : {false, true}) {
        if (isFilled) FillCaches(space);
        Space original = space;
        const Space copy(original);
        EXPECT_EQ(std::memcmp(copy.Primaries(), space.Primaries(), 6 * sizeof(float)), 0);
        EXPECT_EQ(copy.WhitePoint(), space.WhitePoint());
        EXPECT_TRUE(ConvertAlike(copy, space));
        EXPECT_EQ(std::memcmp(copy.LuminanceCoeffs(), space.LuminanceCoeffs(), 3 * sizeof(float)), 0);

        const Space moved(std::move(original));
        EXPECT_TRUE(ConvertAlike(moved, space));
        EXPECT_TRUE(ConvertAlike(original, space)) << "a move copies"; // NOLINT(bugprone-use-after-move)

        Space assigned(other);
        FillCaches(assigned);
        EXPECT_EQ(&(assigned = space), &assigned);
        EXPECT_TRUE(ConvertAlike(assigned, space));
        EXPECT_EQ(assigned.WhitePoint(), space.WhitePoint());
        EXPECT_EQ(assigned.LinearToEOTF(0.3f), space.LinearToEOTF(0.3f));

        Space taken(other);
        FillCaches(taken);
        EXPECT_EQ(&(taken = std::move(assigned)), &taken);
        EXPECT_TRUE(ConvertAlike(taken, space));
        EXPECT_TRUE(ConvertAlike(assigned, space)) << "a move copies"; // NOLINT(bugprone-use-after-move)

        Space& self = taken;
        taken = self;
        EXPECT_TRUE(ConvertAlike(taken, space)) << "assigned to itself";
    }
}

TEST(ColorSpaceObjects, CopiesAndMovesAreAlike) {
    ExpectCopiesAlike(SRGBColorSpace(), SRGBColorSpace());
    ExpectCopiesAlike(GammaColorSpace(0.3f), GammaColorSpace());
    ExpectCopiesAlike(Rec709ColorSpace(), Rec709ColorSpace());
    ExpectCopiesAlike(Rec2020ColorSpace(), Rec2020ColorSpace());
    ExpectCopiesAlike(HLGColorSpace(), HLGColorSpace());
    ExpectCopiesAlike(DCIP3ColorSpace(kIlluminantD50), DCIP3ColorSpace());
    ExpectCopiesAlike(PQColorSpace(false, true), PQColorSpace(true, false));
    ExpectCopiesAlike(PQColorSpace(kPrimaries, false), PQColorSpace(false, true));
}

TEST(ColorSpaceObjects, DifferentSpacesConvertDifferently) { // or the test above would prove nothing
    EXPECT_FALSE(ConvertAlike(GammaColorSpace(0.3f), GammaColorSpace()));
    EXPECT_FALSE(ConvertAlike(DCIP3ColorSpace(kIlluminantD50), DCIP3ColorSpace()));
    EXPECT_FALSE(ConvertAlike(PQColorSpace(false, true), PQColorSpace(true, false)));
    EXPECT_FALSE(ConvertAlike(PQColorSpace(kPrimaries, false), PQColorSpace(false, false)));
}

TEST(ColorSpaceObjects, CopiesTakeOverWhatIsCalculated) {
    const DCIP3ColorSpace empty(kIlluminantD50);
    const DCIP3ColorSpace copyOfEmpty(empty);
    EXPECT_EQ(FieldAt<uint16_t>(&copyOfEmpty, kFromValidOffset), 0);
    EXPECT_EQ(FieldAt<float>(&copyOfEmpty, kP3LumaOffset), 0.0f);

    FillCaches(empty);
    const DCIP3ColorSpace copy(empty);
    constexpr size_t kFields = kToValidOffset + 1 - sizeof(void*);
    const auto fieldsOf = [](const DCIP3ColorSpace& space) {
        return FieldAt<std::array<uint8_t, kFields>>(&space, sizeof(void*));
    };
    auto expected = fieldsOf(empty), actual = fieldsOf(copy);
    constexpr size_t kPadding = 81 - sizeof(void*); // behind the flag of the matrices
    std::fill_n(expected.begin() + kPadding, 3, uint8_t{0});
    std::fill_n(actual.begin() + kPadding, 3, uint8_t{0});
    EXPECT_EQ(actual, expected);
}

TEST(ColorSpaceObjects, CopiesTakeOverTheFlagAndMatricesThatAHostSet) {
    class Host : public SRGBColorSpace {
    public:
        using ColorSpace::matricesValid;
        using ColorSpace::rgbToXYZ;
    };
    Host host;
    host.rgbToXYZ.m[0] = 3;
    host.matricesValid = true;
    const Host copy(host);
    EXPECT_TRUE(copy.matricesValid);
    EXPECT_EQ(copy.RGBtoXYZ().m[0], 3.0f);
    Host assigned;
    EXPECT_FALSE(assigned.matricesValid);
    assigned = host;
    EXPECT_EQ(assigned.RGBtoXYZ().m[0], 3.0f);
}

const ColorSpace& Shared(int64_t which) {
    return ColorSpace::WorkingSpace(static_cast<PK_WorkingSpace>(which));
}

const std::type_info& ClassOf(const ColorSpace& space) {
    return typeid(space);
}

TEST(WorkingSpace, AreOfTheirClasses) {
    EXPECT_EQ(ClassOf(Shared(0)), typeid(Rec709ColorSpace));
    EXPECT_EQ(ClassOf(Shared(1)), typeid(Rec2020ColorSpace));
    EXPECT_EQ(ClassOf(Shared(2)), typeid(DCIP3ColorSpace));
    EXPECT_EQ(ClassOf(Shared(3)), typeid(DCIP3ColorSpace));
    EXPECT_EQ(ClassOf(Shared(4)), typeid(PQColorSpace));
    EXPECT_EQ(ClassOf(Shared(5)), typeid(PQColorSpace));
    EXPECT_EQ(ClassOf(Shared(6)), typeid(SRGBColorSpace));
    EXPECT_EQ(Shared(2).WhitePoint(), ColorSpace::Illuminant(kIlluminantD60));
    EXPECT_EQ(Shared(3).WhitePoint(), ColorSpace::Illuminant(kIlluminantD65));
    EXPECT_TRUE(ConvertAlike(Shared(2), DCIP3ColorSpace(kIlluminantD60)));
    EXPECT_TRUE(ConvertAlike(Shared(3), DCIP3ColorSpace()));
    EXPECT_TRUE(ConvertAlike(Shared(4), PQColorSpace(false, true)));
    EXPECT_TRUE(ConvertAlike(Shared(5), PQColorSpace(true, true)));
}

TEST(WorkingSpace, AreMadeOnce) {
    for (int i = 0; i < 7; ++i) {
        EXPECT_EQ(&Shared(i), &Shared(i));
        for (int j = 0; j < i; ++j) EXPECT_NE(&Shared(i), &Shared(j));
    }
}

TEST(WorkingSpace, AnyOtherNumberIsSRGB) {
    const ColorSpace& srgb = ColorSpace::WorkingSpace(kWorkingSpaceSRGB);
    for (const int64_t which : {int64_t{6}, int64_t{7}, int64_t{-1}, int64_t{INT32_MAX}, int64_t{INT32_MIN}})
        EXPECT_EQ(&Shared(which), &srgb) << which;
}

/// Ends the process with 0 if eight threads, which ask for all spaces at once, each in another order, get the same.
[[noreturn]] void MeetAllSpacesForTheFirstTime() {
    constexpr size_t kThreads = 8;
    std::array<std::array<const ColorSpace*, 7>, kThreads> found{};
    std::barrier start(static_cast<ptrdiff_t>(kThreads));
    std::vector<std::thread> threads;
    for (size_t i = 0; i < kThreads; ++i)
        threads.emplace_back([&found, &start, i] {
            start.arrive_and_wait();
            for (size_t k = 0; k < 7; ++k) {
                // The PQ instances first: they ask for others while they are made.
                const size_t which = (11 + i - k) % 7;
                found[i][which] = &Shared(static_cast<int64_t>(which));
                if (found[i][which]->Primaries()[0] < 0.6f) std::_Exit(3);
            }
        });
    for (std::thread& thread : threads) thread.join();
    std::_Exit(std::ranges::all_of(found, [&](const auto& other) { return other == found[0]; }) ? 0 : 2);
}

TEST(WorkingSpace, ManyThreadsMayMeetAllForTheFirstTime) {
    // In a process of its own, so that it is the first time.
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(MeetAllSpacesForTheFirstTime(), testing::ExitedWithCode(0), "");
}

TEST(WorkingSpace, APQSpaceMayBeTheFirstThatIsAskedFor) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(
        {
            Shared(5);
            Shared(4);
            std::_Exit(Shared(3).Primaries()[0] == Shared(5).Primaries()[0] ? 0 : 2);
        },
        testing::ExitedWithCode(0), "");
}

} // namespace
