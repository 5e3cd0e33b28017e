#pragma once

/// \file
/// The whole exported interface.

#include <PixelKiln/Accumulate.h>
#include <PixelKiln/BlendMode.h>
#include <PixelKiln/BoxBlur.h>
#include <PixelKiln/Buffers.h>
#include <PixelKiln/CodecBridges.h>
#include <PixelKiln/ColorSpace.h>
#include <PixelKiln/Composite.h>
#include <PixelKiln/Convert.h>
#include <PixelKiln/CrossDissolve.h>
#include <PixelKiln/DV.h>
#include <PixelKiln/Deinterlace.h>
#include <PixelKiln/Fills.h>
#include <PixelKiln/GaussianBlur.h>
#include <PixelKiln/Lifecycle.h>
#include <PixelKiln/Matte.h>
#include <PixelKiln/Motion.h>
#include <PixelKiln/Overlay.h>
#include <PixelKiln/PixelFormat.h>
#include <PixelKiln/Planar.h>
#include <PixelKiln/QuadWarp.h>
#include <PixelKiln/QuarterScale.h>
#include <PixelKiln/Rotate.h>
#include <PixelKiln/ScaleConvert.h>
#include <PixelKiln/Types.h>
#include <PixelKiln/Utilities.h>
