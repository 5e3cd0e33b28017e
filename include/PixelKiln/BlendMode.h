#pragma once

/// \file
/// The blend modes by number.

#include <PixelKiln/Types.h>

/// How the colour of a top image meets that of the image behind it. Any number may be given; those that have no
/// constant are no mode.
using PK_BlendMode = int32_t;

// Below, s is a sample of the top image and b that of the back image. "Of the colours as wholes" are the modes that
// do not go sample by sample.

/// Hue and saturation of the top colour, luminance of the back colour.
inline constexpr PK_BlendMode PK_BlendMode_Color = 0;
/// Darkens the back colour by the inverse of the top: 1 - (1 - b) / s.
inline constexpr PK_BlendMode PK_BlendMode_ColorBurn = 1;
/// Brightens the back colour by the top: b / (1 - s).
inline constexpr PK_BlendMode PK_BlendMode_ColorDodge = 2;
/// The lesser of s and b.
inline constexpr PK_BlendMode PK_BlendMode_Darken = 3;
/// Of the colours as wholes the one with less luminance.
inline constexpr PK_BlendMode PK_BlendMode_DarkerColor = 4;
/// |s - b|.
inline constexpr PK_BlendMode PK_BlendMode_Difference = 5;
/// Each pixel from one image or the other, by chance: the likelier from the top, the greater its alpha and the opacity.
inline constexpr PK_BlendMode PK_BlendMode_Dissolve = 6;
/// s + b - 2 s b.
inline constexpr PK_BlendMode PK_BlendMode_Exclusion = 7;
/// Multiply where the top is dark, Screen where it is bright.
inline constexpr PK_BlendMode PK_BlendMode_HardLight = 8;
/// 0 or 1, by whether s + b reaches 1.
inline constexpr PK_BlendMode PK_BlendMode_HardMix = 9;
/// Hue of the top colour, saturation and luminance of the back colour.
inline constexpr PK_BlendMode PK_BlendMode_Hue = 10;
/// The greater of s and b.
inline constexpr PK_BlendMode PK_BlendMode_Lighten = 11;
/// Of the colours as wholes the one with more luminance.
inline constexpr PK_BlendMode PK_BlendMode_LighterColor = 12;
/// s + b - 1.
inline constexpr PK_BlendMode PK_BlendMode_LinearBurn = 13;
/// s + b.
inline constexpr PK_BlendMode PK_BlendMode_LinearDodge = 14;
/// 2 s + b - 1.
inline constexpr PK_BlendMode PK_BlendMode_LinearLight = 15;
/// Luminance of the top colour, hue and saturation of the back colour.
inline constexpr PK_BlendMode PK_BlendMode_Luminosity = 16;
/// s b.
inline constexpr PK_BlendMode PK_BlendMode_Multiply = 17;
/// s: the top image over the back image.
inline constexpr PK_BlendMode PK_BlendMode_Normal = 18;
/// Multiply where the back is dark, Screen where it is bright.
inline constexpr PK_BlendMode PK_BlendMode_Overlay = 19;
/// Darken by 2 s where the top is dark, Lighten by 2 s - 1 where it is bright.
inline constexpr PK_BlendMode PK_BlendMode_PinLight = 20;
/// Saturation of the top colour, hue and luminance of the back colour.
inline constexpr PK_BlendMode PK_BlendMode_Saturation = 21;
/// 1 - (1 - s) (1 - b).
inline constexpr PK_BlendMode PK_BlendMode_Screen = 22;
/// Darkens or brightens softly, by whether the top is dark or bright.
inline constexpr PK_BlendMode PK_BlendMode_SoftLight = 23;
/// ColorBurn by 2 s where the top is dark, ColorDodge by 2 s - 1 where it is bright.
inline constexpr PK_BlendMode PK_BlendMode_VividLight = 24;
/// b - s.
inline constexpr PK_BlendMode PK_BlendMode_Subtract = 25;
/// b / s.
inline constexpr PK_BlendMode PK_BlendMode_Divide = 26;
