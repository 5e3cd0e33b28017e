#pragma once

// Blocks of DV at half and a quarter of their size, from the coefficients of lowest frequency alone.

#include "dv/DVSegment.h"

namespace PK {

/// How far a block is to be parsed for it.
DVParseDepth DepthOfReduction(DVSize size);

/// Levels to samples, in place: four lines of four at half the size. At a quarter the first two coefficients of the first
/// two lines give such four lines, and two lines of two samples are the means of each 2 x 2 of them. A block of 2-4-8 mode
/// has the sums of lines there, and goes the same way.
void ReduceBlockDV(const DVTransformKernels& transforms, int16_t* block, const DVSteps& steps, DVSize size);

} // namespace PK
