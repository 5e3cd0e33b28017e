// Which kernels lead from one raster format to another: a plain restatement of the router, for the tests.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace reference {

struct Step {
    std::string kernel;
    uint32_t next = 0;         // the format that the kernel leaves the row in
    bool interpolated = false; // of Upsample422To444Float32Row: chroma is interpolated, not repeated
};

// The next kernel on the way from one format to another; empty where there is none.
std::optional<Step> ChooseStep(uint32_t source, uint32_t destination, int quality, bool sse2);

// All kernels on the way, at most eight; empty where there is no way.
std::vector<Step> Chain(uint32_t source, uint32_t destination, int quality, bool sse2);

} // namespace reference
