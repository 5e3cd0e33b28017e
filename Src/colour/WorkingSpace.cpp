#include <PixelKiln/ColorSpace.h>

namespace PK {

const ColorSpace& ColorSpace::WorkingSpace(PK_WorkingSpace which) {
    switch (which) {
    case kWorkingSpaceRec709: {
        static const Rec709ColorSpace space;
        return space;
    }
    case kWorkingSpaceRec2020: {
        static const Rec2020ColorSpace space;
        return space;
    }
    case kWorkingSpaceDCIP3D60: {
        static const DCIP3ColorSpace space(kIlluminantD60);
        return space;
    }
    case kWorkingSpaceDCIP3D65: {
        static const DCIP3ColorSpace space(kIlluminantD65);
        return space;
    }
    case kWorkingSpacePQRec2020: {
        static const PQColorSpace space(false, true);
        return space;
    }
    case kWorkingSpacePQP3: {
        static const PQColorSpace space(true, true);
        return space;
    }
    case kWorkingSpaceSRGB:
        break;
    }
    static const SRGBColorSpace space;
    return space;
}

} // namespace PK
