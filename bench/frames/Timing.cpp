#include "frames/Timing.h"

#include <algorithm>
#include <ctime>

namespace FrameBench {
namespace {

constexpr int kRunsInRound = 3;

double ProcessorSeconds() {
    timespec now;
    clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &now);
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) * 1e-9;
}

// What disturbs a run only ever lengthens it, so the faster half is the better half; its middle is taken.
double LowerQuartile(std::vector<double>& seconds) {
    const auto quartile = seconds.begin() + static_cast<std::ptrdiff_t>(seconds.size() / 4);
    std::nth_element(seconds.begin(), quartile, seconds.end());
    return *quartile;
}

} // namespace

std::vector<double> MeasureInTurns(const std::vector<std::function<void()>>& contenders, int rounds) {
    std::vector<std::vector<double>> seconds(contenders.size());
    for (int round = 0; round < rounds; ++round)
        for (size_t i = 0; i < contenders.size(); ++i) {
            contenders[i](); // brings its own images into the caches
            for (int run = 0; run < kRunsInRound; ++run) {
                const double start = ProcessorSeconds();
                contenders[i]();
                seconds[i].push_back(ProcessorSeconds() - start);
            }
        }
    std::vector<double> typical;
    for (std::vector<double>& each : seconds) typical.push_back(LowerQuartile(each));
    return typical;
}

} // namespace FrameBench
