#pragma once

// Curves in a rectangle with two axes and a legend.

#include "Drawing.h"

#include <functional>
#include <string>
#include <vector>

namespace tool {

struct Tick {
    double at;
    std::string label; ///< empty for a line without words
};

struct Axis {
    std::string title;
    double first;
    double last;
    bool logarithmic;
    std::vector<Tick> ticks;
};

struct Curve {
    std::string label;
    Colour colour;
    std::vector<double> dashes; ///< in points, line and gap in turn; empty for a whole line
    std::function<double(double)> value;
};

struct Plot {
    std::string title;
    std::string note; ///< below the title
    Axis x;
    Axis y;
    std::vector<Curve> curves; ///< the legend lists them in this order
};

struct Box {
    double left, top, width, height;
};

/// Draws a plot with its words into a box. What leaves the range of the y axis is cut off.
void DrawPlot(cairo_t* context, const Plot& plot, const Box& box);

} // namespace tool
