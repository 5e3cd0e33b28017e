#pragma once

// The commands of the program: what each is told, and the function that does it. All throw Failure.

#include "FramePipe.h"

#include <optional>
#include <string>
#include <vector>

namespace tool {

struct ListOptions {
    bool csv = false;
};
void RunFormats(const ListOptions& options);
void RunKernels(const ListOptions& options);

void RunInfo();

struct ExplainOptions {
    std::string source;
    std::string destination;
    int32_t quality = kDefaultQuality;
};
void RunExplain(const ExplainOptions& options);

void RunConvert(const PipeOptions& options);

struct FillOptions : PipeOptions {
    std::string colour;
};
void RunFill(const FillOptions& options);

struct RotateOptions : PipeOptions {
    int32_t degrees = 0;
};
void RunRotate(const RotateOptions& options);

struct BoxBlurOptions : PipeOptions {
    double radius = 0;
    int32_t passes = 1;
    bool rows = false;
    bool columns = false;
    bool renormalise = false;
};
void RunBoxBlur(const BoxBlurOptions& options);

struct WarpOptions : PipeOptions {
    std::string quad;
    std::string onto;
    float feather = 0;
    int32_t opacity = 255;
};
void RunWarp(const WarpOptions& options);

struct StampOptions : PipeOptions {
    int32_t number = 0;
    std::string at = "0.02,0.02";
    float digit = 0.05F;
    bool hex = false;
};
void RunStamp(const StampOptions& options);

/// The frames are BGRA_4444_32f on the way; from and to of PipeOptions stay empty.
struct ColourOptions : PipeOptions {
    std::string fromSpace;
    std::string toSpace;
    bool gamutClip = false;
    std::optional<float> exposure;
    std::optional<float> slope;
    std::optional<float> knee;
};
void RunColour(const ColourOptions& options);

struct CurvesOptions {
    std::string output;
};
void RunCurves(const CurvesOptions& options);

struct CompareOptions {
    std::string first;
    std::string second;
    std::optional<double> limit; ///< steps of 8 bits
};
void RunCompare(const CompareOptions& options);

struct SheetOptions {
    std::string output;
    std::vector<std::string> images;
};
void RunSheet(const SheetOptions& options);

struct PairsOptions {
    std::string output;
    std::string image;
    int32_t quality = kDefaultQuality;
};
void RunPairs(const PairsOptions& options);

struct DemoOptions {
    std::string image;
    std::string folder;
};
void RunDemo(const DemoOptions& options);

} // namespace tool
