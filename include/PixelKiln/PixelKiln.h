#pragma once

/// \file
/// The whole exported interface.

#include <PixelKiln/Buffers.h>
#include <PixelKiln/Convert.h>
#include <PixelKiln/Fills.h>
#include <PixelKiln/Lifecycle.h>
#include <PixelKiln/PixelFormat.h>
#include <PixelKiln/Types.h>
#include <PixelKiln/Utilities.h>
