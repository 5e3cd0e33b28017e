#pragma once

// The calls whose allocations fail, and the families that make them.
//
// A family is a file X_allocations.cpp that registers itself:
//
//     void AddFlips(Calls& calls) {
//         calls.push_back({"PK_FlipInPlace", TakesOrRefuses("a row above 256 KiB"), Content(kBytes),
//                          [](uint8_t* image) { return PK_FlipInPlace(image, ...); }});
//     }
//     const Family sFlips(AddFlips);

#include <PixelKiln/Types.h>

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

namespace PKAllocations {

/// What a call does about memory, as its header tells.
struct Memory {
    enum class Kind {
        kNone,       ///< It asks for none.
        kOrRefused,  ///< Without it the call returns PK_ErrOutOfMemory and leaves its destination.
        kOrFinished, ///< Without it the call does the same work.
    };

    Kind kind;
    const char* why; ///< what for, or why it needs none
};

constexpr Memory TakesNone(const char* why) {
    return {Memory::Kind::kNone, why};
}
constexpr Memory TakesOrRefuses(const char* what) {
    return {Memory::Kind::kOrRefused, what};
}
constexpr Memory TakesOrDoesWithout(const char* what) {
    return {Memory::Kind::kOrFinished, what};
}

/// Names of exported functions, without arguments and so without overloads.
using Names = std::vector<std::string>;

struct Call {
    Names exports; ///< what is called
    Memory memory;
    std::vector<uint8_t> before; ///< what the block holds, which is all that the call writes

    /// Allocates nothing by itself, and gives the same for the same block.
    std::function<PK_Result(uint8_t* block)> make;

    PK_Result result = PK_Success; ///< where no allocation fails
    bool startsLibrary = false;    ///< itself; for all others it is started beforehand
};

using Calls = std::vector<Call>;

class Family {
public:
    using Add = void (*)(Calls& calls);
    explicit Family(Add add);

    static Calls AllCalls();

private:
    static std::vector<Add>& Register();
};

// Wide enough that a row of four bytes a pixel is no longer given on the stack.
inline constexpr int32_t kWidth = 70001, kHeight = 4;

/// Random bytes, the same in all calls.
std::vector<uint8_t> Content(size_t bytes);

/// An image of kWidth x kHeight pixels of random bytes, and its row bytes.
struct Image {
    explicit Image(PK_PixelFormat format);

    PK_PixelFormat format;
    int32_t rowBytes;
    std::vector<uint8_t> bytes;
};

} // namespace PKAllocations
