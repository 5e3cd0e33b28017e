#pragma once

/// \file
/// An image placed in another: moved, scaled, turned, blurred against aliasing, and composited, field by field where they
/// are interlaced.

#include <PixelKiln/BlendMode.h>
#include <PixelKiln/PixelFormat.h>

extern "C" {

/// Places a source in a destination.
///
/// Geometry. The anchor, a fraction of the source's size, comes to lie on the position, a fraction of the destination's;
/// y of both counts from the bottom. About it the source is scaled, then turned clockwise, in square pixels: with P the
/// pixel aspect ratio aspectNum / aspectDen a column counts P. An angle whose cosine is not below that of a twentieth of
/// a degree is no rotation. Only destination pixels that the source reaches are written.
///
/// Sampling. Where the source lies on whole pixels, to 5e-5 of one, unscaled and not turned, its pixels are taken as they
/// are. Else they are sampled between four neighbours or, at quality 5, by the cubic of Keys (1981) with a = -0.75,
/// stretched for a reduction down to a quarter. Up to quality 4 an edge is hard, or with \p smoothEdges fades over one
/// source pixel.
///
/// Blur. At quality 3 and 4 a Gaussian blur of sigma (softness + 1) / 4 source pixels per destination pixel goes before
/// the sampling of each axis where that is more than 0.25: of what gets smaller, and, with a softness, of anything. A
/// progressive source in an interlaced destination is blurred along the destination's columns by a further softness + 1.
///
/// Fields. Of an interlaced source (\p srcField 1 or 2: that field is the earlier) each field is sampled alone; at quality
/// 5 the other is rebuilt by PK_Deinterlace. To an interlaced destination both fields are drawn, one after the other, or
/// one by \p renderField: rows 0, 2, 4 and so on for 1, the others for 2.
///
/// Result. With \p composite each row goes over the destination as PK_CompositeWithBlendMode lays it, mode Normal. Else it
/// replaces what is there, faded by PK_AlphaGain where the opacity is below 1 - 8e-6.
///
/// Crop. Nothing outside it is read or seen, with three exceptions: fields of an interlaced source have half of its rows from
/// half of its top, rounded down, so that below an odd top the row above shows; at quality 5 such a source is made
/// progressive as a whole; and a source that lies pixel on pixel on the whole destination is copied whole.
///
/// Destinations of pairs or groups of pixels (4:2:2, V210): those that are covered in part keep the pixels beside, the chroma
/// of a pair becoming that of both.
///
/// Memory: row bytes may be of either sign; no alignment is asked for. Source and destination must not overlap.
///
/// Threads: more than 32 rows are a task on all processors. May be called from any number of threads at the same time on
/// different destinations. PK_Initialize must have been called. The floating-point mode is that of PK_Convert, and the
/// caller's on return.
///
/// \param src                first row of the source in memory.
/// \param srcRowBytes        bytes from one row of it to the next.
/// \param srcWidth           its pixels in a row.
/// \param srcHeight          its rows.
/// \param srcFormat          a 4:4:4 format of four channels; at quality 5 and a scale other than 1 it is
///                           BGRP_4444_32f_Linear.
/// \param srcField           its earlier field, 1 or 2; any other number: it is progressive.
/// \param srcRect            the part that is drawn, rows counted from the top; null: all.
/// \param dst                first row of the destination in memory.
/// \param dstRowBytes        bytes from one row of it to the next.
/// \param dstWidth           its pixels in a row.
/// \param dstHeight          its rows.
/// \param dstFormat          a raster format.
/// \param dstField           its earlier field, 1 or 2; any other number: it is progressive.
/// \param aspectNum          width of a pixel,
/// \param aspectDen          over its height; of both images.
/// \param position           where the anchor lies, a fraction of the destination, y from the bottom.
/// \param anchor             a fraction of the source, y from the bottom.
/// \param scale              destination pixels for a source pixel.
/// \param rotation           degrees, clockwise.
/// \param opacity            0 to 1.
/// \param composite          over the destination instead of in its place.
/// \param softness           0 to 1.
/// \param smoothEdges        edges of the source fade.
/// \param renderField        0: all rows.
/// \param quality            render quality, 0 to 5. Above 4, sources other than premultiplied 32f RGB have 4; for those, a
///                           number above 5 is like 4.
/// \param compositeInLinear  as for PK_CompositeWithBlendMode.
/// \return
///  - PK_ErrBadRect: \p srcRect is empty, inverted or not inside the source.
///  - PK_ErrBadSrcFormat: the source is of none of these formats.
///  - PK_ErrBadDstFormat: the destination is of no raster format.
///  - PK_ErrBadMotionParameter: a softness below 0 or above 1.
///  - PK_Success: drawn, or nothing to draw: an opacity or scale below 8e-6, negative ones included, an image of size 0, or
///    a source that reaches no pixel.
///  - PK_ErrFailed: a negative or too great size, or a null pointer where there are pixels.
///  - PK_ErrOutOfMemory: no memory for the blurred or progressive source, for rows or for the weights of quality 5; or a
///    field of the crop without rows, to be blurred without smooth edges.
///
/// Arguments are checked in this order, before memory is touched. Memory for rows is there before the first is drawn; where a
/// second field finds none for its source, the first is drawn.
PK_API PK_Result PK_Motion(const void* src, int32_t srcRowBytes, int32_t srcWidth, int32_t srcHeight,
                           PK_PixelFormat srcFormat, int32_t srcField, const PK_Rect* srcRect, void* dst,
                           int32_t dstRowBytes, int32_t dstWidth, int32_t dstHeight, PK_PixelFormat dstFormat,
                           int32_t dstField, uint32_t aspectNum, uint32_t aspectDen, PK_Point position,
                           PK_Point anchor, PK_Point scale, double rotation, float opacity, bool composite,
                           double softness, bool smoothEdges, int32_t renderField, int32_t quality,
                           bool compositeInLinear) noexcept;

/// Places a source over a destination, as PK_Motion with \p composite does, by a blend mode. Parameters as there, and:
/// \param blendMode  a blend mode; for PK_BlendMode_Dissolve the C runtime's random numbers are started anew by srand(1).
/// \return what PK_Motion returns, and what PK_CompositeWithBlendMode returns for a mode that there is not.
PK_API PK_Result PK_MotionWithBlendMode(const void* src, int32_t srcRowBytes, int32_t srcWidth,
                                        int32_t srcHeight, PK_PixelFormat srcFormat, int32_t srcField,
                                        const PK_Rect* srcRect, void* dst, int32_t dstRowBytes,
                                        int32_t dstWidth, int32_t dstHeight, PK_PixelFormat dstFormat,
                                        int32_t dstField, uint32_t aspectNum, uint32_t aspectDen,
                                        PK_Point position, PK_Point anchor, PK_Point scale, double rotation,
                                        float opacity, double softness, bool smoothEdges, int32_t renderField,
                                        PK_BlendMode blendMode, int32_t quality,
                                        bool compositeInLinear) noexcept;

} // extern "C"
