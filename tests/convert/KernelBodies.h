#pragma once

// Runs every body of a row kernel that this processor can, one after the other, on rows of typed samples.

#include "convert/KernelTable.h"
#include "support/Targets.h"

#include <gtest/gtest.h>

#include <cstring>
#include <vector>

namespace PKTest {

/// The instruction sets of this processor for which the kernel has a body.
inline std::vector<PK::Target> TargetsWithBody(PK::Kernel kernel) {
    std::vector<PK::Target> targets = TargetsOfThisProcessor();
    std::erase_if(targets, [kernel](PK::Target target) { return !PK::Body(kernel, target); });
    return targets;
}

/// Calls check(target, body) for each body of the kernel that the processor can run.
template <class Check>
void ForEachBody(PK::Kernel kernel, Check check) {
    const std::vector<PK::Target> targets = TargetsWithBody(kernel);
    EXPECT_FALSE(targets.empty()) << PK::Info(kernel).name << " has no body";
    for (const PK::Target target : targets) {
        SCOPED_TRACE(testing::Message() << PK::Info(kernel).name << ", " << PK::TargetName(target));
        check(target, PK::Body(kernel, target));
        if (testing::Test::HasFatalFailure()) return;
    }
}

/// The row that a body makes of `source`, `samples` long. Samples behind the row must stay as they are.
template <class To, class From>
std::vector<To> RunRow(PK::RowKernel body, const std::vector<From>& source, int32_t width, size_t samples) {
    constexpr size_t kMargin = 64;
    std::vector<uint8_t> bytes(samples * sizeof(To) + kMargin, 0xA5);
    body(source.data(), bytes.data(), width);
    const std::vector<uint8_t> margin(bytes.end() - kMargin, bytes.end());
    EXPECT_EQ(margin, std::vector<uint8_t>(kMargin, 0xA5)) << "written behind a row of width " << width;
    std::vector<To> row(samples);
    if (samples) std::memcpy(row.data(), bytes.data(), samples * sizeof(To));
    return row;
}

/// The same in place, for kernels that keep the size of a pixel.
template <class Sample>
std::vector<Sample> RunRowInPlace(PK::RowKernel body, std::vector<Sample> row, int32_t width) {
    body(row.data(), row.data(), width);
    return row;
}

} // namespace PKTest
