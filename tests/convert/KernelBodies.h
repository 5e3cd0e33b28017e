#pragma once

// Runs every body of a row kernel that this processor can, one after the other, on rows of typed samples.

#include "convert/KernelTable.h"
#include "frame/Capabilities.h"

#include <gtest/gtest.h>

#include <cstring>
#include <vector>

namespace PKTest {

/// Calls check(target, body) for each body of the kernel that the processor can run.
template <class Check>
void ForEachBody(PK::Kernel kernel, Check check) {
    PK::SetCapabilities(PK::ReadProcessor());
    int32_t count = 0;
    for (int i = 0; i < PK::kTargetCount; ++i) {
        const auto target = static_cast<PK::Target>(i);
        const PK::RowKernel body = PK::Body(kernel, target);
        if (!body || !PK::IsEnabled(target)) continue;
        ++count;
        SCOPED_TRACE(testing::Message() << PK::Info(kernel).name << ", " << PK::TargetName(target));
        check(target, body);
    }
    EXPECT_GT(count, 0) << PK::Info(kernel).name << " has no body";
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
