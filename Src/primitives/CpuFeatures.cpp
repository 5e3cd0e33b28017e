#include "primitives/CpuFeatures.h"

#include "primitives/FirstUse.h"

#include <cpuid.h>

namespace PK {

namespace {

uint8_t HasBit(uint32_t reg, int bit) {
    return reg >> bit & 1;
}

bool CanReadXCR0(uint32_t leaf1ECX) {
    return HasBit(leaf1ECX, 27) && HasBit(leaf1ECX, 28); // OSXSAVE and AVX
}

CpuidReport ReadProcessor() {
    CpuidReport report{};
    uint32_t eax = 0, ebx = 0, ecx = 0, edx = 0;
    if (__get_cpuid(1, &eax, &ebx, &ecx, &edx)) {
        report.leaf1ECX = ecx;
        report.leaf1EDX = edx;
    }
    if (__get_cpuid_count(7, 0, &eax, &ebx, &ecx, &edx)) report.leaf7EBX = ebx;
    if (__get_cpuid(0x80000001, &eax, &ebx, &ecx, &edx)) {
        report.extendedECX = ecx;
        report.extendedEDX = edx;
    }
    if (CanReadXCR0(report.leaf1ECX)) {
        uint32_t high = 0;
        asm volatile("xgetbv" : "=a"(report.xcr0), "=d"(high) : "c"(0));
    }
    return report;
}

} // namespace

CpuFlags FlagsOf(const CpuidReport& report) {
    constexpr uint32_t kVectorState = 6; // the system saves the XMM and the YMM registers
    const uint32_t ecx = report.leaf1ECX, edx = report.leaf1EDX;
    const uint8_t avx = CanReadXCR0(ecx) && (report.xcr0 & kVectorState) == kVectorState;
    const auto withAVX = [avx](uint32_t reg, int bit) {
        return static_cast<uint8_t>(HasBit(reg, bit) & avx);
    };
    return {
        .mmx = HasBit(edx, 23),
        .extended3DNow = HasBit(report.extendedEDX, 30),
        .sse = HasBit(edx, 25),
        .sse2 = HasBit(edx, 26),
        .sse3 = HasBit(ecx, 0),
        .ssse3 = HasBit(ecx, 9),
        .sse4a = HasBit(report.extendedECX, 6),
        .sse41 = HasBit(ecx, 19),
        .sse42 = HasBit(ecx, 20),
        .aes = HasBit(ecx, 25),
        .avx = avx,
        .avx2 = withAVX(report.leaf7EBX, 5),
        .fma3 = withAVX(ecx, 12),
        .fma4 = withAVX(report.extendedECX, 16),
        .xop = withAVX(report.extendedECX, 11),
        .f16c = withAVX(ecx, 29),
        .popcnt = HasBit(ecx, 23),
        .misalignedSSE = HasBit(report.extendedECX, 7),
        .rdtscp = HasBit(report.extendedEDX, 27),
        .rdrand = HasBit(ecx, 30),
    };
}

const CpuFeatures& CpuFeatures::Instance() {
    static constinit FirstUse<CpuFeatures> sFeatures;
    return sFeatures.Get([] {
        const CpuFlags flags = FlagsOf(ReadProcessor());
        return CpuFeatures{{flags, flags, flags}};
    });
}

} // namespace PK
