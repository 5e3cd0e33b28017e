// pixelkiln info: the machine as the library sees it.

#include "Command.h"
#include "Terminal.h"
#include "explain/TargetNames.h"
#include "frame/Capabilities.h"

#include <cpuid.h>
#include <cstring>
#include <thread>
#include <unistd.h>

namespace tool {
namespace {

std::string ProcessorName() {
    constexpr unsigned kFirstLeaf = 0x80000002;
    constexpr unsigned kLastLeaf = 0x80000004;
    if (__get_cpuid_max(0x80000000, nullptr) < kLastLeaf) return "unknown";
    char name[49] = "";
    for (unsigned leaf = kFirstLeaf; leaf <= kLastLeaf; ++leaf) {
        unsigned words[4];
        __get_cpuid(leaf, &words[0], &words[1], &words[2], &words[3]);
        std::memcpy(name + (leaf - kFirstLeaf) * sizeof(words), words, sizeof(words));
    }
    const std::string text(name);
    const size_t first = text.find_first_not_of(' ');
    return first == std::string::npos ? "unknown" : text.substr(first);
}

std::string FlagsText() {
    const std::pair<const char*, uint8_t> flags[] = {
        {"SSE", PK::sCPUHasSSE},     {"SSE2", PK::sCPUHasSSE2},   {"SSE3", PK::sCPUHasSSE3},
        {"SSSE3", PK::sCPUHasSSSE3}, {"SSE4.1", PK::sCPUHasSSE4}, {"SSE4.2", PK::sCPUHasSSE42},
        {"AVX", PK::sCPUHasAVX},     {"AVX2", PK::sCPUHasAVX2},   {"AVX-512", PK::sCPUHasAVX512},
    };
    std::vector<std::string> names;
    for (const auto& [name, isOn] : flags)
        if (isOn) names.push_back(name);
    return Join(names, " ");
}

std::string BodiesText() {
    return Join(TargetNames(PK::Offer::flags, [](PK::Target target) { return PK::IsEnabled(target); }), " ");
}

std::string CacheText(int name) {
    const long bytes = sysconf(name);
    return bytes > 0 ? std::to_string(bytes / 1024) + " KiB" : "unknown";
}

void Run() {
    Print("PixelKiln   " PIXELKILN_VERSION "\n"
          "processor   " +
          ProcessorName() + "\n" + "threads     " + std::to_string(std::thread::hardware_concurrency()) +
          "\n" + "flags       " + FlagsText() + "\n" + "bodies      " + BodiesText() + "\n" + "L1 data     " +
          CacheText(_SC_LEVEL1_DCACHE_SIZE) + "\n" + "L2          " + CacheText(_SC_LEVEL2_CACHE_SIZE) +
          "\n" + "L3          " + CacheText(_SC_LEVEL3_CACHE_SIZE) + "\n");
}

const Command sInfo(Group::Listings, "info", "Show version, processor, flags and caches", Run);

} // namespace
} // namespace tool
