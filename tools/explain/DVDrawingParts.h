#pragma once

// What the drawings of DV share: colours, boxes and words.

#include "Drawing.h"

#include "dv/DVFormat.h"

#include <string>

namespace tool {

inline constexpr double kMargin = 24;
inline constexpr int32_t kWidth = 960;
inline constexpr Colour kWhite = {1, 1, 1};
inline constexpr Colour kHeader = {0.93, 0.76, 0.42}, kSubcode = {0.78, 0.85, 0.58},
                        kVAUX = {0.60, 0.80, 0.80}, kAudio = {0.86, 0.70, 0.84};
inline constexpr Colour kMacroblocks[PK::kMacroblocksOfSegment] = {
    {0.84, 0.36, 0.31}, {0.89, 0.63, 0.24}, {0.38, 0.62, 0.33}, {0.27, 0.52, 0.72}, {0.55, 0.40, 0.67}};

inline Colour Mixed(const Colour& colour, double white) {
    const auto mix = [white](double channel) { return channel + (1 - channel) * white; };
    return {mix(colour.red), mix(colour.green), mix(colour.blue)};
}

inline void FillBox(cairo_t* context, double x, double y, double width, double height, const Colour& colour) {
    SetColour(context, colour);
    cairo_rectangle(context, x, y, width, height);
    cairo_fill(context);
}

inline void StrokeBox(cairo_t* context, double x, double y, double width, double height,
                      const Colour& colour = kInk, double line = 1) {
    SetColour(context, colour);
    cairo_set_line_width(context, line);
    cairo_rectangle(context, x, y, width, height);
    cairo_stroke(context);
}

inline void DrawBox(cairo_t* context, double x, double y, double width, double height, const Colour& colour,
                    const std::string& text = "", double size = 11) {
    FillBox(context, x, y, width, height, colour);
    StrokeBox(context, x, y, width, height, kPaleInk, 0.75);
    if (!text.empty())
        DrawText(context, text, x + width / 2, y + height / 2 + 0.36 * size, {size, false, Align::Centre});
}

inline void DrawHeading(cairo_t* context, const std::string& text, double baseline) {
    DrawText(context, text, kMargin, baseline, {15, true});
}

inline void DrawNote(cairo_t* context, const std::string& text, double x, double baseline) {
    DrawText(context, text, x, baseline, {12, false, Align::Left, kPaleInk});
}

/// On the line of a heading, up to the margin.
inline void DrawRemark(cairo_t* context, const std::string& text, double baseline) {
    DrawText(context, text, kWidth - kMargin, baseline, {12, false, Align::Right, kPaleInk});
}

} // namespace tool
