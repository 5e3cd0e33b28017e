#pragma once

// Drawing with cairo, which scales pictures and sets words, so that no font and no scaler of our own is needed.
// No display is needed either.

#include "Frame.h"

#include <cairo.h>
#include <functional>
#include <memory>
#include <string>

namespace tool {

struct DestroyCairo {
    void operator()(cairo_surface_t* surface) const { cairo_surface_destroy(surface); }
    void operator()(cairo_t* context) const { cairo_destroy(context); }
};
using Surface = std::unique_ptr<cairo_surface_t, DestroyCairo>;

struct Colour {
    double red, green, blue;
};
inline constexpr Colour kPaper = {0.96, 0.96, 0.95};
inline constexpr Colour kInk = {0.12, 0.13, 0.15};
inline constexpr Colour kPaleInk = {0.42, 0.43, 0.46};

void SetColour(cairo_t* context, const Colour& colour);

enum class Align { Left, Centre, Right };
struct Lettering {
    double size;
    bool bold = false;
    Align align = Align::Left;
    Colour colour = kInk;
};
void DrawText(cairo_t* context, const std::string& text, double x, double baseline,
              const Lettering& lettering);

/// Draws a BGRA_4444_8u picture into a rectangle.
void DrawPicture(cairo_t* context, const Frame& picture, double x, double y, double width, double height);

/// What is drawn on paper that is already coloured.
using Draw = std::function<void(cairo_t*)>;

void WritePngDrawing(int32_t width, int32_t height, const Draw& draw, const std::string& name);
void WriteSvgDrawing(int32_t width, int32_t height, const Draw& draw, const std::string& name);

} // namespace tool
