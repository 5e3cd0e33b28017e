#include "stress/Calls.h"

#include <algorithm>

namespace PKStress {

namespace {

struct Repetition {
    Call call;
    std::vector<uint8_t> expected; ///< empty if there is nothing that can be expected

    explicit Repetition(const Call& once) : call(once), expected(Make()) {
        if (expected == call.before) expected.clear();
    }

    /// What the call leaves in a block; empty if it fails.
    std::vector<uint8_t> Make() const {
        std::vector<uint8_t> block = call.before;
        if (call.write(block.data()) != PK_Success) block.clear();
        return block;
    }

    bool ComesOutRight() const { return !expected.empty() && Make() == expected; }
};

} // namespace

std::function<bool()> Repeat(const std::vector<Call>& calls) {
    const std::vector<Repetition> repetitions(calls.begin(), calls.end());
    return [repetitions] { return std::ranges::all_of(repetitions, &Repetition::ComesOutRight); };
}

std::vector<uint8_t> RandomImage(PK_PixelFormat format, int32_t width, int32_t height,
                                 PKTest::Random& random) {
    return random.Bytes(static_cast<size_t>(PK_PixelFormatSize(format, width, height)));
}

} // namespace PKStress
