#pragma once

// A walk over all codes, sizes or magnitudes. PIXELKILN_TEST_STRIDE=N in the environment takes each N-th step only, for
// machines on which the whole takes too long: emulated ones, and those with sanitizers. With an N that is odd, steps fall
// on all places of a vector.

#include <algorithm>
#include <cstdint>
#include <cstdlib>

namespace PKTest {

class Walk {
public:
    /// Whether the step that now begins is to be left out; the first never is.
    bool LeavesOut() { return fSteps++ % Stride() != 0; }

private:
    static uint64_t Stride() {
        static const char* const chosen = std::getenv("PIXELKILN_TEST_STRIDE");
        static const uint64_t stride = std::strtoull(chosen == nullptr ? "1" : chosen, nullptr, 10);
        return std::max<uint64_t>(stride, 1);
    }

    uint64_t fSteps = 0;
};

} // namespace PKTest
