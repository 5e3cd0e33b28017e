#include <PixelKiln/ColorSpace.h>

namespace PK {

namespace {

struct WorkingSpaces {
    Rec709ColorSpace rec709;
    Rec2020ColorSpace rec2020;
    DCIP3ColorSpace p3D60{kIlluminantD60}, p3D65{kIlluminantD65};
    PQColorSpace pqRec2020{false, true}, pqP3{true, true}; // which ask for those above
    SRGBColorSpace sRGB;
};

// Ahead of all static objects that may ask for one. Not at the first request: a fork would leave the child with one that
// another thread was just making. What costs time is calculated at first need all the same.
[[gnu::init_priority(101)]] const WorkingSpaces sSpaces;

} // namespace

const ColorSpace& ColorSpace::WorkingSpace(PK_WorkingSpace which) {
    switch (which) {
    case kWorkingSpaceRec709:
        return sSpaces.rec709;
    case kWorkingSpaceRec2020:
        return sSpaces.rec2020;
    case kWorkingSpaceDCIP3D60:
        return sSpaces.p3D60;
    case kWorkingSpaceDCIP3D65:
        return sSpaces.p3D65;
    case kWorkingSpacePQRec2020:
        return sSpaces.pqRec2020;
    case kWorkingSpacePQP3:
        return sSpaces.pqP3;
    case kWorkingSpaceSRGB:
        break;
    }
    return sSpaces.sRGB;
}

} // namespace PK
