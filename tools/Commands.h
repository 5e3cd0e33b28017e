#pragma once

// The commands of the program: what each is told, and the function that does it. All throw Failure.

#include "Frame.h"

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

struct ConvertOptions {
    std::string input;
    std::string output;
    std::string from;
    std::string to;
    std::string size;
    int32_t quality = kDefaultQuality;
    int32_t pngDepth = 8;
    bool packed = false;
    bool quiet = false;
};
void RunConvert(const ConvertOptions& options);

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
