// Colour spaces on many threads: the shared instances, and objects that all threads meet for the first time, so that what
// a const operation calculates and keeps is calculated by several at once while others copy the object.

#include "stress/Operation.h"

#include "support/Random.h"

#include <PixelKiln/ColorSpace.h>

#include <algorithm>
#include <array>
#include <cstring>
#include <iterator>
#include <memory>
#include <mutex>
#include <vector>

namespace {

using namespace PKStress;
using namespace PK;

constexpr int32_t kPixels = 29; // groups of eight and a rest

using Row = std::array<float, size_t{4} * kPixels>;

Row MakeRow() {
    PKTest::Random random(40);
    Row row;
    for (float& x : row) x = static_cast<float>(random.Next()) * 0x1p-32f * 1.5f - 0.25f;
    return row;
}

const Row& SourceRow() {
    static const Row row = MakeRow();
    return row;
}

bool AreSame(const Row& a, const Row& b) {
    return std::memcmp(a.data(), b.data(), sizeof a) == 0;
}

/// All that a space answers.
struct Answers {
    explicit Answers(const ColorSpace& space)
        : coded{space.LinearToEOTF(0.3f), space.EOTFToLinear(0.7f)}, toXYZ(space.RGBtoXYZ()),
          toRGB(space.XYZtoRGB()) {
        const float* source = SourceRow().data();
        for (size_t clip = 0; clip < 2; ++clip) {
            space.ConvertPixelsFromRec709(source, rows[2 * clip].data(), kPixels, clip != 0);
            space.ConvertPixelsToRec709(source, rows[2 * clip + 1].data(), kPixels, clip != 0);
        }
        space.CompressPixelsToSDR(source, rows[4].data(), kPixels, 1, 1.2f, 0.7f);
        std::copy_n(space.LuminanceCoeffs(), 3, luma);
    }

    bool operator==(const Answers& other) const {
        return std::ranges::equal(coded, other.coded) && std::ranges::equal(luma, other.luma) &&
               std::ranges::equal(toXYZ.m, other.toXYZ.m) && std::ranges::equal(toRGB.m, other.toRGB.m) &&
               std::ranges::equal(rows, other.rows, AreSame);
    }

    float coded[2];
    CSMatrix toXYZ, toRGB;
    Row rows[5] = {};
    float luma[3];
};

// The expected answers are those of objects of one thread's own, so that all threads meet the shared ones together.
const Answers& ExpectedOfShared(size_t which) {
    static const std::array<Answers, 7> expected = {
        Answers(Rec709ColorSpace()),
        Answers(Rec2020ColorSpace()),
        Answers(DCIP3ColorSpace(kIlluminantD60)),
        Answers(DCIP3ColorSpace(kIlluminantD65)),
        Answers(PQColorSpace(false, true)),
        Answers(PQColorSpace(true, true)),
        Answers(SRGBColorSpace()),
    };
    return expected[which];
}

std::function<bool()> PrepareSharedSpaces() {
    ExpectedOfShared(0);
    return [] {
        for (size_t which = 0; which < 7; ++which)
            if (!(Answers(ColorSpace::WorkingSpace(static_cast<PK_WorkingSpace>(which))) ==
                  ExpectedOfShared(which)))
                return false;
        return true;
    };
}

/// One object of every class that keeps what it calculates, and of the others.
struct Spaces {
    GammaColorSpace gamma;
    Rec2020ColorSpace rec2020;
    HLGColorSpace hlg;
    DCIP3ColorSpace p3{kIlluminantD50};
    PQColorSpace pq{true, false}, ownPQ{std::data(kPrimaries), true};

    static constexpr float kPrimaries[6] = {0.713f, 0.293f, 0.165f, 0.83f, 0.128f, 0.044f};
};

template <class Space>
bool CopiesAnswerAlike(const Space& space, const Answers& expected) {
    const Space copy(space);
    Space assigned(copy);
    assigned = space;
    return Answers(copy) == expected && Answers(assigned) == expected;
}

struct Expected {
    explicit Expected(const Spaces& spaces)
        : gamma(spaces.gamma), rec2020(spaces.rec2020), hlg(spaces.hlg), p3(spaces.p3), pq(spaces.pq),
          ownPQ(spaces.ownPQ) {}

    bool Fits(const Spaces& spaces) const {
        // A copy first: others may be calculating what it takes over.
        return CopiesAnswerAlike(spaces.p3, p3) && CopiesAnswerAlike(spaces.pq, pq) &&
               CopiesAnswerAlike(spaces.ownPQ, ownPQ) && Answers(spaces.p3) == p3 &&
               Answers(spaces.pq) == pq && Answers(spaces.ownPQ) == ownPQ && Answers(spaces.gamma) == gamma &&
               CopiesAnswerAlike(spaces.gamma, gamma) && Answers(spaces.rec2020) == rec2020 &&
               CopiesAnswerAlike(spaces.rec2020, rec2020) && Answers(spaces.hlg) == hlg &&
               CopiesAnswerAlike(spaces.hlg, hlg);
    }

    Answers gamma, rec2020, hlg, p3, pq, ownPQ;
};

/// Hands out one set of objects to the next callers, then a fresh one.
class FirstMeetings {
public:
    std::shared_ptr<const Spaces> Next() {
        constexpr int kCallers = 8;
        const std::scoped_lock lock(fMutex);
        if (fCalls++ % kCallers == 0) fSpaces = std::make_shared<const Spaces>();
        return fSpaces;
    }

private:
    std::mutex fMutex;
    std::shared_ptr<const Spaces> fSpaces;
    int fCalls = 0;
};

std::function<bool()> PrepareFirstMeetings() {
    const auto expected = std::make_shared<const Expected>(Spaces());
    const auto meetings = std::make_shared<FirstMeetings>();
    return [expected, meetings] { return expected->Fits(*meetings->Next()); };
}

/// Both directions of YCbCr and the clamp, which keep nothing.
struct PlainAnswers {
    PlainAnswers() {
        const Rec2020ColorSpace space;
        space.ConvertPixelsFromYUVtoRGB(SourceRow().data(), rows[0].data(), kPixels);
        space.ConvertPixelsFromRGBtoYUV(SourceRow().data(), rows[1].data(), kPixels);
        ClampFloatPixels(SourceRow().data(), rows[2].data(), 1, sizeof(Row), 0, 1);
    }
    bool operator==(const PlainAnswers& other) const { return std::ranges::equal(rows, other.rows, AreSame); }

    Row rows[3] = {};
};

std::function<bool()> PrepareYUVAndClamp() {
    return [expected = PlainAnswers()] { return PlainAnswers() == expected; };
}

const Operation sSharedSpaces("colour-shared", PrepareSharedSpaces);
const Operation sFirstMeetings("colour-first-meetings", PrepareFirstMeetings);
const Operation sYUVAndClamp("colour-yuv-clamp", PrepareYUVAndClamp);

} // namespace
