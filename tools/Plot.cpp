#include "Plot.h"

#include <cmath>

namespace tool {
namespace {

constexpr double kLeftMargin = 64; // labels and title of the y axis
constexpr double kTopMargin = 56;  // title and note
constexpr double kBottomMargin = 52;
constexpr double kRightMargin = 14;
constexpr double kLegendLine = 19;
constexpr double kLegendSample = 30;
constexpr double kTextSize = 13;
constexpr int kSteps = 240; // along the x axis
constexpr Colour kGround = {1, 1, 1};
constexpr Colour kGrid = {0.88, 0.88, 0.88};

// How far along an axis a value lies, 0 at its first and 1 at its last.
double Along(const Axis& axis, double value) {
    if (axis.logarithmic) return std::log(value / axis.first) / std::log(axis.last / axis.first);
    return (value - axis.first) / (axis.last - axis.first);
}

// The place of a step, `done` of the way: on a linear axis closer together at its start, where curves are steep.
double ValueAt(const Axis& axis, double done) {
    if (axis.logarithmic) return axis.first * std::pow(axis.last / axis.first, done);
    return axis.first + done * done * (axis.last - axis.first);
}

double XOf(const Plot& plot, const Box& field, double value) {
    return field.left + field.width * Along(plot.x, value);
}

double YOf(const Plot& plot, const Box& field, double value) {
    return field.top + field.height * (1 - Along(plot.y, value));
}

void Line(cairo_t* context, double x0, double y0, double x1, double y1) {
    cairo_move_to(context, x0, y0);
    cairo_line_to(context, x1, y1);
    cairo_stroke(context);
}

void DrawGrid(cairo_t* context, const Plot& plot, const Box& field) {
    const double right = field.left + field.width;
    const double bottom = field.top + field.height;
    SetColour(context, kGround);
    cairo_rectangle(context, field.left, field.top, field.width, field.height);
    cairo_fill(context);
    cairo_set_line_width(context, 1);
    for (const Tick& tick : plot.x.ticks) {
        const double x = XOf(plot, field, tick.at);
        SetColour(context, kGrid);
        Line(context, x, field.top, x, bottom);
        DrawText(context, tick.label, x, bottom + 18, {.size = kTextSize, .align = Align::Centre});
    }
    for (const Tick& tick : plot.y.ticks) {
        const double y = YOf(plot, field, tick.at);
        SetColour(context, kGrid);
        Line(context, field.left, y, right, y);
        DrawText(context, tick.label, field.left - 8, y + 4, {.size = kTextSize, .align = Align::Right});
    }
    SetColour(context, kPaleInk);
    cairo_rectangle(context, field.left, field.top, field.width, field.height);
    cairo_stroke(context);
}

void DrawTitles(cairo_t* context, const Plot& plot, const Box& box, const Box& field) {
    DrawText(context, plot.title, field.left, box.top + 18, {.size = 16, .bold = true});
    DrawText(context, plot.note, field.left, box.top + 40, {.size = kTextSize, .colour = kPaleInk});
    DrawText(context, plot.x.title, field.left + field.width / 2, field.top + field.height + 40,
             {.size = kTextSize, .align = Align::Centre});
    cairo_save(context);
    cairo_translate(context, box.left + 14, field.top + field.height / 2);
    cairo_rotate(context, -std::acos(-1.0) / 2);
    DrawText(context, plot.y.title, 0, 0, {.size = kTextSize, .align = Align::Centre});
    cairo_restore(context);
}

void SetPen(cairo_t* context, const Curve& curve) {
    SetColour(context, curve.colour);
    cairo_set_line_width(context, 2);
    cairo_set_line_join(context, CAIRO_LINE_JOIN_ROUND);
    cairo_set_dash(context, curve.dashes.data(), static_cast<int>(curve.dashes.size()), 0);
}

void DrawCurve(cairo_t* context, const Plot& plot, const Box& field, const Curve& curve) {
    const double ceiling = 2 * plot.y.last; // a curve may rise far above the field, which cairo need not see
    for (int step = 0; step <= kSteps; ++step) {
        const double x = ValueAt(plot.x, static_cast<double>(step) / kSteps);
        cairo_line_to(context, XOf(plot, field, x), YOf(plot, field, std::fmin(curve.value(x), ceiling)));
    }
    SetPen(context, curve);
    cairo_stroke(context);
}

void DrawCurves(cairo_t* context, const Plot& plot, const Box& field) {
    cairo_save(context);
    cairo_rectangle(context, field.left, field.top, field.width, field.height);
    cairo_clip(context);
    for (const Curve& curve : plot.curves) DrawCurve(context, plot, field, curve);
    cairo_restore(context);
}

// In the top left corner, which curves that rise to the right leave free.
void DrawLegend(cairo_t* context, const Plot& plot, const Box& field) {
    double y = field.top + 20;
    for (const Curve& curve : plot.curves) {
        cairo_save(context);
        SetPen(context, curve);
        Line(context, field.left + 12, y - 4, field.left + 12 + kLegendSample, y - 4);
        cairo_restore(context);
        DrawText(context, curve.label, field.left + 20 + kLegendSample, y, {.size = kTextSize});
        y += kLegendLine;
    }
}

} // namespace

void DrawPlot(cairo_t* context, const Plot& plot, const Box& box) {
    const Box field = {box.left + kLeftMargin, box.top + kTopMargin, box.width - kLeftMargin - kRightMargin,
                       box.height - kTopMargin - kBottomMargin};
    DrawTitles(context, plot, box, field);
    DrawGrid(context, plot, field);
    DrawCurves(context, plot, field);
    DrawLegend(context, plot, field);
}

} // namespace tool
