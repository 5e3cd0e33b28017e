#include "geometry/MotionDrawer.h"

#include "primitives/Thresholds.h"

#include <PixelKiln/Accumulate.h>
#include <PixelKiln/Composite.h>
#include <PixelKiln/Convert.h>

namespace PK {

bool MotionDrawer::IsFading() const {
    return fJob.opacity - 1 < -kNegligible;
}

PK_Result MotionDrawer::Draw(const uint8_t* source, int32_t sourceStep, PK_PixelFormat sourceFormat,
                             uint8_t* destination, int32_t destinationStep, PK_PixelFormat destinationFormat,
                             int32_t width, int32_t height) const {
    if (fJob.composites)
        return PK_CompositeWithBlendMode(source, sourceStep, sourceFormat, destination, destinationStep,
                                         destinationFormat, destination, destinationStep, destinationFormat,
                                         width, height, fJob.opacity, fJob.blendMode, fJob.quality,
                                         fJob.inLinear);
    if (IsFading())
        return PK_AlphaGain(source, sourceStep, sourceFormat, destination, destinationStep, destinationFormat,
                            width, height, fJob.opacity, fJob.quality);
    return PK_Convert(source, sourceStep, sourceFormat, destination, destinationStep, destinationFormat,
                      width, height, fJob.quality);
}

} // namespace PK
