// Runs a reference kernel on values written out in a test.
#pragma once

#include <cstdint>
#include <cstring>
#include <stdexcept>
#include <string_view>
#include <vector>

#include <gtest/gtest.h>

#include "ReferenceKernels.h"

namespace reference {

struct Variant {
    bool vectorMember = false;
    int quality = 0;
};

// The converted row as samples of type To. Fails if the kernel writes past the end of its row.
template <typename To, typename From>
std::vector<To> ConvertRow(std::string_view kernel, uint32_t source, uint32_t destination,
                           const std::vector<From>& row, int32_t width, Variant variant = {}) {
    constexpr size_t kFence = 64;
    constexpr uint8_t kFenceByte = 0xA5;
    if (row.size() * sizeof(From) < static_cast<size_t>(RowLength(source, width))) {
        throw std::logic_error("source row too short");
    }
    const size_t length = static_cast<size_t>(RowLength(destination, width));
    std::vector<uint8_t> bytes(length + kFence, kFenceByte);
    Run(kernel, source, destination, variant.vectorMember, row.data(), bytes.data(), width, variant.quality);
    for (size_t i = length; i < bytes.size(); ++i)
        EXPECT_EQ(bytes[i], kFenceByte) << kernel << " writes beyond its row";
    std::vector<To> result(length / sizeof(To));
    if (length != 0) std::memcpy(result.data(), bytes.data(), length);
    return result;
}

using Bytes = std::vector<uint8_t>;
using Words = std::vector<uint16_t>;
using DoubleWords = std::vector<uint32_t>;
using Floats = std::vector<float>;

} // namespace reference
