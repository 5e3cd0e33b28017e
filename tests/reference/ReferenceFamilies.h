// The families that the reference kernels are written in. Inner to the reference.
#pragma once

#include <cstdint>
#include <string_view>

namespace reference {

struct Job {
    std::string_view kernel;
    uint32_t source;
    uint32_t destination;
    bool vectorMember;
    const void* src;
    void* dst;
    int32_t width;
    int quality;
};

// Each runs the job and returns true if kernel and formats name a member of its family, else returns false.
bool RunCopyAndAlpha(const Job& job);
bool RunPremultiplication(const Job& job);
bool RunDepthChange(const Job& job);
bool RunRGBToYUV(const Job& job);
bool RunYUVToRGB(const Job& job);
bool RunBetweenMatrices(const Job& job);
bool RunChromaResampling(const Job& job);
bool RunTransferFunction(const Job& job);
bool RunV210(const Job& job);
bool RunRGB10(const Job& job);

} // namespace reference
