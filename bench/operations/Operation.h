#pragma once

// What the benchmark of operations measures: each operation, and other libraries at the same work. Both are
// entered in lists before main begins, so that a peer's file is compiled in only where its library is installed.

#include <cstddef>
#include <cstdint>
#include <functional>
#include <initializer_list>
#include <string>
#include <vector>

namespace OperationBench {

#ifndef OPERATION_BENCH_LINES
#define OPERATION_BENCH_LINES 1080
#endif
inline constexpr int32_t kHeight = OPERATION_BENCH_LINES;
inline constexpr int32_t kWidth = kHeight / 9 * 16;
inline constexpr int32_t kPixels = kWidth * kHeight;
inline constexpr int32_t kBGRARowBytes = 4 * kWidth;
inline constexpr int32_t kTurnedRowBytes = 4 * kHeight;

using Run = std::function<void()>;

/// Makes what lasts longer than one run, and gives back what runs once. An operation in place takes the
/// destination.
using Prepare = Run (*)(const uint8_t* source, uint8_t* destination);

/// What an operation should reach, as a share of the speed of something else.
enum class Against {
    Nothing,
    Memset, ///< of the bytes that are written
    Memcpy, ///< of as many bytes, read and written
    Peer,   ///< the fastest
};

/// What the samples of the source are.
enum class Samples { Bytes, Words10, Floats };

struct Operation {
    const char* name;
    size_t bytesRead;
    size_t bytesWritten;
    Samples samples;
    Against against;
    double share;
    Prepare prepare;
};

struct Peer {
    const char* operation;
    const char* name;
    bool isComparable; ///< writes the same bytes but for rounding
    Prepare prepare;
    bool setsAim = true; ///< not where its result is much less exact than ours
};

std::vector<Operation>& AllOperations();
std::vector<Peer>& AllPeers();

struct AddOperations {
    AddOperations(std::initializer_list<Operation> operations) {
        AllOperations().insert(AllOperations().end(), operations.begin(), operations.end());
    }
};

struct AddPeers {
    AddPeers(std::initializer_list<Peer> peers) {
        AllPeers().insert(AllPeers().end(), peers.begin(), peers.end());
    }
};

} // namespace OperationBench
