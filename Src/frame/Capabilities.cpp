#include "frame/Capabilities.h"

#include "frame/CacheSize.h"
#include "primitives/Dispatch.h"

#include "zebcore/debug.h"

#include <cpuid.h>
#include <string_view>
#include <unistd.h>

namespace PK {

namespace {

constexpr uint32_t kLeaf1EDX_SSE = 1u << 25;
constexpr uint32_t kLeaf1EDX_SSE2 = 1u << 26;
constexpr uint32_t kLeaf1ECX_SSE3 = 1u << 0;
constexpr uint32_t kLeaf1ECX_SSSE3 = 1u << 9;
constexpr uint32_t kLeaf1ECX_SSE41 = 1u << 19;
constexpr uint32_t kLeaf1ECX_SSE42 = 1u << 20;
constexpr uint32_t kLeaf1ECX_AVX = 0x18000000; // AVX, and XGETBV open to programs
constexpr uint32_t kLeaf7EBX_AVX2 = 1u << 5;
constexpr uint32_t kLeaf7EBX_AVX512 = 1u << 16 | 1u << 17 | 1u << 30 | 1u << 31; // F, DQ, BW, VL
constexpr uint32_t kXCR0_AVX = 6;       // the system saves the XMM and the YMM registers
constexpr uint32_t kXCR0_AVX512 = 0xe0; // and the mask registers and both parts of the ZMM ones

bool HasAll(uint32_t bits, uint32_t mask) {
    return (bits & mask) == mask;
}

bool CanReadXCR0(const ProcessorReport& report) {
    return HasAll(report.leaf1ECX, kLeaf1ECX_AVX);
}

bool HasAVX(const ProcessorReport& report) {
    return CanReadXCR0(report) && HasAll(report.xcr0, kXCR0_AVX);
}

// Deliberate: this compares the processor signature, not the highest leaf, and so holds on every real
// processor.
bool HasLeaf7(const ProcessorReport& report) {
    return report.leaf1EAX >= 7;
}

uint32_t ReadXCR0() {
    uint32_t low = 0;
    uint32_t high = 0;
    asm volatile("xgetbv" : "=a"(low), "=d"(high) : "c"(0));
    return low;
}

void SetIf(Flag& flag, bool condition) {
    if (condition) flag = 1;
}

// A host without the memory to answer leaves the default.
template <class Use>
void WithSetting(const char* name, const char* defaultText, Use use) noexcept {
    try {
        use(zebcore::debug::DebugDatabase::Instance().GetEntry(name, defaultText));
    } catch (...) {
        return;
    }
}

void ClearIfTrue(const char* setting, Flag& flag) noexcept {
    WithSetting(setting, "false", [&flag](std::string_view text) {
        if (text == "true") flag = 0;
    });
}

// The report without what stands above a target. SSE stays: it has no bodies of its own.
ProcessorReport UpTo(Target highest, ProcessorReport report) {
    if (highest < Target::avx512) report.leaf7EBX &= ~kLeaf7EBX_AVX512;
    if (highest < Target::avx2) report.leaf7EBX &= ~kLeaf7EBX_AVX2;
    if (highest < Target::avx) report.leaf1ECX &= ~kLeaf1ECX_AVX;
    if (highest < Target::sse41) report.leaf1ECX &= ~(kLeaf1ECX_SSE41 | kLeaf1ECX_SSE42);
    if (highest < Target::ssse3) report.leaf1ECX &= ~kLeaf1ECX_SSSE3;
    if (highest < Target::sse2) {
        report.leaf1ECX &= ~kLeaf1ECX_SSE3;
        report.leaf1EDX &= ~kLeaf1EDX_SSE2;
    }
    return report;
}

} // namespace

ProcessorReport ReadProcessor() noexcept {
    ProcessorReport report{};
    uint32_t unused = 0;
    __cpuid(1, report.leaf1EAX, unused, report.leaf1ECX, report.leaf1EDX);
    if (CanReadXCR0(report)) report.xcr0 = ReadXCR0();
    if (HasAVX(report) && HasLeaf7(report)) {
        uint32_t eax = 0;
        uint32_t ecx = 0;
        uint32_t edx = 0;
        __cpuid_count(7, 0, eax, report.leaf7EBX, ecx, edx);
    }
    return UpTo(HighestTarget(), report);
}

void SetCapabilities(const ProcessorReport& report) noexcept {
    SetIf(sCPUHasSSE, HasAll(report.leaf1EDX, kLeaf1EDX_SSE));
    SetIf(sCPUHasSSE2, HasAll(report.leaf1EDX, kLeaf1EDX_SSE2));
    SetIf(sCPUHasSSE3, HasAll(report.leaf1ECX, kLeaf1ECX_SSE3));
    SetIf(sCPUHasSSSE3, HasAll(report.leaf1ECX, kLeaf1ECX_SSSE3));
    SetIf(sCPUHasSSE4, HasAll(report.leaf1ECX, kLeaf1ECX_SSE41));
    SetIf(sCPUHasSSE42, HasAll(report.leaf1ECX, kLeaf1ECX_SSE42));
    if (!HasAVX(report)) return;
    sCPUHasAVX = 1;
    if (!HasLeaf7(report)) return;
    SetIf(sCPUHasAVX2, HasAll(report.leaf7EBX, kLeaf7EBX_AVX2));
    SetIf(sCPUHasAVX512, HasAll(report.leaf7EBX, kLeaf7EBX_AVX512) && HasAll(report.xcr0, kXCR0_AVX512));
}

void ApplyTargetSetting() noexcept {
    WithSetting("PK.highestTarget", "", [](std::string_view word) {
        if (const auto target = TargetOfWord(word)) HoldTo(*target);
    });
}

void ApplyCapabilitySettings() noexcept {
    ClearIfTrue("PK.disableAVX", sCPUHasAVX);
    ClearIfTrue("PK.disableAVX2", sCPUHasAVX2);
}

void DetectProcessor() noexcept {
    ApplyTargetSetting();
    SetCapabilities(ReadProcessor());
    DetectCache(sysconf);
    ApplyCapabilitySettings(); // after the cache, which goes by the flags as the processor gave them
}

} // namespace PK
