#include "support/Check.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <utility>

namespace PKFuzz {

namespace {

bool sVerbose = false;
std::string sCall;

bool IsNamed(PK_Result result) {
    switch (result) {
    case PK_Success:
    case PK_ErrBadRect:
    case PK_ErrBadSrcFormat:
    case PK_ErrBadDstFormat:
    case PK_ErrBadPosX:
    case PK_ErrBadPosY:
    case PK_ErrBadWidth:
    case PK_ErrBadHeight:
    case PK_ErrBadDVSourceSize:
    case PK_ErrNullSource:
    case PK_ErrNullDestination:
    case PK_ErrSizeMismatch:
    case PK_ErrBadDVFormat:
    case PK_ErrBadDVDestination:
    case PK_ErrOutOfMemory:
    case PK_ErrBadMotionParameter:
    case PK_ErrBadFieldType:
    case PK_ErrFailed:
    case PK_ErrNotSupported:
        return true;
    default:
        return false;
    }
}

} // namespace

void SetVerbose(bool verbose) {
    sVerbose = verbose;
}

void SetCall(std::string words) {
    sCall = std::move(words);
    if (sVerbose) std::fprintf(stderr, "%s\n", sCall.c_str());
}

void Check(bool holds, const char* rule) {
    if (holds) return;
    std::fprintf(stderr, "broken: %s\n  in %s\n", rule, sCall.c_str());
    std::abort();
}

void CheckSame(const std::vector<uint8_t>& expected, const std::vector<uint8_t>& actual, const char* rule) {
    const auto [left, right] = std::ranges::mismatch(expected, actual);
    if (left != expected.end() && right != actual.end())
        std::fprintf(stderr, "byte %td of %zu: 0x%02x and 0x%02x\n", left - expected.begin(), expected.size(),
                     *left, *right);
    Check(left == expected.end() && right == actual.end(), rule);
}

void CheckResult(PK_Result expected, PK_Result actual) {
    if (expected != actual) std::fprintf(stderr, "result %d, not %d\n", actual, expected);
    Check(expected == actual, "the arguments decide the result");
}

void CheckIsNamed(PK_Result result) {
    Check(IsNamed(result), "a result is one of the named codes");
}

} // namespace PKFuzz
