#pragma once

// The families that the one entry point chooses from.
//
// A family is a file X_fuzz.cpp that registers itself:
//
//     void FuzzScale(ByteStream& stream) { ... }
//     const Family sFamily('s', "scale", FuzzScale);
//
// The first byte of an input is the letter of its family, so that a kept input still means the same once
// there are more families; any other first byte chooses one by its value.

#include "support/ByteStream.h"

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

namespace PKFuzz {

class Family {
public:
    using Run = void (*)(ByteStream& stream);

    /// The letter must be one that no other family has.
    Family(char letter, const char* name, Run run);

    char Letter() const { return fLetter; }
    std::string_view Name() const { return fName; }

    /// Makes one run, from the library as it is after start and back to it.
    void RunOnce(ByteStream& stream) const;

    /// All families in the order of their letters.
    static const std::vector<const Family*>& All();

    static const Family& OfFirstByte(uint8_t byte);

private:
    static std::vector<const Family*>& Register();

    char fLetter;
    const char* fName;
    Run fRun;
};

} // namespace PKFuzz

/// One run on any bytes.
extern "C" int LLVMFuzzerTestOneInput(const uint8_t* bytes, size_t count);
