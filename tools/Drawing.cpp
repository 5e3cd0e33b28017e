#include "Drawing.h"

#include "Failure.h"
#include "OutputFile.h"
#include "Png.h"

#include <cairo-svg.h>

namespace tool {
namespace {

using Context = std::unique_ptr<cairo_t, DestroyCairo>;

Surface SurfaceOver(Frame& frame, cairo_format_t format) {
    return Surface(cairo_image_surface_create_for_data(frame.Pixels(), format, frame.Width(), frame.Height(),
                                                       frame.RowBytes()));
}

// Between the rows of cairo, from the top, and those of the four-channel formats, from the bottom.
void Flip(Frame& frame) {
    PK_FlipInPlace(frame.Pixels(), frame.RowBytes(), frame.Width(), frame.Height(), frame.Format());
}

void RequireDrawn(cairo_status_t status) {
    if (status != CAIRO_STATUS_SUCCESS)
        throw Failure(kExitFailed, std::string("cannot draw the picture: ") + cairo_status_to_string(status));
}

void DrawOn(cairo_surface_t* surface, const Draw& draw) {
    const Context context(cairo_create(surface));
    SetColour(context.get(), kPaper);
    cairo_paint(context.get());
    draw(context.get());
    RequireDrawn(cairo_status(context.get()));
}

cairo_status_t Append(void* text, const unsigned char* data, unsigned int length) {
    static_cast<std::string*>(text)->append(reinterpret_cast<const char*>(data), length);
    return CAIRO_STATUS_SUCCESS;
}

} // namespace

void SetColour(cairo_t* context, const Colour& colour) {
    cairo_set_source_rgb(context, colour.red, colour.green, colour.blue);
}

void DrawText(cairo_t* context, const std::string& text, double x, double baseline,
              const Lettering& lettering) {
    cairo_select_font_face(context, "sans-serif", CAIRO_FONT_SLANT_NORMAL,
                           lettering.bold ? CAIRO_FONT_WEIGHT_BOLD : CAIRO_FONT_WEIGHT_NORMAL);
    cairo_set_font_size(context, lettering.size);
    SetColour(context, lettering.colour);
    cairo_text_extents_t extents;
    cairo_text_extents(context, text.c_str(), &extents);
    const double share = lettering.align == Align::Left ? 0 : lettering.align == Align::Centre ? 0.5 : 1;
    cairo_move_to(context, x - share * extents.x_advance, baseline);
    cairo_show_text(context, text.c_str());
}

void DrawPicture(cairo_t* context, const Frame& picture, double x, double y, double width, double height) {
    Frame premultiplied = Converted(picture, PK_PixelFormat_BGRP_4444_8u, kDefaultQuality);
    Flip(premultiplied);
    const Surface surface = SurfaceOver(premultiplied, CAIRO_FORMAT_ARGB32);
    cairo_save(context);
    cairo_translate(context, x, y);
    cairo_scale(context, width / picture.Width(), height / picture.Height());
    cairo_set_source_surface(context, surface.get(), 0, 0);
    cairo_pattern_set_filter(cairo_get_source(context), CAIRO_FILTER_GOOD);
    cairo_pattern_set_extend(cairo_get_source(context), CAIRO_EXTEND_PAD);
    cairo_rectangle(context, 0, 0, picture.Width(), picture.Height());
    cairo_fill(context);
    cairo_restore(context);
}

void WritePngDrawing(int32_t width, int32_t height, const Draw& draw, const std::string& name) {
    OutputFile file(name);
    Frame frame(PK_PixelFormat_BGRX_4444_8u, width, height);
    DrawOn(SurfaceOver(frame, CAIRO_FORMAT_RGB24).get(), draw);
    Flip(frame);
    WritePng(Converted(frame, PK_PixelFormat_BGRA_4444_8u, kDefaultQuality), file);
    file.Commit();
}

void WriteSvgDrawing(int32_t width, int32_t height, const Draw& draw, const std::string& name) {
    OutputFile file(name);
    std::string text;
    const Surface surface(cairo_svg_surface_create_for_stream(Append, &text, width, height));
    cairo_svg_surface_set_document_unit(surface.get(), CAIRO_SVG_UNIT_PX);
    DrawOn(surface.get(), draw);
    cairo_surface_finish(surface.get());
    RequireDrawn(cairo_surface_status(surface.get()));
    file.Write(text.data(), text.size());
    file.Commit();
}

} // namespace tool
