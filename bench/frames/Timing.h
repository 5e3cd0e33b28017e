#pragma once

// Times contenders against each other: they take turns, so that what disturbs the machine disturbs all.

#include <functional>
#include <vector>

namespace FrameBench {

/// The seconds that one run of each contender takes, in processor time of the whole process: waiting for a
/// processor that others use does not count, and threads of a contender's own would.
std::vector<double> MeasureInTurns(const std::vector<std::function<void()>>& contenders, int rounds);

} // namespace FrameBench
