#include "Pictures.h"

#include "Charts.h"
#include "Measures.h"
#include "Scaler.h"

#include "Drawing.h"
#include "Numbers.h"

#include <algorithm>
#include <cmath>
#include <functional>
#include <iterator>

namespace Scaling {
namespace {

constexpr int32_t kCell = 160, kGap = 8, kHeading = 28, kLeft = 56;

/// A square part, each pixel `times` as large.
tool::Frame Part(const Grey& grey, int32_t left, int32_t top, int32_t times) {
    tool::Frame frame(PK_PixelFormat_BGRA_4444_8u, kCell, kCell);
    for (int32_t y = 0; y < kCell; ++y)
        for (int32_t x = 0; x < kCell; ++x) {
            const float value = grey.Row(top + y / times)[left + x / times];
            const auto code = static_cast<uint8_t>(std::lround(std::clamp(value, 0.0f, 1.0f) * 255));
            std::fill_n(frame.Row(y) + 4 * x, 3, code);
            frame.Row(y)[4 * x + 3] = 255;
        }
    return frame;
}

tool::Frame PartOfPlate(const Grey& plate) {
    const int32_t times = std::max(1, kCell / plate.width), start = plate.width - kCell / times;
    return Part(plate, start, start, times);
}

tool::Frame PartOfEdge(const Grey& edge) {
    constexpr int32_t kTimes = 5;
    const int32_t start = (edge.width - kCell / kTimes) / 2;
    return Part(edge, start, start, kTimes);
}

double TopOf(size_t row) {
    return kHeading + static_cast<double>(row) * (kCell + kGap);
}

void DrawGrid(const Grey& chart, std::span<const double> scales,
              const std::function<tool::Frame(const Grey&)>& part, const std::string& name) {
    std::vector<Scaler> scalers;
    std::ranges::copy_if(AllScalers(), std::back_inserter(scalers), &Scaler::isShown);
    const auto draw = [&](cairo_t* context) {
        for (size_t i = 0; i < scales.size(); ++i)
            tool::DrawText(context, tool::Formatted("%g", scales[i]), kGap, TopOf(i) + kCell / 2.0,
                           {.size = 15, .bold = true});
        double x = kLeft;
        for (const Scaler& scaler : scalers) {
            tool::DrawText(context, scaler.name, x, kHeading - 10, {.size = 13, .bold = true});
            for (size_t i = 0; i < scales.size(); ++i) {
                const int32_t side = ScaledSide(kSide, scales[i]);
                tool::DrawPicture(context, part(scaler.scale(chart, side, side)), x, TopOf(i), kCell, kCell);
            }
            x += kCell + kGap;
        }
    };
    tool::WritePngDrawing(kLeft + static_cast<int32_t>(scalers.size()) * (kCell + kGap),
                          kHeading + static_cast<int32_t>(scales.size()) * (kCell + kGap), draw, name);
}

} // namespace

void DrawPlates(std::span<const double> scales, const std::string& name) {
    DrawGrid(ZonePlate(), scales, PartOfPlate, name);
}

void DrawEdges(std::span<const double> scales, const std::string& name) {
    DrawGrid(SlantedEdge(), scales, PartOfEdge, name);
}

} // namespace Scaling
